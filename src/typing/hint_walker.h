// typing/: nodes and comments into type hints.
//   in     the tree of one line, and the comments among its tokens
//   out    hint records, and those of the names that hints in comments read, appended to those of the text;
//          the fault of a hint in a comment
//   keeps  the storage of the parser for hints in comments
//   start  at CHintWalker::Walk
//
// hint_walker.cpp    the walk, the visits, and pairing names with hints
// comment_hints.cpp  hints in comments
// hint_parser.h      their text into trees; function_hint.h of those of functions
// false_hints.h      what looks like a hint and isn't one
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "names/name_walker.h"
#include "syntax/tree_observer.h"
#include "syntax/tree_size.h"
#include "typing/false_hints.h"
#include "typing/hint_parser.h"

namespace codeloom {

// What hints are read from and where their records go.
struct CHintContext {
    CRecords* records = nullptr;         // null when only the fault is wanted
    size_t first_record = 0;             // of the line
    CFalseHints* false_hints = nullptr;  // at this line; null when all that looks like a hint is one
    CTreeObserver* observer = nullptr;   // null when nobody wants to see the trees of hints in comments
};

struct CHintResult {
    CFault fault;  // the records of the line are of no use then
    ELimit limit = ELimit::kNone;
    // The hint of a function names arguments that its `def` lacks. The line is to leave no records.
    bool is_given_up = false;
    bool is_deep = false;  // the tree of a hint in a comment is larger than walks go
};

// Not for two threads at once.
class CHintWalker {
  public:
    // Names that hints in comments read go to `names`.
    CHintWalker(int version, CNameWalker& names) : _fParser(version), _fNames(names) {}

    // The hints of a line, whose names are recorded already.
    CHintResult Walk(const CTree& tree, const CHintContext& context);

    // The hint of a function in the comment that is the first line of its body.
    CHintResult WalkComment(const CRawLogical& comment, const CHintContext& context);

  private:
    // A hint: part of the line's tree, or of that of a comment.
    struct CHint {
        CHintTree tree;
        const CTreeNode* node = nullptr;
        bool of_arg = false;
    };

    struct CArgumentName {
        std::string name;
        CSpan place;
    };

    // Thrown where the walk ends with a result that is set already.
    struct CStop {};

    // The name under which the hint of what a function returns is recorded.
    static constexpr std::string_view kReturnName = "return";

    template <class Visit>
    CHintResult _Run(const CRawLogical& line, const CHintContext& context, Visit visit);
    void _NoteLimit(ELimit limit);
    void _NoteSize(const CTree& tree);

    void _VisitNode(const CTreeNode& node);
    void _VisitInner(const CTreeNode& node);
    void _VisitExprStmt(const CTreeNode& node);
    void _VisitFor(const CTreeNode& node);
    void _VisitWith(const CTreeNode& node);
    void _VisitFuncdef(const CTreeNode& node);

    void _Pair(const CTreeNode& name, const CHint& hint);
    void _RecordTarget(const CTreeNode& target, const CHint& hint);
    void _Record(std::string_view name, CSpan place, const CHint& hint);
    bool _IsWanted() const;
    void _Tell(std::string_view name, CSpan place, const CHint& hint);

    // Comments
    bool _CommentsMayHoldHints();
    bool _ReadHint(uint32_t token_i);
    std::optional<uint32_t> _FindComment(int32_t row) const;
    int32_t _LastRowOf(const CTreeNode& node) const;
    bool _ReadEndingHint(const CTreeNode& node);
    bool _PairArgumentComment(const CParameter& parameter);
    bool _IsForArgument(const CParameter& parameter) const;
    void _PairComment(const CTreeNode& name, bool of_arg);
    void _RecordFunction(const CTreeNode* funcdef);
    void _CollectArguments();
    [[noreturn]] void _GiveUp();
    void _WalkNames(const CHint& hint);
    CSpan _PlaceOf(const CHint& hint) const;

    CHintParser _fParser;
    CTreeSize _fTreeSize;
    CNameWalker& _fNames;
    const CRawLogical* _fLine = nullptr;
    const CTree* _fTree = nullptr;
    CHintContext _fContext;
    CHintResult _fResult;
    std::optional<bool> _fHasMarks;  // comments of the line may hold hints; none until it matters
    CCommentHint _fHint;             // the last one that was read
    std::vector<CArgumentName> _fArguments;
    int _fArgument_i = -1;  // that a hint in a function's form is for, while it is recorded
    CTextBuffer _fName;
    uint32_t _fVisitCount = 0;
    uint32_t _fDepth = 0;
    uint32_t _fNesting = 0;
};

}  // namespace codeloom
