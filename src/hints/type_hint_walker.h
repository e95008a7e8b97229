// The walker for type hints: annotations in the tree, and `# type:` comments, which have a parser of their
// own.
//   type_hint_walker.cpp   the walk, the visits, and pairing names with hints
//   comment_hints.cpp      comments: finding, parsing, and the place of a fault in them
#pragma once

#include <nanobind/nanobind.h>

#include "hints/dispatch_walker.h"
#include "hints/hint_text.h"
#include "host/pair.h"
#include "parse/parser_driver.h"
#include "tree/definition_nodes.h"
#include "tree/node_to_text.h"
#include "tree/statement_nodes.h"
#include "walker/node_walker.h"

namespace codeloom {

// A text found in the tokens, or none, and the index of its token.
struct CFoundText {
    CTextOrNone text;
    Py_ssize_t tok_i = -1;
};

// Rows counted from the logical's first one.
struct CRowRange {
    Py_ssize_t first_row = 0;
    Py_ssize_t end_row = 0;  // after the last one
};

class CTypeHintWalker : public CDispatchWalker {
  public:
    // The name under which a return hint is recorded.
    static constexpr const char* kReturnName = "return";

    // `grammar_file` is the grammar of hints, which may be another than that of the code. The names that
    // hints in comments use go to `general_node_walker`; with none they go nowhere.
    void Init(nb::object version_triple, nb::object grammar_file, CRef<CNodeWalker> general_node_walker);
    void InitWithParser(CRef<CPGenParserImpl> hint_parser, CRef<CNodeWalker> general_node_walker);

    void Walk(CNodeRef node, CLogicalLine& logical, bool first_in_def) override;

    // The truth value of a visit's result says whether the children are to be visited.
    OPERATIONS_OF(CTypeHintWalker, CDispatchWalker)
    OPERATION(nb::object, _VisitFuncdefStmt, (CFuncdefStmt& node),
              "Record the hints of a def's arguments and of what it returns.", "node"_a);
    OPERATION(CRewrittenHint, _RewriteFuncdefCommentHint, (nb::str hint),
              "Rewrite the function hint in a comment so that it parses: the tokens of a `def` with dummy "
              "names, and for each the offset to report a syntax error at.",
              "hint"_a);
    OPERATION(void, _ProcessFuncdefComment,
              (nb::str hint, Py_ssize_t tok_i, CRef<CLogicalLine> funcdef_logical, bool is_arg),
              "Record a hint for a `def`. `funcdef_logical` is None for a comment in the body: then the "
              "arguments go by their indexes. TypeError when it has no records of arguments to name them by.",
              "hint"_a, "tok_i"_a, "funcdef_logical"_a.none(), "is_arg"_a);
    OPERATION(void, _ProcessArgSpecificComment, (const CArgument& arg),
              "Record the hint in a comment immediately after an argument and its comma.", "arg"_a);
    OPERATION(nb::object, _VisitForStmt, (CForStmt& node),
              "Record the comment hint of a `for` for its target.", "node"_a);
    OPERATION(nb::object, _VisitWithStmt, (CWithStmt& node),
              "Record the comment hint of a `with` for the target of each item.", "node"_a);
    OPERATION(nb::object, _VisitExprStmt, (CExprStmt& node),
              "Record the annotation or the comment hint of an assignment.", "node"_a);
    OPERATION(void, _ProcessTarget, (CNode& node, CNodeRef target),
              "Record the hint in the comment at the end of `node` for `target`.", "node"_a,
              "target"_a.none());
    OPERATION(void, _ProcessNameAndHintNodes, (CNodeRef name_node, CNodeRef hint_node, bool is_arg),
              "Record a hint for a name. Tuples are paired item by item; what has no partner is passed over.",
              "name_node"_a.none(), "hint_node"_a.none(), "is_arg"_a = false);
    OPERATION(CFoundText, _FindEndingTypeComment, (CNode& node),
              "The hint in the comment on the row on which `node` ends, and the index of its token; "
              "(None, -1) when there is no comment.",
              "node"_a);
    OPERATION(CTextOrNone, _GetHintFromComment, (nb::str comment),
              "The hint following `type:`, with blanks for all before it, so that offsets stay; None when "
              "there is none.",
              "comment"_a);
    OPERATION(CRowRange, _GetRowRange, (CNode& node), "The first row of `node` and the one after its last.",
              "node"_a);
    OPERATION(bool, _IsDottedName, (nb::bytes s),
              "True for letters and digits alone that begin with a letter, and for nothing.", "s"_a);
    OPERATION(CFoundText, _FindComment, (Py_ssize_t row, CRef<CLogicalLine> logical),
              "The comment on a row of `logical`, by default of the one that is walked, and the index of its "
              "token; (None, -1) when there is none.",
              "row"_a, "logical"_a.none()= nb::none());
    OPERATION(CBytesOrNone, _GetHintInfoStr, (CNodeRef node),
              "The record of a hint; None when it has no text.", "node"_a.none());
    OPERATION(void, _AddSymInfo, (nb::object name, nb::object istr, bool is_arg),
              "Append a record to the logical.", "name"_a, "istr"_a, "is_arg"_a);
    OPERATION(CNodeRef, _ParseHint, (nb::str hint, Py_ssize_t tok_i, bool call_general_node_walker),
              "The top node of a hint; None when it isn't one expression. Give it back with "
              "`_fHintParser.DiscardNode`. SyntaxError with the place in the comment when it doesn't parse.",
              "hint"_a, "tok_i"_a, "call_general_node_walker"_a);
    OPERATION(void, _RaiseHintSyntaxError, (Py_ssize_t tok_i, Py_ssize_t utf8_offset_in_hint),
              "Raise SyntaxError for a place in the hint that the comment token at `tok_i` holds.", "tok_i"_a,
              "utf8_offset_in_hint"_a);
    OPERATION(CNodeRef, _ParseFuncdefCommentHint, (nb::str hint, Py_ssize_t tok_i),
              "The same as _ParseHint for the hint of a function; its names go to "
              "no walker.",
              "hint"_a, "tok_i"_a);
    END_OPERATIONS

    template <class Visitor>
    void References(Visitor&& visit) {
        CDispatchWalker::References(visit);
        visit(_fNameConv);
        visit(_fHintConv);
        visit(_fHintParser);
        visit(_fGeneralNodeWalker);
    }

    CRef<CNodeToTextConverterImpl> _fNameConv;  // of targets
    CRef<CNodeToTextConverterImpl> _fHintConv;  // of hints
    int _fCommentHintCount = 0;                 // comments of the line that may hold a hint; 0 between walks
    CRef<CPGenParserImpl> _fHintParser;
    CRef<CNodeWalker> _fGeneralNodeWalker;

  private:
    template <class Parse, class OffsetOf>
    CNodeRef _Parsed(Py_ssize_t tok_i, Parse parse, OffsetOf offset_of);

    void _WalkLoneComment(CLogicalLine& logical, bool first_in_def);
    void _VisitArgument(const CArgument& arg);
    void _ProcessEndingComment(CFuncdefStmt& node, const CArgument* last_arg);
    void _ProcessNameAndHint(const CNodeRef& name_node, const nb::str& hint, Py_ssize_t tok_i, bool is_arg);
    void _RecordFuncdefHint(CFuncdefStmt& hint_node, CLogicalLine* funcdef_logical, bool is_arg);
    void _RecordHint(const nb::object& name, const CNodeRef& hint_node, bool is_arg);
    void _WalkNamesOf(const CNodeRef& hint_node);

    int _fArgCommentCount = 0;  // hints in comments of arguments that the visit of a `def` has taken
};

void BindTypeHintWalker(nb::module_& module);

}  // namespace codeloom

namespace nanobind::detail {

template <>
struct type_caster<codeloom::CFoundText>
    : pair_caster<codeloom::CFoundText, codeloom::CTextOrNone, codeloom::CIndex> {};

template <>
struct type_caster<codeloom::CRowRange>
    : pair_caster<codeloom::CRowRange, codeloom::CIndex, codeloom::CIndex> {};

}  // namespace nanobind::detail
