// Columns of tables, in the buffers of the Arrow columnar format.
#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <string_view>
#include <vector>

#include "names/name_table.h"
#include "text/plain_array.h"

namespace codeloom {

// Bits, the lowest of a byte first.
class CBits {
  public:
    void Add(bool bit) {
        if (_fCount % 8 == 0) _fBytes.push_back(0);
        _fBytes.back() = static_cast<uint8_t>(_fBytes.back() | (unsigned{bit} << _fCount % 8));
        ++_fCount;
    }
    size_t Count() const { return _fCount; }
    const void* Data() const { return _fBytes.data(); }

  private:
    TPlainArray<uint8_t> _fBytes;
    size_t _fCount = 0;
};

inline constexpr uint32_t kUnknownName = UINT32_MAX;

// The names of many texts, each of which has numbers of its own for them.
class CNamePool {
  public:
    CNamePool() = default;
    explicit CNamePool(const CNameTable& names) { BeginText(names); }

    // What numbers are of from now on. `names` must stay as it is up to the next call.
    void BeginText(const CNameTable& names) {
        _fOfText = &names;
        _fNumbers.clear();
        _fNumbers.Resize(names.Count(), kUnknownName);
    }

    // The number in the pool.
    uint32_t Number(uint32_t of_text) {
        uint32_t& number = _fNumbers[of_text];
        if (number == kUnknownName) number = _fNames.Number(_fOfText->Text(of_text));
        return number;
    }
    std::string_view Text(uint32_t number) const { return _fNames.Text(number); }

  private:
    const CNameTable* _fOfText = nullptr;
    TPlainArray<uint32_t> _fNumbers;  // by those of the text
    CNameTable _fNames;
};

// What all columns have. `Buffers` gives those after the one that tells of nulls.
class CColumn {
  public:
    CColumn() = default;
    CColumn(const CColumn&) = delete;
    CColumn& operator=(const CColumn&) = delete;
    virtual ~CColumn() = default;

    virtual const char* Format() const = 0;  // in the letters of the C data interface
    virtual std::vector<const void*> Buffers() const = 0;
    virtual const CColumn* Dictionary() const { return nullptr; }

    size_t Count() const { return _fCount; }
    size_t NullCount() const { return _fNullCount; }
    const void* Validity() const { return _fNullCount == 0 ? nullptr : _fValidity.Data(); }

    // For names that come by number.
    virtual void UsePool(CNamePool&) {}

  protected:
    void _CountValue() {
        ++_fCount;
        if (_fNullCount != 0) _fValidity.Add(true);
    }
    void _CountNull() {
        while (_fValidity.Count() < _fCount) _fValidity.Add(true);
        _fValidity.Add(false);
        ++_fCount;
        ++_fNullCount;
    }

  private:
    size_t _fCount = 0;
    size_t _fNullCount = 0;
    CBits _fValidity;  // empty up to the first null
};

template <class Number_>
class TNumberColumn final : public CColumn {
  public:
    void Add(Number_ number) {
        _fNumbers.push_back(number);
        _CountValue();
    }
    void AddNull() {
        _fNumbers.push_back(0);
        _CountNull();
    }
    const char* Format() const override { return sizeof(Number_) == 8 ? "l" : "i"; }
    std::vector<const void*> Buffers() const override { return {_fNumbers.data()}; }

  private:
    static_assert(sizeof(Number_) == 8 || sizeof(Number_) == 4);

    TPlainArray<Number_> _fNumbers;
};

class CBoolColumn final : public CColumn {
  public:
    void Add(bool value) {
        _fBits.Add(value);
        _CountValue();
    }
    const char* Format() const override { return "b"; }
    std::vector<const void*> Buffers() const override { return {_fBits.Data()}; }

  private:
    CBits _fBits;
};

// UTF-8 with offsets of 64 bits, since those of a batch of texts may have no room in 32.
class CTextColumn final : public CColumn {
  public:
    CTextColumn() { _fOffsets.push_back(0); }

    void Add(std::string_view text) {
        _fTexts += text;
        _fOffsets.push_back(static_cast<int64_t>(_fTexts.size()));
        _CountValue();
    }
    void AddNull() {
        _fOffsets.push_back(static_cast<int64_t>(_fTexts.size()));
        _CountNull();
    }
    const char* Format() const override { return "U"; }
    std::vector<const void*> Buffers() const override { return {_fOffsets.data(), _fTexts.data()}; }

  private:
    TPlainArray<int64_t> _fOffsets;
    CTextBuffer _fTexts;
};

// Dictionary-coded: of many equal texts each is there once.
class CDictionaryColumn : public CColumn {
  public:
    void AddNull() {
        _fIndexes.push_back(0);
        _CountNull();
    }
    const char* Format() const override { return "i"; }
    std::vector<const void*> Buffers() const override { return {_fIndexes.data()}; }
    const CColumn* Dictionary() const override { return &_fDictionary; }

  protected:
    void _AddIndex(size_t i) {
        _fIndexes.push_back(static_cast<int32_t>(i));
        _CountValue();
    }

    CTextColumn _fDictionary;

  private:
    TPlainArray<int32_t> _fIndexes;
};

// The words of a fixed list, by their numbers.
class CWordColumn final : public CDictionaryColumn {
  public:
    explicit CWordColumn(std::span<const std::string_view> words) {
        for (const std::string_view word : words) _fDictionary.Add(word);
    }
    void Add(size_t number) { _AddIndex(number); }
};

// Names and other texts that come again and again.
class CNameColumn final : public CDictionaryColumn {
  public:
    void Add(std::string_view name) {
        const uint32_t number = _fNames.Number(name);
        if (number == _fDictionary.Count()) _fDictionary.Add(name);
        _AddIndex(number);
    }

  private:
    CNameTable _fNames;
};

// Names that other columns have too.
class CPooledColumn final : public CDictionaryColumn {
  public:
    void UsePool(CNamePool& pool) override { _fPool = &pool; }
    // By its number in the text.
    void Add(uint32_t number) {
        const uint32_t pooled = _fPool->Number(number);
        if (pooled >= _fIndexOf.size()) [[unlikely]]
            _fIndexOf.Resize(2 * size_t{pooled} + 1, kUnknownName);
        uint32_t& index = _fIndexOf[pooled];
        if (index == kUnknownName) [[unlikely]] {
            index = static_cast<uint32_t>(_fDictionary.Count());
            _fDictionary.Add(_fPool->Text(pooled));
        }
        _AddIndex(index);
    }

  private:
    CNamePool* _fPool = nullptr;
    TPlainArray<uint32_t> _fIndexOf;  // by numbers of the pool
};

}  // namespace codeloom
