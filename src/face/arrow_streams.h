// Tables for other libraries of the host, by the capsules of the Arrow C interfaces.
#pragma once

#include <memory>

#include "arrow/tables.h"
#include "face/source_file.h"

namespace codeloom {

// A table as the host sees it.
struct CHostTable {
    std::string_view name;
    std::shared_ptr<const CTable> table;
};

// A capsule "arrow_array_stream". Who takes it over empties it; otherwise it frees the stream.
nb::object StreamCapsule(std::shared_ptr<const CTable> table);

// Some rows of a table of a file. Requires: a table has this name.
nb::object StreamOfRows(const CSourceFile& file, const char* table, const CSelection& selection);

// Raises ValueError for a name that no table has.
const CTableKind& TableKindNamed(std::string_view name);

// A whole table of a file. Raises ValueError where no table has the name.
CHostTable TableOf(const CSourceFile& file, std::string_view name);

// Binds the class Table, and what tables there are.
void BindTables(nb::module_& module);

}  // namespace codeloom
