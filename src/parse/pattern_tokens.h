// The tokens of a `case` on hosted trees, as plans of its patterns look at them.
#pragma once

#include "parse/match_case_parser.h"
#include "syntax/case_pattern_plans.h"
#include "tree/expression_nodes.h"
#include "tree/pattern_nodes.h"

namespace codeloom {

struct CMatchCaseStatementParser::CPatternTokens {
    using CIndex = Py_ssize_t;
    using CPlan = CPatternWork::CPlan;

    static constexpr Py_ssize_t kNone = -1;
    static constexpr CPatternNodeMaker kPattern = &NewPseudoNode<CPatternNode>;
    static constexpr CPatternNodeMaker kSequencePattern = &NewPseudoNode<CSequencePatternNode>;
    static constexpr CPatternNodeMaker kClassPattern = &NewPseudoNode<CClassPatternNode>;
    static constexpr CPatternNodeMaker kClassArgumentPattern = &NewPseudoNode<CClassArgumentPatternNode>;
    static constexpr CPatternNodeMaker kExpression = &NewPseudoNode<CExpression>;

    CMatchCaseStatementParser& parser;

    int Type(Py_ssize_t i) const { return parser._TokType(i); }
    Py_ssize_t Count() const { return parser._TokCount(); }
    bool IsAs(Py_ssize_t i) const { return parser._IsTok(i, "as"); }
    Py_ssize_t Find(const CPatternMark& mark, Py_ssize_t start_i, Py_ssize_t end_i) const {
        return parser._Find(mark.text, start_i, end_i);
    }
    [[noreturn]] void FailAt(Py_ssize_t i) const { parser._FailAt(i); }
};

}  // namespace codeloom
