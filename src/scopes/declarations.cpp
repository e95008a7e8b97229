#include "scopes/declarations.h"

#include <algorithm>
#include <array>
#include <bit>
#include <cstring>
#include <string>

#include "text/char_class.h"

namespace codeloom {

namespace {

// Before, all but a declared parameter is a warning only.
constexpr int kRefusesEarlierUses = 306;

// Of one symbol that is declared, what came before: indexes of occurrences.
struct CSeen {
    uint32_t parameter = kNoIndex;
    uint32_t use = kNoIndex;
    uint32_t annotation = kNoIndex;
    uint32_t assignment = kNoIndex;
    uint32_t global = kNoIndex;
    uint32_t nonlocal = kNoIndex;
};

using CBytes [[gnu::vector_size(16)]] = unsigned char;
constexpr size_t kStep = sizeof(CBytes);

CBytes Load(const char* bytes) {
    CBytes loaded;
    std::memcpy(&loaded, bytes, kStep);
    return loaded;
}

bool MayHoldEither(std::string_view text) {
    if (text.size() < kStep + 4) return true;
    CBytes found{};
    const size_t last = text.size() - kStep - 4;
    for (size_t i = 0;; i = std::min(i + kStep, last)) {
        const char* const bytes = text.data() + i;
        found |= (Load(bytes) == 'l') & (Load(bytes + 1) == 'o') & (Load(bytes + 3) == 'a') &
                 (Load(bytes + 4) == 'l');
        if (i == last) break;
    }
    return std::ranges::any_of(std::bit_cast<std::array<unsigned char, kStep>>(found),
                               [](unsigned char byte) { return byte != 0; });
}

class CDeclarationCheck {
  public:
    CDeclarationCheck(const CTextNames& names, int version, CProblems& problems)
        : _fNames(names), _fVersion(version), _fProblems(problems), _fSeen(names.scopes.symbols.size()) {}

    void Run();

  private:
    void _Visit(uint32_t i, bool is_in_doubt);
    void _CheckDeclaration(uint32_t i, const CSeen& seen);
    void _CheckEarlier(uint32_t i, const CSeen& seen);
    void _CheckBinding(uint32_t i);
    void _CheckAnnotation(uint32_t i, const CSeen& seen);
    void _Note(uint32_t i, CSeen& seen);
    bool _MayBeBoundByLostLine(uint32_t scope) const;
    CProblem& _Report(ECode code, uint32_t i, std::string_view before, std::string_view after);
    void _ReportEarlier(ECode code, uint32_t i, std::string_view what, uint32_t earlier,
                        std::string_view earlier_is);

    const COccurrence& _Item(uint32_t i) const { return _fNames.occurrences.items[i]; }
    const CSymbol& _SymbolOf(uint32_t i) const { return _fNames.scopes.symbols[_fNames.scopes.symbol_of[i]]; }
    std::string_view _Word(uint32_t i) const {
        return _Item(i).role == ERole::kGlobal ? "global" : "nonlocal";
    }

    const CTextNames& _fNames;
    const int _fVersion;
    CProblems& _fProblems;
    std::vector<CSeen> _fSeen;  // by symbol
};

void CDeclarationCheck::Run() {
    for (size_t line_i = 0; line_i < _fNames.lines.size(); ++line_i)
        for (uint32_t i = _fNames.FirstOccurrence(line_i); i < _fNames.FirstOccurrence(line_i + 1); ++i)
            _Visit(i, _fNames.lines[line_i].is_in_doubt);
}

void CDeclarationCheck::_Visit(uint32_t i, bool is_in_doubt) {
    const uint32_t symbol_i = _fNames.scopes.symbol_of[i];
    if (symbol_i == kNoIndex) return;
    const CSymbol& symbol = _fNames.scopes.symbols[symbol_i];
    if (!symbol.Is(CSymbol::kIsDeclaredGlobal) && !symbol.Is(CSymbol::kIsDeclaredNonlocal)) return;
    CSeen& seen = _fSeen[symbol_i];
    const ERole role = _Item(i).role;
    if (!is_in_doubt && (role == ERole::kGlobal || role == ERole::kNonlocal)) {
        _CheckDeclaration(i, seen);
    } else if (!is_in_doubt && (_Item(i).flags & COccurrence::kIsAnnotated) != 0 && symbol.scope != 0) {
        _CheckAnnotation(i, seen);
    }
    _Note(i, seen);
}

void CDeclarationCheck::_Note(uint32_t i, CSeen& seen) {
    const auto note = [i](uint32_t& first) { first = first == kNoIndex ? i : first; };
    switch (_Item(i).role) {
        case ERole::kParameter:
            return note(seen.parameter);
        case ERole::kRead:
            return note(seen.use);
        case ERole::kGlobal:
            return note(seen.global);
        case ERole::kNonlocal:
            return note(seen.nonlocal);
        case ERole::kImport:
            return;
        default:
            return note((_Item(i).flags & COccurrence::kIsAnnotated) != 0 ? seen.annotation
                                                                          : seen.assignment);
    }
}

// One mark a declaration. That of a name with both kinds is on the first one, as the interpreter has it.
void CDeclarationCheck::_CheckDeclaration(uint32_t i, const CSeen& seen) {
    const size_t problem_count = _fProblems.size();
    _CheckEarlier(i, seen);
    if (_fProblems.size() > problem_count) return;
    const uint32_t other = _Item(i).role == ERole::kGlobal ? seen.nonlocal : seen.global;
    if (other != kNoIndex) {
        _Report(ECode::kNonlocalAndGlobal, other, "name '", "' is nonlocal and global")
            .related.push_back({_Item(i).start, _Item(i).end, "the other declaration"});
    } else if (_Item(i).role == ERole::kNonlocal) {
        _CheckBinding(i);
    }
}

void CDeclarationCheck::_CheckEarlier(uint32_t i, const CSeen& seen) {
    const std::string word(_Word(i));
    if (seen.parameter != kNoIndex)
        return _ReportEarlier(ECode::kDeclaredParameter, i, "' is parameter and " + word, seen.parameter,
                              "the parameter");
    if (_fVersion < kRefusesEarlierUses) return;
    if (seen.use != kNoIndex)
        return _ReportEarlier(ECode::kDeclaredAfterUse, i, "' is used prior to " + word + " declaration",
                              seen.use, "the first use");
    if (seen.annotation != kNoIndex) {
        _Report(ECode::kDeclaredAnnotated, i, "annotated name '", "' can't be " + word)
            .related.push_back({_Item(seen.annotation).start, _Item(seen.annotation).end, "the annotation"});
    } else if (seen.assignment != kNoIndex) {
        _ReportEarlier(ECode::kDeclaredAfterUse, i, "' is assigned to before " + word + " declaration",
                       seen.assignment, "the first assignment");
    }
}

void CDeclarationCheck::_CheckAnnotation(uint32_t i, const CSeen& seen) {
    const uint32_t declaration = seen.global != kNoIndex ? seen.global : seen.nonlocal;
    if (declaration == kNoIndex || _fVersion < kRefusesEarlierUses) return;
    _Report(ECode::kDeclaredAnnotated, i, "annotated name '", "' can't be " + std::string(_Word(declaration)))
        .related.push_back({_Item(declaration).start, _Item(declaration).end, "the declaration"});
}

// A `nonlocal` at module level is refused where it stands.
void CDeclarationCheck::_CheckBinding(uint32_t i) {
    const CSymbol& symbol = _SymbolOf(i);
    if (symbol.scope == 0 || symbol.Is(CSymbol::kIsDeclaredGlobal)) return;
    if (_MayBeBoundByLostLine(symbol.scope)) return;
    if (symbol.binding != CSymbol::EBinding::kFree) {
        _Report(ECode::kNonlocalWithoutBinding, i, "no binding for nonlocal '", "' found");
    } else if (const CSymbol& home = _fNames.scopes.symbols[symbol.home];
               home.Is(CSymbol::kIsTypeParameter)) {
        _Report(ECode::kNonlocalTypeParameter, i, "nonlocal binding not allowed for type parameter '", "'");
    }
}

bool CDeclarationCheck::_MayBeBoundByLostLine(uint32_t scope) const {
    for (; scope != 0; scope = _fNames.scopes.scopes[scope].parent)
        if (_fNames.scopes.scopes[scope].is_lost || _fNames.scopes.scopes[scope].has_lost_lines) return true;
    return false;
}

CProblem& CDeclarationCheck::_Report(ECode code, uint32_t i, std::string_view before,
                                     std::string_view after) {
    std::string message(before);
    message.append(_fNames.occurrences.Name(_Item(i))).append(after);
    return _fProblems.emplace_back(CProblem{code, _Item(i).start, _Item(i).end, std::move(message), {}, {}});
}

void CDeclarationCheck::_ReportEarlier(ECode code, uint32_t i, std::string_view what, uint32_t earlier,
                                       std::string_view earlier_is) {
    _Report(code, i, "name '", what)
        .related.push_back({_Item(earlier).start, _Item(earlier).end, std::string(earlier_is)});
}

// The word stands where a statement may begin, with a blank after it.
bool MayBeginStatement(std::string_view text, size_t pos, size_t length) {
    const char next = ByteAt(text, pos + length);
    if (!IsBlank(next) && next != '\\') return false;
    while (pos > 0 && IsBlank(text[pos - 1])) --pos;
    const char last = pos == 0 ? '\n' : text[pos - 1];
    return IsRowEnd(last) || last == ';' || last == ':';
}

// The first place from `start` up to `end`; npos when there is none.
size_t FindPlace(std::string_view text, size_t start, size_t end) {
    size_t first = std::string_view::npos;
    for (const std::string_view word : {std::string_view("global"), std::string_view("nonlocal")}) {
        const std::string_view part = text.substr(0, std::min(first, end));
        size_t pos = part.find(word, start);
        while (pos != std::string_view::npos && !MayBeginStatement(text, pos, word.size()))
            pos = part.find(word, pos + 1);
        first = std::min(first, pos);
    }
    return first;
}

// The last definition before `end` that begins a row at column 0, from `start` on; `start` when there is
// none.
size_t LastDefinition(std::string_view text, size_t start, size_t end) {
    for (size_t pos = end; pos > start;) {
        pos = text.find_last_of('\n', pos - 1);
        if (pos == std::string_view::npos || pos < start) return start;
        const std::string_view row = text.substr(pos + 1, 6);
        if (row.starts_with("def ") || row.starts_with("class ") || row.starts_with("async ")) return pos + 1;
    }
    return start;
}

}  // namespace

// Both words hold "lo?al", which is searched sixteen bytes at a time and without a branch.
CDeclarationPlaces::CDeclarationPlaces(std::string_view text) {
    constexpr size_t kBlock = 4096, kOverlap = kStep + 8;
    size_t definition = 0, after_last = 0;
    for (size_t start = 0; start < text.size(); start += kBlock) {
        if (!MayHoldEither(text.substr(start, kBlock + kOverlap))) continue;
        const size_t end = std::min(start + kBlock + kOverlap, text.size());
        for (size_t pos = std::max(start, after_last);
             (pos = FindPlace(text, pos, end)) != std::string_view::npos; ++pos) {
            definition = std::max(definition, LastDefinition(text, definition, pos));
            _fPlaces.push_back({static_cast<uint32_t>(pos), static_cast<uint32_t>(definition)});
            after_last = pos + 1;
        }
    }
}

const CDeclarationPlaces::CPlace* CDeclarationPlaces::_From(uint32_t start) {
    while (_fNext < _fPlaces.size() && _fPlaces[_fNext].start < start) ++_fNext;
    return _fNext < _fPlaces.size() ? &_fPlaces[_fNext] : nullptr;
}

bool CDeclarationPlaces::MayLieInBlockOf(uint32_t line_start) {
    const CPlace* const place = _From(line_start);
    return place != nullptr && place->definition <= line_start;
}

bool CDeclarationPlaces::HasOneIn(uint32_t start, uint32_t end) {
    const CPlace* const place = _From(start);
    return place != nullptr && place->start < end;
}

bool DeclaresInModule(const CTextNames& names) {
    const TPlainArray<COccurrence>& items = names.occurrences.items;
    for (uint32_t i = 0; i < items.size(); ++i)
        if ((items[i].role == ERole::kGlobal || items[i].role == ERole::kNonlocal) &&
            names.ScopeOfOccurrence(i) == 0)
            return true;
    return false;
}

void CheckDeclarations(const CTextNames& names, int version, CProblems& problems) {
    CDeclarationCheck(names, version, problems).Run();
}

}  // namespace codeloom
