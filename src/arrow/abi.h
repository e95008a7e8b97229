// The structures of the Arrow C data and C stream interfaces, by which tables pass between libraries without
// a copy. Their layout is defined by the project Arrow; who makes one sets `release`, who takes one over
// calls it once.
#pragma once

#include <cstdint>

extern "C" {

struct ArrowSchema {
    const char* format;
    const char* name;
    const char* metadata;
    int64_t flags;
    int64_t n_children;
    ArrowSchema** children;
    ArrowSchema* dictionary;
    void (*release)(ArrowSchema*);
    void* private_data;
};

struct ArrowArray {
    int64_t length;
    int64_t null_count;
    int64_t offset;
    int64_t n_buffers;
    int64_t n_children;
    const void** buffers;
    ArrowArray** children;
    ArrowArray* dictionary;
    void (*release)(ArrowArray*);
    void* private_data;
};

// The calls give zero, or a number of errno.h.
struct ArrowArrayStream {
    int (*get_schema)(ArrowArrayStream*, ArrowSchema* out);
    int (*get_next)(ArrowArrayStream*, ArrowArray* out);  // a released array at the end
    const char* (*get_last_error)(ArrowArrayStream*);
    void (*release)(ArrowArrayStream*);
    void* private_data;
};

}  // extern "C"

namespace codeloom {

// Of a schema's `flags`: the column may hold nulls.
inline constexpr int64_t kArrowNullable = 2;

// The names of the capsules that pass them between libraries of the host.
inline constexpr const char* kArrowStreamCapsule = "arrow_array_stream";
inline constexpr const char* kArrowArrayCapsule = "arrow_array";
inline constexpr const char* kArrowSchemaCapsule = "arrow_schema";

}  // namespace codeloom
