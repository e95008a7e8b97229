// Texts out of the tables of other libraries.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "arrow/abi.h"

namespace codeloom {

// A structure that is released with its owner.
template <class Node>
class TArrowOwner {
  public:
    TArrowOwner() = default;
    TArrowOwner(TArrowOwner&& other) noexcept : node(std::exchange(other.node, {})) {}
    TArrowOwner& operator=(TArrowOwner&&) = delete;
    ~TArrowOwner() {
        if (node.release != nullptr) node.release(&node);
    }
    // Takes over what another structure holds, as the interface tells consumers to.
    explicit TArrowOwner(Node& taken) : node(taken) { taken.release = nullptr; }

    Node node = {};
};

// A column of text or bytes, in any of the layouts that the format has for them, dictionary-coded or not.
class CTextInput {
  public:
    // Both must outlive it. `offset` is that of the table's own rows. None where the column holds no text.
    static std::optional<CTextInput> Make(const ArrowSchema& schema, const ArrowArray& array, int64_t offset);

    // None for a null.
    std::optional<std::string_view> At(int64_t row) const;

  private:
    CTextInput(const ArrowArray& array, int64_t offset) : _fArray(&array), _fOffset(offset + array.offset) {}

    template <class Element>
    const Element* _Buffer(size_t i) const {
        return static_cast<const Element*>(_fArray->buffers[i]);
    }
    bool _IsNull(int64_t i) const;
    int64_t _IndexAt(int64_t i) const;
    std::string_view _TextAt(int64_t i) const;
    std::string_view _ViewAt(int64_t i) const;

    enum class ELayout : uint8_t { kOffsets32, kOffsets64, kViews, kDictionary };

    static std::optional<ELayout> _LayoutOf(const ArrowSchema& schema);

    const ArrowArray* _fArray;
    int64_t _fOffset;
    ELayout _fLayout = ELayout::kOffsets32;
    char _fIndexFormat = 'i';
    std::vector<CTextInput> _fDictionary;  // one, or none
};

// The batches of a stream, or a single one.
class CTableInput {
  public:
    explicit CTableInput(TArrowOwner<ArrowSchema> schema) : _fSchema(std::move(schema)) {}

    const ArrowSchema& Schema() const { return _fSchema.node; }
    void AddBatch(TArrowOwner<ArrowArray> batch) { _fBatches.push_back(std::move(batch)); }
    const std::vector<TArrowOwner<ArrowArray>>& Batches() const { return _fBatches; }
    int64_t Count() const;

    std::vector<std::string> ColumnNames() const;
    // None where there is no such column.
    std::optional<size_t> ColumnNamed(std::string_view name) const;

    // True for a column of text, false for one of bytes. Requires: it holds one of both.
    bool IsText(size_t column_i) const;
    // All cells of a column, which stay valid as long as the input; false where it holds no text.
    bool TakeTexts(size_t column_i, std::vector<std::optional<std::string_view>>& texts) const;

  private:
    TArrowOwner<ArrowSchema> _fSchema;
    std::vector<TArrowOwner<ArrowArray>> _fBatches;
};

}  // namespace codeloom
