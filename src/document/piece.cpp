#include "document/piece.h"

#include "signatures/join_signatures.h"

namespace codeloom {

namespace {

void Move(CStatementHead& head, uint32_t shift) {
    if (head.start == head.end) return;
    head.start += shift;
    head.end += shift;
}

}  // namespace

void Move(CProblem& problem, uint32_t shift) {
    problem.start += shift;
    problem.end += shift;
    for (CRelated& related : problem.related) {
        related.start += shift;
        related.end += shift;
    }
}

void Move(CRawLogical& line, uint32_t shift) {
    for (CRawToken& token : line.tokens) token.start += shift;
}

void Move(CBlock& block, uint32_t shift) {
    Move(block.header, shift);
    Move(block.previous, shift);
    for (CSpan* const span : {&block.takes_all, &block.full_header}) {
        if (span->start == span->end) continue;
        span->start += shift;
        span->end += shift;
    }
    if (block.bare_except_start == block.bare_except_end) return;
    block.bare_except_start += shift;
    block.bare_except_end += shift;
}

CPiece::CPiece(std::string_view file_text, CFilePart part, uint32_t start, const CPartState& state_before)
    : text(file_text.substr(start, part.end - start)),
      rows(text),
      state(state_before),
      looked_at(part.looked_at - start),
      problems(std::move(part.analysis.problems)),
      faults(std::move(part.faults)),
      late_problems(std::move(part.late_problems)),
      lines(std::move(part.analysis.lines)),
      scanned_in_vain(part.scanned_in_vain),
      repeated_text(part.repeated_text),
      has_asked_for_literals(part.has_asked_for_literals),
      closed(std::move(part.closed)),
      may_have_reopened(part.may_have_reopened),
      declares_for_others(part.declares_for_others),
      needs_whole_text(part.needs_whole_text) {
    for (CProblem& problem : problems) Move(problem, -start);
    for (CProblem& problem : late_problems) Move(problem, -start);
    for (CLineFault& fault : faults) Move(fault.line, -start);
    for (CLine& line : lines) {
        line.start -= start;
        line.end -= start;
    }
    for (CBlock& block : closed) Move(block, -start);
    lines.Shrink();
}

std::unique_ptr<const CPieceNames> MakeNames(CFilePart part, uint32_t start) {
    auto made = std::make_unique<CPieceNames>();
    made->names = std::move(part.analysis.names);
    made->open_scope = part.open_scope;
    COccurrences& found = made->names.occurrences;
    for (COccurrence& item : found.items) {
        item.start -= start;
        item.end -= start;
        if (item.object_start == item.object_end) continue;
        item.object_start -= start;
        item.object_end -= start;
    }
    for (CInnerScope& scope : found.scopes) {
        scope.start -= start;
        scope.end -= start;
    }
    for (CLineNames& line : made->names.lines)
        if (line.end != 0) line.end -= start;
    made->names.scopes = {};
    CSignatureJoiner(made->signatures).Append(part.analysis.signatures, -start, 0);
    return made;
}

}  // namespace codeloom
