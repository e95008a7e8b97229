#include "arrow/batch.h"

#include <algorithm>

#include "arrow/table_builder.h"
#include "file/time_limit.h"

namespace codeloom {

namespace {

// Texts one after the other.
class CBatchRun {
  public:
    explicit CBatchRun(const CBatchSettings& settings);

    void Take(const CBatchFile& file);
    std::vector<std::shared_ptr<const CTable>> Finish();

  private:
    const double _fMostSeconds;
    CFileSettings _fFileSettings;
    std::vector<std::unique_ptr<CTableBuilder>> _fBuilders;
    CNamePool _fNames;
    TRows<CFileRow> _fFiles;
};

uint32_t CountRows(const CRowIndex& rows) {
    return rows.Count() - (rows.Text(rows.Count() - 1).empty() ? 1 : 0);
}

CBatchRun::CBatchRun(const CBatchSettings& settings)
    : _fMostSeconds(settings.most_seconds), _fFiles(FileColumns(), {}) {
    _fFileSettings.false_hints = settings.false_hints;
    _fFileSettings.wants_records = _fFileSettings.wants_names = false;
    for (const CTableKind* kind : settings.tables) {
        _fFileSettings.wants_records |= kind->wants_records;
        _fFileSettings.wants_names |= kind->wants_names;
        _fBuilders.push_back(kind->make({.with_file_id = true, .with_source = settings.with_source}));
    }
}

void CBatchRun::Take(const CBatchFile& file) {
    CFileRow row = file.row;
    if (file.text) {
        const CTimeLimit limit(_fMostSeconds);
        _fFileSettings.version = file.version;
        _fFileSettings.time_limit = &limit;
        const CFileAnalysis analysis = AnalyzeFile(
            *file.text, _fFileSettings, file.unreadable != nullptr ? *file.unreadable : CUnreadable());
        if (analysis.is_cut) {
            row.state = EFileState::kTooSlow;
            row.reason = "the file takes longer than the limit";
        } else {
            const CRowIndex rows(*file.text);
            _fNames.BeginText(*analysis.records.names);
            for (const auto& builder : _fBuilders)
                builder->AppendAll({*file.text, analysis, rows, _fNames, file.version, row.file_id});
            row.rows = CountRows(rows);
            row.lines = static_cast<uint32_t>(analysis.lines.size());
            row.problems = static_cast<uint32_t>(analysis.problems.size());
        }
    }
    _fFiles.Append({row}, 0);
}

std::vector<std::shared_ptr<const CTable>> CBatchRun::Finish() {
    std::vector<std::shared_ptr<const CTable>> tables;
    for (const auto& builder : _fBuilders) tables.push_back(builder->Finish());
    tables.push_back(_fFiles.Finish());
    return tables;
}

}  // namespace

std::vector<CTableKind::CColumnInfo> FileColumnInfos() {
    return ColumnInfosOf(FileColumns());
}

std::vector<std::shared_ptr<const CTable>> AnalyzeBatch(std::span<const CBatchFile> files,
                                                        const CBatchSettings& settings) {
    CBatchRun run(settings);
    for (const CBatchFile& file : files) run.Take(file);
    return run.Finish();
}

}  // namespace codeloom
