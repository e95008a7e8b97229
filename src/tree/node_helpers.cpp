#include "tree/node_helpers.h"

#include "host/errors.h"

namespace codeloom {

namespace {

// Counts the steps down a chain of parentheses: a tree that a host made may contain itself.
class CDescent {
  public:
    void Step() {
        if (++_fDepth > kMaxDepth) RaiseHost(PyExc_RecursionError, "a node contains itself");
    }

  private:
    static constexpr int kMaxDepth = 1'000'000;
    int _fDepth = 0;
};

// The node within `( ... )`, tuples and generators too; empty for anything else.
CNodeRef InnerOfParens(CNode& node) {
    const bool is_filled_paren =
        node.As<CAtom>() != nullptr && node.ChildCount() == CAtom::kFilledChildCount && node.IsToken(0, "(");
    return is_filled_paren ? node.GetChild(CAtom::kContentsIndex) : CNodeRef();
}

bool IsGrouping(const CNode& inner) {
    return inner.As<CTestListStarExpr>() == nullptr && inner.As<CCompForNode>() == nullptr;
}

}  // namespace

CNodeRef DropSimpleParens(CNode& node) {
    CDescent descent;
    CNodeRef result(&node);
    for (;;) {
        CNodeRef inner = InnerOfParens(*result);
        if (!inner || !IsGrouping(*inner)) return result;
        result = std::move(inner);
        descent.Step();
    }
}

std::optional<std::vector<CNodeRef>> ExpandSeqLiteral(CNode& node) {
    const CNodeRef sequence = DropSimpleParens(node);
    if (sequence->As<CAtom>() == nullptr || !sequence->IsToken(0, "(")) return std::nullopt;
    std::vector<CNodeRef> elements;
    if (sequence->ChildCount() == 2) return elements;
    const CNodeRef contents = sequence->GetChild(CAtom::kContentsIndex);
    CTestListStarExpr* const list = contents->As<CTestListStarExpr>();
    if (list == nullptr) return std::vector{contents};
    const int count = list->GetSubExprCount();
    for (int i = 0; i < count; ++i) elements.emplace_back(list->GetSubExpr(i).get());
    return elements;
}

bool IsDottedName(CNode& node) {
    const CRecursionScope recursion;  // a tree that a host made may contain itself
    const CNodeRef shown = DropSimpleParens(node);
    if (shown->As<CNameLiteral>() != nullptr) return true;
    if (CAtomExpr* const chain = shown->As<CAtomExpr>())
        return !chain->GetPrefix() && IsDottedChain(PartsOf(*chain));
    CPower* const power = shown->As<CPower>();
    return power != nullptr && !power->GetExponentNode() && IsDottedChain(PartsOf(*power));
}

bool IsDottedChain(const CChainParts& chain) {
    const auto& [atom, trailers] = chain;
    for (Py_ssize_t i = 0; i < trailers.Size(); ++i)
        if (trailers.At<CTrailer>(i)->GetDotName().is_none()) return false;
    // Parentheses before a trailer aren't simple.
    return trailers.Size() == 0 ? IsDottedName(*atom) : atom->As<CNameLiteral>() != nullptr;
}

bool IsSetLiteral(CAtom& atom_node) {
    const bool is_filled_brace =
        TextIs(atom_node.GetInitialBracket(), "{") && atom_node.ChildCount() == CAtom::kFilledChildCount;
    return is_filled_brace && !atom_node.ChildAt(CAtom::kContentsIndex).HasToken(":");
}

bool IsGenExpression(CAtom& atom_node) {
    const bool is_filled_paren =
        atom_node.ChildCount() == CAtom::kFilledChildCount && TextIs(atom_node.GetInitialBracket(), "(");
    return is_filled_paren && atom_node.ChildAt(CAtom::kContentsIndex).HasToken("for");
}

bool IsTupleLiteralNode(CNode& node) {
    CDescent descent;
    CNodeRef inner(&node);
    while (CAtom* const atom = inner->As<CAtom>()) {
        if (!TextIs(atom->GetInitialBracket(), "(")) return false;
        if (atom->ChildCount() == 2) return true;
        HostAssert(atom->ChildCount() == CAtom::kFilledChildCount);
        inner = atom->ChildAs<CNode>(CAtom::kContentsIndex);
        descent.Step();
    }
    return inner->As<CTestListStarExpr>() != nullptr && inner->HasToken(",");
}

void BindNodeHelpers(nb::module_& module) {
    module.def(
        "DropSimpleParens", &DropSimpleParens, "node"_a,
        nb::sig("def DropSimpleParens(node: CNode) -> CNode"),
        " If node is a parenthesized expression ( test ), return the\n    inner test node.  Otherwise, "
        "return the original node. ");
    module.def("IsSetLiteral", &IsSetLiteral, "atom_node"_a,
               "True for a set display. ValueError for an atom without children.");
    module.def(
        "IsGenExpression", &IsGenExpression, "atom_node"_a,
        "True for a generator in its parentheses under a grammar that has its `for` right in them. "
        "Where the\n`for` is a node of its own, as in both grammars here, False: ask IsComprehension.");
    module.def("IsTupleLiteralNode", &IsTupleLiteralNode, "node"_a,
               "True for a tuple, in any number of parentheses or none. AssertionError for parentheses that "
               "hold more\nthan one node, ValueError for an atom without children.");
}

}  // namespace codeloom
