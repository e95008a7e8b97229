#include "grammar/parse_tables.h"

#include <limits>
#include <stdexcept>

namespace codeloom {

namespace {

constexpr auto kMaxId = std::numeric_limits<uint16_t>::max();

}  // namespace

CParseTables::CParseTables(const CGrammarRules& rules, bool promotes_single_child)
    : _fPromotesSingleChild(promotes_single_child) {
    _MergeTerminals(rules);
    _FindArcs(rules);
    _AddFixedRows();
    _fChains.resize(1);
    _fRowsOfChains.resize(1);
    if (!_fPromotesSingleChild) _AddRuleChains(rules);
    _AddStateRows(rules);
    _AddStartRows(rules);
    _FillChainRows();
    _fArcs = {};
    _fStateRows = {};
    _fRowsOfChains = {};
    _fRowByStateAround = {};
}

size_t CParseTables::ByteCount() const {
    return _fCells.size() * sizeof(uint16_t) + _fMoves.size() * sizeof(CMove) +
           _fChains.size() * sizeof(CChain);
}

// Terminals whose arcs lead from the same states to the same states get one label.
void CParseTables::_MergeTerminals(const CGrammarRules& rules) {
    using CStatePairs = std::vector<std::pair<int, int>>;
    std::vector<CStatePairs> arcs_of(rules.Terminals().size());
    for (size_t state = 0; state < rules.States().size(); ++state)
        for (const CArc& arc : rules.States()[state].arcs)
            if (!rules.IsRule(arc.symbol))
                arcs_of[rules.TerminalOf(arc.symbol)].emplace_back(state, arc.target);
    std::map<CStatePairs, int> labels;
    for (auto& arcs : arcs_of) {
        const int label = static_cast<int>(labels.size());
        _fLabelOfTerminal.push_back(labels.try_emplace(std::move(arcs), label).first->second);
    }
    _fStride = static_cast<int>(labels.size()) + 2;  // EndLabel and UnknownLabel are the last
}

void CParseTables::_FindArcs(const CGrammarRules& rules) {
    _fArcs.targets.assign(rules.States().size() * _fStride, -1);
    _fArcs.begun_rules.assign(rules.States().size() * _fStride, -1);
    for (size_t state = 0; state < rules.States().size(); ++state) {
        for (const CArc& arc : rules.States()[state].arcs) {
            for (size_t terminal = 0; terminal < _fLabelOfTerminal.size(); ++terminal) {
                if (!rules.CanBegin(arc.symbol, static_cast<int>(terminal))) continue;
                const size_t cell = state * _fStride + _fLabelOfTerminal[terminal];
                _fArcs.targets[cell] = arc.target;
                if (rules.IsRule(arc.symbol)) _fArcs.begun_rules[cell] = arc.symbol;
            }
        }
    }
}

void CParseTables::_AddFixedRows() {
    for (const EMove kind : {EMove::kRefuse, EMove::kDone, EMove::kComplete, EMove::kPromote})
        _fMoves.push_back({.kind = kind});
    for (const EMove kind : {EMove::kComplete, EMove::kDone}) {  // kLastRow and DoneRow
        const int row = _AddRow();
        for (int label = 0; label <= EndLabel(); ++label) _SetMove(row, label, {.kind = kind});
    }
}

// Where single children stay, every rule is a chain of its own.
void CParseTables::_AddRuleChains(const CGrammarRules& rules) {
    for (size_t rule = 0; rule < rules.Rules().size(); ++rule)
        _fChains.push_back({CGrammarRules::kFirstRuleNumber + static_cast<int>(rule), kLastRow});
}

void CParseTables::_AddStateRows(const CGrammarRules& rules) {
    for (const auto& state : rules.States()) _fStateRows.push_back(state.IsLast() ? kLastRow : _AddRow());
    for (size_t state = 0; state < rules.States().size(); ++state) {
        if (_fStateRows[state] == kLastRow) continue;
        _fFirstMoveOfRow = _fMoves.size();
        for (int label = 0; label <= EndLabel(); ++label) {
            const size_t cell = state * _fStride + label;
            CMove move{.kind = rules.States()[state].accepts ? EMove::kComplete : EMove::kRefuse};
            if (const int target = _fArcs.targets[cell]; target >= 0) {
                const int rule = _fArcs.begun_rules[cell];
                move = rule < 0 ? CMove{.kind = EMove::kShift, .next_row = _fStateRows[target]}
                                : _MoveInto(rules, rule, _fStateRows[target], label);
            }
            _SetMove(_fStateRows[state], label, move);
        }
    }
}

void CParseTables::_AddStartRows(const CGrammarRules& rules) {
    for (size_t rule = 0; rule < rules.Rules().size(); ++rule) {
        const int row = _AddRow();
        _fStartRows.push_back(row);
        _fFirstMoveOfRow = _fMoves.size();
        for (int label = 0; label < EndLabel(); ++label)
            if (_fArcs.targets[rules.Rules()[rule].start_state * _fStride + label] >= 0)
                _SetMove(row, label, _MoveInto(rules, static_cast<int>(rule), DoneRow(), label));
    }
}

// A chain moves as its last rule does. Where that is complete, it is replaced by its single child, and the
// rest of the chain moves.
void CParseTables::_FillChainRows() {
    for (size_t chain = 1; chain < _fRowsOfChains.size(); ++chain) {
        const auto [row, state_row] = _fRowsOfChains[chain];
        const int row_around = _fChains[chain].row_around;
        _fFirstMoveOfRow = _fMoves.size();
        for (int label = 0; label <= EndLabel(); ++label) {
            CMove move = Move(state_row, label);
            if (move.kind == EMove::kComplete) {
                move = row_around == kLastRow ? CMove{.kind = EMove::kPromote} : Move(row_around, label);
            } else if (move.kind != EMove::kRefuse) {
                move.chain = static_cast<uint16_t>(chain);
            }
            _SetMove(row, label, move);
        }
    }
}

int CParseTables::_AddRow() {
    _fCells.resize(_fCells.size() + _fStride);  // refuses everything
    return static_cast<int>(_fCells.size()) - _fStride;
}

void CParseTables::_SetMove(int row, int label, const CMove& move) {
    size_t id = static_cast<size_t>(move.kind);
    if (move.kind > EMove::kPromote) {
        id = _fFirstMoveOfRow;
        while (id < _fMoves.size() && !(_fMoves[id] == move)) ++id;
        if (id == _fMoves.size()) _fMoves.push_back(move);
    }
    if (id > kMaxId) throw std::length_error("the grammar is too large: more than 65535 moves");
    _fCells[row + label] = static_cast<uint16_t>(id);
}

// The move where `rule` begins with `label`, and the rule that it is in goes on in `next_row`.
CMove CParseTables::_MoveInto(const CGrammarRules& rules, int rule, int next_row, int label) {
    if (!_fPromotesSingleChild)
        return {.kind = EMove::kOpen,
                .new_chain = static_cast<uint16_t>(rule + 1),
                .next_row = next_row,
                .new_row = _fStateRows[rules.Rules()[rule].start_state]};
    int row = kLastRow;
    while (rule >= 0) {
        const int cell = rules.Rules()[rule].start_state * _fStride + label;
        const int state_row = _fStateRows[_fArcs.targets[cell]];
        if (state_row != kLastRow) row = _ChainRow(CGrammarRules::kFirstRuleNumber + rule, state_row, row);
        rule = _fArcs.begun_rules[cell];
    }
    if (row == kLastRow) return {.kind = EMove::kShift, .next_row = next_row};
    return {.kind = EMove::kBegin, .next_row = next_row, .new_row = row};
}

int CParseTables::_ChainRow(int rule_number, int state_row, int row_around) {
    const auto [found, is_new] = _fRowByStateAround.try_emplace({state_row, row_around}, 0);
    if (is_new) {
        if (_fChains.size() > kMaxId)
            throw std::length_error("the grammar is too large: more than 65535 chains");
        found->second = _AddRow();
        _fChains.push_back({rule_number, row_around});
        _fRowsOfChains.emplace_back(found->second, state_row);
    }
    return found->second;
}

}  // namespace codeloom
