#include "grammar/automaton.h"

#include <algorithm>
#include <map>
#include <set>
#include <utility>

namespace codeloom {

namespace {

using CStateSet = std::vector<int>;  // in rising order, each state once

// Adds all states that can be reached without taking a symbol.
void Close(const CNfa& nfa, CStateSet& states) {
    std::vector<bool> is_member(nfa.StateCount());
    for (const int state : states) is_member[state] = true;
    for (size_t i = 0; i < states.size(); ++i) {
        for (const CArc& arc : nfa.ArcsOf(states[i])) {
            if (arc.symbol != CNfa::kEmpty || is_member[arc.target]) continue;
            is_member[arc.target] = true;
            states.push_back(arc.target);
        }
    }
    std::sort(states.begin(), states.end());
}

// The sets that the symbols lead to from one set.
std::map<int, CStateSet> StepsFrom(const CNfa& nfa, const CStateSet& states) {
    std::map<int, std::set<int>> targets;
    for (const int state : states)
        for (const CArc& arc : nfa.ArcsOf(state))
            if (arc.symbol != CNfa::kEmpty) targets[arc.symbol].insert(arc.target);
    std::map<int, CStateSet> steps;
    for (const auto& [symbol, reached] : targets) {
        CStateSet& step = steps[symbol];
        step.assign(reached.begin(), reached.end());
        Close(nfa, step);
    }
    return steps;
}

// Each state of the result stands for the set of states that `nfa` may be in.
CDfa Determinise(const CNfa& nfa) {
    CDfa dfa;
    std::map<CStateSet, int> numbers;
    std::vector<CStateSet> sets;
    const auto number_of = [&](const CStateSet& states) {
        const auto [found, is_new] = numbers.try_emplace(states, static_cast<int>(sets.size()));
        if (is_new) sets.push_back(states);
        return found->second;
    };
    CStateSet start{nfa.fWhole.start};
    Close(nfa, start);
    number_of(start);
    for (size_t i = 0; i < sets.size(); ++i) {
        CDfaState state;
        state.accepts = std::binary_search(sets[i].begin(), sets[i].end(), nfa.fWhole.end);
        for (const auto& [symbol, reached] : StepsFrom(nfa, sets[i]))
            state.arcs.push_back({symbol, number_of(reached)});
        dfa.push_back(std::move(state));
    }
    return dfa;
}

// The states with targets replaced by the groups they are in: no symbol distinguishes equal ones.
CDfaState SeenByGroups(const CDfaState& state, const std::vector<int>& group_of) {
    CDfaState seen = state;
    for (CArc& arc : seen.arcs) arc.target = group_of[arc.target];
    return seen;
}

// Splits the states into groups until all in one group behave alike; each group becomes one state.
CDfa Minimise(const CDfa& dfa) {
    std::vector<int> group_of(dfa.size(), 0);
    size_t group_count = 1;
    while (true) {
        std::map<std::pair<int, CDfaState>, int> groups;
        std::vector<int> next_group_of;
        for (size_t i = 0; i < dfa.size(); ++i) {
            const std::pair key(group_of[i], SeenByGroups(dfa[i], group_of));
            next_group_of.push_back(groups.try_emplace(key, static_cast<int>(groups.size())).first->second);
        }
        group_of = std::move(next_group_of);
        if (groups.size() == group_count) break;
        group_count = groups.size();
    }
    CDfa smallest(group_count);
    for (size_t i = 0; i < dfa.size(); ++i) smallest[group_of[i]] = SeenByGroups(dfa[i], group_of);
    return smallest;
}

}  // namespace

int CNfa::AddState() {
    _fArcs.emplace_back();
    return StateCount() - 1;
}

CDfa MakeDfa(const CNfa& nfa) {
    return Minimise(Determinise(nfa));
}

}  // namespace codeloom
