#include "grammar/grammar_rules.h"

#include <algorithm>

namespace codeloom {

namespace {

bool IsKeyword(const std::string& text) {
    return std::all_of(text.begin(), text.end(),
                       [](char c) { return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || c == '_'; });
}

}  // namespace

bool CTokenTypes::IsShared(int type) const {
    return std::count_if(type_of_operator.begin(), type_of_operator.end(),
                         [type](const auto& entry) { return entry.second == type; }) > 1;
}

CGrammarRules::CGrammarRules(const CGrammarText& text, const CTokenTypes& token_types)
    : _fFileName(text.file_name) {
    _NameRules(text);
    _MakeStates(text, token_types);
    for (size_t rule = 0; rule < _fRules.size(); ++rule) {
        std::vector<int> path;
        _FindFirst(static_cast<int>(rule), path);
    }
    for (const CState& state : _fStates) _CheckChoices(state);
}

// Numbers the rules: the start symbol, then the others by name.
void CGrammarRules::_NameRules(const CGrammarText& text) {
    if (text.rules.size() > kMaxRules) _Raise(text.rules[kMaxRules].row, "too many rules");
    for (const CRuleText& rule : text.rules) _fRules.push_back({rule.name, rule.row, 0, {}});
    std::sort(_fRules.begin() + 1, _fRules.end(), [](const CRule& a, const CRule& b) {
        return std::tie(a.name, a.row) < std::tie(b.name, b.row);
    });
    for (const CRule& rule : _fRules) {
        const int number = static_cast<int>(_fRuleOfName.size());
        const auto [found, is_new] = _fRuleOfName.try_emplace(rule.name, number);
        if (is_new) continue;
        const auto [first, second] = std::minmax(_fRules[found->second].row, rule.row);
        _Raise(second, "rule '" + rule.name + "' is already defined in row " + std::to_string(first));
    }
}

void CGrammarRules::_MakeStates(const CGrammarText& text, const CTokenTypes& token_types) {
    std::vector<int> symbols;
    for (const CSymbolText& symbol : text.symbols) symbols.push_back(_Resolve(symbol, token_types));
    std::vector<const CRuleText*> rule_texts(_fRules.size());
    for (const CRuleText& rule : text.rules) rule_texts[_fRuleOfName.find(rule.name)->second] = &rule;
    for (size_t rule = 0; rule < _fRules.size(); ++rule) {
        CNfa automaton = rule_texts[rule]->automaton;
        automaton.RenumberSymbols([&](int symbol) { return symbols[symbol]; });
        const int start = static_cast<int>(_fStates.size());
        _fRules[rule].start_state = start;
        for (CDfaState& state : MakeDfa(automaton)) {
            for (CArc& arc : state.arcs) arc.target += start;
            _fStates.push_back({static_cast<int>(rule), state.accepts, std::move(state.arcs)});
        }
        if (_fStates[start].accepts)
            _Raise(_fRules[rule].row,
                   "rule '" + _fRules[rule].name + "' can be empty, but must take a token");
    }
}

int CGrammarRules::_Resolve(const CSymbolText& symbol, const CTokenTypes& token_types) {
    if (symbol.is_quoted) return _ResolveQuoted(symbol, token_types);
    if (const auto rule = _fRuleOfName.find(symbol.text); rule != _fRuleOfName.end()) return rule->second;
    const auto type = token_types.type_of_name.find(symbol.text);
    if (type == token_types.type_of_name.end())
        _Raise(symbol.row, "'" + symbol.text + "' is neither a rule nor a kind of token");
    return _SymbolOfTerminal({type->second, "", symbol.text}, symbol.row);
}

int CGrammarRules::_ResolveQuoted(const CSymbolText& symbol, const CTokenTypes& token_types) {
    if (IsKeyword(symbol.text)) {
        const auto name = token_types.type_of_name.find("NAME");
        if (name == token_types.type_of_name.end())
            _Raise(symbol.row, "a keyword needs a kind of token called NAME");
        return _SymbolOfTerminal({name->second, symbol.text, symbol.Shown()}, symbol.row);
    }
    const auto type = token_types.type_of_operator.find(symbol.text);
    if (type == token_types.type_of_operator.end())
        _Raise(symbol.row, symbol.Shown() + " isn't an operator that the tokens know");
    const bool is_shared = token_types.IsShared(type->second);
    return _SymbolOfTerminal({type->second, is_shared ? symbol.text : "", symbol.Shown()}, symbol.row);
}

int CGrammarRules::_SymbolOfTerminal(CTerminal terminal, int row) {
    if (terminal.type < 0 || terminal.type >= CTokenTypes::kLimit)
        _Raise(row, "the type of " + terminal.shown + " is " + std::to_string(terminal.type) +
                        ", but must be from 0 to 255");
    const auto same = std::find_if(_fTerminals.begin(), _fTerminals.end(), [&](const CTerminal& other) {
        return other.type == terminal.type && other.text == terminal.text;
    });
    const auto index = same - _fTerminals.begin();
    if (same == _fTerminals.end()) _fTerminals.push_back(std::move(terminal));
    return static_cast<int>(_fRules.size() + index);
}

// Finds what `rule` can begin with, and before it the rules that it can begin with. `path` holds the rules
// whose beginning is being looked for.
void CGrammarRules::_FindFirst(int rule, std::vector<int>& path) {
    if (!_fRules[rule].first.empty()) return;
    const bool is_recursive = std::find(path.begin(), path.end(), rule) != path.end();
    path.push_back(rule);
    if (is_recursive) _RaiseLeftRecursion(path);
    std::vector<bool> first(_fTerminals.size());
    for (const CArc& arc : _fStates[_fRules[rule].start_state].arcs) {
        if (IsRule(arc.symbol)) _FindFirst(arc.symbol, path);
        for (size_t terminal = 0; terminal < first.size(); ++terminal)
            if (CanBegin(arc.symbol, static_cast<int>(terminal))) first[terminal] = true;
    }
    _fRules[rule].first = std::move(first);
    path.pop_back();
}

// `path` ends with the rule that begins with itself.
void CGrammarRules::_RaiseLeftRecursion(const std::vector<int>& path) const {
    const CRule& rule = _fRules[path.back()];
    std::string shown = rule.name;
    for (auto step = std::find(path.begin(), path.end(), path.back()) + 1; step != path.end(); ++step)
        shown += " -> " + _fRules[*step].name;
    _Raise(rule.row, "rule '" + rule.name + "' begins with itself: " + shown);
}

void CGrammarRules::_CheckChoices(const CState& state) const {
    for (size_t terminal = 0; terminal < _fTerminals.size(); ++terminal) {
        const CArc* chosen = nullptr;
        for (const CArc& arc : state.arcs) {
            if (!CanBegin(arc.symbol, static_cast<int>(terminal))) continue;
            if (chosen != nullptr)
                _Raise(_fRules[state.rule].row, "rule '" + _fRules[state.rule].name + "' leaves a choice: " +
                                                    _fTerminals[terminal].shown + " can begin both " +
                                                    _Shown(chosen->symbol) + " and " + _Shown(arc.symbol));
            chosen = &arc;
        }
    }
}

std::string CGrammarRules::_Shown(int symbol) const {
    return IsRule(symbol) ? _fRules[symbol].name : _fTerminals[TerminalOf(symbol)].shown;
}

void CGrammarRules::_Raise(int row, const std::string& what) const {
    throw CGrammarError(_fFileName, row, what);
}

}  // namespace codeloom
