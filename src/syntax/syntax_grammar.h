// One grammar of the language as the parser runs on it: tables, labels and node kinds by number.
#pragma once

#include <array>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "grammar/parse_tables.h"
#include "syntax/node_kinds.h"
#include "syntax/tree_forms.h"
#include "text/words.h"

namespace codeloom {

class CSyntaxGrammar {
  public:
    CSyntaxGrammar(std::string_view name, std::string_view text);

    // The file that it was made from, which lives as long as the process.
    std::string_view Text() const { return _fText; }

    const CParseTables& Tables() const { return _fTables; }
    int StartRow() const { return _fTables.StartRow(0); }

    // The label of a token by its type, and by its word where that makes a difference.
    int LabelOfType(int type) const { return _fLabelOfType[type]; }
    int LabelOfWord(EWord word, int type) const {
        const int label = _fLabelOfWord[static_cast<size_t>(word)];
        return label == kNoLabel ? LabelOfType(type) : label;
    }

    // Rules by the numbers that they have in trees, from CGrammarRules::kFirstRuleNumber on.
    ENodeKind KindOfRule(int rule_number) const { return _fKindOfRule[_Index(rule_number)]; }
    const CRuleForm* FormOfRule(int rule_number) const { return _fFormOfRule[_Index(rule_number)]; }
    int RuleCount() const { return static_cast<int>(_fRules.Rules().size()); }
    const std::string& NameOfRule(int rule_number) const { return _fRules.Rules()[_Index(rule_number)].name; }
    int NumberOfRule(std::string_view name) const;  // -1 for a name that no rule has

  private:
    static constexpr int kNoLabel = -1;

    static size_t _Index(int rule_number) {
        return static_cast<size_t>(rule_number - CGrammarRules::kFirstRuleNumber);
    }
    void _FindLabels();

    std::string_view _fText;
    CGrammarRules _fRules;
    CParseTables _fTables;
    std::array<int, CTokenTypes::kLimit> _fLabelOfType;
    std::array<int, static_cast<size_t>(EWord::kCount)> _fLabelOfWord;
    std::vector<ENodeKind> _fKindOfRule;
    std::vector<const CRuleForm*> _fFormOfRule;  // null for most
};

}  // namespace codeloom
