#include "parquet/thrift.h"

#include <utility>

namespace codeloom {

void AddVarint(std::string& bytes, uint64_t value) {
    for (; value >= 0x80; value >>= 7) bytes += static_cast<char>(value | 0x80);
    bytes += static_cast<char>(value);
}

void CThriftWriter::Int32(int field, int32_t value) {
    _Field(field, EType::kInt32);
    AddVarint(_fBytes, Zigzag(value));
}

void CThriftWriter::Int64(int field, int64_t value) {
    _Field(field, EType::kInt64);
    AddVarint(_fBytes, Zigzag(value));
}

void CThriftWriter::Text(int field, std::string_view value) {
    _Field(field, EType::kBinary);
    _AddText(value);
}

void CThriftWriter::Int32List(int field, const std::vector<int32_t>& values) {
    _BeginList(field, EType::kInt32, values.size());
    for (const int32_t value : values) AddVarint(_fBytes, Zigzag(value));
}

void CThriftWriter::TextList(int field, const std::vector<std::string_view>& values) {
    _BeginList(field, EType::kBinary, values.size());
    for (const std::string_view value : values) _AddText(value);
}

void CThriftWriter::BeginStruct(int field) {
    _Field(field, EType::kStruct);
    BeginItem();
}

void CThriftWriter::BeginStructList(int field, size_t count) {
    _BeginList(field, EType::kStruct, count);
}

void CThriftWriter::EndStruct() {
    _fBytes += '\0';
    _fLast.pop_back();
}

std::string CThriftWriter::Finish() {
    EndStruct();
    return std::move(_fBytes);
}

// A field's number is that of the one before plus a few.
void CThriftWriter::_Field(int field, EType type) {
    const int step = field - std::exchange(_fLast.back(), field);
    _fBytes += static_cast<char>(step << 4 | static_cast<int>(type));
}

void CThriftWriter::_BeginList(int field, EType element, size_t count) {
    constexpr size_t kLong = 15;
    _Field(field, EType::kList);
    const size_t size = count < kLong ? count : kLong;
    _fBytes += static_cast<char>(size << 4 | static_cast<size_t>(element));
    if (size == kLong) AddVarint(_fBytes, count);
}

void CThriftWriter::_AddText(std::string_view text) {
    AddVarint(_fBytes, text.size());
    _fBytes += text;
}

}  // namespace codeloom
