// Pairs of brackets.
#pragma once

namespace codeloom {

constexpr char CloserOf(char opener) {
    if (opener == '(') return ')';
    return opener == '[' ? ']' : '}';
}

}  // namespace codeloom
