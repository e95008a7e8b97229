#include "arrow/input.h"

#include <cstring>

namespace codeloom {

namespace {

// A text of a view layout: short ones lie in the view itself, others in a buffer.
struct CTextView {
    static constexpr int32_t kMostInline = 12;

    int32_t length;
    char prefix[4];
    int32_t buffer_i;
    int32_t offset;
};

static_assert(sizeof(CTextView) == 16);

template <class Index>
int64_t IndexIn(const void* buffer, int64_t i) {
    return static_cast<int64_t>(static_cast<const Index*>(buffer)[i]);
}

}  // namespace

std::optional<CTextInput::ELayout> CTextInput::_LayoutOf(const ArrowSchema& schema) {
    const std::string_view format = schema.format;
    if (schema.dictionary != nullptr) return ELayout::kDictionary;
    if (format == "u" || format == "z") return ELayout::kOffsets32;
    if (format == "U" || format == "Z") return ELayout::kOffsets64;
    if (format == "vu" || format == "vz") return ELayout::kViews;
    return std::nullopt;
}

std::optional<CTextInput> CTextInput::Make(const ArrowSchema& schema, const ArrowArray& array,
                                           int64_t offset) {
    const std::optional<ELayout> layout = _LayoutOf(schema);
    if (!layout) return std::nullopt;
    CTextInput input(array, offset);
    input._fLayout = *layout;
    if (layout == ELayout::kDictionary) {
        std::optional<CTextInput> dictionary = Make(*schema.dictionary, *array.dictionary, 0);
        if (!dictionary) return std::nullopt;
        input._fIndexFormat = schema.format[0];
        input._fDictionary.push_back(std::move(*dictionary));
    }
    return input;
}

std::optional<std::string_view> CTextInput::At(int64_t row) const {
    const int64_t i = row + _fOffset;
    if (_IsNull(i)) return std::nullopt;
    return _fLayout == ELayout::kDictionary ? _fDictionary.front().At(_IndexAt(i)) : _TextAt(i);
}

bool CTextInput::_IsNull(int64_t i) const {
    const auto* const validity = _Buffer<uint8_t>(0);
    return validity != nullptr && (validity[i / 8] >> (i % 8) & 1) == 0;
}

int64_t CTextInput::_IndexAt(int64_t i) const {
    const void* const indexes = _fArray->buffers[1];
    switch (_fIndexFormat) {
        case 'c':
            return IndexIn<int8_t>(indexes, i);
        case 'C':
            return IndexIn<uint8_t>(indexes, i);
        case 's':
            return IndexIn<int16_t>(indexes, i);
        case 'S':
            return IndexIn<uint16_t>(indexes, i);
        case 'i':
            return IndexIn<int32_t>(indexes, i);
        case 'I':
            return IndexIn<uint32_t>(indexes, i);
        default:
            return IndexIn<int64_t>(indexes, i);
    }
}

std::string_view CTextInput::_TextAt(int64_t i) const {
    if (_fLayout == ELayout::kViews) return _ViewAt(i);
    const bool is_large = _fLayout == ELayout::kOffsets64;
    const auto at = [&](int64_t offset_i) {
        return is_large ? _Buffer<int64_t>(1)[offset_i] : int64_t{_Buffer<int32_t>(1)[offset_i]};
    };
    const int64_t start = at(i);
    return {_Buffer<char>(2) + start, static_cast<size_t>(at(i + 1) - start)};
}

std::string_view CTextInput::_ViewAt(int64_t i) const {
    constexpr size_t kFirstData = 2;
    const CTextView& view = _Buffer<CTextView>(1)[i];
    const auto length = static_cast<size_t>(view.length);
    if (view.length <= CTextView::kMostInline) return {view.prefix, length};
    return {_Buffer<char>(kFirstData + static_cast<size_t>(view.buffer_i)) + view.offset, length};
}

int64_t CTableInput::Count() const {
    int64_t count = 0;
    for (const auto& batch : _fBatches) count += batch.node.length;
    return count;
}

std::vector<std::string> CTableInput::ColumnNames() const {
    std::vector<std::string> names;
    for (int64_t i = 0; i < Schema().n_children; ++i) names.emplace_back(Schema().children[i]->name);
    return names;
}

std::optional<size_t> CTableInput::ColumnNamed(std::string_view name) const {
    for (int64_t i = 0; i < Schema().n_children; ++i)
        if (Schema().children[i]->name == name) return static_cast<size_t>(i);
    return std::nullopt;
}

bool CTableInput::IsText(size_t column_i) const {
    const ArrowSchema* schema = Schema().children[column_i];
    if (schema->dictionary != nullptr) schema = schema->dictionary;
    const std::string_view format = schema->format;
    return format == "u" || format == "U" || format == "vu";
}

bool CTableInput::TakeTexts(size_t column_i, std::vector<std::optional<std::string_view>>& texts) const {
    texts.reserve(static_cast<size_t>(Count()));
    for (const auto& batch : _fBatches) {
        const ArrowArray& rows = batch.node;
        const auto column =
            CTextInput::Make(*Schema().children[column_i], *rows.children[column_i], rows.offset);
        if (!column) return false;
        for (int64_t row = 0; row < rows.length; ++row) texts.push_back(column->At(row));
    }
    return true;
}

}  // namespace codeloom
