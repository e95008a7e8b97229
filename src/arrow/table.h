// A table in columns, and the same as a stream of the Arrow C stream interface.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "arrow/abi.h"
#include "arrow/column.h"

namespace codeloom {

struct CTable {
    struct CField {
        std::string name;
        bool is_nullable = false;
        std::unique_ptr<CColumn> column;
    };

    std::vector<CField> fields;
    size_t count = 0;  // of rows
};

// Makes `out` a stream of one batch, which is the table. What is taken from the stream shares the table's
// buffers and keeps them alive; any thread may use and release it.
void ExportStream(std::shared_ptr<const CTable> table, ArrowArrayStream& out);

}  // namespace codeloom
