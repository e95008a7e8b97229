#include "arrow/batch.h"

#include <algorithm>

#include "file/time_limit.h"

namespace codeloom {

namespace {

uint32_t CountRows(const CRowIndex& rows) {
    return rows.Count() - (rows.Text(rows.Count() - 1).empty() ? 1 : 0);
}

}  // namespace

std::vector<CTableKind::CColumnInfo> FileColumnInfos() {
    return ColumnInfosOf(FileColumns());
}

CBatchAnalyzer::CBatchAnalyzer(CBatchSettings settings)
    : _fSettings(std::move(settings)), _fFiles(FileColumns(), false) {
    _fFileSettings.false_hints = _fSettings.false_hints;
    _fFileSettings.wants_records = _fFileSettings.wants_names = false;
    for (const CTableKind* kind : _fSettings.tables) {
        _fFileSettings.wants_records |= kind->wants_records;
        _fFileSettings.wants_names |= kind->wants_names;
        _fBuilders.push_back(kind->make(true));
    }
}

void CBatchAnalyzer::Take(const CBatchFile& file) {
    CFileRow row = file.row;
    if (file.text) {
        const CTimeLimit limit(_fSettings.most_seconds);
        _fFileSettings.version = file.version;
        _fFileSettings.time_limit = &limit;
        const CFileAnalysis analysis = AnalyzeFile(
            *file.text, _fFileSettings, file.unreadable != nullptr ? *file.unreadable : CUnreadable());
        if (analysis.is_cut) {
            row.state = EFileState::kTooSlow;
            row.reason = "the file takes longer than the limit";
        } else {
            const CRowIndex rows(*file.text);
            for (const auto& builder : _fBuilders)
                builder->AppendAll({*file.text, analysis, rows, file.version, row.file_id});
            row.rows = CountRows(rows);
            row.lines = static_cast<uint32_t>(analysis.lines.size());
            row.problems = static_cast<uint32_t>(analysis.problems.size());
        }
    }
    _fFiles.Append({row}, 0);
}

std::vector<std::pair<std::string_view, const CTable*>> CBatchAnalyzer::Tables() const {
    std::vector<std::pair<std::string_view, const CTable*>> tables;
    for (size_t i = 0; i < _fBuilders.size(); ++i)
        tables.emplace_back(_fSettings.tables[i]->name, &_fBuilders[i]->Rows());
    tables.emplace_back(kFilesTable, &_fFiles.Table());
    return tables;
}

void CBatchAnalyzer::ClearRows() {
    for (const auto& builder : _fBuilders) builder->ClearRows();
    _fFiles.Clear();
}

std::vector<std::shared_ptr<const CTable>> CBatchAnalyzer::Finish() {
    std::vector<std::shared_ptr<const CTable>> tables;
    for (const auto& builder : _fBuilders) tables.push_back(builder->Finish());
    tables.push_back(_fFiles.Finish());
    return tables;
}

}  // namespace codeloom
