// The state of a search for bytes outside brackets and strings.
#pragma once

#include <Python.h>

namespace codeloom {

struct tNonNestedStruct {             // NOLINT(readability-identifier-naming)
    const char* to_search = nullptr;  // null: the search is finished, or was never set up
    const char* to_find = nullptr;    // borrowed from the byte string given at initialisation
    Py_ssize_t to_find_len = 0;
    char first_char = '\0';  // of to_find; not set when that is empty
    Py_ssize_t pos = 0;      // where the next step starts
    Py_ssize_t end = 0;      // exclusive
    int nest_count = 0;      // brackets open at pos; below zero after a closer too many
};

}  // namespace codeloom
