// Makes every node: from the free list of its record, or new.
#pragma once

#include <vector>

#include <nanobind/nanobind.h>

#include "host/binding.h"
#include "host/key_filter.h"
#include "neighbours/optpgen/object_stack.h"
#include "tree/node.h"

namespace codeloom {

class CNodeFactory : public CHosted {
  public:
    // `gram.number2symbol` names the grammar states, `tok_number2name` the token types; `cls_for_nodetype`
    // gives the class for each; `keywords` is a dictionary or any false value, shared and not copied.
    void Init(nb::object gram, nb::object cls_for_nodetype, nb::object keywords, nb::object tok_number2name,
              nb::object op_text2number);

    OPERATIONS_OF(CNodeFactory, CNoOperations)
    OPERATION(CNodeRef, ConvertSingleNode,
              (int type, nb::handle text, nb::handle context, nb::handle children),
              "The node for a token (children None) or a completed rule (a list of at least two nodes). A\n"
              "statement followed by its newline is the statement itself.",
              "type"_a, "text"_a.none(), "context"_a.none(), "children"_a.none());
    OPERATION(CNodeRef, NewNode,
              (CNodeClassInfo& clsinfo, int type, nb::handle text, nb::handle context, nb::handle children),
              "A node of the record `clsinfo`, from its free list or new; `type` is ignored.", "clsinfo"_a,
              "type"_a, "text"_a.none(), "context"_a.none(), "children"_a.none());
    OPERATION(CNodeRef, NewKeywordNode, (nb::handle text, nb::handle context),
              "A leaf for a keyword; AttributeError on a factory without keywords.", "text"_a.none(),
              "context"_a.none());
    OPERATION(CNodeRef, NewNameNode, (nb::handle text, nb::handle context), "A CNameLiteral leaf.",
              "text"_a.none(), "context"_a.none());
    OPERATION(CNodeRef, CreateOperatorNode, (nb::handle text, nb::handle context),
              "A leaf for an operator; None when `text` isn't one.", "text"_a.none(), "context"_a.none());
    OPERATION(void, DiscardNodes, (nb::handle node), "Give the tree under `node` back to the free lists.",
              "node"_a.none());
    OPERATION(CNodeRef, RecursiveConvert, (nb::tuple raw),
              "Convert a raw tree of (type, text, context, children) tuples.", "raw"_a);
    END_OPERATIONS

    // ConvertSingleNode for native parsers, whose factory has no overrides: for a token, and for a rule whose
    // children, all of them nodes, are on a stack from `first` to its top. They leave it.
    CNodeRef ConvertToken(int type, nb::handle text, nb::handle context) {
        return _NewLeaf(_RecordFor(type, text), text, context);
    }
    CNodeRef ConvertRule(int type, nb::handle context, CObjectStack& stack, size_t first);

    nb::list GetClassInfoList() const;

    template <class Visitor>
    void References(Visitor&& visit) {
        for (CRef<CNodeClassInfo>& info : _fClassInfoList) visit(info);
        visit(_fKeywordClassInfo);
        visit(_fKeywords);
        visit(_fOperatorStrToNumber);
    }

    nb::object _fOperatorStrToNumber = nb::none();  // operator text to token type

  private:
    static CNodeRef _FreeNode(CNodeClassInfo& clsinfo);
    static CNodeRef _NewLeaf(CNodeClassInfo& clsinfo, nb::handle text, nb::handle context);
    CNodeClassInfo& _ClassInfo(Py_ssize_t type) const;
    CNodeClassInfo& _RecordFor(int type, nb::handle text) const;

    std::vector<CRef<CNodeClassInfo>> _fClassInfoList;  // by node type: token types and grammar states alike
    CRef<CNodeClassInfo> _fKeywordClassInfo;            // one for all keywords; empty without keywords
    nb::object _fKeywords = nb::none();                 // keyword texts as keys
    mutable CKeyFilter _fKeywordFilter;                 // of _fKeywords
};

}  // namespace codeloom
