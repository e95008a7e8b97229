#include "neighbours/tokenizer/recovery.h"

#include <algorithm>

#include "neighbours/tokenizer/keywords.h"
#include "neighbours/tokenizer/rows.h"

namespace codeloom {

namespace {

// A header of more rows than this isn't believed, so that looking for its end takes bounded time.
constexpr int kMostHeaderRows = 200;

constexpr auto kCompoundWords =
    std::to_array<std::string_view>({"def", "class", "if", "elif", "else", "for", "while", "with", "try",
                                     "except", "finally", "async", "match", "case"});

// The end of a simple statement. Comment rows directly before the row that ends it stay outside, unless they
// are indented deeper.
size_t FindIndentedEnd(CLexer& lexer, const CPlace& place) {
    CRowReader reader(lexer, place);
    CTokenRow row;
    reader.Next(row);
    size_t comments_start = 0;
    size_t end = row.end;
    while (reader.Next(row)) {
        const bool is_deeper = row.indent > place.indent;
        if (row.is_comment && !is_deeper) {
            if (comments_start == 0) comments_start = row.start;
            continue;
        }
        if (!is_deeper && !row.begins_with_closer) break;
        if (row.is_comment && comments_start) continue;
        comments_start = 0;
        end = row.end;
    }
    return end;
}

struct CHeaderEnd {
    size_t end = 0;  // behind the row that ends the header; zero when none does
    bool is_sure = false;
};

// The end of a compound header whose rows begin at `place`. A header without a row that ends in ":" ends
// before the body, that is before the first of the least indented rows among those that are deeper than its
// own.
size_t FindHeaderEnd(CLexer& lexer, const CPlace& place) {
    CRowReader reader(lexer, place);
    CTokenRow row;
    reader.Next(row);
    size_t body_start = row.end;
    int32_t body_indent = INT32_MAX;
    for (int row_count = 0; row_count < kMostHeaderRows; ++row_count) {
        if (row.ends_in_colon) return row.end;
        if (!reader.Next(row)) break;
        const bool is_deeper = row.indent > place.indent;
        if (!is_deeper && !row.begins_with_closer) break;
        if (is_deeper && !row.is_comment && row.indent < body_indent) {
            body_indent = row.indent;
            body_start = row.start;
        }
        if (row.begins_statement) break;
    }
    return body_start;
}

}  // namespace

size_t FindRecoveredEnd(CLexer& lexer, const CPlace& place) {
    const bool is_compound = keywords::IsOneOf(WordAt(lexer.Text(), place.pos), kCompoundWords);
    if (is_compound) return FindHeaderEnd(lexer, place);
    CRowReader reader(lexer, place);
    CTokenRow row;
    reader.Next(row);
    const bool is_spoilt_header =
        row.ends_in_colon && (reader.OpenBrackets().empty() || reader.OpenBrackets().back() == ')');
    return is_spoilt_header ? row.end : FindIndentedEnd(lexer, place);
}

size_t FindStrayCloser(CLexer& lexer, CPlace place, int32_t indent, size_t& looked_at) {
    CRowReader reader(lexer, place);
    CTokenRow row;
    bool is_inside = false;
    while (reader.Next(row)) {
        looked_at = row.start;
        const bool can_continue = is_inside || row.indent > indent || row.begins_with_closer;
        if (!can_continue || row.begins_statement) return 0;
        if (row.stray_closer_end) return row.stray_closer_end;
        is_inside = !reader.OpenBrackets().empty();
    }
    looked_at = lexer.Text().size();
    return 0;
}

}  // namespace codeloom
