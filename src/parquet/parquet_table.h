// parquet/: tables as files of the Parquet format.
//   in     the rows of a CTable, a piece at a time
//   out    the bytes of a file
//   keeps  nothing
//   start  at CParquetTable here
//
// thrift.h       how a file says what it holds
// encodings.h    how the values of a page are written
// column_chunk.h all pages of a column
// A file has one group of rows, and each piece is a page of each column. Dictionaries of columns are written
// as they are, since they are made to be those of all pieces.
#pragma once

#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "arrow/table.h"
#include "parquet/column_chunk.h"

namespace codeloom {

class CParquetTable {
  public:
    // Notes of the file, by their names.
    using CNotes = std::vector<std::pair<std::string, std::string>>;

    // Adds the rows of a table, which has the same columns each time. Their dictionaries may have grown.
    void Add(const CTable& rows, const CCompress& compress);

    // The whole file. Requires: Add was called, if with no rows; `last` is what it was called with last.
    std::string Finish(const CTable& last, const CNotes& notes, const CCompress& compress);

  private:
    std::string _Footer(const CTable& table, const CNotes& notes) const;

    std::vector<CColumnChunk> _fChunks;
    size_t _fCount = 0;  // of rows
};

}  // namespace codeloom
