// The tables that the parser runs on.
//   in     the rules of a grammar
//   out    for each place in a rule a row, and in it for each label of the next token the move to make
//
// Terminals that no rule distinguishes share a label.
//
// Where single children are promoted, chains make an atom cheap. When a rule is begun, the next token alone
// decides which rule it begins with, which one that begins with, and so on down to the rule that takes the
// token: in an expression some seventeen rules, each with one child so far. All these chains are known
// beforehand, and kept as a tree: a chain is its last rule, in the state after its first child, and the
// chain of the rules around that one. Rules that can take no second child are left out, since such a rule is
// replaced by its child.
#pragma once

#include <cstdint>
#include <map>
#include <utility>
#include <vector>

#include "grammar/grammar_rules.h"

namespace codeloom {

enum class EMove : uint16_t {
    kRefuse,    // the token fits nowhere
    kDone,      // the start symbol is complete, and nothing may follow
    kComplete,  // the rule is complete
    kPromote,   // all rules of the chain end with their single child, which belongs to the rule below
    kOpen,      // open a rule that begins with the token, and look there
    kShift,     // take the token
    kBegin,     // take the token as the first child of a chain
};

struct CMove {
    EMove kind = EMove::kRefuse;
    uint16_t chain = 0;      // the chain whose last rule moves, where that is decided just now, else 0
    uint16_t new_chain = 0;  // of the rule to open
    int next_row = 0;        // of the rule that moves
    int new_row = 0;         // of the rule to open, of the chain to begin

    bool operator==(const CMove&) const = default;
};

class CParseTables {
  public:
    static constexpr int kLastRow = 0;  // of every rule to which nothing can be added

    CParseTables(const CGrammarRules& rules, bool promotes_single_child);

    const CMove& Move(int row, int label) const { return _fMoves[_fCells[row + label]]; }

    // The same for those who can't spare an instruction: Moves()[Cells()[row + label]].
    const uint16_t* Cells() const { return _fCells.data(); }
    const CMove* Moves() const { return _fMoves.data(); }

    int StartRow(int rule) const { return _fStartRows[rule]; }  // where a parse for `rule` begins
    int DoneRow() const { return _fStride; }                    // and where it ends

    // The number of the last rule of a chain, and the row of the rules around it; kLastRow when there are
    // none.
    int RuleNumber(int chain) const { return _fChains[chain].rule_number; }
    int RowAround(int chain) const { return _fChains[chain].row_around; }

    int LabelOfTerminal(int terminal) const { return _fLabelOfTerminal[terminal]; }
    int EndLabel() const { return _fStride - 2; }      // takes nothing, completes whatever can be complete
    int UnknownLabel() const { return _fStride - 1; }  // of a token that the grammar doesn't have

    int RuleCount() const { return static_cast<int>(_fStartRows.size()); }
    int RowCount() const { return static_cast<int>(_fCells.size()) / _fStride; }
    int LabelCount() const { return _fStride; }
    int ChainCount() const { return static_cast<int>(_fChains.size()); }
    int MoveCount() const { return static_cast<int>(_fMoves.size()); }
    size_t ByteCount() const;

  private:
    struct CChain {
        int rule_number;
        int row_around;
    };

    // What the grammar says, by state and label.
    struct CArcs {
        std::vector<int> targets;      // -1: no arc
        std::vector<int> begun_rules;  // -1: the arc takes the token itself
    };

    void _MergeTerminals(const CGrammarRules& rules);
    void _FindArcs(const CGrammarRules& rules);
    void _AddFixedRows();
    void _AddRuleChains(const CGrammarRules& rules);
    void _AddStateRows(const CGrammarRules& rules);
    void _AddStartRows(const CGrammarRules& rules);
    void _FillChainRows();
    int _AddRow();
    void _SetMove(int row, int label, const CMove& move);
    CMove _MoveInto(const CGrammarRules& rules, int rule, int next_row, int label);
    int _ChainRow(int rule_number, int state_row, int row_around);

    const bool _fPromotesSingleChild;
    int _fStride = 0;               // cells of a row
    std::vector<uint16_t> _fCells;  // by row and label: a move
    std::vector<CMove> _fMoves;     // the first ones are the kinds that have nothing but their kind
    std::vector<CChain> _fChains;   // from 1
    std::vector<int> _fStartRows;   // by rule
    std::vector<int> _fLabelOfTerminal;

    // While the tables are made.
    CArcs _fArcs;
    size_t _fFirstMoveOfRow = 0;                      // of the row that is being filled
    std::vector<int> _fStateRows;                     // by state
    std::vector<std::pair<int, int>> _fRowsOfChains;  // from 1: row of the chain, row of its state
    std::map<std::pair<int, int>, int>
        _fRowByStateAround;  // row of a state and row around it to row of the chain
};

}  // namespace codeloom
