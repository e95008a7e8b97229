// A grammar as the host knows it, and the generator that makes it from a file.
#pragma once

#include <memory>
#include <string>

#include <nanobind/nanobind.h>

#include "grammar/grammar_rules.h"
#include "grammar/parse_tables.h"
#include "host/hosted.h"
#include "neighbours/optpgen/token_labels.h"

namespace codeloom {

class CGrammar : public CHosted {
  public:
    CGrammar(CGrammarRules rules, const CTokenTypes& token_types);

    // Tables for a parser that replaces a rule with a single child by that child, or that keeps it; the
    // second ones are made when they are first asked for.
    const CParseTables& Tables(bool promotes_single_child);
    // The index of the rule with this number; none stands for the start symbol. The host's ValueError when
    // there is no such rule.
    int RuleOfNumber(nb::handle number) const;

    const CTokenLabels& TokenLabels() const { return _fTokenLabels; }
    std::string Repr() const;

    template <class Visitor>
    void References(Visitor&& visit) {
        visit(symbol2number);
        visit(number2symbol);
    }

    nb::object symbol2number;  // dictionaries; the parser doesn't read them
    nb::object number2symbol;

  private:
    CGrammarRules _fRules;
    CParseTables _fPromotingTables;
    std::unique_ptr<CParseTables> _fKeepingTables;
    CTokenLabels _fTokenLabels;
};

class ParserGenerator : public CHosted {
  public:
    void Init(nb::object grammar_file, nb::dict tok_number2name, nb::dict op_text2number);

    CRef<CGrammar> make_grammar() const;

  private:
    CGrammarText _fText;
    CTokenTypes _fTokenTypes;
};

}  // namespace codeloom
