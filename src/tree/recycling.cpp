#include "tree/recycling.h"

#include <algorithm>
#include <cassert>
#include <utility>
#include <vector>

#include "host/errors.h"

namespace codeloom {

namespace {

constexpr Py_ssize_t kMaxDepth = 100;

CNodeRef NodeToRecycle(nb::handle node) {
    if (node.is_none()) throw nb::attribute_error("'NoneType' object has no attribute 'fClsInfo'");
    return CNodeRef(Instance<CNode>(node));
}

#ifndef NDEBUG

// A free list holds free nodes only, each once. Of a long one the start counts.
void CheckFreeList(const CNodeClassInfo& record) {
    constexpr size_t kMostLooked = 64;
    std::vector<const CNode*> seen;
    for (const CNode* node = record.fFirstFree.get(); node != nullptr && seen.size() < kMostLooked;
         node = node->fNextFree.get()) {
        assert(node->fIsFree);
        assert(std::find(seen.begin(), seen.end(), node) == seen.end());
        seen.push_back(node);
    }
}

#else

void CheckFreeList(const CNodeClassInfo&) {}

#endif

// Takes a tree apart. Whatever is dropped may run host code, and that may ask for nodes, or give this tree
// back once more: so a node goes on its free list when nothing is left of it, and what it held is dropped
// after that.
class CRecycling {
  public:
    CRecycling() : _fWaiting(std::move(gSpare)) {}
    ~CRecycling() {
        DropEach(_fWaiting);
        if (_fWaiting.capacity() <= kMostKept) gSpare = std::move(_fWaiting);
    }
    CRecycling(const CRecycling&) = delete;
    CRecycling& operator=(const CRecycling&) = delete;

    // Gives the number of nodes that lie too deep.
    int64_t Recycle(CNodeRef root) {
        int64_t too_deep_count = 0;
        _fWaiting.push_back({std::move(root), 0});
        while (!_fWaiting.empty()) {
            CPart part = std::move(_fWaiting.back());
            _fWaiting.pop_back();
            if (part.depth > kMaxDepth) {
                ++too_deep_count;
            } else if (!part.node->fIsFree) {
                _RecycleOne(std::move(part));
            }
        }
        return too_deep_count;
    }

  private:
    struct CPart {
        CNodeRef node;
        Py_ssize_t depth;
    };

    void _RecycleOne(CPart part) {
        CNode& node = *part.node;
        const nb::object list = _TakeChildren(node, part.depth + 1);
        const nb::object text = std::exchange(node.fText, nb::none());
        const nb::object context = std::exchange(node.fContext, nb::none());
        if (!node.fClsInfo) return;
        node.fClsInfo->PutBack(std::move(part.node));
        CheckFreeList(*node.fClsInfo);
    }

    // The first child comes next. A child of the host's that isn't a node leaves the node as it is.
    nb::object _TakeChildren(CNode& node, Py_ssize_t depth) {
        const auto first = static_cast<Py_ssize_t>(_fWaiting.size());
        if (const nb::object list = node.fChildren.ListOfHost(); list.is_valid()) [[unlikely]]
            for (Py_ssize_t i = 0; i < ListSize(list); ++i)
                _fWaiting.push_back({NodeToRecycle(ListItem(list, i)), depth});
        nb::object list =
            node.fChildren.TakeAll([&](CNodeRef child) { _fWaiting.push_back({std::move(child), depth}); });
        std::reverse(_fWaiting.begin() + first, _fWaiting.end());
        return list;
    }

    static constexpr size_t kMostKept = 4096;
    static inline std::vector<CPart> gSpare;  // memory for the next tree

    std::vector<CPart> _fWaiting;  // the next one last
};

}  // namespace

// Printing runs host code too, and lets other threads in: by then nothing is under way any more.
void FinishedWithNode(nb::handle node) {
    int64_t too_deep_count = CRecycling().Recycle(NodeToRecycle(node));
    for (; too_deep_count > 0; --too_deep_count) PrintReport(nb::str("depth too great"));
}

}  // namespace codeloom
