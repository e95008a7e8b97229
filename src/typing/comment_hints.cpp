// Hints in comments.
#include <algorithm>
#include <string>

#include "names/record_kinds.h"
#include "syntax/definitions.h"
#include "text/white_space.h"
#include "tokenizer/comment_hint.h"
#include "typing/function_hint.h"
#include "typing/hint_walker.h"

namespace codeloom {

namespace {

const CTreeNode& LastPiece(const CParameter& parameter) {
    if (parameter.value != nullptr) return *parameter.value;
    return parameter.type_expr != nullptr ? *parameter.type_expr : *parameter.name;
}

// The rows that a token covers, as the host's strings count them: any character that ends a line does.
int32_t CountRows(std::string_view text) {
    if (text.find('\n') == std::string_view::npos) return 1;
    int32_t count = 1;
    for (size_t pos = 0; pos < text.size();) {
        const CDecodedChar decoded = DecodeChar(text, pos);
        const uint32_t code = decoded.code;
        const bool ends_row = (code >= 0x0A && code <= 0x0D) || (code >= 0x1C && code <= 0x1E) ||
                              code == 0x85 || code == 0x2028 || code == 0x2029;
        pos += std::max<size_t>({decoded.length, RowEndLength(text, pos), 1});
        count += ends_row && pos < text.size();
    }
    return count;
}

// The `def` leaves records of its arguments: of their names, its type parameters, or what it returns.
bool HasArgumentRecords(const CTree& tree, const CTreeNode& funcdef) {
    bool has_names = false;
    ForEachParameter(tree, ParametersOfFuncdef(tree, funcdef), [&](const CParameter& parameter) {
        has_names |= parameter.name != nullptr || parameter.nested != nullptr;
    });
    return has_names || ReturnTypeOfFuncdef(tree, funcdef) != nullptr ||
           tree.fRoot.Is(ENodeKind::kWithTypeParameters);
}

}  // namespace

// Finding

// Looks at the tokens when it is first asked for a line.
bool CHintWalker::_CommentsMayHoldHints() {
    if (!_fLine->may_have_comments) return false;
    if (!_fHasMarks)
        _fHasMarks =
            std::any_of(_fLine->tokens.begin(), _fLine->tokens.end(), [this](const CRawToken& token) {
                return token.type == kTokenId_COMMENT &&
                       _fLine->Text(token).find(kTypeMark) != std::string_view::npos;
            });
    return *_fHasMarks;
}

// Reads the hint in a comment; false when there is none.
bool CHintWalker::_ReadHint(uint32_t token_i) {
    const CRawToken& token = _fLine->tokens[token_i];
    const std::string_view comment = _fLine->Text(token);
    const std::optional<std::string_view> hint = HintInComment(comment);
    CFalseHints* const false_hints = _fContext.false_hints;
    if (!hint || (false_hints != nullptr && false_hints->IsFalseInComment(*hint))) return false;
    _fHint.token_i = token_i;
    _fHint.start = _fLine->StartOf(token);
    _fHint.text.assign(static_cast<size_t>(hint->data() - comment.data()), ' ').append(*hint);
    if (false_hints != nullptr) CFalseHints::MakeReadable(_fHint.text);
    _fHint.text.resize(EndBeforeSpace(_fHint.text, _fHint.text.size()));
    return true;
}

// The first comment on a row.
std::optional<uint32_t> CHintWalker::_FindComment(int32_t row) const {
    const std::vector<CRawToken>& tokens = _fLine->tokens;
    for (uint32_t i = 0; i < tokens.size() && tokens[i].position.row <= row; ++i)
        if (tokens[i].position.row == row && tokens[i].type == kTokenId_COMMENT) return i;
    return std::nullopt;
}

// The row on which a node ends. An invented leaf is where the last token is.
int32_t CHintWalker::_LastRowOf(const CTreeNode& node) const {
    const CTreeNode& leaf = LastLeaf(*_fTree, node);
    const size_t token_i = std::min<size_t>(leaf.token, _fLine->tokens.size() - 1);
    return _fLine->tokens[token_i].position.row + CountRows(_fTree->Text(leaf)) - 1;
}

// The hint in the comment on the row on which a node ends.
bool CHintWalker::_ReadEndingHint(const CTreeNode& node) {
    const std::optional<uint32_t> token_i = _FindComment(_LastRowOf(node));
    return token_i && _ReadHint(*token_i);
}

// The comment directly after an argument and its comma. False when it holds no hint.
bool CHintWalker::_PairArgumentComment(const CParameter& parameter) {
    const std::vector<CRawToken>& tokens = _fLine->tokens;
    uint32_t token_i = LastLeaf(*_fTree, LastPiece(parameter)).token + 1;
    if (token_i < tokens.size() && tokens[token_i].type == kTokenId_COMMA) ++token_i;
    const bool is_comment = token_i < tokens.size() && tokens[token_i].type == kTokenId_COMMENT;
    if (!is_comment || !_ReadHint(token_i)) return false;
    _PairComment(*parameter.name, true);
    return true;
}

// True when the comment after the header is that of its last argument, which has no room for its own but
// there: it is on the argument's row and isn't in a function's form.
bool CHintWalker::_IsForArgument(const CParameter& parameter) const {
    return parameter.name != nullptr && !HasFunctionForm(_fHint.text) &&
           _LastRowOf(LastPiece(parameter)) == _fLine->tokens[_fHint.token_i].position.row;
}

// Recording

// The hint that was read is that of a name.
void CHintWalker::_PairComment(const CTreeNode& name, bool of_arg) {
    const CHintTree tree = _fParser.ParseExpression(_fHint);
    if (!tree) return;
    _NoteSize(*tree.tree);
    const CHint hint{tree, &tree.tree->fRoot, of_arg};
    _WalkNames(hint);
    _Pair(name, hint);
}

// The hint that was read is that of a function: of `funcdef`, or, where that is null, of the one whose body
// begins with the comment. Then arguments go by their indexes.
void CHintWalker::_RecordFunction(const CTreeNode* funcdef) {
    const CHintTree tree = _fParser.ParseFunction(_fHint);
    if (!tree) return;
    _NoteSize(*tree.tree);
    const CTreeNode& header = tree.tree->fRoot;
    const bool of_arg = funcdef != nullptr;
    if (of_arg) _CollectArguments();
    uint32_t argument_i = 0;
    ForEachParameter(*tree.tree, ParametersOfFuncdef(*tree.tree, header), [&](const CParameter& parameter) {
        if (parameter.nested != nullptr) return;
        const uint32_t i = argument_i++;
        _fArgument_i = static_cast<int>(i);
        if (parameter.type_expr == nullptr) return;
        const CHint hint{tree, parameter.type_expr, of_arg};
        _WalkNames(hint);
        if (of_arg && !HasArgumentRecords(*_fTree, *funcdef)) _GiveUp();
        if (of_arg && i < _fArguments.size()) return _Record(_fArguments[i].name, _fArguments[i].place, hint);
        _Record(std::string(kArgPrefix) + std::to_string(i), _PlaceOf(hint), hint);
    });
    _fArgument_i = -1;
    if (const CTreeNode* const result = ReturnTypeOfFuncdef(*tree.tree, header)) {
        const CHint hint{tree, result, of_arg};
        _WalkNames(hint);
        _Record(kReturnName, _PlaceOf(hint), hint);
    }
}

// The arguments of the line, by the records which say that they are bound.
void CHintWalker::_CollectArguments() {
    _fArguments.clear();
    if (_fContext.records == nullptr) return;
    const CRecords& records = *_fContext.records;
    for (size_t i = _fContext.first_record; i < records.records.size(); ++i) {
        const CRecord& record = records.records[i];
        if (record.of_arg && record.kind == kSetKind)
            _fArguments.push_back({std::string(records.Name(record)), {record.start, record.end}});
    }
}

void CHintWalker::_GiveUp() {
    _fResult.is_given_up = true;
    throw CStop();
}

// The names that a hint in a comment uses are read by the line that it is on.
void CHintWalker::_WalkNames(const CHint& hint) {
    if (_fContext.observer != nullptr)
        _fContext.observer->TakeHint(*hint.tree.tree, *hint.node, hint.tree.shift);
    CRecords* const records = _fContext.records;
    const size_t first = records != nullptr ? records->records.size() : 0;
    const CWalkResult walked = _fNames.Walk(*hint.tree.tree, *hint.node, records);
    if (walked.limit != ELimit::kNone) _NoteLimit(walked.limit);
    if (walked.fault) {
        _fResult.fault = walked.fault;
        throw CStop();
    }
    if (records == nullptr) return;
    for (size_t i = first; i < records->records.size(); ++i) {
        records->records[i].start += hint.tree.shift;
        records->records[i].end += hint.tree.shift;
    }
}

// The bytes of a hint in a comment.
CSpan CHintWalker::_PlaceOf(const CHint& hint) const {
    const CSpan place = SpanOf(*hint.tree.tree, *hint.node);
    return {place.start + hint.tree.shift, place.end + hint.tree.shift};
}

}  // namespace codeloom
