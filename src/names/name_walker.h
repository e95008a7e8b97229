// names/: what one logical line does with names.
//   in     the tree of one line
//   out    records appended to those of the text, each with its place, in the order in which the walk meets
//          what they say; the names read come at the end. Those of arguments are among the others.
//   keeps  the storage of its notes and texts
//   start  at CNameWalker::Walk, then the switch in name_walker.cpp
//
// loads.cpp          names, chains, calls, comprehensions, decorators
// definitions.cpp    `def`, `lambda`, `class`, imports, `global`, type parameters
// targets.cpp        assignments: the names on the left with what is on the right
// statements.cpp     `for`, `with`, `except`, `return`, `yield`, `:=`, `match`, `case`
// value_equivs.cpp   what a value is recorded as
#pragma once

#include <string>
#include <string_view>

#include "names/chain_name.h"
#include "names/name_notes.h"
#include "names/node_text.h"
#include "names/records.h"
#include "names/walk_limits.h"
#include "syntax/arguments.h"
#include "syntax/fault.h"
#include "syntax/imports.h"
#include "syntax/tree_size.h"

namespace codeloom {

struct CWalkResult {
    CFault fault;  // what parses but isn't allowed: the records of the line are of no use then
    ELimit limit = ELimit::kNone;
};

// Not for two threads at once.
class CNameWalker {
  public:
    explicit CNameWalker(bool is_python3) : _fIsPython3(is_python3) {}

    // `records` may be null when only the fault and the limit are wanted.
    CWalkResult Walk(const CTree& tree, CRecords* records) { return Walk(tree, tree.fRoot, records); }

    // The same for what is at and below `node` alone.
    CWalkResult Walk(const CTree& tree, const CTreeNode& node, CRecords* records);

  private:
    // What a name that is met may be: read; a target, whose record is made elsewhere; a target within an
    // expression, of a comprehension or a lambda.
    enum class EContext : uint8_t { kLoad, kStore, kStoreWithin };

    // What a call calls; without a number when it has no dotted name.
    struct CFunctionName {
        uint32_t number = CChainName::kNoNumber;
        CSpan place;
    };

    [[gnu::always_inline]] void _VisitNode(const CTreeNode& node) {
        _CountVisit();
        if (!node.IsLeaf()) return _VisitInner(node);
        if (node.Is(ENodeKind::kNameLiteral)) _VisitName(node);
    }
    void _CountVisit() {
        if (++_fVisitCount > kMostVisits) [[unlikely]]
            throw CLimitHit{ELimit::kTooManyVisits};
        if (_fDepth >= kMostDepth) [[unlikely]]
            throw CLimitHit{ELimit::kTooDeep};
    }
    [[gnu::noinline]] void _VisitInner(const CTreeNode& node);
    void _Dispatch(const CTreeNode& node);
    void _VisitChildren(const CTreeNode& node);
    void _VisitIn(EContext context, const CTreeNode& node);

    // Loads
    void _VisitName(const CTreeNode& name);
    uint32_t _NoteName(std::string_view text, CSpan place, uint32_t token, bool is_load);
    void _VisitDottedName(const CTreeNode& node);
    void _VisitPower(const CTreeNode& node);
    void _VisitChain(const CChain& chain);
    void _VisitAtom(const CChain& chain, CChainName& name);
    void _VisitDotName(const CChain& chain, size_t i, CChainName& name);
    CFunctionName _FunctionOf(const CChain& chain, size_t call_i, const CChainName& name);
    void _VisitArguments(const CTreeNode* arguments, CFunctionName function);
    void _RecordCall(const CTreeNode* arguments, CFunctionName function);
    void _RecordIsInstance(const CTreeNode& arguments);
    void _RecordInstanceOf(uint32_t name, CSpan place, const CTreeNode& class_or_tuple);
    void _VisitCompFor(const CTreeNode& node);
    void _VisitDecorator(const CTreeNode& node);

    // Definitions
    void _VisitImport(const CTreeNode& node);
    void _VisitFromImport(const CTreeNode& node);
    void _RecordImported(uint32_t name, const CImportedName& imported, CSpan place, char kind, size_t value);
    void _VisitFuncdef(const CTreeNode& node);
    void _VisitParameters(const CTreeNode& node);
    void _VisitParameter(const CParameter& parameter);
    void _VisitLambda(const CTreeNode& node);
    void _VisitLambdaParameters(const CTreeNode& node);
    void _VisitClassdef(const CTreeNode& node);
    void _RecordDeclared(const CTreeNode& node, char kind);
    void _VisitTypeParameter(const CTreeNode& node);

    // Targets
    void _VisitExprStmt(const CTreeNode& node);
    void _VisitAssignment(const CTreeNode& node, uint32_t target_count);
    void _VisitAnnotatedAssign(const CTreeNode& node, const CTreeNode& annotated);
    void _RecordTargets(const CTreeNode& target, const CTreeNode* value);
    void _RecordItems(const CTreeNode& target, const CTreeNode* value);
    void _RecordTarget(const CTreeNode& target, const CTreeNode* value);
    void _RecordStarredTarget(const CTreeNode& starred);

    // Statements
    void _VisitFor(const CTreeNode& node);
    void _VisitWithItem(const CTreeNode& node);
    void _VisitExcept(const CTreeNode& node);
    void _VisitReturn(const CTreeNode& node);
    void _VisitYield(const CTreeNode& node);
    void _InsertPrefix(size_t pos, char kind);
    void _VisitNamed(const CTreeNode& node);
    void _VisitCase(const CTreeNode& node);
    void _VisitPattern(const CTreeNode& node);

    // What a value stands for: appends the payload to the values and gives its kind; 0 where that isn't
    // known. `_fTrailer` comes after it where a part of the value is meant.
    char _AppendEquiv(const CTreeNode& value);
    char _AppendEquivOfAtom(const CTreeNode& atom);
    char _AppendEquivOfChain(const CChain& chain);
    char _AppendEquivOfOperators(const CTreeNode& node);
    char _AppendEquivOfLeaf(const CTreeNode& leaf);
    char _AppendEquivOfTuple(const CTreeNode& list);
    char _AppendLiteral(std::string_view type_name, std::string_view value = {});
    char _AppendNumber(const CTreeNode& number, std::string_view sign);
    char _AppendString(const CTreeNode& literal);

    // Records. The payload of one lies between `value` and the end of the values.
    size_t _BeginValue() const { return _fRecords->values.size(); }
    void _Add(uint32_t name, char kind, CSpan place, size_t value, bool of_arg = false);
    void _AddPlain(uint32_t name, char kind, CSpan place, bool of_arg = false) {
        _Add(name, kind, place, _fRecords->values.size(), of_arg);
    }
    void _AddEquiv(uint32_t name, const CTreeNode& value, CSpan place, bool of_arg = false);
    void _RecordNotes();
    [[noreturn]] static void _Fail(EFault kind, const CTreeNode& node);

    bool _IsRecording() const { return _fRecords != nullptr; }
    uint32_t _Number(std::string_view name);
    uint32_t _NumberOfLeaf(const CTreeNode& name) { return _Number(_fTree->TextOfName(name)); }
    uint32_t _NumberOfText(const CTreeNode& node);

    const bool _fIsPython3;
    const CTree* _fTree = nullptr;
    CRecords* _fRecords = nullptr;
    CTreeSize _fTreeSize;
    CRecords _fUnwanted;
    CNameNotes _fNotes;
    CTextBuffer _fScratch;  // texts of names, the innermost last
    CTextBuffer _fTrailer;  // which part of a value a target receives
    std::string _fEncoded;  // storage for literals of several rows
    EContext _fContext = EContext::kLoad;
    uint32_t _fVisitCount = 0;
    uint32_t _fDepth = 0;
    uint32_t _fNesting = 0;
};

}  // namespace codeloom
