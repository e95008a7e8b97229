// Parameters of definitions and arguments of calls, one by one, whatever shape the grammar gave them.
#pragma once

#include "syntax/expressions.h"

namespace codeloom {

enum class EStars : uint8_t { kNone, kOne, kTwo };

inline EStars StarsOf(const CTreeNode& token) {
    if (IsToken(token, kTokenId_STAR)) return EStars::kOne;
    return IsToken(token, kTokenId_DOUBLESTAR) ? EStars::kTwo : EStars::kNone;
}

// The arguments of a call

// One argument that isn't a plain expression
//   child    name  '='  value
//   child    name  ':='  value
//   child    '*' or '**'  value
//   child    value  comprehension
inline EStars StarsOfArgument(const CTree& tree, const CTreeNode& argument) {
    return argument.Is(ENodeKind::kUsedArgument) ? StarsOf(tree.Child(argument, 0)) : EStars::kNone;
}

inline bool IsNamedArgument(const CTree& tree, const CTreeNode& argument) {
    return argument.Is(ENodeKind::kUsedArgument) && HasTokenAt(tree, argument, 1, kTokenId_EQUAL);
}

// `f(a := b)`
inline bool IsAssigningArgument(const CTree& tree, const CTreeNode& argument) {
    return argument.Is(ENodeKind::kUsedArgument) && HasTokenAt(tree, argument, 1, kTokenId_COLONEQUAL);
}

// `f(a for b in c)`
inline bool IsBareGenerator(const CTree& tree, const CTreeNode& argument) {
    return argument.Is(ENodeKind::kUsedArgument) && argument.child_count == 2 &&
           TryChild(tree, argument, 1, ENodeKind::kCompFor) != nullptr;
}

// What a call passes.
struct CArgumentParts {
    const CTreeNode* name = nullptr;   // before `=`
    const CTreeNode* value = nullptr;  // after `=`; otherwise the argument itself
    EStars stars = EStars::kNone;      // not set for a lone argument, see StarsOfArgument
};

inline CArgumentParts PartsOfArgument(const CTree& tree, const CTreeNode& argument) {
    if (!IsNamedArgument(tree, argument)) return {nullptr, &argument, EStars::kNone};
    return {&tree.Child(argument, 0), &tree.Child(argument, 2), EStars::kNone};
}

// `a, b=1, *c` in a call, in the parentheses of a class too
//   child    argument  ','  argument ...
// In the 2.7 grammar `*` and `**` are children too, before their argument.
inline bool IsArgumentList(const CTreeNode& arguments) {
    return arguments.Is(ENodeKind::kUsedArglist) || arguments.Is(ENodeKind::kTestList);
}

// Calls visit(parts) for each argument of a list or of the lone one that is in its place.
template <class Visit>
void ForEachArgument(const CTree& tree, const CTreeNode& arguments, Visit visit) {
    if (!IsArgumentList(arguments)) return visit(PartsOfArgument(tree, arguments));
    CArgumentParts current;
    for (const CTreeNode& child : tree.Children(arguments)) {
        if (IsToken(child, kTokenId_COMMA)) {
            visit(current);
            current = {};
        } else if (child.Is(ENodeKind::kUsedArgument)) {
            current = PartsOfArgument(tree, child);
            current.stars = StarsOfArgument(tree, child);
        } else if (const EStars stars = StarsOf(child); stars != EStars::kNone) {
            current.stars = stars;
        } else {
            current.value = &child;
        }
    }
    if (current.value != nullptr) visit(current);
}

uint32_t CountArguments(const CTree& tree, const CTreeNode& arguments);

// The parameters of a definition

struct CParameter {
    const CTreeNode* name = nullptr;
    const CTreeNode* value = nullptr;      // the default
    const CTreeNode* type_expr = nullptr;  // the annotation
    EStars stars = EStars::kNone;
    const CTreeNode* nested = nullptr;  // the parameters of the old tuple form, which has nothing else
};

// `name: annotation`, and in the 2.7 grammar `(a, b)`; or a name alone
//   child    name  ':'  annotation
//   child    '('  parameters  ')'
CParameter PartsOfParameter(const CTree& tree, const CTreeNode& parameter);

// Reads a list of parameters, child by child.
//   child    ['*' or '**']  parameter  ['='  default]  ','  parameter ...
// A bare `*` and a `/` are without a parameter.
class CParameterReader {
  public:
    explicit CParameterReader(const CTree& tree) : _fTree(tree) {}

    // Calls visit(parameter) when the child completes one, the child after the last one being null.
    template <class Visit>
    void Read(const CTreeNode* child, Visit& visit) {
        if (child == nullptr || IsToken(*child, kTokenId_COMMA)) {
            if (_fCurrent.name != nullptr || _fCurrent.stars != EStars::kNone) visit(_fCurrent);
            _fCurrent = {};
            _fPart = EPart::kName;
        } else if (child->Is(ENodeKind::kParameterDef)) {
            const CParameter parts = PartsOfParameter(_fTree, *child);
            if (parts.nested != nullptr) return visit(parts);
            _fCurrent.name = parts.name;
            _fCurrent.type_expr = parts.type_expr;
        } else {
            _ReadPart(*child);
        }
    }

  private:
    enum class EPart : uint8_t { kName, kAnnotation, kDefault };

    void _ReadPart(const CTreeNode& child);

    const CTree& _fTree;
    CParameter _fCurrent;
    EPart _fPart = EPart::kName;
};

// Calls visit(parameter) for each parameter of a definition: `node` is its kParameters, its list, or a lone
// parameter.
template <class Visit>
void ForEachParameter(const CTree& tree, const CTreeNode& node, Visit visit) {
    const CTreeNode* list = &node;
    if (node.Is(ENodeKind::kParameters)) {
        if (node.child_count == 2) return;
        list = &tree.Child(node, 1);
    }
    if (!list->Is(ENodeKind::kDefiningArglist)) return visit(PartsOfParameter(tree, *list));
    CParameterReader reader(tree);
    for (const CTreeNode& child : tree.Children(*list)) reader.Read(&child, visit);
    reader.Read(nullptr, visit);
}

}  // namespace codeloom
