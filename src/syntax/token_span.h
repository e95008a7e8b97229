// The part of a logical line that a parser is to take, and steps over its tokens.
#pragma once

#include <cstdint>
#include <span>

#include "tokenizer/raw_logical.h"

namespace codeloom {

struct CTokenRange {
    uint32_t start;
    uint32_t end;
};

// 1 for an opening bracket, -1 for a closing one, 0 for any other token. Kinds of brackets don't matter.
constexpr int DepthStep(const CRawToken& token) {
    if (IsOpenerType(token.type)) return 1;
    return IsCloserType(token.type) ? -1 : 0;
}

// A plain value; it views the line and the list of removed tokens.
struct CTokenSpan {
    static constexpr uint32_t kNone = UINT32_MAX;

    const CRawLogical* line = nullptr;
    uint32_t start = 0;
    uint32_t end = 0;
    uint32_t tail = 0;  // where what is missing after the end is reported: the end, or that of the line
    bool in_async_def = false;
    std::span<const CTokenRange> removed = {};  // tokens that aren't looked at, in their order

    static CTokenSpan OfLine(const CRawLogical& line, bool in_async_def) {
        const auto count = static_cast<uint32_t>(line.tokens.size());
        return {&line, 0, count, count, in_async_def};
    }

    // The tokens from `part_start` to `part_end`, as if the line ended there.
    CTokenSpan Part(uint32_t part_start, uint32_t part_end) const {
        return {line, part_start, part_end, part_end, in_async_def};
    }
    // The same tokens, with the others of the line still to come.
    CTokenSpan Within(uint32_t part_start, uint32_t part_end) const {
        return {line, part_start, part_end, tail, in_async_def};
    }
    CTokenSpan Without(std::span<const CTokenRange> ranges) const {
        return {line, start, end, tail, in_async_def, ranges};
    }

    const CRawToken& Token(uint32_t i) const { return line->tokens[i]; }
    bool IsType(uint32_t i, int type) const { return i < end && Token(i).type == type; }
    bool IsWord(uint32_t i, EWord word) const { return i < end && Token(i).word == word; }
    bool IsName(uint32_t i) const { return IsType(i, kTokenId_NAME); }

    bool IsRemoved(uint32_t i) const {
        for (const CTokenRange& range : removed)
            if (range.start <= i && i < range.end) return true;
        return false;
    }

    // True for a comment or a backslash, which aren't part of a statement; for a backslash before blanks too.
    bool IsPassedOver(uint32_t i) const {
        const CRawToken& token = Token(i);
        return codeloom::IsPassedOver(token) ||
               (token.type == kTokenId_ERRORTOKEN && line->Text(token).starts_with('\\'));
    }

    // For a backslash: true when it ends its row.
    bool ContinuesRow(uint32_t i) const {
        return i + 1 == tail || line->tokens[i + 1].position.row > Token(i).position.row;
    }

    // The first token; the token after the one at `i`. Comments, backslashes and removed tokens are passed
    // over. `tail` where there is none.
    uint32_t First() const {
        const bool is_at_once = start < end && removed.empty() && !IsPassedOver(start);
        return is_at_once ? start : _From(start);
    }
    uint32_t Next(uint32_t i) const { return _From(i + 1); }

    // The token before the place `i`; kNone where there is none.
    uint32_t Previous(uint32_t i) const {
        while (i > start) {
            --i;
            if (i < end && !IsRemoved(i) && !IsPassedOver(i)) return i;
        }
        return kNone;
    }

    // The token of `type` in [from, to) outside brackets; kNone where there is none. It may be a bracket
    // itself.
    uint32_t Find(int type, uint32_t from, uint32_t to) const {
        int depth = 0;
        for (uint32_t i = from; i < to; ++i) {
            const CRawToken& token = Token(i);
            if (depth == 0 && token.type == type) return i;
            depth += DepthStep(token);
        }
        return kNone;
    }

  private:
    uint32_t _From(uint32_t i) const {
        for (; i < end; ++i)
            if (!IsPassedOver(i) && !IsRemoved(i)) return i;
        return tail;
    }
};

// Calls visit(i, token) for each token of `span` from `from` on that is outside brackets, closing
// brackets not among them, until it returns false. Comments, backslashes and removed tokens are passed over,
// and what is between a `lambda` and its `:`.
template <class Visit>
void ForEachOutsideBrackets(const CTokenSpan& span, uint32_t from, Visit visit) {
    int depth = 0, lambda_count = 0;
    for (uint32_t i = span.Next(from - 1); i < span.end; i = span.Next(i)) {
        const CRawToken& token = span.Token(i);
        const int step = DepthStep(token);
        if (depth == 0 && token.word == EWord::kLambda) {
            ++lambda_count;
        } else if (depth == 0 && lambda_count != 0) {
            lambda_count -= token.type == kTokenId_COLON;
        } else if (depth == 0 && step >= 0 && !visit(i, token)) {
            return;
        }
        depth += step;
    }
}

}  // namespace codeloom
