// An array of plain records that grows one by one: cheaper per item than a vector, and moved in one copy.
#pragma once

#include <algorithm>
#include <cassert>
#include <cstddef>
#include <cstdlib>
#include <memory>
#include <new>
#include <type_traits>
#include <utility>

namespace codeloom {

template <class Item>
class TPlainArray {
    static_assert(std::is_trivially_copyable_v<Item> && std::is_trivially_destructible_v<Item>);

  public:
    TPlainArray() = default;
    TPlainArray(TPlainArray&& other) noexcept { *this = std::move(other); }
    TPlainArray& operator=(TPlainArray&& other) noexcept {
        _fItems = std::move(other._fItems);
        _fSize = std::exchange(other._fSize, 0);
        _fCapacity = std::exchange(other._fCapacity, 0);
        return *this;
    }

    // As a vector has them.
    size_t size() const { return _fSize; }
    bool empty() const { return _fSize == 0; }
    Item* data() { return _fItems.get(); }
    const Item* data() const { return _fItems.get(); }
    Item* begin() { return _fItems.get(); }
    const Item* begin() const { return _fItems.get(); }
    Item* end() { return _fItems.get() + _fSize; }
    const Item* end() const { return _fItems.get() + _fSize; }
    Item& operator[](size_t i) {
        assert(i < _fSize);
        return _fItems[i];
    }
    const Item& operator[](size_t i) const {
        assert(i < _fSize);
        return _fItems[i];
    }
    Item& back() {
        assert(!empty());
        return _fItems[_fSize - 1];
    }
    const Item& back() const {
        assert(!empty());
        return _fItems[_fSize - 1];
    }
    void clear() { _fSize = 0; }

    Item& push_back(const Item& item) {
        if (_fSize == _fCapacity) [[unlikely]]
            return _PushGrowing(item);
        return *std::construct_at(_fItems.get() + _fSize++, item);
    }

    // So many items; new ones are `item`.
    void Resize(size_t count, const Item& item) {
        Reserve(count);
        if (count > _fSize) std::uninitialized_fill(end(), begin() + count, item);
        _fSize = count;
    }

    // Requires: count <= size().
    void CutTo(size_t count) {
        assert(count <= _fSize);
        _fSize = count;
    }

    void Reserve(size_t count) {
        if (count > _fCapacity) _SetCapacity(count);
    }

    // Releases memory that isn't used.
    void Shrink() {
        if (_fSize != _fCapacity) _SetCapacity(std::max<size_t>(_fSize, 1));
    }

  private:
    struct CFree {
        void operator()(Item* items) const { std::free(items); }
    };

    static constexpr size_t kFirstCapacity = 64;

    [[gnu::noinline]] Item& _PushGrowing(const Item item) {
        _SetCapacity(std::max(2 * _fCapacity, kFirstCapacity));
        return *std::construct_at(_fItems.get() + _fSize++, item);
    }

    [[gnu::noinline]] void _SetCapacity(size_t capacity) {
        void* const items = std::realloc(static_cast<void*>(_fItems.get()), capacity * sizeof(Item));
        if (items == nullptr) throw std::bad_alloc();
        static_cast<void>(_fItems.release());
        _fItems.reset(static_cast<Item*>(items));
        _fCapacity = capacity;
    }

    std::unique_ptr<Item[], CFree> _fItems;
    size_t _fSize = 0;
    size_t _fCapacity = 0;
};

}  // namespace codeloom
