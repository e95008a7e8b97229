#include "document/pieces.h"

#include <algorithm>
#include <iterator>

#include "file/follow_ups.h"
#include "scopes/join_names.h"
#include "signatures/join_signatures.h"

namespace codeloom {

namespace {

// A piece gets so many lines or a few more, and grows by edits up to the most before it is parted. Few lines
// are soon analysed anew, but all pieces are gone over for each text.
constexpr size_t kFewestLines = 16;
constexpr size_t kMostLines = 48;

bool HaveAskedForLiterals(const std::vector<CPiecePtr>& pieces) {
    return std::any_of(pieces.begin(), pieces.end(),
                       [](const CPiecePtr& piece) { return piece->has_asked_for_literals; });
}

void Move(CProblem& problem, uint32_t shift) {
    problem.start += shift;
    problem.end += shift;
    for (CRelated& related : problem.related) {
        related.start += shift;
        related.end += shift;
    }
}

void Move(CRawLogical& line, uint32_t shift) {
    for (CRawToken& token : line.tokens) token.start += shift;
}

void Move(CStatementHead& head, uint32_t shift) {
    if (head.start == head.end) return;
    head.start += shift;
    head.end += shift;
}

void Move(CBlock& block, uint32_t shift) {
    Move(block.header, shift);
    Move(block.previous, shift);
    for (CSpan* const span : {&block.takes_all, &block.full_header}) {
        if (span->start == span->end) continue;
        span->start += shift;
        span->end += shift;
    }
    if (block.bare_except_start == block.bare_except_end) return;
    block.bare_except_start += shift;
    block.bare_except_end += shift;
}

// The problems of pieces, one piece after the other, without those that follow from others.
class CJoinedProblems {
  public:
    explicit CJoinedProblems(std::string_view text) : _fText(text) {}

    void Add(const CPiece& piece, uint32_t start);
    CProblems Take();

  private:
    bool _FollowsFromOther(const CProblem& problem, CRawLogical line, uint32_t start);

    std::string_view _fText;
    CProblems _fProblems;
    CProblems _fLate;
    CFollowUps _fFollowUps;
};

void CJoinedProblems::Add(const CPiece& piece, uint32_t start) {
    auto fault = piece.faults.begin();
    for (size_t i = 0; i < piece.problems.size(); ++i) {
        CProblem problem = piece.problems[i];
        Move(problem, start);
        const bool is_fault = fault != piece.faults.end() && fault->problem_i == i;
        if (is_fault && _FollowsFromOther(problem, fault++->line, start)) continue;
        _fProblems.push_back(std::move(problem));
    }
    for (const CProblem& problem : piece.late_problems) Move(_fLate.emplace_back(problem), start);
}

bool CJoinedProblems::_FollowsFromOther(const CProblem& problem, CRawLogical line, uint32_t start) {
    Move(line, start);
    line.file_text = _fText;
    return _fFollowUps.Take(problem, line, _fProblems);
}

CProblems CJoinedProblems::Take() {
    _fFollowUps.DropInConflicts(_fProblems);
    std::move(_fLate.begin(), _fLate.end(), std::back_inserter(_fProblems));
    SortByPlace(_fProblems);
    return std::move(_fProblems);
}

CPiecePtr MakePiece(CFilePart part, uint32_t start, const CPartState& state) {
    auto piece = std::make_shared<CPiece>();
    piece->length = part.end - start;
    piece->looked_at = part.looked_at - start;
    piece->state = state;
    piece->problems = std::move(part.analysis.problems);
    piece->faults = std::move(part.faults);
    piece->late_problems = std::move(part.late_problems);
    piece->lines.assign(part.analysis.lines.begin(), part.analysis.lines.end());
    piece->limits = std::move(part.analysis.limits);
    for (CProblem& problem : piece->problems) Move(problem, -start);
    for (CProblem& problem : piece->late_problems) Move(problem, -start);
    for (CLineFault& fault : piece->faults) Move(fault.line, -start);
    for (CLine& line : piece->lines) {
        line.start -= start;
        line.end -= start;
    }
    piece->scanned_in_vain = part.scanned_in_vain;
    piece->repeated_text = part.repeated_text;
    piece->has_asked_for_literals = part.has_asked_for_literals;
    piece->closed = std::move(part.closed);
    for (CBlock& block : piece->closed) Move(block, -start);
    piece->may_have_reopened = part.may_have_reopened;
    piece->needs_whole_text = part.needs_whole_text;
    return piece;
}

// What a part says of names, with places counted from `start`.
std::unique_ptr<const CPieceNames> MakeNames(CFilePart part, uint32_t start) {
    auto made = std::make_unique<CPieceNames>();
    made->names = std::move(part.analysis.names);
    COccurrences& found = made->names.occurrences;
    for (COccurrence& item : found.items) {
        item.start -= start;
        item.end -= start;
        if (item.object_start == item.object_end) continue;
        item.object_start -= start;
        item.object_end -= start;
    }
    for (CInnerScope& scope : found.scopes) {
        scope.start -= start;
        scope.end -= start;
    }
    for (CLineNames& line : made->names.lines)
        if (line.end != 0) line.end -= start;
    made->names.scopes = {};
    CSignatureJoiner(made->signatures).Append(part.analysis.signatures, -start, 0);
    return made;
}

}  // namespace

// Makes the pieces of a text, out of those of the text before where they are the same.
class CPieceWork final : CPartEnd {
  public:
    CPieceWork(std::string_view text, CPieces& pieces) : _fText(text), _fMade(pieces), _fLiteralNames(text) {}

    void MakeAll() {
        _AnalyzeFrom(0, {});
        _NoteLiterals();
    }

    void MakeFrom(const CPieces& old, const CTextEdit& edit);

  private:
    bool EndsAt(uint32_t start, const CPartState& state, size_t line_count) override;
    uint32_t _AnalyzeFrom(uint32_t start, CPartState state);
    CFilePart _AnalyzePart(uint32_t start, const CPartState& state);
    std::vector<CBlock> _ClosedBefore() const;
    bool _IsSame() const;
    void _SkipOldBefore(uint32_t start);
    uint32_t _PlaceOfOld() const;
    void _NoteLiterals();
    CPieces::CLiteralTexts _Literals();

    std::string_view _fText;
    CPieces& _fMade;
    CLiteralNames _fLiteralNames;

    // The pieces of the text before, from which what is the same is taken.
    const CPieces* _fOld = nullptr;
    CTextEdit _fEdit;
    bool _fHasOtherLiterals = false;
    size_t _fOld_i = 0;        // the next one
    uint32_t _fOldStart = 0;   // where it begins, in the text before
    bool _fHasMetOld = false;  // the part under way ends where that one begins
};

void CPieceWork::MakeFrom(const CPieces& old, const CTextEdit& edit) {
    _fOld = &old;
    _fEdit = edit;
    _fHasOtherLiterals = HaveAskedForLiterals(old._fPieces) && _Literals() != old._fLiterals;
    uint32_t start = 0;  // in the text after
    while (_fOld_i < old._fPieces.size()) {
        const CPiecePtr& piece = old._fPieces[_fOld_i];
        if (!_IsSame()) {
            start = _AnalyzeFrom(start, piece->state);
            continue;
        }
        _fMade._fPieces.push_back(piece);
        start += piece->length;
        _fOldStart += piece->length;
        ++_fOld_i;
    }
    _NoteLiterals();
}

// The next old piece says the same as before.
bool CPieceWork::_IsSame() const {
    const CPiece& piece = *_fOld->_fPieces[_fOld_i];
    if (_fHasOtherLiterals && piece.has_asked_for_literals) return false;
    return (_fOldStart > _fEdit.end && !piece.may_have_reopened) ||
           _fOldStart + piece.looked_at < _fEdit.start;
}

// Makes pieces from `start` on up to the end of the text or to an old piece that is the same; gives its
// place.
uint32_t CPieceWork::_AnalyzeFrom(uint32_t start, CPartState state) {
    _fHasMetOld = false;
    do {
        CFilePart part = _AnalyzePart(start, state);
        const uint32_t end = part.end;
        CPartState next = part.state;
        _fMade._fPieces.push_back(MakePiece(std::move(part), start, state));
        start = end;
        state = std::move(next);
    } while (start < _fText.size() && !_fHasMetOld);
    if (!_fHasMetOld && _fOld != nullptr) _fOld_i = _fOld->_fPieces.size();
    return start;
}

// What was closed before matters for few pieces.
CFilePart CPieceWork::_AnalyzePart(uint32_t start, const CPartState& state) {
    const size_t old_i = _fOld_i;
    const uint32_t old_start = _fOldStart;
    CFilePart part = AnalyzePart(_fText, _fMade._fSettings, _fLiteralNames, start, state, {}, *this);
    if (!part.may_have_reopened) return part;
    _fOld_i = old_i;
    _fOldStart = old_start;
    _fHasMetOld = false;
    return AnalyzePart(_fText, _fMade._fSettings, _fLiteralNames, start, state, _ClosedBefore(), *this);
}

// By depth the last block that the pieces so far have closed.
std::vector<CBlock> CPieceWork::_ClosedBefore() const {
    std::vector<CBlock> closed;
    uint32_t start = 0;
    for (const CPiecePtr& piece : _fMade._fPieces) {
        if (closed.size() < piece->closed.size()) closed.resize(piece->closed.size());
        for (size_t i = 0; i < piece->closed.size(); ++i) {
            if (piece->closed[i].indent.column == 0) continue;
            closed[i] = piece->closed[i];
            Move(closed[i], start);
        }
        start += piece->length;
    }
    return closed;
}

bool CPieceWork::EndsAt(uint32_t start, const CPartState& state, size_t line_count) {
    if (_fOld == nullptr) return line_count >= kFewestLines;
    _SkipOldBefore(start);
    _fHasMetOld = _fOld_i < _fOld->_fPieces.size() && _PlaceOfOld() == start && _IsSame() &&
                  _fOld->_fPieces[_fOld_i]->state == state;
    return _fHasMetOld || line_count >= kMostLines;
}

void CPieceWork::_SkipOldBefore(uint32_t start) {
    const std::vector<CPiecePtr>& pieces = _fOld->_fPieces;
    while (_fOld_i < pieces.size() && _PlaceOfOld() < start) _fOldStart += pieces[_fOld_i++]->length;
}

// Where the next old piece begins in the text after; zero for one that begins within the edit.
uint32_t CPieceWork::_PlaceOfOld() const {
    if (_fOldStart < _fEdit.start) return _fOldStart;
    return _fOldStart > _fEdit.end ? _fOldStart - _fEdit.end + _fEdit.NewEnd() : 0;
}

void CPieceWork::_NoteLiterals() {
    if (HaveAskedForLiterals(_fMade._fPieces)) _fMade._fLiterals = _Literals();
}

CPieces::CLiteralTexts CPieceWork::_Literals() {
    CPieces::CLiteralTexts texts;
    for (const std::string_view name : _fLiteralNames.Get()) texts.emplace(name);
    return texts;
}

CPieces::CPieces(std::string_view text, const CFileSettings& settings) : _fSettings(settings) {
    _fSettings.names = std::make_shared<CNameTable>();
    CPieceWork(text, *this).MakeAll();
}

CPieces CPieces::Edited(std::string_view text, const CTextEdit& edit) const {
    CPieces made(_fSettings);
    CPieceWork(text, made).MakeFrom(*this, edit);
    return made;
}

std::optional<CFileAnalysis> CPieces::Analysis(std::string_view text, bool wants_names) const {
    std::optional<CFileAnalysis> analysis(std::in_place);
    size_t line_count = 0, scanned_in_vain = 0, repeated_text = 0;
    for (const CPiecePtr& piece : _fPieces) line_count += piece->lines.size();
    analysis->lines.Reserve(line_count);
    CJoinedProblems problems(text);
    uint32_t start = 0;
    for (const CPiecePtr& piece : _fPieces) {
        if (piece->needs_whole_text || (wants_names && piece->may_have_reopened)) return {};
        scanned_in_vain += piece->scanned_in_vain;
        repeated_text += piece->repeated_text;
        const auto first_line = static_cast<uint32_t>(analysis->lines.size());
        for (const CLine& line : piece->lines)
            analysis->lines.push_back({line.start + start, line.end + start, 0, line.type});
        for (const CLineLimit& limit : piece->limits)
            analysis->limits.push_back({limit.line + first_line, limit.limit});
        problems.Add(*piece, start);
        start += piece->length;
    }
    if (!MayBeInParts(start, scanned_in_vain, repeated_text)) return {};
    analysis->problems = problems.Take();
    if (wants_names) _JoinNames(text, *analysis);
    return analysis;
}

void CPieces::_JoinNames(std::string_view text, CFileAnalysis& analysis) const {
    CLiteralNames literal_names(text);
    std::vector<CNamePart> parts;
    CSignatureJoiner signatures(analysis.signatures);
    uint32_t start = 0, first_line = 0;
    for (const CPiecePtr& piece : _fPieces) {
        const uint32_t end = start + piece->length;
        if (!piece->names)
            piece->names = MakeNames(
                AnalyzeNamesOfPart(text, _fSettings, literal_names, start, end, piece->state), start);
        parts.push_back({&piece->names->names, start});
        signatures.Append(piece->names->signatures, start, first_line);
        first_line += static_cast<uint32_t>(piece->lines.size());
        start = end;
    }
    analysis.names = JoinNames(parts, _fSettings.names);
}

}  // namespace codeloom
