// Records of a text as plain data: what its lines say about names, and where each name is.
#pragma once

#include <cstdint>
#include <memory>
#include <string_view>
#include <type_traits>

#include "names/name_table.h"
#include "text/plain_array.h"
#include "text/text_buffer.h"

namespace codeloom {

// One record. `kind` is the kind byte of record_kinds.h, kPlainEquivKind for a plain equiv.
struct CRecord {
    uint32_t name;   // in the table of names
    uint32_t value;  // where the payload, without its prefix, begins in the texts
    uint32_t value_length;
    uint32_t start;  // the bytes of the file at which the name is; equal where it is nowhere
    uint32_t end;
    char kind;
    bool of_arg;
};

static_assert(std::is_trivial_v<CRecord>);  // so that many are moved in one go

// The records of one or many lines, in their order.
struct CRecords {
    TPlainArray<CRecord> records;
    CTextBuffer values;                                                  // payloads, one after the other
    std::shared_ptr<CNameTable> names = std::make_shared<CNameTable>();  // others may share it

    std::string_view Value(const CRecord& record) const {
        return values.View().substr(record.value, record.value_length);
    }
    std::string_view Name(const CRecord& record) const { return names->Text(record.name); }
};

}  // namespace codeloom
