// Finite automata over numbered symbols: the form that the right side of a rule takes.
//   in     a nondeterministic automaton, as the text of a rule builds it
//   out    the smallest deterministic one of the same language
#pragma once

#include <compare>
#include <vector>

namespace codeloom {

struct CArc {
    int symbol;
    int target;  // the state that it leads to

    auto operator<=>(const CArc&) const = default;
};

// A piece of a rule under construction: one state to enter by, one to leave by.
struct CNfaSpan {
    int start;
    int end;
};

class CNfa {
  public:
    static constexpr int kEmpty = -1;  // the symbol of an arc that takes nothing

    int AddState();
    void AddArc(int from, int symbol, int target) { _fArcs[from].push_back({symbol, target}); }
    void AddEmptyArc(int from, int target) { AddArc(from, kEmpty, target); }

    const std::vector<CArc>& ArcsOf(int state) const { return _fArcs[state]; }
    int StateCount() const { return static_cast<int>(_fArcs.size()); }

    CNfaSpan fWhole{};  // start and end of the automaton

    // Gives every symbol of an arc another number.
    template <class Renumber>
    void RenumberSymbols(Renumber renumber) {
        for (auto& arcs : _fArcs)
            for (CArc& arc : arcs)
                if (arc.symbol != kEmpty) arc.symbol = renumber(arc.symbol);
    }

  private:
    std::vector<std::vector<CArc>> _fArcs;  // by state
};

struct CDfaState {
    bool accepts = false;
    std::vector<CArc> arcs;  // in the order of their symbols, each symbol once

    auto operator<=>(const CDfaState&) const = default;
};

using CDfa = std::vector<CDfaState>;  // state 0 is the start

// The smallest deterministic automaton of the same language.
CDfa MakeDfa(const CNfa& nfa);

}  // namespace codeloom
