// The parser that runs on a grammar's tables.
//   in     tokens, one at a time
//   out    a node for each token and each complete rule, made by the NodeConverter; at last the root
//   keeps  its stacks, reused from parse to parse
//   start  at addtoken
//
// An open rule that has more than one child is a frame of its own. Rules that have one child so far share the
// frame of their chain (parse_tables.h). The children of all frames are on one stack, so that a rule with a
// single child turns into that child without a move. Nothing here calls itself: nesting of the text costs
// frames, no call depth.
#pragma once

#include <vector>

#include <nanobind/nanobind.h>

#include "neighbours/optpgen/grammar.h"
#include "neighbours/optpgen/node_converter.h"
#include "neighbours/optpgen/object_stack.h"
#include "neighbours/optpgen/parser.h"

namespace codeloom {

class ParserImpl : public Parser {
  public:
    void Init(CGrammar& grammar, CRef<NodeConverter> node_converter, bool promotesinglechild);

    void setup(nb::handle start) override;
    bool addtoken(int type, nb::handle value, nb::handle context) override;
    nb::object finish() override;

    template <class Visitor>
    void References(Visitor&& visit) {
        visit(_fGrammar);
        visit(_fConverter);
        _fContexts.VisitReferences(visit);
        _fChildren.VisitReferences(visit);
        if (!_fGrammar) _fPhase = EPhase::kIdle;  // cleared: no token reaches the tables any more
    }

  private:
    enum class EPhase {
        kIdle,  // setup comes next
        kParsing,
        kComplete,  // finish comes next
        kBusy,      // an operation is under way, and may be calling the converter
    };

    // An open rule, or a chain of rules with one child. The frame at the bottom holds the start symbol.
    struct CFrame {
        int row;
        int chain;           // whose last rule is open here; not yet decided while there is one child
        size_t first_child;  // in _fChildren
    };

    class CBusyScope;

    // The first two run for every token; as parts of their callers they save a tenth of it.
    [[gnu::always_inline]] const CMove& _FindMove(int label, nb::handle context);
    [[gnu::always_inline]] void _OpenFrame(const CFrame& frame, nb::handle context);
    void _CompleteRule();
    void _CloseFrame();
    void _DropAll();
    [[noreturn]] void _RaiseNotParsing(int type, nb::handle value, nb::handle context) const;
    [[noreturn]] void _RaiseMisused() const;

    CRef<CGrammar> _fGrammar;
    CRef<NodeConverter> _fConverter;
    const CParseTables* _fTables = nullptr;       // of the grammar
    const CTokenLabels* _fTokenLabels = nullptr;  // of the grammar
    EPhase _fPhase = EPhase::kIdle;
    std::vector<CFrame> _fFrames;
    CObjectStack _fContexts;  // by frame but the first: the context of its first token
    CObjectStack _fChildren;
};

}  // namespace codeloom
