#include "parquet/parquet_table.h"

#include "parquet/encodings.h"
#include "parquet/thrift.h"

namespace codeloom {

namespace {

constexpr std::string_view kMagic = "PAR1";
constexpr int32_t kFormatVersion = 2;
constexpr std::string_view kWriter = "codeloom";

// A field of the schema, as a structure of the list under way.
void DescribeType(const CTable::CField& field, CThriftWriter& out) {
    constexpr int32_t kUtf8 = 0;
    constexpr int kStringType = 1;
    const EParquetType type = ParquetTypeOf(*field.column);
    out.BeginItem();
    out.Int32(1, static_cast<int32_t>(type));
    out.Int32(3, field.is_nullable ? 1 : 0);
    out.Text(4, field.name);
    if (type == EParquetType::kByteArray) {
        out.Int32(6, kUtf8);
        out.BeginStruct(10);
        out.BeginStruct(kStringType);
        out.EndStruct();
        out.EndStruct();
    }
    out.EndStruct();
}

void DescribeSchema(const CTable& table, CThriftWriter& out) {
    out.BeginStructList(2, table.fields.size() + 1);
    out.BeginItem();
    out.Text(4, "schema");
    out.Int32(5, static_cast<int32_t>(table.fields.size()));
    out.EndStruct();
    for (const CTable::CField& field : table.fields) DescribeType(field, out);
}

}  // namespace

void CParquetTable::Add(const CTable& rows, const CCompress& compress) {
    _fChunks.resize(rows.fields.size());
    for (size_t i = 0; i < _fChunks.size(); ++i) _fChunks[i].Add(rows.fields[i], compress);
    _fCount += rows.count;
}

std::string CParquetTable::Finish(const CTable& last, const CNotes& notes, const CCompress& compress) {
    std::string file(kMagic);
    for (size_t i = 0; i < _fChunks.size(); ++i) _fChunks[i].Write(*last.fields[i].column, compress, file);
    std::string tail;
    EncodeText(_Footer(last, notes), tail);
    // The length of the footer comes after it.
    file.append(tail, sizeof(uint32_t)).append(tail, 0, sizeof(uint32_t)).append(kMagic);
    return file;
}

std::string CParquetTable::_Footer(const CTable& table, const CNotes& notes) const {
    CThriftWriter out;
    out.Int32(1, kFormatVersion);
    DescribeSchema(table, out);
    out.Int64(3, static_cast<int64_t>(_fCount));
    out.BeginStructList(4, _fCount == 0 ? 0 : 1);
    if (_fCount != 0) {
        int64_t raw_size = 0;
        out.BeginItem();
        out.BeginStructList(1, _fChunks.size());
        for (size_t i = 0; i < _fChunks.size(); ++i) {
            _fChunks[i].Describe(table.fields[i], out);
            raw_size += _fChunks[i].RawSize();
        }
        out.Int64(2, raw_size);
        out.Int64(3, static_cast<int64_t>(_fCount));
        out.EndStruct();
    }
    out.BeginStructList(5, notes.size());
    for (const auto& [name, value] : notes) {
        out.BeginItem();
        out.Text(1, name);
        out.Text(2, value);
        out.EndStruct();
    }
    out.Text(6, kWriter);
    return out.Finish();
}

}  // namespace codeloom
