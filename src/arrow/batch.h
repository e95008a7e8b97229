// The tables of many texts, made one text after the other.
#pragma once

#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "arrow/file_rows.h"
#include "arrow/tables.h"
#include "file/file_analyzer.h"

namespace codeloom {

// One file of a batch: the row that tells of it, and its text unless it isn't to be analysed.
struct CBatchFile {
    CFileRow row;
    std::optional<std::string_view> text;
    const CUnreadable* unreadable = nullptr;  // none for a text that was decoded without a fault
    int version = CLanguage::kNewest;
};

struct CBatchSettings {
    std::vector<const CTableKind*> tables;
    bool false_hints = false;
    bool with_source = true;  // as in CTableForm
    double most_seconds = 0;  // for a file
};

// The name of the table of files, and its columns.
inline constexpr std::string_view kFilesTable = "files";
std::vector<CTableKind::CColumnInfo> FileColumnInfos();

// The tables that the settings name, in their order, and that of the files. Any thread may call it.
std::vector<std::shared_ptr<const CTable>> AnalyzeBatch(std::span<const CBatchFile> files,
                                                        const CBatchSettings& settings);

}  // namespace codeloom
