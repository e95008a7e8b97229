// tree/: the typed syntax tree of one logical line, made of recycled nodes.
//   in     tokens and completed grammar rules, from the parser
//   out    typed nodes; accessors read them by position and make nothing
//   keeps  free nodes, on the class record that made them
//   start  at CNode here, CNodeFactory in node_factory.h, the classes in node_classes.h
#pragma once

#include <algorithm>
#include <bitset>
#include <string_view>

#include <nanobind/nanobind.h>

#include "host/binding.h"
#include "host/collections.h"
#include "host/or_none.h"
#include "host/text_match.h"
#include "tree/children.h"

namespace codeloom {

class CNode;
using CNodeRef = CRef<CNode>;
using CNodeList = nb::typed<nb::list, CNode>;

// One record for each grammar state and token type of a factory, and one for keywords. A node goes back to
// the free list of the record that made it.
class CNodeClassInfo : public CHosted {
  public:
    // `name` is a text string or none.
    void Init(nb::object cls, int nodetype, nb::object name);

    // The free list. A node joins it when nothing is left of what it held, and once only: a node that is on
    // it already stays where it is.
    CNodeRef TakeFree();  // empty when there is none
    void PutBack(CNodeRef node);

    template <class Visitor>
    void References(Visitor&& visit) {
        visit(fCls);
        visit(fName);
        visit(fFirstFree);
    }

    nb::object fCls = nb::none();
    int fNodeType = 0;
    nb::object fName = nb::none();
    CNodeRef fFirstFree;
};

// Which node class an object is of, and which are its bases, without a question to the interpreter.
class CNodeKind {
  public:
    bool Is(const CNodeKind& kind) const { return _fKinds[kind._fIndex]; }

    // Sets the kind up once that of its base is; of CNode itself that is an empty kind.
    void DeriveFrom(const CNodeKind& base) {
        static size_t last_index = 0;
        if (_fIndex == 0) _fIndex = ++last_index;
        _fKinds = base._fKinds;
        _fKinds.set(_fIndex);
    }

  private:
    static constexpr size_t kMaxKinds = 128;
    size_t _fIndex = 0;
    std::bitset<kMaxKinds> _fKinds;
};

// Set up when the class is bound.
template <class Class>
inline CNodeKind kNodeKind;

// Base of all node classes, and the class of every state that has none of its own.
// A node class stores nothing: it reads fChildren by position or by short search.
class CNode : public CHosted {
  public:
    using CAnyOfKind = CNode;

    CNode() = default;
    ~CNode() override;

    template <class Class>
    void SetClass() {
        _fKind = &kNodeKind<Class>;
    }

    void Init(CRef<CNodeClassInfo> cls_info) { fClsInfo = std::move(cls_info); }

    OPERATIONS_OF(CNode, CNoOperations)
    OPERATION(Py_ssize_t, GetChildCount, (), "The number of direct children; 0 for a leaf.");
    virtual Py_ssize_t _GetChildCount();
    OPERATION(CTextOrNone, GetChildText, (Py_ssize_t child_i),
              "The text of the child at `child_i`; None at or past the end, and for a child without text.\n"
              "A negative index counts from the end; IndexError below the start.",
              "child_i"_a);
    virtual CTextOrNone _GetChildText(Py_ssize_t i);
    OPERATION(CNodeRef, GetChild, (Py_ssize_t child_i),
              "The child at `child_i`; None at or past the end. A negative index counts from the end;\n"
              "IndexError below the start.",
              "child_i"_a);
    OPERATION(CTextOrNone, GetStateName, (),
              "The name of the grammar state; the class name of a node without a class record.");
    OPERATION(bool, _DoesChildTextMatch, (nb::str text), "True when a direct child's text equals `text`.",
              "text"_a);

    template <class Below>
    class TOfHost : public Below {
      public:
        TOfHost() { this->_fAsksHost = true; }
        Py_ssize_t _GetChildCount() override { return CNode::CountWithinBounds(this->GetChildCount()); }
        CTextOrNone _GetChildText(Py_ssize_t i) override { return this->GetChildText(i); }
    };
    FOR_HOST_SUBCLASSES(TOfHost)
    END_OPERATIONS

    // Reading by position, for native code. A borrowed child belongs to the tree: whoever runs host code
    // while holding one holds a CNodeRef.

    // This node as a T; null when it is of another class.
    template <class T>
    T* As() const {
        return _fKind->Is(kNodeKind<T>) ? static_cast<T*>(const_cast<CNode*>(this)) : nullptr;
    }

    // The child at `i`, borrowed. TypeError for a leaf, IndexError outside the list.
    CNode& ChildAt(Py_ssize_t i) const { return fChildren.At(i); }

    // The same as a T; TypeError when it is of another class.
    template <class T>
    CRef<T> ChildAs(Py_ssize_t i) const {
        return fChildren.RefAt<T>(i);
    }

    // The child at `i`, borrowed, when it is a T; null when it isn't, and past the end.
    template <class T>
    T* TryChild(Py_ssize_t i) const {
        const CNode* const child = _HasItem(i) ? fChildren.TryAt(i) : nullptr;
        return child == nullptr ? nullptr : child->As<T>();
    }

    // The following three are what accessors read. Of a class of the host, its overrides are asked.

    Py_ssize_t ChildCount() const { return _fAsksHost ? _Asked()._GetChildCount() : fChildren.Size(); }

    // The text of the child at `i`; none past the end, and for a child without text.
    CTextOrNone ChildText(Py_ssize_t i) const { return _fAsksHost ? _Asked()._GetChildText(i) : _TextAt(i); }

    // True when the child at `i` has the text `token`; false past the end.
    bool IsToken(Py_ssize_t i, std::string_view token) const {
        if (_fAsksHost) [[unlikely]]
            return TextIs(ChildText(i), token);
        return _HasItem(i) && ChildAt(i).HasText(token);
    }

    // A count that an override gave, so that one can reckon with it.
    static constexpr Py_ssize_t CountWithinBounds(Py_ssize_t count) {
        return std::clamp<Py_ssize_t>(count, 0, INT32_MAX / 2);
    }

    bool HasText(std::string_view text) const { return TextIs(fText, text); }

    // True when a direct child has the text `token`.
    bool HasToken(std::string_view token) const;

    template <class Visitor>
    void References(Visitor&& visit) {
        fChildren.VisitReferences(visit);
        visit(fText);
        visit(fContext);
        visit(fClsInfo);
        visit(fNextFree);
    }

    TChildren<CNode> fChildren;        // in source order; none for a leaf
    nb::object fText = nb::none();     // text string; none for a non-terminal
    nb::object fContext = nb::none();  // by convention the index of the node's (first) token
    CRef<CNodeClassInfo> fClsInfo;     // the record that made the node
    CNodeRef fNextFree;                // link of the free list; stale while the node is in use
    bool fIsFree = false;              // on the free list of its record

  protected:
    bool _fAsksHost = false;  // of a class of the host, which may override what accessors read

  private:
    const CNodeKind* _fKind = &kNodeKind<CNode>;

    bool _HasItem(Py_ssize_t i) const { return i < fChildren.Size() && !fChildren.IsNone(); }
    CTextOrNone _TextAt(Py_ssize_t i) const {
        return _HasItem(i) ? CTextOrNone(ChildAt(i).fText) : CTextOrNone();
    }
    CNode& _Asked() const { return const_cast<CNode&>(*this); }
};

}  // namespace codeloom
