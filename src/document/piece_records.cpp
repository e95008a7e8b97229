#include "document/piece_records.h"

#include <utility>

#include "text/move_bytes.h"

namespace codeloom {

std::unique_ptr<const CPieceRecords> MakeRecords(CFilePart part, uint32_t start) {
    auto made = std::make_unique<CPieceRecords>();
    made->records = std::move(part.analysis.records);
    made->limits = std::move(part.analysis.limits);
    for (CRecord& record : made->records.records) MoveBytesIfAny(record, -start);
    for (const CLine& line : part.analysis.lines) made->first_records.push_back(line.first_record);
    return made;
}

void AppendRecords(const CPieceRecords& piece, uint32_t start, uint32_t first_line, CFileAnalysis& analysis) {
    CRecords& joined = analysis.records;
    const auto first_record = static_cast<uint32_t>(joined.records.size());
    const auto first_value = static_cast<uint32_t>(joined.values.size());
    for (size_t i = 0; i < piece.first_records.size(); ++i)
        analysis.lines[first_line + i].first_record = first_record + piece.first_records[i];
    for (CRecord record : piece.records.records) {
        MoveBytesIfAny(record, start);
        record.value += first_value;
        joined.records.push_back(record);
    }
    joined.values += piece.records.values.View();
    for (const CLineLimit& limit : piece.limits)
        analysis.limits.push_back({limit.line + first_line, limit.limit});
}

}  // namespace codeloom
