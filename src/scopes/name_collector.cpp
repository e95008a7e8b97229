#include "scopes/name_collector.h"

#include <algorithm>

#include "scopes/lost_bindings.h"

namespace codeloom {

namespace {

bool OpensScope(EClause clause) {
    return clause == EClause::kDef || clause == EClause::kAsyncDef || clause == EClause::kClass;
}

}  // namespace

void CNameCollector::BeginLine(const CRawLogical& line, const CBlockTracker& blocks) {
    const COccurrences& found = _fNames.occurrences;
    _fNames.lines.push_back({static_cast<uint32_t>(found.items.size()),
                             static_cast<uint32_t>(found.scopes.size()), _fBlocks.ScopeOf(blocks), 0});
    _fFinder.BeginLine(line);
}

void CNameCollector::EndLine(const CRawLogical& line, bool has_fault, const CBlockTracker& blocks) {
    uint32_t opened = _fFinder.OpenedScope();
    _fFinder.EndLine(has_fault);
    if (line.type == ELogicalType::kComment) return;
    _fNames.lines.back().end = line.EndOf(line.tokens.back());
    const bool has_names = _fNames.lines.back().first_occurrence < _fNames.occurrences.items.size();
    _fNames.lines.back().is_in_doubt = _fMayDeclareNames && has_names && blocks.IsInDoubt();
    const CStatementHead& head = blocks.Head();
    if (has_fault) {
        opened = OpensScope(head.clause) ? _AddLostScope(line, head) : 0;
        _NoteLostLine(line, head.clause, opened);
    }
    if (opened == 0) return;
    const CLineNames& names = _fNames.lines.back();
    _fNames.occurrences.scopes[names.first_scope + opened - 1].start = head.start;
    _fBlocks.Add(head.start, _fNames.ScopeOf(names, opened));
}

void CNameCollector::_NoteLostLine(const CRawLogical& line, EClause clause, uint32_t opened_scope) {
    _fNames.lines.back().has_fault = true;
    for (const CRawToken& token : line.tokens)
        if (token.type == kTokenId_NAME && token.word == EWord::kNone)
            _fNames.lost_names.push_back(_fNames.occurrences.names->Number(line.Text(token)));
    const CLineNames& names = _fNames.lines.back();
    const CLostBindings found = FindLostBindings(line, clause);
    const auto note = [&](const CRawToken* token, uint32_t scope) {
        _fNames.lost_bindings.push_back(
            {_fNames.occurrences.names->Number(line.Text(*token)), _fNames.ScopeOf(names, scope)});
    };
    for (const CRawToken* const token : found.names) note(token, 0);
    for (const CRawToken* const token : found.parameters) note(token, opened_scope);
}

// The header's block belongs to a scope all the same.
uint32_t CNameCollector::_AddLostScope(const CRawLogical& line, const CStatementHead& head) {
    COccurrences& found = _fNames.occurrences;
    CInnerScope scope;
    scope.kind = head.clause == EClause::kClass ? EScopeKind::kClass : EScopeKind::kFunction;
    scope.is_lost = true;
    scope.start = head.start;
    scope.end = line.EndOf(line.tokens.back());
    const auto name = std::find_if(line.tokens.begin(), line.tokens.end(), [](const CRawToken& token) {
        return token.type == kTokenId_NAME && token.word == EWord::kNone;
    });
    scope.name = found.names->Number(name == line.tokens.end() ? std::string_view() : line.Text(*name));
    found.scopes.push_back(scope);
    return 1;
}

// The header of the class is before the part, and has no place in it.
void CNameCollector::Resume(bool defers_annotations, bool is_in_class) {
    _fFinder.SetDefersAnnotations(defers_annotations);
    if (!is_in_class) return;
    COccurrences& found = _fNames.occurrences;
    CInnerScope around;
    around.kind = EScopeKind::kClass;
    around.name = found.names->Number({});
    found.scopes.push_back(around);
    _fBlocks.Add(0, 1);
    _fBlocks.Resume(1);
}

void CNameCollector::Finish() {
    std::vector<uint32_t>& lost = _fNames.lost_names;
    std::sort(lost.begin(), lost.end());
    lost.erase(std::unique(lost.begin(), lost.end()), lost.end());
}

}  // namespace codeloom
