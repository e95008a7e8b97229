// The text of a grammar file, read into one automaton for each rule.
//
//   rule: alternatives     goes on while a bracket is open; a `#` begins a comment
//   NAME  rule  'text'     a kind of token, another rule, a keyword or operator
//   a | b   [a]   (a)   a*   a+
#pragma once

#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

#include "grammar/automaton.h"

namespace codeloom {

// What is wrong with a grammar, which the host sees as a ValueError. The message names the file and the row.
struct CGrammarError : std::invalid_argument {
    CGrammarError(const std::string& file_name, int row, const std::string& what)
        : std::invalid_argument(file_name + ":" + std::to_string(row) + ": " + what) {}
};

// A name or a quoted text on the right side of a rule.
struct CSymbolText {
    std::string text;  // without quotes
    bool is_quoted;
    int row;  // where it is first, from 1

    std::string Shown() const { return is_quoted ? "'" + text + "'" : text; }
};

struct CRuleText {
    std::string name;
    int row;         // from 1
    CNfa automaton;  // its symbols are indices into CGrammarText::symbols
};

struct CGrammarText {
    std::string file_name;
    std::vector<CSymbolText> symbols;
    std::vector<CRuleText> rules;  // at least one; the first is the start symbol
};

// Raises CGrammarError on a text that isn't a grammar.
CGrammarText ReadGrammarText(const std::string& file_name, std::string_view text);

}  // namespace codeloom
