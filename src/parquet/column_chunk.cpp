#include "parquet/column_chunk.h"

#include <algorithm>
#include <span>

#include "parquet/encodings.h"

namespace codeloom {

namespace {

constexpr int32_t kZstandard = 6;

bool IsThere(const CColumn& column, size_t i) {
    const auto* const bits = static_cast<const uint8_t*>(column.Validity());
    return bits == nullptr || (bits[i / 8] >> i % 8 & 1) != 0;
}

// The values without nulls; `kept` is where they are put if there are nulls.
template <class Number>
std::span<const Number> NumbersOf(const CColumn& column, std::vector<Number>& kept) {
    const auto* const numbers = static_cast<const Number*>(column.Buffers()[0]);
    if (column.NullCount() == 0) return {numbers, column.Count()};
    kept.reserve(column.Count() - column.NullCount());
    for (size_t i = 0; i < column.Count(); ++i)
        if (IsThere(column, i)) kept.push_back(numbers[i]);
    return kept;
}

std::span<const int64_t> OffsetsOf(const CColumn& texts) {
    return {static_cast<const int64_t*>(texts.Buffers()[0]), texts.Count() + 1};
}

const char* BytesOf(const CColumn& texts) {
    return static_cast<const char*>(texts.Buffers()[1]);
}

// The lengths of all, then their bytes one after the other; a null has none.
void EncodeTexts(const CColumn& column, std::string& body) {
    const std::span<const int64_t> offsets = OffsetsOf(column);
    std::vector<int32_t> lengths;
    lengths.reserve(column.Count());
    for (size_t i = 0; i < column.Count(); ++i)
        if (IsThere(column, i)) lengths.push_back(static_cast<int32_t>(offsets[i + 1] - offsets[i]));
    EncodeDeltas(lengths, body);
    body.append(BytesOf(column), static_cast<size_t>(offsets.back()));
}

}  // namespace

EParquetType ParquetTypeOf(const CColumn& column) {
    if (column.Dictionary() != nullptr) return EParquetType::kByteArray;
    switch (column.Format()[0]) {
        case 'b':
            return EParquetType::kBool;
        case 'i':
            return EParquetType::kInt32;
        case 'l':
            return EParquetType::kInt64;
        default:
            return EParquetType::kByteArray;
    }
}

void CColumnChunk::Add(const CTable::CField& field, const CCompress& compress) {
    const CColumn& column = *field.column;
    if (column.Count() == 0) return;
    std::string body;
    if (field.is_nullable) EncodeLevels(column.Validity(), column.Count(), body);
    const EEncoding encoding = _Encode(column, body);
    if (std::find(_fEncodings.begin(), _fEncodings.end(), encoding) == _fEncodings.end())
        _fEncodings.push_back(encoding);
    _AddPage(body, encoding, column.Count(), false, compress);
    _fCount += static_cast<int64_t>(column.Count());
}

EEncoding CColumnChunk::_Encode(const CColumn& column, std::string& body) {
    if (column.NullCount() == column.Count()) return EEncoding::kPlain;  // of no values
    std::vector<int32_t> kept;
    if (column.Dictionary() != nullptr) {
        EncodeIndexes(NumbersOf<int32_t>(column, kept), column.Dictionary()->Count(), body);
        return EEncoding::kDictionary;
    }
    switch (ParquetTypeOf(column)) {
        case EParquetType::kBool:
            body.append(static_cast<const char*>(column.Buffers()[0]), (column.Count() + 7) / 8);
            return EEncoding::kPlain;
        case EParquetType::kInt32:
            EncodeDeltas(NumbersOf<int32_t>(column, kept), body);
            return EEncoding::kDeltas;
        case EParquetType::kInt64:
            return _EncodeLongs(column, body);
        case EParquetType::kByteArray:
            EncodeTexts(column, body);
            return EEncoding::kDeltaLengths;
    }
    return EEncoding::kPlain;
}

// Those that mostly come several times in a row are a dictionary of the runs.
EEncoding CColumnChunk::_EncodeLongs(const CColumn& column, std::string& body) {
    std::vector<int64_t> kept;
    const std::span<const int64_t> numbers = NumbersOf<int64_t>(column, kept);
    std::vector<uint32_t> lengths;
    const auto first_index = static_cast<uint32_t>(_fRuns.size());
    for (size_t i = 0; i < numbers.size(); ++i) {
        if (i == 0 || numbers[i] != numbers[i - 1]) {
            _fRuns.push_back(numbers[i]);
            lengths.push_back(0);
        }
        ++lengths.back();
    }
    if (lengths.size() * 2 <= numbers.size()) {
        EncodeRuns(lengths, first_index, body);
        return EEncoding::kDictionary;
    }
    _fRuns.resize(first_index);
    body.append(reinterpret_cast<const char*>(numbers.data()), numbers.size_bytes());
    return EEncoding::kPlain;
}

void CColumnChunk::_AddPage(std::string_view body, EEncoding encoding, size_t count, bool is_dictionary,
                            const CCompress& compress) {
    const std::string compressed = compress(body);
    CThriftWriter header;
    header.Int32(1, is_dictionary ? 2 : 0);
    header.Int32(2, static_cast<int32_t>(body.size()));
    header.Int32(3, static_cast<int32_t>(compressed.size()));
    header.BeginStruct(is_dictionary ? 7 : 5);
    header.Int32(1, static_cast<int32_t>(count));
    header.Int32(2, static_cast<int32_t>(encoding));
    if (!is_dictionary) {  // of levels
        header.Int32(3, static_cast<int32_t>(EEncoding::kLevels));
        header.Int32(4, static_cast<int32_t>(EEncoding::kLevels));
    }
    header.EndStruct();
    const std::string head = header.Finish();
    _fRawSize += static_cast<int64_t>(head.size() + body.size());
    std::string& pages = is_dictionary ? _fDictionary : _fPages;
    pages += head;
    pages += compressed;
}

std::string CColumnChunk::_Dictionary(const CColumn& column) const {
    if (!_fRuns.empty())
        return {reinterpret_cast<const char*>(_fRuns.data()), _fRuns.size() * sizeof _fRuns[0]};
    std::string body;
    const std::span<const int64_t> offsets = OffsetsOf(*column.Dictionary());
    for (size_t i = 0; i + 1 < offsets.size(); ++i)
        EncodeText(
            {BytesOf(*column.Dictionary()) + offsets[i], static_cast<size_t>(offsets[i + 1] - offsets[i])},
            body);
    return body;
}

void CColumnChunk::Write(const CColumn& column, const CCompress& compress, std::string& file) {
    const size_t entries = column.Dictionary() != nullptr ? column.Dictionary()->Count() : _fRuns.size();
    if (std::find(_fEncodings.begin(), _fEncodings.end(), EEncoding::kDictionary) != _fEncodings.end())
        _AddPage(_Dictionary(column), EEncoding::kPlain, entries, true, compress);
    _fStart = static_cast<int64_t>(file.size());
    file += _fDictionary;
    file += _fPages;
}

void CColumnChunk::Describe(const CTable::CField& field, CThriftWriter& out) const {
    std::vector<int32_t> encodings = {static_cast<int32_t>(EEncoding::kLevels)};
    for (const EEncoding encoding : _fEncodings) encodings.push_back(static_cast<int32_t>(encoding));
    if (!_fDictionary.empty()) encodings.push_back(static_cast<int32_t>(EEncoding::kPlain));
    const auto dictionary_size = static_cast<int64_t>(_fDictionary.size());
    out.BeginItem();
    out.Int64(2, 0);
    out.BeginStruct(3);
    out.Int32(1, static_cast<int32_t>(ParquetTypeOf(*field.column)));
    out.Int32List(2, encodings);
    out.TextList(3, {field.name});
    out.Int32(4, kZstandard);
    out.Int64(5, _fCount);
    out.Int64(6, _fRawSize);
    out.Int64(7, dictionary_size + static_cast<int64_t>(_fPages.size()));
    out.Int64(9, _fStart + dictionary_size);
    if (dictionary_size != 0) out.Int64(11, _fStart);
    out.EndStruct();
    out.EndStruct();
}

}  // namespace codeloom
