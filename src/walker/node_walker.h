// walker/: what one logical line does with names.
//   in     the typed tree of one line, and its CLogicalLine
//   out    records appended to that line
//   keeps  nothing from one line to the next, but its limits
//   start  at CNodeWalker::Walk, then _VisitNode
// So far the walk visits every node under its limits and records nothing.
#pragma once

#include <nanobind/nanobind.h>

#include "neighbours/logicalline/logical_line.h"
#include "tree/node.h"
#include "walker/walk_limits.h"

namespace codeloom {

class CNodeWalker : public CHosted {
  public:
    void Init(nb::tuple version_triple);

    virtual void Walk(CNodeRef node, CLogicalLine& logical);
    virtual void _VisitChildren(CNode& node);
    virtual void _VisitNode(CNode& node);

    template <class Visitor>
    void References(Visitor&& visit) {
        visit(_fLogical);
    }

    bool _fPy3 = true;  // the analysed language is 3.0 or later

  private:
    CRef<CLogicalLine> _fLogical;  // the line being walked; it guards against re-entry
    int _fVisitCount = 0;
    int _fRecurseCount = 0;
};

template <class Class>
class TNodeWalkerOperations : public Class {
    FIRST_OPERATIONS
    OPERATION(Walk,
              "Walk the tree of a logical line and record on the line what it says. ValueError while a walk "
              "is under way.",
              "node"_a.none(), "logical"_a)
    OPERATION(_VisitChildren, "Visit each direct child, in order.", "node"_a)
    OPERATION(_VisitNode, "Visit a node: count, limit, dispatch.", "node"_a)
    END_OPERATIONS
};

void BindNodeWalker(nb::module_& module);

}  // namespace codeloom
