#include "file/follow_ups.h"

#include <algorithm>

namespace codeloom {

namespace {

// What a text may be full of is reported once: prompts, markup.
bool IsSaid(const CProblem& problem, const CProblems& reported) {
    return std::any_of(reported.begin(), reported.end(), [&](const CProblem& other) {
        return other.code == problem.code && other.message == problem.message;
    });
}

//   def f()    lacks its ':'
//   {          is written instead of it, on a row of its own
bool IsBraceOfHeader(const CRawLogical& line, const CProblems& reported) {
    if (line.tokens.front().type != kTokenId_LBRACE || reported.empty()) return false;
    const CProblem& last = reported.back();
    const uint32_t start = line.StartOf(line.tokens.front());
    if (last.code != ECode::kMissingColon || last.end > start) return false;
    const std::string_view between = line.file_text.substr(last.end, start - last.end);
    return between.find_first_not_of(" \t\r\n") == std::string_view::npos;
}

char QuoteAt(std::string_view text, uint32_t start) {
    const size_t quote_pos = text.find_first_of("'\"", start);
    return quote_pos == std::string_view::npos ? '\0' : text[quote_pos];
}

}  // namespace

bool CFollowUps::Take(const CProblem& problem, const CRawLogical& line, CProblems& reported) {
    bool follows = false;
    switch (problem.code) {
        case ECode::kForeignText:
            follows = IsSaid(problem, reported);
            break;
        case ECode::kConflictMarker:
            _NoteConflict(problem, line.file_text);
            break;
        case ECode::kUnterminatedTriple:
            _fTripleQuote = QuoteAt(line.file_text, problem.start);
            break;
        case ECode::kUnterminatedString:
            follows = _EndsTriple(problem, line.file_text);
            break;
        case ECode::kUnmatchedCloser:
            follows = _ClosesEarlier(problem, line, reported);
            break;
        default:
            break;
    }
    follows |= IsBraceOfHeader(line, reported);
    _NoteOpen(line);
    return follows;
}

void CFollowUps::DropInConflicts(CProblems& problems) const {
    for (const CSpan& conflict : _fConflicts)
        std::erase_if(problems, [&](const CProblem& problem) {
            const bool is_marker = problem.start == conflict.start && problem.code == ECode::kConflictMarker;
            return !is_marker && problem.start >= conflict.start && problem.start < conflict.end;
        });
}

void CFollowUps::_NoteConflict(const CProblem& problem, std::string_view text) {
    const size_t last_marker = text.find("\n>>>>>>>", problem.start);
    const size_t in_last_row = last_marker == std::string_view::npos ? problem.start : last_marker + 1;
    const size_t end = std::min(text.find('\n', in_last_row), text.size());
    _fConflicts.push_back({problem.start, static_cast<uint32_t>(end)});
}

// `""" text"` was closed with fewer quotes than it was opened with.
bool CFollowUps::_EndsTriple(const CProblem& problem, std::string_view text) {
    if (_fTripleQuote == 0 || QuoteAt(text, problem.start) != _fTripleQuote) return false;
    _fTripleQuote = 0;
    return true;
}

//   f(          the line is broken off before `return`
//       return
//   )           is where the line began
//   (def f():
//       pass)   ends what the other one began
bool CFollowUps::_ClosesEarlier(const CProblem& problem, const CRawLogical& line, CProblems& reported) {
    const CRawToken& first = line.tokens.front();
    const CRawToken& last = line.tokens.back();
    const bool is_first = line.StartOf(first) == problem.start;
    const bool is_last = line.StartOf(last) == problem.start;
    const int16_t closer_type = is_first ? first.type : last.type;
    const auto closes = [&](const COpen& open) {
        return open.type + 1 == closer_type &&
               ((is_first && open.column == first.position.col) || (is_last && open.is_first));
    };
    const auto found = std::find_if(_fOpen.rbegin(), _fOpen.rend(), closes);
    if (found == _fOpen.rend()) return false;
    for (CProblem& earlier : reported)
        if (earlier.code == ECode::kNeverClosed && earlier.start == found->start)
            earlier.related.push_back({problem.start, problem.end, "closes it, after a statement"});
    _fOpen.erase(found.base() - 1, _fOpen.end());
    return true;
}

void CFollowUps::_NoteOpen(const CRawLogical& line) {
    const size_t before = _fOpen.size();
    for (const CRawToken& token : line.tokens) {
        if (IsOpenerType(token.type))
            _fOpen.push_back(
                {token.type, token.start, line.tokens.front().position.col, &token == line.tokens.data()});
        if (IsCloserType(token.type) && _fOpen.size() > before) _fOpen.pop_back();
    }
}

}  // namespace codeloom
