#include "arrow/batch.h"

#include <algorithm>

#include "arrow/table_builder.h"
#include "file/time_limit.h"

namespace codeloom {

namespace {

class CBatchRun {
  public:
    explicit CBatchRun(const CBatchSettings& settings) : _fSettings(settings) {
        _fFileSettings.false_hints = settings.false_hints;
        _fFileSettings.wants_records = _fFileSettings.wants_names = false;
        for (const CTableKind* kind : settings.tables) {
            _fFileSettings.wants_records |= kind->wants_records;
            _fFileSettings.wants_names |= kind->wants_names;
            _fBuilders.push_back(kind->make(true));
        }
    }

    void Take(CBatchFile& file);
    std::vector<std::shared_ptr<const CTable>> Finish();

  private:
    const CBatchSettings& _fSettings;
    CFileSettings _fFileSettings;
    std::vector<std::unique_ptr<CTableBuilder>> _fBuilders;
    std::vector<CFileRow> _fFiles;
};

uint32_t CountRows(const CRowIndex& rows) {
    return rows.Count() - (rows.Text(rows.Count() - 1).empty() ? 1 : 0);
}

void CBatchRun::Take(CBatchFile& file) {
    CFileRow& row = file.row;
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
    _fFiles.push_back(row);
}

std::vector<std::shared_ptr<const CTable>> CBatchRun::Finish() {
    std::vector<std::shared_ptr<const CTable>> tables;
    for (const auto& builder : _fBuilders) tables.push_back(builder->Finish());
    tables.push_back(TableOfRows(FileColumns(), _fFiles));
    return tables;
}

}  // namespace

std::vector<CTableKind::CColumnInfo> FileColumnInfos() {
    return ColumnInfosOf(FileColumns());
}

std::vector<std::shared_ptr<const CTable>> AnalyzeBatch(std::span<CBatchFile> files,
                                                        const CBatchSettings& settings) {
    CBatchRun run(settings);
    for (CBatchFile& file : files) run.Take(file);
    return run.Finish();
}

}  // namespace codeloom
