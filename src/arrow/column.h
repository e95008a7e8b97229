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
    void Clear() {
        _fBytes.clear();
        _fCount = 0;
    }

  private:
    TPlainArray<uint8_t> _fBytes;
    size_t _fCount = 0;
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

    // Of names that come by number, the text's own; up to the next text.
    virtual void BeginText(const CNameTable&) {}
    // Leaves nothing but the dictionary.
    virtual void ClearRows() {
        _fCount = _fNullCount = 0;
        _fValidity.Clear();
    }

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
    void ClearRows() override {
        CColumn::ClearRows();
        _fNumbers.clear();
    }

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
    void ClearRows() override {
        CColumn::ClearRows();
        _fBits.Clear();
    }

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
    void ClearRows() override {
        CColumn::ClearRows();
        _fOffsets.CutTo(1);
        _fTexts.clear();
    }

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
    void ClearRows() override {
        CColumn::ClearRows();
        _fIndexes.clear();
    }

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
    void Add(std::string_view name) { _AddIndex(_NumberOf(name)); }

    // Each text has numbers of its own for names, most of which come again.
    void BeginText(const CNameTable& names) override {
        _fTextNames = &names;
        _fOfText.clear();
        _fOfText.Resize(names.Count(), kUnknown);
    }
    void AddNumber(uint32_t number) {
        uint32_t& known = _fOfText[number];
        if (known == kUnknown) known = _NumberOf(_fTextNames->Text(number));
        _AddIndex(known);
    }

  private:
    static constexpr uint32_t kUnknown = UINT32_MAX;

    uint32_t _NumberOf(std::string_view name) {
        const uint32_t number = _fNames.Number(name);
        if (number == _fDictionary.Count()) _fDictionary.Add(name);
        return number;
    }

    CNameTable _fNames;
    const CNameTable* _fTextNames = nullptr;
    TPlainArray<uint32_t> _fOfText;
};

}  // namespace codeloom
