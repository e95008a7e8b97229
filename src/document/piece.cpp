#include "document/piece.h"

#include "signatures/join_signatures.h"
#include "text/move_bytes.h"

namespace codeloom {

void Move(CProblem& problem, uint32_t shift) {
    MoveBytes(problem, shift);
    for (CRelated& related : problem.related) MoveBytes(related, shift);
}

void Move(CRawLogical& line, uint32_t shift) {
    for (CRawToken& token : line.tokens) token.start += shift;
}

void Move(CBlock& block, uint32_t shift) {
    MoveBytesIfAny(block.header, shift);
    MoveBytesIfAny(block.previous, shift);
    MoveBytesIfAny(block.takes_all, shift);
    MoveBytesIfAny(block.full_header, shift);
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
    for (CLine& line : lines) MoveBytes(line, -start);
    for (CBlock& block : closed) Move(block, -start);
    lines.Shrink();
}

std::unique_ptr<const CPieceNames> MakeNames(CFilePart part, uint32_t start) {
    auto made = std::make_unique<CPieceNames>();
    made->names = std::move(part.analysis.names);
    made->open_scope = part.open_scope;
    COccurrences& found = made->names.occurrences;
    for (COccurrence& item : found.items) item.Move(-start);
    for (CInnerScope& scope : found.scopes) MoveBytes(scope, -start);
    for (CLineNames& line : made->names.lines) line.Move(-start);
    made->names.scopes = {};
    CSignatureJoiner(made->signatures).Append(part.analysis.signatures, -start, 0);
    return made;
}

}  // namespace codeloom
