// Searches outside brackets among the tokens of a logical line. Kinds of brackets aren't distinguished. The
// depth may fall below zero, where nothing is found.
#pragma once

#include <string_view>
#include <vector>

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

// 1 for an opening bracket, -1 for a closing one, 0 for any other token.
int DepthStep(std::string_view token);

// True for a comment, a backslash and an empty text, which aren't part of a statement.
constexpr bool IsPassedOver(std::string_view token) {
    return token.empty() || token.front() == '#' || token.front() == '\\';
}

// True when there is a token at `i`, and it is `text`.
bool IsToken(nb::handle toks, Py_ssize_t i, std::string_view text);

// True for a name or a keyword; IndexError past the end.
bool IsName(nb::handle toks, Py_ssize_t i);

// The index in [start, end) of the token `target` outside brackets; -1 when there is none. The target may be
// a bracket itself. `depth` is that of `start`.
Py_ssize_t FindOutsideBrackets(std::string_view target, nb::handle toks, Py_ssize_t start, Py_ssize_t end,
                               int depth = 0);

// `found` itself when it is -1 or in [start, end); ValueError for what else an override may answer, since a
// search that goes back never ends.
Py_ssize_t CheckedIndex(Py_ssize_t found, Py_ssize_t start, Py_ssize_t end);

// FindOutsideBrackets for many searches in one tuple of tokens: each takes one step over a whole bracket, so
// that nested brackets cost no more than flat ones.
class CBracketSteps {
  public:
    CBracketSteps() = default;
    explicit CBracketSteps(nb::handle toks);

    // `toks` is the tuple that this was made of.
    Py_ssize_t Find(std::string_view target, nb::handle toks, Py_ssize_t start, Py_ssize_t end) const;

  private:
    std::vector<Py_ssize_t> _fNext;  // for each token the next one outside of what it opens
};

}  // namespace codeloom
