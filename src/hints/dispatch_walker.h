// hints/: nodes and comments into type hints.
//   in     the typed tree of one line, and its CLogicalLine
//   out    hint records appended to that line
//   keeps  nothing from one line to the next, but its limits
//   start  at CTypeHintWalker::Walk
//
// The dispatch walker calls a visit for each node by the node's exact class. A visit that returns true, or no
// visit at all, has the children visited; the False object in place of a visit skips a class and its
// children.
#pragma once

#include <vector>

#include <nanobind/nanobind.h>

#include "hints/dispatch_table.h"
#include "neighbours/logicalline/logical_line.h"
#include "walker/walk_limits.h"

namespace codeloom {

class CDispatchWalker : public CHosted {
  public:
    // `dispatch_dict` maps node classes to callables of (walker, node), or to False; it may be none.
    void Init(nb::object dispatch_dict);

    OPERATIONS_OF(CDispatchWalker, CNoOperations)
    OPERATION(
        void, Walk, (CNodeRef node, CLogicalLine& logical, bool first_in_def),
        "Walk the tree. This can raise SyntaxError in cases where code parses but is rejected because it's "
        "ambiguous. ValueError while a walk is under way.",
        "node"_a.none(), "logical"_a, "first_in_def"_a);
    OPERATION(void, _VisitNode, (CNodeRef node),
              "Visit the node and all children. Dispatches to a visit method based on node type.",
              "node"_a.none());
    END_OPERATIONS

    nb::object GetDispatchDict() const { return _fDispatch.Dict(); }
    nb::list GetNodeStack() const;

    template <class Visitor>
    void References(Visitor&& visit) {
        visit(_fLogical);
        _fDispatch.References(visit);
        for (CNodeRef& node : _fNodeStack) visit(node);
    }

    CRef<CLogicalLine> _fLogical;  // the line being walked; none between walks

  protected:
    // For a class that has visits of its own.
    void InitWithVisits(nb::dict dispatch_dict, std::vector<CNativeVisit> native_visits);

  private:
    bool _IsIdleLeaf(const CNode& node);
    bool _AreChildrenWanted(const CNodeRef& node);
    void _VisitChildren(const CNodeRef& node);

    CDispatchTable _fDispatch;
    bool _fIsNative = false;  // no host subclass, whose override of _VisitNode wants every node
    CVisitLimits _fLimits;
    std::vector<CNodeRef> _fNodeStack;  // from the root to the node now visited
};

void BindDispatchWalker(nb::module_& module);

}  // namespace codeloom
