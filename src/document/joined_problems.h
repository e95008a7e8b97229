// The problems of pieces, one piece after the other, without those that follow from others.
#pragma once

#include <cstdint>
#include <string_view>

#include "document/piece.h"
#include "file/follow_ups.h"

namespace codeloom {

class CJoinedProblems {
  public:
    // `text` is that of all pieces.
    explicit CJoinedProblems(std::string_view text) : _fText(text) {}

    // Call in their order for all pieces that have problems.
    void Add(const CPiece& piece, uint32_t start);
    // The problems of declarations: those that the pieces know, or else those that the caller puts there.
    void AddLate(const CPiece& piece, uint32_t start);
    CProblems& Late() { return _fLate; }
    // By place. Call once.
    CProblems Take();

  private:
    bool _FollowsFromOther(const CProblem& problem, CRawLogical line, uint32_t start);

    std::string_view _fText;
    CProblems _fProblems;
    CProblems _fLate;
    CFollowUps _fFollowUps;
};

}  // namespace codeloom
