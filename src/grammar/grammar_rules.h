// The rules of a grammar, fit for a parser that decides by the next token.
//   in     the text of the grammar as automata, and the numbers of the token types
//   out    deterministic states with resolved symbols, and what each rule can begin with
// Refused, each with the row and the names: unknown names and operators, a rule defined twice, one that can
// be empty or begins with itself, and a choice that one token doesn't decide.
#pragma once

#include <map>
#include <string>
#include <vector>

#include "grammar/grammar_text.h"

namespace codeloom {

// The token types that a grammar text may refer to.
struct CTokenTypes {
    static constexpr int kLimit = 256;  // token types are below, numbers of rules are not

    std::map<std::string, int, std::less<>> type_of_name;
    std::map<std::string, int, std::less<>> type_of_operator;

    // True when the text decides between operators of one type.
    bool IsShared(int type) const;
};

// One kind of token, as far as the grammar distinguishes them.
struct CTerminal {
    int type;
    std::string text;  // of a keyword, or of an operator whose type other operators share; else empty
    std::string shown;
};

class CGrammarRules {
  public:
    static constexpr int kFirstRuleNumber = CTokenTypes::kLimit;

    struct CRule {
        std::string name;
        int row;
        int start_state;
        std::vector<bool> first;  // by terminal: whether the rule can begin with it
    };
    struct CState {
        int rule;
        bool accepts;
        std::vector<CArc> arcs;  // symbols below the number of rules are rules, terminals follow

        // True when nothing can follow, so that the rule ends here without a look at the next token.
        bool IsLast() const { return accepts && arcs.empty(); }
    };

    CGrammarRules(const CGrammarText& text, const CTokenTypes& token_types);

    const std::vector<CRule>& Rules() const { return _fRules; }  // the start symbol, then by name
    const std::vector<CState>& States() const { return _fStates; }
    const std::vector<CTerminal>& Terminals() const { return _fTerminals; }

    bool IsRule(int symbol) const { return symbol < static_cast<int>(_fRules.size()); }
    int TerminalOf(int symbol) const { return symbol - static_cast<int>(_fRules.size()); }

    // Whether an arc with `symbol` is the one to take when the next token is `terminal`.
    bool CanBegin(int symbol, int terminal) const {
        return IsRule(symbol) ? _fRules[symbol].first[terminal] : TerminalOf(symbol) == terminal;
    }

  private:
    // More would make the tables too large; the recursion that finds first sets relies on it too.
    static constexpr size_t kMaxRules = 2000;

    void _NameRules(const CGrammarText& text);
    void _MakeStates(const CGrammarText& text, const CTokenTypes& token_types);
    int _Resolve(const CSymbolText& symbol, const CTokenTypes& token_types);
    int _ResolveQuoted(const CSymbolText& symbol, const CTokenTypes& token_types);
    int _SymbolOfTerminal(CTerminal terminal, int row);
    void _FindFirst(int rule, std::vector<int>& path);
    [[noreturn]] void _RaiseLeftRecursion(const std::vector<int>& path) const;
    void _CheckChoices(const CState& state) const;
    std::string _Shown(int symbol) const;
    [[noreturn]] void _Raise(int row, const std::string& what) const;

    std::string _fFileName;
    std::vector<CRule> _fRules;
    std::map<std::string, int, std::less<>> _fRuleOfName;
    std::vector<CTerminal> _fTerminals;
    std::vector<CState> _fStates;
};

}  // namespace codeloom
