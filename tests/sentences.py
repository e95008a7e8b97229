"""Statements made at random from a grammar file: every shape of tree that the parser can give.

A sentence is a walk through the automata of the rules, read by the interpreter's own pgen. Once it is
as long as wanted, each rule takes its shortest way out.
"""

from grammar_tools import ORACLE, GrammarPath, LoadOracle

WORDS = {
    "NAME": ["a", "b", "_", "match", "case", "type", "é", "self", "isinstance", "Literal"],
    "NUMBER": ["1", "0", "2.5", "1j"],
    "STRING": ["'s'", '"List[a]"', "f'{a!r:>{b}} {c}'", "r'\\d'", "'''a,\nb'''"],
    "NEWLINE": ["\n"],
    "ASYNC": ["async"],
    "AWAIT": ["await"],
}
COMMENTS = ["  # c\n", "  # type: a[b]\n", "  # type: (a, *b) -> c\n", "  # type: ignore\n"]
_NEVER = 1_000_000
_END = 0  # the label of the arc that leaves a rule


class Sentences:
    """The statements of one grammar file. `words` are the texts of the kinds of tokens."""

    def __init__(self, version, random, words=WORDS):
        self.grammar = LoadOracle(GrammarPath(version))
        self.random = random
        self.words = words
        self.operators = {type: text for text, type in ORACLE.operators.items()}
        self.to_end = {rule: [_NEVER] * len(states) for rule, (states, _) in self.grammar.dfas.items()}
        while any([self._Shorten(rule) for rule in self.to_end]):
            pass

    def Text(self, most_tokens=30):
        tokens = []
        self._Extend(tokens, self.grammar.symbol2number["stmt"], self.random.randrange(3, most_tokens))
        return " ".join(tokens).replace("\n ", "\n")

    def _Extend(self, tokens, rule, length):
        states, to_end = self.grammar.dfas[rule][0], self.to_end[rule]
        state = 0
        while True:
            arcs = [arc for arc in states[state] if self._Length(arc, to_end) < _NEVER]
            if len(tokens) < length:
                label, next_state = self.random.choice(arcs)
            else:
                label, next_state = min(arcs, key=lambda arc: self._Length(arc, to_end))
            if label == _END:
                return
            type, text = self.grammar.labels[label]
            if type in self.grammar.dfas:
                self._Extend(tokens, type, length)
            else:
                tokens.append(text or self._Word(type))
            state = next_state

    def _Word(self, type):
        words = self.words.get(ORACLE.names.get(type))
        return self.random.choice(words) if words else self.operators[type]

    def _Shorten(self, rule):
        """Mend what is known of the ways from each state to the rule's end; true when there was need."""
        states, to_end = self.grammar.dfas[rule][0], self.to_end[rule]
        shortest = [min(self._Length(arc, to_end) for arc in arcs) for arcs in states]
        is_shorter = shortest != to_end
        to_end[:] = shortest
        return is_shorter

    def _Length(self, arc, to_end):
        label, next_state = arc
        if label == _END:
            return 0
        type, _ = self.grammar.labels[label]
        if type in self.grammar.dfas:
            return min(_NEVER, self.to_end[type][0] + 1 + to_end[next_state])
        # Suites stay on the row of their header.
        return _NEVER if ORACLE.names.get(type) == "INDENT" else min(_NEVER, 1 + to_end[next_state])
