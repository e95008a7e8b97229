#include "scopes/scope_builder.h"

#include <algorithm>
#include <string>

#include "scopes/mangling.h"
#include "scopes/symbol_table.h"

namespace codeloom {

namespace {

using EBinding = CSymbol::EBinding;

// What the interpreter compiles as a function.
bool IsFunction(EScopeKind kind) {
    return kind >= EScopeKind::kFunction && kind <= EScopeKind::kGenerator;
}

// Right in a class, these see its names.
bool IsAnnotationScope(EScopeKind kind) {
    return kind >= EScopeKind::kTypeParameters;
}

class CScopeBuilder {
  public:
    explicit CScopeBuilder(CTextNames& names)
        : _fNames(names),
          _fScopes(names.scopes),
          _fSymbols(names.scopes, names.occurrences.names->Count(), names.occurrences.items.size() / 2),
          _fSuper(names.occurrences.names->Number("super")),
          _fClassCell(names.occurrences.names->Number("__class__")),
          _fStar(names.occurrences.names->Number("*")) {
        names.scopes.symbols.Reserve(names.occurrences.items.size() / 2 + 1);
    }

    void Run();

  private:
    void _AddScopes();
    void _AddOccurrences();
    void _NotePrivateNames();
    uint32_t _Mangled(uint32_t name, uint32_t scope);
    uint32_t _MangledByClass(uint32_t name, uint32_t scope);
    uint32_t _MangledBy(const CScope& named, uint32_t name);
    uint32_t _AddTypeParameter(uint32_t scope, uint32_t name);
    uint32_t _Add(const COccurrence& occurrence, uint32_t scope);
    uint32_t _AddWalrus(uint32_t scope, uint32_t name);
    uint32_t _AddFlags(uint32_t scope, uint32_t name, uint16_t flags);
    void _NoteNamespaces();
    void _Resolve();
    void _NoteNamesBoundAround();
    void _ResolveOne(uint32_t symbol_i);
    void _LookUp(uint32_t symbol_i);
    bool _LookUpInClass(uint32_t symbol_i);
    uint32_t _FindAround(uint32_t scope, uint32_t name);
    void _Bind(uint32_t symbol_i, EBinding binding, uint32_t home);
    void _PassOn(uint32_t symbol_i, uint32_t home);

    CTextNames& _fNames;
    CScopeTable& _fScopes;
    CSymbolTable _fSymbols;
    const uint32_t _fSuper;
    const uint32_t _fClassCell;
    const uint32_t _fStar;
    // By name.
    std::vector<uint8_t> _fIsPrivate;      // of those that lines hold; in a text without classes none is
    std::vector<uint8_t> _fIsBoundAround;  // in a scope that those within it see
};

void CScopeBuilder::Run() {
    _AddScopes();
    _NotePrivateNames();
    _AddOccurrences();
    for (const CLostBinding& binding : _fNames.lost_bindings)
        _AddFlags(binding.scope, _Mangled(binding.name, binding.scope), CSymbol::kIsBoundElsewhere);
    _NoteNamespaces();
    _Resolve();
}

// Scopes

void CScopeBuilder::_AddScopes() {
    const TPlainArray<CInnerScope>& inner = _fNames.occurrences.scopes;
    TPlainArray<CScope>& scopes = _fScopes.scopes;
    scopes.Resize(inner.size() + 1, {});
    scopes[0].name = _fNames.occurrences.names->Number({});
    // The class around a part of a text is on none of its lines.
    const size_t first = _fNames.lines.empty() ? 0 : _fNames.lines[0].first_scope;
    for (size_t i = 0; i < first; ++i) scopes[i + 1].kind = inner[i].kind;
    for (size_t line_i = 0; line_i < _fNames.lines.size(); ++line_i) {
        const CLineNames& line = _fNames.lines[line_i];
        const size_t end =
            line_i + 1 < _fNames.lines.size() ? _fNames.lines[line_i + 1].first_scope : inner.size();
        for (size_t i = line.first_scope; i < end; ++i) {
            CScope& scope = scopes[i + 1];
            scope.kind = inner[i].kind;
            scope.is_lost = inner[i].is_lost;
            scope.is_text = inner[i].is_text;
            scope.is_of_class = inner[i].is_of_class;
            scope.name = inner[i].name;
            scope.parent = _fNames.ScopeOf(line, inner[i].parent);
            scope.start = inner[i].start;
            scope.end = inner[i].end;
        }
        scopes[line.scope].end = std::max(scopes[line.scope].end, line.end);
        scopes[line.scope].has_lost_lines |= line.has_fault;
    }
}

// Symbols

void CScopeBuilder::_NotePrivateNames() {
    const bool has_class = std::any_of(_fScopes.scopes.begin(), _fScopes.scopes.end(),
                                       [](const CScope& scope) { return scope.kind == EScopeKind::kClass; });
    const CNameTable& names = *_fNames.occurrences.names;
    _fIsPrivate.resize(names.Count());
    if (!has_class) return;
    for (uint32_t name = 0; name < names.Count(); ++name) _fIsPrivate[name] = IsPrivate(names.Text(name));
}

// The name as the class around mangles it.
inline uint32_t CScopeBuilder::_Mangled(uint32_t name, uint32_t scope) {
    return _fIsPrivate[name] != 0 ? _MangledByClass(name, scope) : name;
}

// Around the body of a class with type parameters, these alone are mangled: by that class.
uint32_t CScopeBuilder::_MangledByClass(uint32_t name, uint32_t scope) {
    for (; scope != 0; scope = _fScopes.scopes[scope].parent) {
        const CScope& around = _fScopes.scopes[scope];
        if (around.kind == EScopeKind::kClass) return _MangledBy(around, name);
        if (!around.is_of_class) continue;
        const uint32_t mangled = _MangledBy(around, name);
        return _fSymbols.Find(scope, mangled) != kNoIndex ? mangled : name;
    }
    return name;
}

uint32_t CScopeBuilder::_MangledBy(const CScope& named, uint32_t name) {
    CNameTable& names = *_fNames.occurrences.names;
    return names.Number(MangledName(names.Text(name), names.Text(named.name)));
}

void CScopeBuilder::_AddOccurrences() {
    const TPlainArray<COccurrence>& items = _fNames.occurrences.items;
    _fScopes.symbol_of.Resize(items.size(), kNoIndex);
    uint32_t* const symbol_of = _fScopes.symbol_of.data();
    for (size_t line_i = 0; line_i < _fNames.lines.size(); ++line_i) {
        const CLineNames& line = _fNames.lines[line_i];
        const uint32_t end = _fNames.FirstOccurrence(line_i + 1);
        for (uint32_t i = line.first_occurrence; i < end; ++i) {
            const COccurrence& item = items[i];
            if (IsScoped(item.role)) symbol_of[i] = _Add(item, _fNames.ScopeOf(line, item.scope));
        }
    }
}

uint32_t CScopeBuilder::_Add(const COccurrence& occurrence, uint32_t scope) {
    const uint32_t name = _Mangled(occurrence.name, scope);
    switch (occurrence.role) {
        case ERole::kRead:
            if (name == _fSuper && IsFunction(_fScopes.scopes[scope].kind))
                _AddFlags(scope, _fClassCell, CSymbol::kIsReferenced);
            return _AddFlags(scope, name, CSymbol::kIsReferenced);
        case ERole::kImport:
            if (name != _fStar) return _AddFlags(scope, name, CSymbol::kIsImported);
            _fScopes.scopes[scope].has_star_import = true;
            return kNoIndex;
        case ERole::kParameter:
            return _AddFlags(scope, name, CSymbol::kIsParameter);
        case ERole::kTypeParameter:
            return _AddTypeParameter(scope, occurrence.name);
        case ERole::kGlobal:
            _AddFlags(0, name, CSymbol::kIsDeclaredGlobal);
            return _AddFlags(scope, name, CSymbol::kIsDeclaredGlobal);
        case ERole::kNonlocal:
            return _AddFlags(scope, name, CSymbol::kIsDeclaredNonlocal);
        default:
            break;
    }
    if ((occurrence.flags & COccurrence::kIsIdle) != 0) return _AddFlags(scope, name, 0);
    if ((occurrence.flags & COccurrence::kIsWalrus) != 0 && IsComprehensionScope(_fScopes.scopes[scope].kind))
        return _AddWalrus(scope, name);
    const bool is_annotated = (occurrence.flags & COccurrence::kIsAnnotated) != 0;
    return _AddFlags(scope, name, CSymbol::kIsAssigned | (is_annotated ? CSymbol::kIsAnnotated : 0));
}

uint32_t CScopeBuilder::_AddTypeParameter(uint32_t scope, uint32_t name) {
    const CScope& of = _fScopes.scopes[scope];
    const bool is_mangled = of.is_of_class && _fIsPrivate[name] != 0;
    return _AddFlags(scope, is_mangled ? _MangledBy(of, name) : _Mangled(name, scope),
                     CSymbol::kIsTypeParameter | CSymbol::kIsAssigned);
}

// In a comprehension `:=` binds in the function or the module around.
uint32_t CScopeBuilder::_AddWalrus(uint32_t scope, uint32_t name) {
    uint32_t around = scope;
    while (IsComprehensionScope(_fScopes.scopes[around].kind)) around = _fScopes.scopes[around].parent;
    const bool is_global =
        _fScopes.scopes[around].kind == EScopeKind::kModule ||
        (_AddFlags(around, name, 0),
         _fScopes.symbols[_fSymbols.Find(around, name)].flags == CSymbol::kIsDeclaredGlobal);
    const bool is_module = _fScopes.scopes[around].kind == EScopeKind::kModule;
    if (is_global) _AddFlags(0, name, CSymbol::kIsDeclaredGlobal);
    if (!is_module) _AddFlags(around, name, CSymbol::kIsAssigned);
    const uint16_t declared = is_global ? CSymbol::kIsDeclaredGlobal : CSymbol::kIsDeclaredNonlocal;
    return _AddFlags(scope, name, declared | CSymbol::kIsAssigned);
}

uint32_t CScopeBuilder::_AddFlags(uint32_t scope, uint32_t name, uint16_t flags) {
    const uint32_t symbol_i = _fSymbols.FindOrAdd(scope, name);
    _fScopes.symbols[symbol_i].flags |= flags;
    return symbol_i;
}

// Inner scopes end where the last of them does.
void CScopeBuilder::_NoteNamespaces() {
    const uint32_t no_name = _fScopes.scopes[0].name;
    for (size_t i = _fScopes.scopes.size(); i-- > 1;) {
        const CScope& scope = _fScopes.scopes[i];
        CScope& parent = _fScopes.scopes[scope.parent];
        parent.end = std::max(parent.end, scope.end);
        if (scope.name == no_name || scope.is_lost) continue;
        const uint32_t symbol_i = _fSymbols.Find(scope.parent, _Mangled(scope.name, scope.parent));
        if (symbol_i != kNoIndex) _fScopes.symbols[symbol_i].flags |= CSymbol::kIsNamespace;
    }
}

// Where symbols are bound

void CScopeBuilder::_Resolve() {
    _NoteNamesBoundAround();
    const size_t count = _fScopes.symbols.size();
    for (uint32_t i = 0; i < count; ++i) _ResolveOne(i);
}

void CScopeBuilder::_NoteNamesBoundAround() {
    _fIsBoundAround.resize(_fNames.occurrences.names->Count());
    for (const CSymbol& symbol : _fScopes.symbols)
        if (symbol.scope != 0 && symbol.MayBeBound() &&
            _fScopes.scopes[symbol.scope].kind != EScopeKind::kClass)
            _fIsBoundAround[symbol.name] = 1;
    _fIsBoundAround[_fClassCell] = 1;
}

void CScopeBuilder::_ResolveOne(uint32_t symbol_i) {
    const CSymbol& symbol = _fScopes.symbols[symbol_i];
    if (symbol.Is(CSymbol::kIsDeclaredGlobal)) {
        const bool is_bound = (symbol.flags & CSymbol::kIsBound) != 0;
        const uint32_t home = _fSymbols.FindOrAdd(0, symbol.name);
        if (is_bound && home != symbol_i) _fScopes.symbols[home].flags |= CSymbol::kIsBoundElsewhere;
        return _Bind(symbol_i, EBinding::kGlobalExplicit, home);
    }
    if (symbol.MayBeBound() && !symbol.Is(CSymbol::kIsDeclaredNonlocal))
        return _Bind(symbol_i, EBinding::kLocal, symbol_i);
    if (symbol.scope == 0) return _Bind(symbol_i, EBinding::kGlobalImplicit, symbol_i);
    _LookUp(symbol_i);
}

void CScopeBuilder::_LookUp(uint32_t symbol_i) {
    if (_LookUpInClass(symbol_i)) return;
    const uint32_t name = _fScopes.symbols[symbol_i].name;
    const uint32_t home = _FindAround(_fScopes.symbols[symbol_i].scope, name);
    if (home != kNoIndex) {
        _Bind(symbol_i, EBinding::kFree, home);
        return _PassOn(symbol_i, home);
    }
    _Bind(symbol_i, EBinding::kGlobalImplicit, _fSymbols.FindOrAdd(0, name));
}

// What is annotated in a class, at any depth, sees the names of the class. The interpreter has them as global
// ones, since the class isn't a function.
bool CScopeBuilder::_LookUpInClass(uint32_t symbol_i) {
    uint32_t scope = _fScopes.symbols[symbol_i].scope;
    if (!IsAnnotationScope(_fScopes.scopes[scope].kind)) return false;
    const CSymbol symbol = _fScopes.symbols[symbol_i];
    while (IsAnnotationScope(_fScopes.scopes[scope].kind)) {
        scope = _fScopes.scopes[scope].parent;
        const uint32_t found_i = _fSymbols.Find(scope, symbol.name);
        const bool is_class = _fScopes.scopes[scope].kind == EScopeKind::kClass;
        if (!is_class && found_i != kNoIndex && _fScopes.symbols[found_i].MayBeBound()) return false;
    }
    if (_fScopes.scopes[scope].kind != EScopeKind::kClass) return false;
    const uint32_t of_class_i = _fSymbols.Find(scope, symbol.name);
    if (of_class_i == kNoIndex) return false;
    const CSymbol& of_class = _fScopes.symbols[of_class_i];
    if (of_class.Is(CSymbol::kIsDeclaredGlobal)) {
        _Bind(symbol_i, EBinding::kGlobalExplicit, _fSymbols.FindOrAdd(0, symbol.name));
        return true;
    }
    if (!of_class.MayBeBound() || of_class.Is(CSymbol::kIsDeclaredNonlocal)) return false;
    _Bind(symbol_i, EBinding::kGlobalImplicit, of_class_i);
    return true;
}

// The symbol of the nearest function around `scope` that binds the name, up to one that declares it global.
uint32_t CScopeBuilder::_FindAround(uint32_t scope, uint32_t name) {
    if (_fIsBoundAround[name] == 0) return kNoIndex;
    for (scope = _fScopes.scopes[scope].parent; scope != 0; scope = _fScopes.scopes[scope].parent) {
        if (_fScopes.scopes[scope].kind == EScopeKind::kClass) {
            if (name == _fClassCell) return _AddFlags(scope, name, CSymbol::kIsBoundElsewhere);
            continue;
        }
        const uint32_t found_i = _fSymbols.Find(scope, name);
        if (found_i == kNoIndex) continue;
        const CSymbol& found = _fScopes.symbols[found_i];
        if (found.Is(CSymbol::kIsDeclaredGlobal)) return kNoIndex;
        if (!found.Is(CSymbol::kIsDeclaredNonlocal) && found.MayBeBound()) return found_i;
    }
    return kNoIndex;
}

void CScopeBuilder::_Bind(uint32_t symbol_i, EBinding binding, uint32_t home) {
    _fScopes.symbols[symbol_i].binding = binding;
    _fScopes.symbols[symbol_i].home = home;
}

// The scopes between one that uses a name and the one that binds it hand it on, but for what is text only.
void CScopeBuilder::_PassOn(uint32_t symbol_i, uint32_t home) {
    const uint32_t name = _fScopes.symbols[symbol_i].name;
    const uint32_t last = _fScopes.symbols[home].scope;
    uint32_t scope = _fScopes.symbols[symbol_i].scope;
    while (!_fScopes.scopes[scope].is_text && (scope = _fScopes.scopes[scope].parent) != last) {
        const size_t count = _fScopes.symbols.size();
        const uint32_t passed_i = _fSymbols.FindOrAdd(scope, name);
        if (_fScopes.symbols.size() == count) continue;
        _fScopes.symbols[passed_i].flags = CSymbol::kIsPassedOn;
        _Bind(passed_i, EBinding::kFree, home);
    }
}

}  // namespace

void BuildScopes(CTextNames& names) {
    CScopeBuilder(names).Run();
}

void CTextNames::Shrink() {
    occurrences.items.Shrink();
    occurrences.scopes.Shrink();
    lines.Shrink();
    scopes.scopes.Shrink();
    scopes.symbols.Shrink();
}

uint32_t CTextNames::LineOfOccurrence(uint32_t occurrence_i) const {
    const auto next =
        std::upper_bound(lines.begin(), lines.end(), occurrence_i,
                         [](uint32_t i, const CLineNames& line) { return i < line.first_occurrence; });
    return static_cast<uint32_t>(next - lines.begin()) - 1;
}

}  // namespace codeloom
