#include "scopes/join_names.h"

#include <algorithm>
#include <utility>

#include "scopes/scope_builder.h"
#include "text/move_bytes.h"

namespace codeloom {

namespace {

// Appends part by part.
class CNameJoiner {
  public:
    explicit CNameJoiner(CTextNames& joined) : _fJoined(joined) {}

    void Append(const CNamePart& part) {
        const CTextNames& names = *part.names;
        _fStart = part.start;
        _fFirstOccurrence = static_cast<uint32_t>(_fJoined.occurrences.items.size());
        // The class around is one of an earlier part.
        const uint32_t left_out = part.begins_in_class ? 1 : 0;
        _fClassBefore = part.begins_in_class ? _fOpenScope : 0;
        _fFirstScope = static_cast<uint32_t>(_fJoined.occurrences.scopes.size()) - left_out;
        for (const COccurrence& occurrence : names.occurrences.items) _Append(occurrence);
        for (size_t i = left_out; i < names.occurrences.scopes.size(); ++i)
            _Append(names.occurrences.scopes[i]);
        for (const CLineNames& line : names.lines) _Append(line);
        for (const CLostBinding& binding : names.lost_bindings)
            _fJoined.lost_bindings.push_back({binding.name, _Moved(binding.scope)});
        _fOpenScope = _Moved(part.open_scope);
        _fJoined.lost_names.insert(_fJoined.lost_names.end(), names.lost_names.begin(),
                                   names.lost_names.end());
    }

  private:
    void _Append(COccurrence occurrence) {
        occurrence.Move(_fStart);
        _fJoined.occurrences.items.push_back(occurrence);
    }

    void _Append(CInnerScope scope) {
        MoveBytes(scope, _fStart);
        _fJoined.occurrences.scopes.push_back(scope);
    }

    void _Append(CLineNames line) {
        line.first_occurrence += _fFirstOccurrence;
        line.first_scope += _fFirstScope;
        line.scope = _Moved(line.scope);
        line.Move(_fStart);
        _fJoined.lines.push_back(line);
    }

    // The module is the same scope for all.
    uint32_t _Moved(uint32_t scope) const {
        if (scope == 0) return 0;
        return scope == 1 && _fClassBefore != 0 ? _fClassBefore : scope + _fFirstScope;
    }

    CTextNames& _fJoined;
    uint32_t _fStart = 0;
    uint32_t _fFirstOccurrence = 0;
    uint32_t _fFirstScope = 0;
    uint32_t _fClassBefore = 0;  // that the part begins in, among all; zero for none
    uint32_t _fOpenScope = 0;    // around the end of the part
};

}  // namespace

CTextNames JoinNames(std::span<const CNamePart> parts, std::shared_ptr<CNameTable> table) {
    CTextNames joined;
    joined.occurrences.names = std::move(table);
    CNameJoiner joiner(joined);
    for (const CNamePart& part : parts) joiner.Append(part);
    std::vector<uint32_t>& lost = joined.lost_names;
    std::sort(lost.begin(), lost.end());
    lost.erase(std::unique(lost.begin(), lost.end()), lost.end());
    BuildScopes(joined);
    return joined;
}

}  // namespace codeloom
