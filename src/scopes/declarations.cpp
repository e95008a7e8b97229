#include "scopes/declarations.h"

#include <string>

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

// One mark per declaration. That of a name with both kinds is on the first one, as the interpreter has it.
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

// A `nonlocal` at module level is refused where it is.
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

}  // namespace

bool DeclaresIn(uint32_t scope, const CTextNames& names) {
    const TPlainArray<COccurrence>& items = names.occurrences.items;
    for (uint32_t i = 0; i < items.size(); ++i)
        if ((items[i].role == ERole::kGlobal || items[i].role == ERole::kNonlocal) &&
            names.ScopeOfOccurrence(i) == scope)
            return true;
    return false;
}

void CheckDeclarations(const CTextNames& names, int version, CProblems& problems) {
    CDeclarationCheck(names, version, problems).Run();
}

}  // namespace codeloom
