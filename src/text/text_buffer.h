// A text that grows piece by piece, most of them short: cheaper per piece than a string, and with its storage
// kept when it is cut.
#pragma once

#include <algorithm>
#include <cassert>
#include <cstddef>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <new>
#include <string_view>
#include <utility>

namespace codeloom {

class CTextBuffer {
  public:
    CTextBuffer() = default;
    CTextBuffer(CTextBuffer&& other) noexcept { *this = std::move(other); }
    CTextBuffer& operator=(CTextBuffer&& other) noexcept {
        _fBytes = std::move(other._fBytes);
        _fSize = std::exchange(other._fSize, 0);
        _fCapacity = std::exchange(other._fCapacity, 0);
        return *this;
    }

    // As a string has them.
    size_t size() const { return _fSize; }
    size_t capacity() const { return _fCapacity; }
    bool empty() const { return _fSize == 0; }
    const char* data() const { return _fBytes.get(); }
    void clear() { _fSize = 0; }

    void reserve(size_t capacity) {
        if (capacity <= _fCapacity) return;
        _SetCapacity(capacity);
    }

    // Releases memory that isn't used.
    void Shrink() {
        if (_fSize != _fCapacity) _SetCapacity(std::max<size_t>(_fSize, 1));
    }

    CTextBuffer& operator+=(std::string_view piece) {
        if (piece.size() > kMostShort || _fCapacity - _fSize < piece.size()) [[unlikely]]
            return _AppendLong(piece);
        _CopyShort(_fBytes.get() + _fSize, piece);
        _fSize += piece.size();
        return *this;
    }

    CTextBuffer& operator+=(char c) {
        if (_fCapacity == _fSize) [[unlikely]]
            return _AppendLong({&c, 1});
        _fBytes[_fSize++] = c;
        return *this;
    }

    std::string_view View() const { return {_fBytes.get(), _fSize}; }
    std::string_view From(size_t start) const { return {_fBytes.get() + start, _fSize - start}; }

    // Requires: size <= size().
    void CutTo(size_t size) {
        assert(size <= _fSize);
        _fSize = size;
    }

    // Requires: pos < size().
    void Erase(size_t pos) {
        assert(pos < _fSize);
        std::memmove(_fBytes.get() + pos, _fBytes.get() + pos + 1, _fSize - pos - 1);
        --_fSize;
    }

  private:
    static constexpr size_t kFirstCapacity = 256;

    static constexpr size_t kMostShort = 16;

    // Copies at most kMostShort bytes, without a call.
    static void _CopyShort(char* to, std::string_view piece) {
        const char* const from = piece.data();
        const size_t count = piece.size();
        if (count >= 8) {
            std::memcpy(to, from, 8);
            std::memcpy(to + count - 8, from + count - 8, 8);
        } else if (count >= 4) {
            std::memcpy(to, from, 4);
            std::memcpy(to + count - 4, from + count - 4, 4);
        } else if (count != 0) {
            to[0] = from[0];
            to[count / 2] = from[count / 2];
            to[count - 1] = from[count - 1];
        }
    }

    // A function of its own, so that short pieces need no room for a call.
    [[gnu::noinline]] CTextBuffer& _AppendLong(std::string_view piece) {
        if (_fCapacity - _fSize < piece.size())
            reserve(std::max(2 * _fCapacity, _fSize + piece.size() + kFirstCapacity));
        std::memcpy(_fBytes.get() + _fSize, piece.data(), piece.size());
        _fSize += piece.size();
        return *this;
    }

    [[gnu::noinline]] void _SetCapacity(size_t capacity) {
        void* const bytes = std::realloc(_fBytes.get(), capacity);
        if (bytes == nullptr) throw std::bad_alloc();
        static_cast<void>(_fBytes.release());
        _fBytes.reset(static_cast<char*>(bytes));
        _fCapacity = capacity;
    }

    struct CFree {
        void operator()(char* bytes) const { std::free(bytes); }
    };

    std::unique_ptr<char[], CFree> _fBytes;
    size_t _fSize = 0;
    size_t _fCapacity = 0;
};

}  // namespace codeloom
