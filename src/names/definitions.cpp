// Statements that define names without an assignment. Of a `def` or a `class` only the header is read.
#include "syntax/definitions.h"

#include "names/name_walker.h"
#include "names/record_kinds.h"
#include "syntax/statements.h"

namespace codeloom {

namespace {

// The header of a class or a def.
bool OpensScope(const CRawLogical& line) {
    return line.type == ELogicalType::kClassDef || line.type == ELogicalType::kFunctionDef;
}

// `a` of `a.b`
const CTreeNode& FirstPart(const CTree& tree, const CTreeNode& name) {
    return name.IsLeaf() ? name : tree.Child(name, 0);
}

}  // namespace

// Imports

// `import a.b` binds `a` and records `a`; `import a.b as c` binds `c` and records `a.b`.
void CNameWalker::_VisitImport(const CTreeNode& node) {
    if (!_IsRecording()) return;
    ForEachImportedName(*_fTree, NamesOfImport(*_fTree, node), [&](const CImportedName& imported) {
        const bool has_as = imported.as_name != nullptr;
        const CTreeNode& bound = has_as ? *imported.as_name : FirstPart(*_fTree, *imported.name);
        const uint32_t name = _NumberOfLeaf(bound);
        const CSpan place = SpanOfLeaf(*_fTree, bound);
        _AddPlain(name, kSetKind, place);
        const size_t value = _BeginValue();
        AppendLeafTexts(*_fTree, has_as ? *imported.name : bound, _fRecords->values);
        _RecordImported(name, imported, place, kImportKind, value);
    });
}

void CNameWalker::_VisitFromImport(const CTreeNode& node) {
    if (!_IsRecording()) return;
    const auto append_module = [&] {
        for (const CTreeNode& part : ModuleOfFromImport(*_fTree, node))
            AppendLeafTexts(*_fTree, part, _fRecords->values);
        _fRecords->values += ' ';
    };
    if (const CTreeNode* const star = StarOfFromImport(*_fTree, node)) {
        const size_t value = _BeginValue();
        append_module();
        _fRecords->values += '*';
        return _Add(_Number("*"), kFromImportKind, SpanOfLeaf(*_fTree, *star), value);
    }
    ForEachImportedName(*_fTree, NamesOfFromImport(*_fTree, node), [&](const CImportedName& imported) {
        const CTreeNode& bound = imported.as_name != nullptr ? *imported.as_name : *imported.name;
        const uint32_t name = _NumberOfLeaf(bound);
        const CSpan place = SpanOfLeaf(*_fTree, bound);
        _AddPlain(name, kSetKind, place);
        const size_t value = _BeginValue();
        append_module();
        AppendLeafTexts(*_fTree, *imported.name, _fRecords->values);
        _RecordImported(name, imported, place, kFromImportKind, value);
    });
}

void CNameWalker::_RecordImported(uint32_t name, const CImportedName& imported, CSpan place, char kind,
                                  size_t value) {
    _Add(name, kind, place, value);
    if (imported.as_name == nullptr) return;
    const size_t as_value = _BeginValue();
    _fRecords->values += _fTree->Text(*imported.as_name);
    _Add(name, kImportAsNameKind, place, as_value);
}

// Functions

void CNameWalker::_VisitFuncdef(const CTreeNode& node) {
    if (_IsRecording()) {
        const CTreeNode& name = NameOfFuncdef(*_fTree, node);
        _AddPlain(_NumberOfLeaf(name), kSetKind, SpanOfLeaf(*_fTree, name));
    }
    _VisitParameters(ParametersOfFuncdef(*_fTree, node));
    if (const CTreeNode* const result = ReturnTypeOfFuncdef(*_fTree, node)) _VisitNode(*result);
}

void CNameWalker::_VisitParameters(const CTreeNode& node) {
    const CNesting nesting(_fNesting);
    ForEachParameter(*_fTree, node, [&](const CParameter& parameter) {
        if (parameter.nested != nullptr) {
            _VisitParameters(*parameter.nested);
        } else if (parameter.name != nullptr) {
            _VisitParameter(parameter);
        }
    });
}

void CNameWalker::_VisitParameter(const CParameter& parameter) {
    if (_IsRecording()) {
        const uint32_t name = _NumberOfLeaf(*parameter.name);
        const CSpan place = SpanOfLeaf(*_fTree, *parameter.name);
        _AddPlain(name, kSetKind, place, true);
        if (parameter.value != nullptr) {
            _AddEquiv(name, *parameter.value, place, true);
        } else if (parameter.stars != EStars::kNone) {
            const size_t value = _BeginValue();
            const char kind = _AppendLiteral(parameter.stars == EStars::kOne ? "tuple" : "dict");
            _Add(name, kind, place, value, true);
        }
    }
    if (parameter.value != nullptr) _VisitNode(*parameter.value);
    if (parameter.type_expr != nullptr) _VisitNode(*parameter.type_expr);
}

void CNameWalker::_VisitLambda(const CTreeNode& node) {
    if (const CTreeNode* const parameters = ParametersOfLambda(*_fTree, node))
        _VisitLambdaParameters(*parameters);
    _VisitNode(BodyOfLambda(*_fTree, node));
}

// They are bound within the expression.
void CNameWalker::_VisitLambdaParameters(const CTreeNode& node) {
    const CNesting nesting(_fNesting);
    ForEachParameter(*_fTree, node, [&](const CParameter& parameter) {
        if (parameter.nested != nullptr) return _VisitLambdaParameters(*parameter.nested);
        if (parameter.name != nullptr) _VisitIn(EContext::kStoreWithin, *parameter.name);
        if (parameter.value != nullptr) _VisitNode(*parameter.value);
    });
}

// Classes and scopes

void CNameWalker::_VisitClassdef(const CTreeNode& node) {
    if (_IsRecording()) {
        const CTreeNode& name = NameOfClassdef(*_fTree, node);
        _AddPlain(_NumberOfLeaf(name), kSetKind, SpanOfLeaf(*_fTree, name));
    }
    const CTreeNode* const bases = BasesOfClassdef(*_fTree, node);
    if (bases == nullptr) return;
    ForEachArgument(*_fTree, *bases, [&](const CArgumentParts& base) { _VisitNode(*base.value); });
}

void CNameWalker::_RecordDeclared(const CTreeNode& node, char kind) {
    if (!_IsRecording()) return;
    ForEachDeclaredName(*_fTree, node, [&](const CTreeNode& name) {
        _AddPlain(_NumberOfLeaf(name), kind, SpanOfLeaf(*_fTree, name));
    });
}

// A bound comes after the stars: "*" of `*Ts`, "int" of `T: int`. On a line that opens no scope, such as
// `type X[T] = int`, the parameter leaves no record.
void CNameWalker::_VisitTypeParameter(const CTreeNode& node) {
    const CTreeNode* const spec = SpecOfTypeParameter(*_fTree, node);
    if (spec != nullptr) _VisitNode(*spec);
    if (!_IsRecording() || !OpensScope(_fTree->Line())) return;
    const EStars stars = StarsOfTypeParameter(*_fTree, node);
    const size_t value = _BeginValue();
    if (stars != EStars::kNone) _fRecords->values += _fTree->Text(_fTree->Child(node, 0));
    if (spec != nullptr) {
        if (stars != EStars::kNone) _fRecords->values += ' ';
        CNodeText(*_fTree).Append(*spec, _fRecords->values);
    }
    const CTreeNode& name = NameOfTypeParameter(*_fTree, node);
    _Add(_NumberOfLeaf(name), kTypeParameterKind, SpanOfLeaf(*_fTree, name), value, true);
}

}  // namespace codeloom
