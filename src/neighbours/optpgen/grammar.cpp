#include "neighbours/optpgen/grammar.h"

#include "host/collections.h"
#include "host/overrides.h"
#include "host/text.h"

namespace codeloom {

namespace {

// The bytes of a file; the host's OSError when it can't be read.
nb::bytes ReadFile(nb::handle path) {
    const nb::object file = nb::module_::import_("io").attr("open")(path, "rb");
    nb::object content = file.attr("read")();
    file.attr("close")();
    return nb::borrow<nb::bytes>(content);
}

}  // namespace

CGrammar::CGrammar(CGrammarRules rules, const CTokenTypes& token_types)
    : _fRules(std::move(rules)),
      _fPromotingTables(_fRules, true),
      _fTokenLabels(_fRules, _fPromotingTables, token_types) {
    nb::dict numbers;
    nb::dict symbols;
    int number = CGrammarRules::kFirstRuleNumber;
    for (const auto& rule : _fRules.Rules()) {
        const nb::object name = InternedText(rule.name);
        numbers[name] = number;
        symbols[nb::int_(number++)] = name;
    }
    symbol2number = std::move(numbers);
    number2symbol = std::move(symbols);
}

const CParseTables& CGrammar::Tables(bool promotes_single_child) {
    if (promotes_single_child) return _fPromotingTables;
    if (!_fKeepingTables) _fKeepingTables = std::make_unique<CParseTables>(_fRules, false);
    return *_fKeepingTables;
}

int CGrammar::RuleOfNumber(nb::handle number) const {
    if (number.is_none()) return 0;
    const int rule = ResultFromHost<int>(nb::borrow<nb::object>(number)) - CGrammarRules::kFirstRuleNumber;
    if (rule >= 0 && rule < static_cast<int>(_fRules.Rules().size())) return rule;
    PyErr_Format(PyExc_ValueError, "the grammar has no rule with the number %R", number.ptr());
    throw nb::python_error();
}

std::string CGrammar::Repr() const {
    return "<Grammar of " + _fRules.Rules().front().name + ": " + std::to_string(_fRules.Rules().size()) +
           " rules, " + std::to_string(_fRules.States().size()) + " states>";
}

void ParserGenerator::Init(nb::object grammar_file, nb::dict tok_number2name, nb::dict op_text2number) {
    for (auto [number, name] : tok_number2name)
        _fTokenTypes.type_of_name.insert_or_assign(std::string(CUtf8(name)),
                                                   ResultFromHost<int>(nb::borrow<nb::object>(number)));
    for (auto [text, number] : op_text2number)
        _fTokenTypes.type_of_operator.insert_or_assign(std::string(CUtf8(text)),
                                                       ResultFromHost<int>(nb::borrow<nb::object>(number)));
    const nb::bytes text = ReadFile(grammar_file);
    _fText = ReadGrammarText(std::string(CUtf8(nb::str(grammar_file))), {text.c_str(), text.size()});
}

CRef<CGrammar> ParserGenerator::make_grammar() const {
    return MakeInstance<CGrammar>(CGrammarRules(_fText, _fTokenTypes), _fTokenTypes);
}

}  // namespace codeloom
