#include "tree/node_factory.h"

#include "host/errors.h"
#include "text/token_type.h"
#include "tree/atom_nodes.h"
#include "tree/recycling.h"

namespace codeloom {

namespace {

bool IsTextOrNone(nb::handle text) {
    return text.is_none() || IsText(text);
}

nb::object NameOfType(nb::handle gram, nb::handle tok_number2name, Py_ssize_t type) {
    nb::object name = gram.attr("number2symbol").attr("get")(type);
    return name.is_none() ? nb::object(tok_number2name.attr("get")(type)) : name;
}

CRef<CNodeClassInfo> NewClassInfo(nb::object cls, int type, nb::object name) {
    CRef<CNodeClassInfo> info = MakeInstance<CNodeClassInfo>();
    info->Init(std::move(cls), type, std::move(name));
    return info;
}

bool IsNewline(const CNode& node) {
    return node.fClsInfo && node.fClsInfo->fNodeType == kTokenId_NEWLINE;
}

// A statement and the newline after it.
bool IsStatementLine(nb::handle text, nb::handle children) {
    return text.is_none() && ListSize(children) == 2 && IsNewline(*Instance<CNode>(ListItem(children, 1)));
}

CNodeRef TakeNode(CObjectStack& stack, size_t i) {
    CNode* const node = nb::inst_ptr<CNode>(stack.At(i));
    return CNodeRef::Steal(node, stack.Take(i));
}

}  // namespace

void CNodeFactory::Init(nb::object gram, nb::object cls_for_nodetype, nb::object keywords,
                        nb::object tok_number2name, nb::object op_text2number) {
    _fKeywords = nb::dict();
    _fOperatorStrToNumber = nb::borrow(reinterpret_cast<PyObject*>(&PyDict_Type))(op_text2number);
    int type = 0;
    for (nb::handle cls : cls_for_nodetype) {
        _fClassInfoList.push_back(
            NewClassInfo(nb::borrow(cls), type, NameOfType(gram, tok_number2name, type)));
        ++type;
    }
    if (!nb::cast<bool>(nb::bool_(keywords))) return;
    if (!nb::isinstance<nb::dict>(keywords)) RaiseWrongType("dict", keywords);
    _fKeywordClassInfo =
        NewClassInfo(nb::borrow(nb::type<CKeywordLiteral>()), kTokenId_NAME, nb::str("KEYWORD"));
    _fKeywords = std::move(keywords);
}

CNodeRef CNodeFactory::ConvertSingleNode(int type, nb::handle text, nb::handle context, nb::handle children) {
    if (children.is_none()) return NewNode(_RecordFor(type, text), type, text, context, children);
    const nb::object node_list = ListOrNone(children);
    HostAssert(ListSize(node_list) >= 2);
    CNodeClassInfo& record = _RecordFor(type, text);
    if (!IsStatementLine(text, node_list)) return NewNode(record, type, text, context, node_list);
    CNodeRef statement(Instance<CNode>(ListItem(node_list, 0)));
    DiscardNodes(ListItem(node_list, 1));
    return statement;
}

CNodeRef CNodeFactory::NewNode(CNodeClassInfo& clsinfo, int, nb::handle text, nb::handle context,
                               nb::handle children) {
    nb::object node_list = ListOrNone(children);
    CNodeRef node = _NewLeaf(clsinfo, text, context);
    node->fChildren.SetList(std::move(node_list));
    return node;
}

CNodeRef CNodeFactory::_NewLeaf(CNodeClassInfo& clsinfo, nb::handle text, nb::handle context) {
    HostAssert(IsTextOrNone(text));
    CNodeRef node = _FreeNode(clsinfo);
    node->fText = nb::borrow(text);
    node->fContext = nb::borrow(context);
    if (!node->fChildren.IsNone()) node->fChildren.SetNone();  // a host's class may make nodes that have some
    return node;
}

CNodeRef CNodeFactory::_FreeNode(CNodeClassInfo& clsinfo) {
    CNodeRef node = clsinfo.TakeFree();
    return node ? node : CNodeRef(Instance<CNode>(nb::object(clsinfo.fCls(clsinfo.Self()))));
}

CNodeRef CNodeFactory::ConvertRule(int type, nb::handle context, CObjectStack& stack, size_t first) {
    const size_t count = stack.Size() - first;
    HostAssert(count >= 2);
    CNodeClassInfo& record = _ClassInfo(type);
    CNodeRef node;
    if (count == 2 && IsNewline(*nb::inst_ptr<CNode>(stack.At(first + 1)))) {
        DiscardNodes(stack.At(first + 1));
        stack.Take(first + 1);
        node = TakeNode(stack, first);
    } else {
        node = _FreeNode(record);
        node->fText = nb::none();
        node->fContext = nb::borrow(context);
        node->fChildren.SetNodes(count, [&](size_t i) { return TakeNode(stack, first + i); });
    }
    stack.CutOff(first);
    return node;
}

CNodeRef CNodeFactory::NewKeywordNode(nb::handle text, nb::handle context) {
    return NewNode(*_fKeywordClassInfo, kTokenId_NAME, text, context, nb::none());
}

CNodeRef CNodeFactory::NewNameNode(nb::handle text, nb::handle context) {
    return NewNode(_ClassInfo(kTokenId_NAME), kTokenId_NAME, text, context, nb::none());
}

CNodeRef CNodeFactory::CreateOperatorNode(nb::handle text, nb::handle context) {
    const nb::object number = nb::object(_fOperatorStrToNumber.attr("get")(text));
    if (!nb::isinstance<nb::int_>(number)) return CNodeRef();
    const int type = nb::cast<int>(number);
    return NewNode(_ClassInfo(type), type, text, context, nb::none());
}

void CNodeFactory::DiscardNodes(nb::handle node) {
    FinishedWithNode(node);
}

CNodeRef CNodeFactory::RecursiveConvert(nb::tuple raw) {
    const CRecursionScope recursion;
    if (TupleSize(raw) != 4)
        throw nb::value_error("a raw node is a tuple of type, text, context and children");
    const nb::handle raw_children = TupleItem(raw, 3);
    const int type = ResultFromHost<int>(nb::borrow(TupleItem(raw, 0)));
    if (raw_children.is_none())
        return ConvertSingleNode(type, TupleItem(raw, 1), TupleItem(raw, 2), nb::none());
    if (!nb::isinstance<nb::list>(raw_children)) RaiseWrongType("list", raw_children);
    nb::list children;
    for (Py_ssize_t i = 0; i < ListSize(raw_children); ++i) {
        const nb::object child = nb::borrow(ListItem(raw_children, i));
        if (!nb::isinstance<nb::tuple>(child)) RaiseWrongType("tuple", child);
        children.append(RecursiveConvert(nb::borrow<nb::tuple>(child)).Release());
    }
    return ConvertSingleNode(type, TupleItem(raw, 1), TupleItem(raw, 2), children);
}

nb::list CNodeFactory::GetClassInfoList() const {
    nb::list infos;
    for (const CRef<CNodeClassInfo>& info : _fClassInfoList) infos.append(info.AsHost());
    return infos;
}

// As the host indexes a list: a negative type counts from the end.
CNodeClassInfo& CNodeFactory::_ClassInfo(Py_ssize_t type) const {
    const Py_ssize_t count = static_cast<Py_ssize_t>(_fClassInfoList.size());
    if (type < 0) type += count;
    if (type < 0 || type >= count) RaiseIndexError("list index out of range");
    return *_fClassInfoList[static_cast<size_t>(type)];
}

CNodeClassInfo& CNodeFactory::_RecordFor(int type, nb::handle text) const {
    const bool is_keyword = (type == kTokenId_NAME && _fKeywordFilter.Contains(_fKeywords, text)) ||
                            type == kTokenId_AWAIT || type == kTokenId_ASYNC;
    return is_keyword ? *_fKeywordClassInfo : _ClassInfo(type);
}

}  // namespace codeloom
