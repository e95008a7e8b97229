// A part of an index: what many sources say, as Parquet files.
#pragma once

#include <map>
#include <string>
#include <utility>
#include <vector>

#include "arrow/batch.h"
#include "face/source_batch.h"
#include "parquet/parquet_table.h"

namespace codeloom {

class CParquetPart {
  public:
    // `notes` are those of all files, and of the file of each table. `compress` takes bytes and gives bytes;
    // it is called with the lock.
    CParquetPart(const std::vector<std::string>& tables, bool false_hints, double max_seconds,
                 std::map<std::string, std::map<std::string, std::string>> notes, nb::callable compress);

    CParquetPart(const CParquetPart&) = delete;
    CParquetPart& operator=(const CParquetPart&) = delete;

    // Analyses what was taken of a batch. The lock is free but for calls of `compress`.
    void Add(const CSourceBatch& sources);

    // The files as bytes, by the names of their tables. Nothing can be added afterwards.
    nb::dict Finish();

  private:
    std::string _Compress(std::string_view bytes) const;
    void _AddPages();

    CBatchAnalyzer _fAnalyzer;
    std::map<std::string, std::map<std::string, std::string>> _fNotes;
    nb::callable _fCompress;
    std::vector<CParquetTable> _fFiles;
};

void BindParquetPart(nb::module_& module);

}  // namespace codeloom
