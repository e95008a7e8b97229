#include "arrow/line_rows.h"

#include <algorithm>

namespace codeloom {

// Problems

const TColumns<CProblemRow>& CProblemSource::Columns() {
    static const auto columns =
        TColumns<CProblemRow>()
            .Add<&CProblemRow::code>("code", "What kind of fault it is, such as `CL201`.")
            .Add<&CProblemRow::severity>("severity", "`error`, or `warning`.")
            .Add<&CProblemRow::line>("line", "The index of its line; null in a text without lines.")
            .AddRange<&CProblemRow::range>("", "The row of what it is about, from 1.")
            .Add<&CProblemRow::message>("message", "What is wrong, in words.")
            .Add<&CProblemRow::hint>("hint", "What may have been meant; null where that isn't known.")
            .Add<&CProblemRow::text>("text",
                                     "The row of the source; null where that has more than 1,000 bytes.");
    return columns;
}

CProblemRow CProblemSource::Of(uint32_t i) const {
    constexpr size_t kMostText = 1'000;
    const CProblem& problem = _fText.analysis.problems[i];
    const CRange range = _fText.rows.RangeOf(problem.start, problem.end);
    const std::string_view text = _fText.rows.Text(range.row - 1);
    return {.code = {CodeText(problem.code)},
            .severity = SeverityOf(problem.code),
            .line = _fText.analysis.LineAt(problem.start),
            .range = range,
            .message = problem.message,
            .hint = problem.hint.empty() ? std::nullopt : std::optional<std::string_view>(problem.hint),
            .text = text.size() > kMostText ? std::nullopt : std::optional(text)};
}

// Lines

const TColumns<CLineRow>& CLineSource::Columns() {
    static const auto columns =
        TColumns<CLineRow>()
            .Add<&CLineRow::line>("line", "The index of the line, by which other tables name it.")
            .Add<&CLineRow::kind>("kind", "What kind of statement it holds or begins.")
            .AddRange<&CLineRow::range>("", "Its first row, from 1.")
            .Add<&CLineRow::indent>("indent",
                                    "The width of the blanks before it; null after another line on "
                                    "the same row.")
            .AddSource<&CLineRow::text>("text", "Its text, as written; in an index with `--text` only.");
    return columns;
}

CLineRow CLineSource::Of(uint32_t i) const {
    const CLine& line = _fText.analysis.lines[i];
    const int indent = _fText.rows.IndentOf(line.start);
    return {.line = i,
            .kind = line.type,
            .range = _fText.rows.RangeOf(line.start, line.end),
            .indent = indent < 0 ? std::nullopt : std::optional(static_cast<uint32_t>(indent)),
            .text = _fText.text.substr(line.start, line.end - line.start)};
}

// Records

const TColumns<CRecordRow>& CRecordSource::Columns() {
    static const auto columns =
        TColumns<CRecordRow>()
            .Add<&CRecordRow::line>("line", "The index of its line.")
            .Add<&CRecordRow::kind>("kind", "What is said of the name.")
            .Add<&CRecordRow::name>("name", "The name; a chain such as `a.b` is one too.")
            .Add<&CRecordRow::payload>("payload", "What is said besides the kind.")
            .Add<&CRecordRow::of_argument>("of_argument",
                                           "The name is an argument or a type parameter of "
                                           "the definition on its line.")
            .AddRange<&CRecordRow::range>("",
                                          "The row of the name, from 1; null where it has no place, as "
                                          "are the next three.");
    return columns;
}

CRecordRow CRecordSource::Of(uint32_t i) {
    const CFileAnalysis& analysis = _fText.analysis;
    if (i < analysis.FirstRecord(_fLine)) _fLine = analysis.LineOfRecord(i);
    while (i >= analysis.FirstRecord(_fLine + 1)) ++_fLine;
    const CRecord& record = analysis.records.records[i];
    const bool has_place = record.start < record.end;
    return {.line = _fLine,
            .kind = RecordKindOf(record.kind),
            .name = {record.name},
            .payload = analysis.records.Value(record),
            .of_argument = record.of_arg,
            .range = has_place ? std::optional(_fText.rows.RangeOf(record.start, record.end)) : std::nullopt};
}

// Limits

const TColumns<CLimitRow>& CLimitSource::Columns() {
    static const auto columns =
        TColumns<CLimitRow>()
            .Add<&CLimitRow::line>("line", "The index of the line that lacks some of its records.")
            .Add<&CLimitRow::kind>("kind", "Which limit it met.");
    return columns;
}

CLimitRow CLimitSource::Of(uint32_t i) const {
    const CLineLimit& limit = _fText.analysis.limits[i];
    return {.line = limit.line, .kind = limit.limit};
}

}  // namespace codeloom
