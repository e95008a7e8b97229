// Names that are read: alone, in chains, in calls, in comprehensions and decorators.
#include <array>

#include "names/name_walker.h"
#include "names/record_kinds.h"
#include "syntax/definitions.h"

namespace codeloom {

// Names

void CNameWalker::_VisitName(const CTreeNode& name) {
    if (!_IsRecording() || _fContext == EContext::kStore || IsValueWord(name.word)) return;
    const CRawToken& token = _fTree->Token(name);
    const CSpan place{token.start, token.start + token.length};
    _NoteName(_fTree->TextOfName(name), place, name.token, _fContext == EContext::kLoad);
}

// A name or a chain that ends with the token, read or bound within an expression. Gives its number.
inline uint32_t CNameWalker::_NoteName(std::string_view text, CSpan place, uint32_t token, bool is_load) {
    const uint32_t number = _fRecords->names->Number(text);
    if (is_load) {
        _fNotes.AddLoad(number, place);
    } else {
        _fNotes.AddStore(number, token, place);
    }
    return number;
}

// Each prefix of `a.b.c` is read.
void CNameWalker::_VisitDottedName(const CTreeNode& node) {
    if (!_IsRecording()) return;
    const size_t start = _fScratch.size();
    const std::span<const CTreeNode> children = _fTree->Children(node);
    for (size_t i = 0; i < children.size(); ++i) {
        _fScratch += _fTree->Text(children[i]);
        if (i % 2 != 0) continue;
        const uint32_t name = _Number(_fScratch.From(start));
        _fNotes.AddLoad(name, SpanBetween(*_fTree, node, children[i]));
    }
    _fScratch.CutTo(start);
}

// Chains

void CNameWalker::_VisitPower(const CTreeNode& node) {
    _VisitChain(ChainOfPower(*_fTree, node));
    if (const CTreeNode* const exponent = ExponentOf(*_fTree, node)) _VisitNode(*exponent);
}

// Brackets without contents have the closing one as their second child, which records nothing.
void CNameWalker::_VisitChain(const CChain& chain) {
    CChainName name(*_fTree, chain, _fScratch);
    _VisitAtom(chain, name);
    for (size_t i = 0; i < chain.trailers.size(); ++i) {
        const CTreeNode& trailer = chain.trailers[i];
        const CTreeNode& token = _fTree->Child(trailer, 0);
        const CTreeNode& child = _fTree->Child(trailer, 1);
        if (IsToken(token, kTokenId_DOT) && child.Is(ENodeKind::kNameLiteral)) {
            if (_IsRecording()) _VisitDotName(chain, i, name);
            continue;
        }
        if (IsToken(token, kTokenId_LPAR) && trailer.child_count == 3) {
            const CFunctionName function = _IsRecording() ? _FunctionOf(chain, i, name) : CFunctionName();
            _VisitArguments(&child, function);
        } else {
            _VisitIn(IsToken(token, kTokenId_LSQB) ? EContext::kLoad : _fContext, child);
        }
        name.is_dotted = false;
    }
}

void CNameWalker::_VisitAtom(const CChain& chain, CChainName& name) {
    const CTreeNode& atom = *chain.atom;
    if (!name.is_dotted) return _VisitNode(atom);
    const bool is_load = _fContext == EContext::kLoad || !chain.trailers.empty();
    if (!_IsRecording() || IsValueWord(atom.word) || (!is_load && _fContext == EContext::kStore)) return;
    name.number = _NoteName(_fTree->TextOfName(atom), name.place, atom.token, is_load);
}

// `.name`
void CNameWalker::_VisitDotName(const CChain& chain, size_t i, CChainName& name) {
    const CTreeNode& last = _fTree->Child(chain.trailers[i], 1);
    const bool is_load = _fContext == EContext::kLoad || i + 1 < chain.trailers.size();
    name.MoveTo(i);
    name.number = CChainName::kNoNumber;
    if (!is_load && _fContext == EContext::kStore) return;
    if (!IsValueWord(last.word)) {
        name.number = _NoteName(name.UpTo(i), name.place, last.token, is_load);
    } else if (name.is_dotted) {
        name.number = _Number(name.UpTo(i));
    }
}

// The name of what the call at `call_i` calls; none when it has no dotted one.
CNameWalker::CFunctionName CNameWalker::_FunctionOf(const CChain& chain, size_t call_i,
                                                    const CChainName& name) {
    if (name.is_dotted) {
        const bool has_number = name.number != CChainName::kNoNumber;
        return {has_number ? name.number : _NumberOfLeaf(*chain.atom), name.place};
    }
    // `(a.b)(x)`
    if (call_i != 0 || !IsDottedName(*_fTree, *chain.atom)) return {};
    const CTreeNode& shown = DropParentheses(*_fTree, *chain.atom);
    return {_NumberOfText(shown), SpanOf(*_fTree, shown)};
}

// Calls

// The arguments of a call, null without any, and what they say about a function with a name.
void CNameWalker::_VisitArguments(const CTreeNode* arguments, CFunctionName function) {
    if (arguments != nullptr) {
        ForEachArgument(*_fTree, *arguments, [&](const CArgumentParts& parts) {
            if (IsBareGenerator(*_fTree, *parts.value) && CountArguments(*_fTree, *arguments) != 1)
                [[unlikely]]
                _Fail(EFault::kBareGenerator, *parts.value);
            _VisitNode(*parts.value);
        });
    }
    if (function.number == CChainName::kNoNumber) return;
    if (arguments != nullptr && _fRecords->names->Text(function.number) == "isinstance")
        _RecordIsInstance(*arguments);
    _RecordCall(arguments, function);
}

// `(a,1)`; no record when an argument has a name or a star.
void CNameWalker::_RecordCall(const CTreeNode* arguments, CFunctionName function) {
    const size_t value = _BeginValue();
    CTextBuffer& values = _fRecords->values;
    values += '(';
    bool is_plain = true;
    if (arguments != nullptr) {
        CNodeText text(*_fTree);
        ForEachArgument(*_fTree, *arguments, [&](const CArgumentParts& parts) {
            is_plain = is_plain && parts.name == nullptr && parts.stars == EStars::kNone &&
                       StarsOfArgument(*_fTree, *parts.value) == EStars::kNone;
            if (!is_plain) return;
            if (values.size() != value + 1) values += ',';
            text.Append(*parts.value, values);
        });
    }
    if (!is_plain) return values.CutTo(value);
    values += ')';
    _Add(function.number, kCalledKind, function.place, value);
}

// isinstance(a, A), isinstance(a, (A, B)): `a` stands for an instance of each class that has a name.
void CNameWalker::_RecordIsInstance(const CTreeNode& arguments) {
    std::array<CArgumentParts, 2> parts;
    uint32_t count = 0;
    ForEachArgument(*_fTree, arguments, [&](const CArgumentParts& argument) {
        if (count < parts.size()) parts[count] = argument;
        ++count;
    });
    if (count != parts.size()) return;
    for (const CArgumentParts& argument : parts)
        if (argument.name != nullptr || argument.stars != EStars::kNone) return;
    if (!IsDottedName(*_fTree, *parts[0].value)) return;
    const CTreeNode& object = DropParentheses(*_fTree, *parts[0].value);
    _RecordInstanceOf(_NumberOfText(object), SpanOf(*_fTree, object), *parts[1].value);
}

// What stands for an instance of a class, or of each class of a tuple, as far as they have names.
void CNameWalker::_RecordInstanceOf(uint32_t name, CSpan place, const CTreeNode& class_or_tuple) {
    const auto record = [&](const CTreeNode& class_node) {
        const size_t value = _BeginValue();
        CNodeText(*_fTree).Append(class_node, _fRecords->values);
        _fRecords->values += kClassInstanceSuffix;
        _Add(name, kPlainEquivKind, place, value);
    };
    CItems classes;
    if (IsDottedName(*_fTree, class_or_tuple)) return record(class_or_tuple);
    if (!IsParenthesizedTuple(*_fTree, class_or_tuple, classes)) return;
    for (uint32_t i = 0; i < classes.count; ++i) {
        const CTreeNode* const item = classes.At(*_fTree, i);
        if (item != nullptr && IsDottedName(*_fTree, *item)) record(*item);
    }
}

// Comprehensions and decorators

void CNameWalker::_VisitCompFor(const CTreeNode& node) {
    const CCompClause clause = CompClauseOf(*_fTree, node);
    _VisitIn(EContext::kStoreWithin, *clause.target);
    _VisitNode(*clause.iterable);
    if (clause.next != nullptr) _VisitNode(*clause.next);
}

// A decorator is a call, without brackets too.
void CNameWalker::_VisitDecorator(const CTreeNode& node) {
    const CTreeNode& name = NameOfDecorator(*_fTree, node);
    _VisitNode(name);
    CFunctionName function;
    if (_IsRecording()) {
        const CTreeNode& shown = DropParentheses(*_fTree, name);
        function = {_NumberOfText(shown), SpanOf(*_fTree, shown)};
    }
    _VisitArguments(ArgumentsOfDecorator(*_fTree, node), function);
}

}  // namespace codeloom
