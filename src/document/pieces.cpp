#include "document/pieces.h"

#include <utility>

#include "document/joined_problems.h"
#include "scopes/declarations.h"
#include "scopes/join_names.h"
#include "signatures/join_signatures.h"
#include "text/move_bytes.h"

namespace codeloom {

namespace {

// A piece gets so many lines or a few more, and grows by edits up to the most before it is parted. Few lines
// are soon analysed anew.
constexpr size_t kFewestLines = 16;
constexpr size_t kMostLines = 48;

// The table of names keeps those of texts before. It is made anew when it has this many more than a text may
// have, in which there are fewer names and chains of names than bytes.
constexpr size_t kMostOldNames = size_t{1} << 16;

}  // namespace

// Makes the pieces of a text, out of those of the text before where they are the same.
class CPieceWork final : CPartEnd {
  public:
    CPieceWork(std::string_view text, CPieces& made) : _fText(text), _fMade(made), _fLiteralNames(text) {}

    void MakeAll() {
        _AnalyzeFrom(0, {});
        _End();
    }

    void MakeFrom(const CPieces& old, std::string_view old_text, const CTextEdit& edit,
                  std::vector<CReplacedLines>& replaced);

  private:
    bool EndsAt(uint32_t start, const CPartState& state, size_t line_count) override;
    void Restart() override;
    void _TakeLiterals(const CPieces& old, std::string_view old_text);
    void _Replace(std::vector<CReplacedLines>& replaced);
    void _AnalyzeFrom(uint32_t start, CPartState state);
    CFilePart _AnalyzePart(uint32_t start, const CPartState& state);
    std::vector<CBlock> _ClosedBefore() const;
    bool _IsSame(const CPieceSums& sums, uint32_t start) const;
    bool _IsSamePiece() const;
    void _SkipOldBefore(uint32_t start);
    uint32_t _PlaceOfOld() const;
    void _End();
    CPieces::CLiteralTexts _Literals();

    std::string_view _fText;
    CPieces& _fMade;
    CLiteralNames _fLiteralNames;

    // The pieces of the text before, from which what is the same is taken: the next one, and whether the part
    // under way ends where that one begins.
    std::optional<CPieceCursor> _fOld;
    std::optional<CPieceCursor> _fOldAtStart;  // of the part under way
    CTextEdit _fEdit;
    bool _fHasOtherLiterals = false;
    bool _fHasMetOld = false;
};

void CPieceWork::MakeFrom(const CPieces& old, std::string_view old_text, const CTextEdit& edit,
                          std::vector<CReplacedLines>& replaced) {
    _fOld.emplace(old._fPieces);
    _fEdit = edit;
    _TakeLiterals(old, old_text);
    while (!_fOld->IsAtEnd()) {
        const CPlacedPage& page = _fOld->Page();
        if (_fOld->BeginsPage() && _IsSame(page.page->sums, page.before.start)) {
            _fMade._fPieces.Add(page);
            _fOld->NextPage();
        } else if (_IsSamePiece()) {
            _fMade._fPieces.Add(_fOld->Piece());
            _fOld->Next();
        } else {
            _Replace(replaced);
        }
    }
    _End();
}

// An edit far from all that names `Literal` leaves its names as they are.
void CPieceWork::_TakeLiterals(const CPieces& old, std::string_view old_text) {
    if (!old._fLiterals) return;
    if (MayNameLiteral(old_text, _fEdit.start, _fEdit.end) ||
        MayNameLiteral(_fText, _fEdit.start, _fEdit.NewEnd())) {
        _fHasOtherLiterals = _Literals() != *old._fLiterals;
    } else {
        _fMade._fLiterals = old._fLiterals;
        _fLiteralNames.Know({_fMade._fLiterals->begin(), _fMade._fLiterals->end()});
    }
}

void CPieceWork::_Replace(std::vector<CReplacedLines>& replaced) {
    const CPiecePlace begin = _fMade._fPieces.Size();
    CReplacedLines lines;
    lines.old_first = _fOld->Place().line;
    lines.new_first = begin.line;
    _AnalyzeFrom(begin.start, _fOld->Piece()->state);
    lines.old_end = _fOld->Place().line;
    lines.new_end = _fMade._fPieces.Size().line;
    replaced.push_back(lines);
}

// What pieces that begin at `start` of the text before say is the same as before.
bool CPieceWork::_IsSame(const CPieceSums& sums, uint32_t start) const {
    if (_fHasOtherLiterals && sums.has_asked_for_literals) return false;
    return (start > _fEdit.end && !sums.may_have_reopened) || start + sums.looked_at < _fEdit.start;
}

bool CPieceWork::_IsSamePiece() const {
    return _IsSame(CPieceSums::Of(*_fOld->Piece()), _fOld->Place().start);
}

// Makes pieces from `start` on up to the end of the text or to an old piece that is the same.
void CPieceWork::_AnalyzeFrom(uint32_t start, CPartState state) {
    _fHasMetOld = false;
    do {
        CFilePart part = _AnalyzePart(start, state);
        const uint32_t end = part.end;
        CPartState next = part.state;
        _fMade._fPieces.Add(std::make_shared<const CPiece>(_fText, std::move(part), start, state));
        start = end;
        state = std::move(next);
    } while (start < _fText.size() && !_fHasMetOld);
    if (!_fHasMetOld && _fOld) _fOld->GoToEnd();
}

// What was closed before matters for few pieces.
CFilePart CPieceWork::_AnalyzePart(uint32_t start, const CPartState& state) {
    _fOldAtStart = _fOld;
    CFilePart part = AnalyzePart(_fText, _fMade._fSettings, _fLiteralNames, start, state, {}, *this);
    if (!part.may_have_reopened) return part;
    Restart();
    return AnalyzePart(_fText, _fMade._fSettings, _fLiteralNames, start, state, _ClosedBefore(), *this);
}

void CPieceWork::Restart() {
    _fOld = _fOldAtStart;
    _fHasMetOld = false;
}

// By depth the last block that the pieces so far have closed.
std::vector<CBlock> CPieceWork::_ClosedBefore() const {
    std::vector<CBlock> closed;
    _fMade._fPieces.ForEach([&](const CPiece& piece, const CPiecePlace& place) {
        if (closed.size() < piece.closed.size()) closed.resize(piece.closed.size());
        for (size_t i = 0; i < piece.closed.size(); ++i) {
            if (piece.closed[i].indent.column == 0) continue;
            closed[i] = piece.closed[i];
            Move(closed[i], place.start);
        }
    });
    return closed;
}

bool CPieceWork::EndsAt(uint32_t start, const CPartState& state, size_t line_count) {
    if (!_fOld) return line_count >= kFewestLines;
    _SkipOldBefore(start);
    _fHasMetOld =
        !_fOld->IsAtEnd() && _PlaceOfOld() == start && _IsSamePiece() && _fOld->Piece()->state == state;
    return _fHasMetOld || line_count >= kMostLines;
}

void CPieceWork::_SkipOldBefore(uint32_t start) {
    while (!_fOld->IsAtEnd() && _PlaceOfOld() < start) _fOld->Next();
}

// Where the next old piece begins in the text after; zero for one that begins within the edit.
uint32_t CPieceWork::_PlaceOfOld() const {
    const uint32_t start = _fOld->Place().start;
    if (start < _fEdit.start) return start;
    return start > _fEdit.end ? start - _fEdit.end + _fEdit.NewEnd() : 0;
}

void CPieceWork::_End() {
    _fMade._fPieces.End();
    if (!_fMade._fLiterals && _fMade._fPieces.Sums().has_asked_for_literals) _fMade._fLiterals = _Literals();
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

CPieces CPieces::Edited(std::string_view old_text, std::string_view text, const CTextEdit& edit,
                        std::vector<CReplacedLines>& replaced) const {
    CPieces made(_fSettings);
    if (_fSettings.names->Count() > text.size() + kMostOldNames)
        made._fSettings.names = std::make_shared<CNameTable>();
    CPieceWork(text, made).MakeFrom(*this, old_text, edit, replaced);
    return made;
}

bool CPieces::SayAll() const {
    const CPieceSums& sums = _fPieces.Sums();
    return !sums.needs_whole_text && MayBeInParts(sums.size.start, sums.scanned_in_vain, sums.repeated_text);
}

CLine CPieces::Line(uint32_t line_i) const {
    const CPlacedPiece at = _fPieces.AtLine(line_i);
    CLine line = at.piece->lines[line_i - at.before.line];
    MoveBytes(line, at.before.start);
    return line;
}

CProblems CPieces::Problems(std::string_view text) const {
    CJoinedProblems problems(text);
    const bool are_late_known = !_fPieces.Sums().declares_for_others;
    _fPieces.ForEach(
        [&](const CPiece& piece, const CPiecePlace& place) {
            if (piece.HasProblems()) problems.Add(piece, place.start);
            if (are_late_known) problems.AddLate(piece, place.start);
        },
        &CPieceSums::has_problems);
    if (!are_late_known) CheckDeclarations(_Names(text), _fSettings.version, problems.Late());
    return problems.Take();
}

std::optional<CFileAnalysis> CPieces::Analysis(std::string_view text, bool wants_records,
                                               bool wants_names) const {
    if ((wants_records || wants_names) && _fPieces.Sums().may_have_reopened) return {};
    std::optional<CFileAnalysis> analysis(std::in_place);
    analysis->lines.Reserve(LineCount());
    _fPieces.ForEach([&](const CPiece& piece, const CPiecePlace& place) {
        for (const CLine& line : piece.lines)
            analysis->lines.push_back({line.start + place.start, line.end + place.start, 0, line.type});
    });
    analysis->problems = Problems(text);
    if (wants_records) _AddRecords(text, *analysis);
    if (!wants_names) return analysis;
    analysis->names = _Names(text);
    CSignatureJoiner signatures(analysis->signatures);
    _fPieces.ForEach([&](const CPiece& piece, const CPiecePlace& place) {
        signatures.Append(piece.names->signatures, place.start, place.line);
    });
    return analysis;
}

void CPieces::_AddRecords(std::string_view text, CFileAnalysis& analysis) const {
    CLiteralNames literal_names(text);
    CFileSettings settings = _fSettings;
    settings.wants_records = true;
    settings.wants_names = false;
    analysis.records.names = _fSettings.names;
    _fPieces.ForEach([&](const CPiece& piece, const CPiecePlace& place) {
        const uint32_t start = place.start;
        if (!piece.records || piece.records->records.names != _fSettings.names)
            piece.records = MakeRecords(
                AnalyzeKnownPart(text, settings, literal_names, start, start + piece.Length(), piece.state),
                start);
        AppendRecords(*piece.records, start, place.line, analysis);
    });
}

CTextNames CPieces::_Names(std::string_view text) const {
    CLiteralNames literal_names(text);
    CFileSettings settings = _fSettings;
    settings.wants_records = false;
    settings.wants_names = true;
    std::vector<CNamePart> parts;
    _fPieces.ForEach([&](const CPiece& piece, const CPiecePlace& place) {
        const uint32_t start = place.start;
        if (!piece.names || piece.names->names.occurrences.names != _fSettings.names)
            piece.names = MakeNames(
                AnalyzeKnownPart(text, settings, literal_names, start, start + piece.Length(), piece.state),
                start);
        parts.push_back({&piece.names->names, start, piece.state.IsInClass(), piece.names->open_scope});
    });
    return JoinNames(parts, _fSettings.names);
}

}  // namespace codeloom
