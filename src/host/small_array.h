// A short array of plain data in the interpreter's own memory, which costs a fraction of the heap's. Made and
// dropped with the interpreter's lock held.
#pragma once

#include <algorithm>
#include <memory>
#include <new>
#include <span>
#include <type_traits>

#include <nanobind/nanobind.h>

namespace codeloom {

template <class Item>
class TSmallArray {
    static_assert(std::is_trivially_copyable_v<Item>);

  public:
    TSmallArray() = default;
    explicit TSmallArray(std::span<const Item> items) : _fCount(items.size()) {
        if (items.empty()) return;
        _fItems.reset(static_cast<Item*>(PyObject_Malloc(items.size_bytes())));
        if (!_fItems) throw std::bad_alloc();
        std::copy(items.begin(), items.end(), _fItems.get());
    }

    std::span<const Item> View() const { return {_fItems.get(), _fCount}; }

  private:
    struct CFree {
        void operator()(Item* items) const { PyObject_Free(items); }
    };

    std::unique_ptr<Item[], CFree> _fItems;
    size_t _fCount = 0;
};

}  // namespace codeloom
