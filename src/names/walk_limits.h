// The limits of a walk over one logical line.
#pragma once

#include <cstdint>

namespace codeloom {

// A limit that a walk hit: the line keeps the records found before.
enum class ELimit : uint8_t { kNone, kTooManyVisits, kTooDeep };

constexpr uint32_t kMostVisits = 10'000;
constexpr uint32_t kMostDepth = 40;  // of nodes that are visited; 1 at the root

// What is read without being visited: texts, targets, patterns, parameters. Deeper than any interpreter's own
// parser goes, and shallow enough for a thread's small stack.
constexpr uint32_t kMostNesting = 250;

// Thrown where a limit is hit, and caught where the walk began.
struct CLimitHit {
    ELimit limit;
};

// Counts one level of nesting while it lives.
class CNesting {
  public:
    explicit CNesting(uint32_t& depth) : _fDepth(depth) {
        if (++_fDepth > kMostNesting) [[unlikely]] {
            --_fDepth;
            throw CLimitHit{ELimit::kTooDeep};
        }
    }
    ~CNesting() { --_fDepth; }
    CNesting(const CNesting&) = delete;
    CNesting& operator=(const CNesting&) = delete;

  private:
    uint32_t& _fDepth;
};

}  // namespace codeloom
