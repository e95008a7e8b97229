#include "neighbours/optpgen/parser_impl.h"

#include <utility>

#include "host/errors.h"
#include "neighbours/optpgen/parse_error.h"

namespace codeloom {

// While it lives, the parser is busy. Unless the operation came to its end, the parse is over then.
class ParserImpl::CBusyScope {
  public:
    explicit CBusyScope(ParserImpl& parser) : _fParser(parser) { parser._fPhase = EPhase::kBusy; }
    ~CBusyScope() {
        if (_fNext == EPhase::kIdle) _fParser._DropAll();
        _fParser._fPhase = _fNext;
    }
    CBusyScope(const CBusyScope&) = delete;
    CBusyScope& operator=(const CBusyScope&) = delete;
    void Succeed(EPhase next) { _fNext = next; }

  private:
    ParserImpl& _fParser;
    EPhase _fNext = EPhase::kIdle;
};

void ParserImpl::Init(CGrammar& grammar, CRef<NodeConverter> node_converter, bool promotesinglechild) {
    _fGrammar = CRef<CGrammar>(&grammar);
    _fConverter = node_converter ? std::move(node_converter) : MakeInstance<NodeConverter>();
    _fTables = &grammar.Tables(promotesinglechild);
    _fTokenLabels = &grammar.TokenLabels();
}

void ParserImpl::setup(nb::handle start) {
    if (_fPhase == EPhase::kBusy) _RaiseMisused();
    const int rule = _fGrammar->RuleOfNumber(start);
    CBusyScope busy(*this);
    _DropAll();
    _fFrames.push_back({_fTables->StartRow(rule), 0, 0});
    busy.Succeed(EPhase::kParsing);
}

bool ParserImpl::addtoken(int type, nb::handle value, nb::handle context) {
    if (_fPhase != EPhase::kParsing) [[unlikely]]
        _RaiseNotParsing(type, value, context);
    CBusyScope busy(*this);
    const CMove& move = _FindMove(_fTokenLabels->Find(type, value), context);
    if (move.kind < EMove::kShift) [[unlikely]]
        RaiseParseError("the grammar doesn't allow this token here", nb::int_(type), value, context);
    _fChildren.Push(
        [&] { return _fConverter->convert(_fGrammar->Self(), type, value, context, nb::handle(Py_None)); });
    _fFrames.back().row = move.next_row;
    if (move.kind == EMove::kBegin) {
        _OpenFrame({move.new_row, 0, _fChildren.Size() - 1}, context);
    } else {
        while (_fFrames.back().row == CParseTables::kLastRow) _CompleteRule();
    }
    const bool is_complete = _fFrames.back().row == _fTables->DoneRow();
    busy.Succeed(is_complete ? EPhase::kComplete : EPhase::kParsing);
    return is_complete;
}

nb::object ParserImpl::finish() {
    if (_fPhase != EPhase::kComplete && _fPhase != EPhase::kParsing) _RaiseMisused();
    CBusyScope busy(*this);
    if (_FindMove(_fTables->EndLabel(), nb::handle(Py_None)).kind == EMove::kDone) return _fChildren.Pop();
    const nb::handle context = _fContexts.Size() == 0 ? nb::handle(Py_None) : _fContexts.Top();
    RaiseParseError("the text ends too early", nb::none(), nb::none(), context);
}

// Completes rules until one can do something with a token of this label, and gives the move to make there.
inline const CMove& ParserImpl::_FindMove(int label, nb::handle context) {
    while (true) {
        CFrame& top = _fFrames.back();
        const CMove& move = _fTables->Move(top.row, label);
        switch (move.kind) {
            case EMove::kPromote:
                _CloseFrame();
                break;
            case EMove::kComplete:
                _CompleteRule();
                break;
            case EMove::kOpen:
                top.row = move.next_row;
                _OpenFrame({move.new_row, move.new_chain, _fChildren.Size()}, context);
                break;
            default:
                if (move.chain != 0) top.chain = move.chain;
                return move;
        }
    }
}

// Makes the node of the rule on top, which then is the single child of the rules around it.
void ParserImpl::_CompleteRule() {
    CFrame& top = _fFrames.back();
    nb::object node = _fConverter->ConvertRule(_fGrammar->Self(), _fTables->RuleNumber(top.chain),
                                               _fContexts.Top(), _fChildren, top.first_child);
    _fChildren.Push([&] { return std::move(node); });
    top.row = _fTables->RowAround(top.chain);
    if (top.row == CParseTables::kLastRow) _CloseFrame();
}

inline void ParserImpl::_OpenFrame(const CFrame& frame, nb::handle context) {
    _fFrames.push_back(frame);
    _fContexts.Push([&] { return nb::borrow(context); });
}

void ParserImpl::_CloseFrame() {
    _fFrames.pop_back();
    _fContexts.Pop();
}

void ParserImpl::_DropAll() {
    _fFrames.clear();
    _fContexts.Clear();
    _fChildren.Clear();
}

void ParserImpl::_RaiseNotParsing(int type, nb::handle value, nb::handle context) const {
    if (_fPhase != EPhase::kComplete) _RaiseMisused();
    RaiseParseError("the text goes on beyond its end", nb::int_(type), value, context);
}

void ParserImpl::_RaiseMisused() const {
    RaiseHost(PyExc_RuntimeError,
              _fPhase == EPhase::kBusy
                  ? "the parser is busy: one of its operations was called from within another"
                  : "no parse is going on: setup comes first");
}

}  // namespace codeloom
