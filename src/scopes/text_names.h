// scopes/: which scope each name of a text belongs to.
//   in     the occurrences of each line, and the blocks around it
//   out    scopes with their symbols; for each occurrence the symbol that it is, and so the scope that binds
//          it
//   keeps  nothing
//   start  at CNameCollector, which gathers a text's lines; BuildScopes makes scopes of them
//
// block_scopes.h     the scope around a line, by its blocks
// scope_builder.cpp  symbols, then where each is bound
// join_names.h       the names of a text out of those of its parts
// lost_bindings.cpp  what a line with a fault evidently binds
// declarations.cpp   what is wrong with `global` and `nonlocal`
// A line with a fault is a gap: nothing is known of its names but that they are there, and what it plainly
// binds. The occurrences of a line and the scopes within it depend on that line alone, but for the import
// that defers annotations; what is made of blocks is made anew when lines change.
#pragma once

#include <vector>

#include "scopes/scopes.h"

namespace codeloom {

// Of one line.
struct CLineNames {
    uint32_t first_occurrence = 0;
    uint32_t first_scope = 0;  // among the scopes that begin on lines
    uint32_t scope = 0;        // around the line, among all
    uint32_t end = 0;          // of the line in bytes; zero for a comment
    bool is_in_doubt = false;  // a fault may have moved what is around it
    bool has_fault = false;

    // To other bytes.
    void Move(uint32_t shift) {
        if (end != 0) end += shift;
    }
};

// What a line with a fault evidently binds.
struct CLostBinding {
    uint32_t name = 0;
    uint32_t scope = 0;  // among all
};

struct CTextNames {
    COccurrences occurrences;
    TPlainArray<CLineNames> lines;     // as many as lines of the text
    std::vector<uint32_t> lost_names;  // those on lines with a fault, by number
    std::vector<CLostBinding> lost_bindings;
    CScopeTable scopes;

    // The occurrences of a line are those from FirstOccurrence(line_i) up to FirstOccurrence(line_i + 1).
    uint32_t FirstOccurrence(size_t line_i) const {
        return line_i < lines.size() ? lines[line_i].first_occurrence
                                     : static_cast<uint32_t>(occurrences.items.size());
    }
    // The scopes that begin on a line are those from FirstScope(line_i) up to FirstScope(line_i + 1), among
    // all.
    uint32_t FirstScope(size_t line_i) const {
        return line_i < lines.size() ? lines[line_i].first_scope + 1
                                     : static_cast<uint32_t>(scopes.scopes.size());
    }
    // Releases memory that isn't used.
    void Shrink();

    uint32_t LineOfOccurrence(uint32_t occurrence_i) const;

    // Among all scopes, that of what is counted from a line. The module's is the first one.
    uint32_t ScopeOf(const CLineNames& line, uint32_t scope) const {
        return scope == 0 ? line.scope : line.first_scope + scope;
    }
    uint32_t ScopeOfOccurrence(uint32_t occurrence_i) const {
        return ScopeOf(lines[LineOfOccurrence(occurrence_i)], occurrences.items[occurrence_i].scope);
    }
};

}  // namespace codeloom
