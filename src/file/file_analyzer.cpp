#include "file/file_analyzer.h"

#include <algorithm>
#include <cassert>
#include <optional>

#include "causes/causes.h"
#include "file/file_part.h"
#include "file/follow_ups.h"
#include "file/method_hints.h"
#include "line/line_length.h"
#include "rules/text_checker.h"
#include "scopes/declaration_places.h"
#include "scopes/declarations.h"
#include "scopes/name_collector.h"
#include "scopes/scope_builder.h"
#include "signatures/signature_finder.h"
#include "tokenizer/quote_context.h"
#include "tokenizer/tokenizer.h"
#include "typing/false_hints.h"

namespace codeloom {

namespace {

// Of a text of so many bytes, most have fewer. What is too much is given back at the end.
constexpr size_t kBytesOfLine = 48;
constexpr size_t kBytesOfRecord = 20;
constexpr size_t kBytesOfValue = 4;
constexpr size_t kBytesOfOccurrence = 24;
constexpr size_t kMostExpected = size_t{1} << 24;  // longer texts grow what they need

bool ImportsPrintFunction(const CRawLogical& logical) {
    if (logical.type != ELogicalType::kFromImport) return false;
    bool is_from_future = false;
    for (const CRawToken& token : logical.tokens) {
        if (token.type != kTokenId_NAME) continue;
        const std::string_view name = logical.Text(token);
        is_from_future |= name == "__future__";
        if (is_from_future && name == "print_function") return true;
    }
    return false;
}

// A declaration, or an import from the future.
bool HasTellingName(const CRawLogical& logical) {
    if (logical.MayHaveWords(WordBits(EWord::kGlobal, EWord::kNonlocal))) return true;
    return logical.type == ELogicalType::kFromImport &&
           std::any_of(logical.tokens.begin(), logical.tokens.end(),
                       [&](const CRawToken& token) { return logical.Text(token) == "__future__"; });
}

// Of what a line with a fault may change, one right in the class around too.
bool IsOfBinding(const CProblem& problem) {
    return problem.code == ECode::kNonlocalWithoutBinding || problem.code == ECode::kNonlocalTypeParameter;
}

uint32_t RowStartOf(const CRawLogical& logical) {
    const CRawToken& first = logical.tokens.front();
    return logical.StartOf(first) - static_cast<uint32_t>(first.position.col);
}

const CUnreadable kAllReadable;

class CEndAt final : public CPartEnd {
  public:
    explicit CEndAt(uint32_t end) : _fEnd(end) {}
    bool EndsAt(uint32_t start, const CPartState&, size_t) override { return start == _fEnd; }
    void Restart() override {}

  private:
    uint32_t _fEnd;
};

// One analysis of one text, or of a part of one.
class CFileAnalyzer final : CTreeObserver {
  public:
    // With `wants_all_names` the rules for declarations see the names of the whole text, else those of the
    // blocks that hold a declaration.
    CFileAnalyzer(std::string_view text, const CFileSettings& settings, const CUnreadable& unreadable,
                  bool wants_all_names)
        : CFileAnalyzer(text, settings, unreadable, text, false, wants_all_names, _fOwnLiteralNames) {}

    // For a part: with `declares_names` the rules for declarations see its names.
    CFileAnalyzer(std::string_view text, const CFileSettings& settings, CLiteralNames& literal_names,
                  bool declares_names)
        : CFileAnalyzer(text, settings, kAllReadable, {}, declares_names, declares_names, literal_names) {}

    CFileAnalysis Run();
    CFilePart RunPart(uint32_t start, const CPartState& state, std::vector<CBlock> closed,
                      CPartEnd& part_end);

    // True after a run that saw too few names for the declarations that are there.
    bool NeedsAllNames() const { return _fNeedsAllNames; }

    // True after a part whose names matter: one declares some, or says how annotations are read.
    bool HasTellingNames() const { return _fHasTellingNames; }

  private:
    // Names may be declared where `declared_text` says so, or anyhow.
    CFileAnalyzer(std::string_view text, const CFileSettings& settings, const CUnreadable& unreadable,
                  std::string_view declared_text, bool declares_names, bool wants_all_names,
                  CLiteralNames& literal_names)
        : _fText(text),
          _fSettings(settings),
          _fUnreadable(unreadable),
          _fLength(text.size()),
          _fOwnLiteralNames(text),
          _fFalseHints(text, literal_names),
          _fChecker(LanguageOf(settings.version), _fResult.problems),
          _fDeclarations(declared_text),
          _fMayDeclareNames(declares_names || !_fDeclarations.IsEmpty()),
          _fWantsAllNames(settings.wants_names || wants_all_names),
          _fSignatures(_fResult.signatures) {
        if (settings.names) _fResult.records.names = settings.names;
        _fResult.names.occurrences.names = _fResult.records.names;
        if (settings.wants_names || _fMayDeclareNames)
            _fNames.emplace(LanguageOf(settings.version), _fMayDeclareNames, _fResult.names);
        _SetLanguage(LanguageOf(settings.version));
    }

    void Take(const CRawLogical& part, const CTree& tree) override;
    void TakeHint(const CTree& tree, const CTreeNode& node, uint32_t shift) override;
    bool WantsHints() const override { return _fSettings.wants_names; }
    void TakeHintOf(const CHintNote& note) override { _fSignatures.TakeHintOf(note); }
    bool _IsOutOfTime() const;
    void _SetLanguage(const CLanguage& language);
    void _MakeRoom();
    void _GiveRoomBack();
    void _TakePrintFunction();
    void _BeginLine(const CRawLogical& logical);
    void _AnalyzeBegunLine(const CRawLogical& logical);
    bool _EndsBefore(const CRawLogical& logical, const CTokenizer& tokenizer, CPartEnd& part_end);
    bool _DeclaresForOthers(uint32_t open_scope) const;
    CFilePart _EndPart(const CLexer& lexer, uint32_t end, uint32_t looked_at);
    CPartState _State() const {
        return {_fChecker.State(), _fHasPrintFunction,
                _fNames ? _fNames->DefersAnnotations() : _fDefersAnnotations};
    }
    void _BeginNames(const CRawLogical& logical);
    void _Leave(const CRawLogical& logical, bool has_fault);
    CLineResult _Analyze(const CRawLogical& logical);
    void _FindOutWhetherToCollect(const CRawLogical& logical);
    void _FinishNames();
    void _AddUnreadable();
    void _PlaceFaults();
    void _AddFault(const CRawLogical& logical, const CFault& fault);
    void _AddProblem(ECode code, uint32_t start, uint32_t end, std::string message);
    bool _IsUnreadable(const CLine& line) const;

    std::string_view _fText;
    const CFileSettings& _fSettings;
    const CUnreadable& _fUnreadable;
    CLengthLimits _fLength;
    CLiteralNames _fOwnLiteralNames;
    CFalseHints _fFalseHints;
    const CLanguage* _fLanguage = nullptr;
    bool _fHasPrintFunction = false;
    std::optional<CLineAnalyzer> _fAnalyzer;
    std::optional<CCauses> _fCauses;  // made for the first fault
    CFollowUps _fFollowUps;
    CFileAnalysis _fResult;
    CTextChecker _fChecker;
    CDeclarationPlaces _fDeclarations;
    const bool _fMayDeclareNames;
    const bool _fWantsAllNames;
    bool _fNeedsAllNames = false;
    bool _fHasTellingNames = false;
    bool _fDefersAnnotations = false;  // before the part
    bool _fIsFileTooLong = false;
    bool _fIsPart = false;
    bool _fBeginsInClass = false;
    uint32_t _fPartStart = 0;
    std::vector<CLineFault> _fFaults;  // of a part
    bool _fIsCollecting = false;       // names of the line under way
    std::optional<CNameCollector> _fNames;
    const CRawLogical* _fLine = nullptr;  // under way, where names are wanted
    CSignatureFinder _fSignatures;
};

CFileAnalysis CFileAnalyzer::Run() {
    _MakeRoom();
    CTokenizer tokenizer(_fText);
    CRawLogical logical;
    while (tokenizer.NextLogical(logical)) {
        _BeginLine(logical);
        _AnalyzeBegunLine(logical);
        if (_IsOutOfTime()) [[unlikely]] {
            CFileAnalysis cut;
            cut.is_cut = true;
            return cut;
        }
    }
    _fChecker.Finish();
    _fFollowUps.DropInConflicts(_fResult.problems);
    if (_fNames) _FinishNames();
    _AddUnreadable();
    _GiveRoomBack();
    SortByPlace(_fResult.problems);
    return std::move(_fResult);
}

// Parts of a text

CFilePart CFileAnalyzer::RunPart(uint32_t start, const CPartState& state, std::vector<CBlock> closed,
                                 CPartEnd& part_end) {
    _fIsPart = true;
    _fPartStart = start;
    _fChecker.Resume(state.check, std::move(closed));
    if (state.has_print_function) _TakePrintFunction();
    _fDefersAnnotations = state.defers_annotations;
    _fBeginsInClass = state.IsInClass();
    if (_fNames) _fNames->Resume(state.defers_annotations, _fBeginsInClass);
    CTokenizer tokenizer(_fText, start, _fBeginsInClass);
    CRawLogical logical;
    for (bool is_fresh = false; tokenizer.NextLogical(logical); is_fresh = tokenizer.IsFresh()) {
        _BeginLine(logical);
        if (is_fresh && _EndsBefore(logical, tokenizer, part_end)) {
            _fResult.lines.CutTo(_fResult.lines.size() - 1);
            return _EndPart(tokenizer.Lexer(), RowStartOf(logical), logical.EndOf(logical.tokens.back()));
        }
        _AnalyzeBegunLine(logical);
    }
    _fChecker.Finish();
    const auto size = static_cast<uint32_t>(_fText.size());
    return _EndPart(tokenizer.Lexer(), size, size);
}

// Only before a line that is judged by itself. One that begins with a string may be judged by what is before
// it, where its quotes are in doubt; a comment after a `def` may be the hint of that.
bool CFileAnalyzer::_EndsBefore(const CRawLogical& logical, const CTokenizer& tokenizer, CPartEnd& part_end) {
    const CRawToken& first = logical.tokens.front();
    const size_t line_count = _fResult.lines.size() - 1;
    if (first.type != kTokenId_NAME && first.type != kTokenId_AT) return false;
    if (line_count == 0 || _fResult.lines[line_count - 1].type == ELogicalType::kFunctionDef) return false;
    const int32_t column = first.position.col;
    if (column != 0 && (!logical.is_indented_by_spaces || !tokenizer.IsInClassOnly())) return false;
    if (!_fChecker.Blocks().BeginsAnew(column)) return false;
    const uint32_t start = RowStartOf(logical);
    const bool has_problem = std::any_of(_fResult.problems.begin(), _fResult.problems.end(),
                                         [&](const CProblem& problem) { return problem.end > start; });
    return !has_problem && part_end.EndsAt(start, _State(), line_count);
}

CFilePart CFileAnalyzer::_EndPart(const CLexer& lexer, uint32_t end, uint32_t looked_at) {
    CFilePart part;
    if (_fNames && end < _fText.size()) part.open_scope = _fNames->ScopeAround(_fChecker.Blocks());
    _fNeedsAllNames = _fNames && _DeclaresForOthers(part.open_scope);
    _PlaceFaults();
    const size_t count = _fResult.problems.size();
    if (_fNames) _FinishNames();
    const auto first_late = _fResult.problems.begin() + static_cast<ptrdiff_t>(count);
    part.late_problems.assign(std::make_move_iterator(first_late),
                              std::make_move_iterator(_fResult.problems.end()));
    _fResult.problems.resize(count);
    if (_fBeginsInClass || part.open_scope != 0)
        _fNeedsAllNames |= std::any_of(part.late_problems.begin(), part.late_problems.end(), IsOfBinding);
    part.faults = std::move(_fFaults);
    part.end = end;
    part.state = _State();
    const size_t next =
        SkipToNextRow(_fText, FindRowEnd(_fText, std::max<size_t>(looked_at, lexer.LookedAt())));
    part.looked_at = static_cast<uint32_t>(std::min(FindRowEnd(_fText, next) + 2, _fText.size()));
    part.scanned_in_vain = lexer.ScannedInVain();
    part.repeated_text = _fLength.RepeatedText();
    part.has_asked_for_literals = _fFalseHints.HasAskedForLiterals();
    const CBlockTracker& blocks = _fChecker.Blocks();
    part.closed = blocks.Closed();
    part.may_have_reopened = _fPartStart > 0 && blocks.MayHaveReopened();
    part.declares_for_others = _fNeedsAllNames;
    part.needs_whole_text = _fIsFileTooLong || blocks.TakenBackFrom() < _fPartStart ||
                            blocks.FollowsUnknown() || (part.may_have_reopened && _fHasTellingNames);
    part.analysis = std::move(_fResult);
    return part;
}

// A declaration concerns names of other parts: one in the module, or in a class that is in others too.
bool CFileAnalyzer::_DeclaresForOthers(uint32_t open_scope) const {
    return DeclaresIn(0, _fResult.names) || (_fBeginsInClass && DeclaresIn(1, _fResult.names)) ||
           (open_scope != 0 && DeclaresIn(open_scope, _fResult.names));
}

// Storage that grew bit by bit would be copied more than once.
void CFileAnalyzer::_MakeRoom() {
    const size_t bytes = std::min(_fText.size(), kMostExpected);
    _fResult.lines.Reserve(bytes / kBytesOfLine + 1);
    if (_fSettings.wants_records) {
        _fResult.records.records.Reserve(bytes / kBytesOfRecord + 1);
        _fResult.records.values.reserve(bytes / kBytesOfValue + 1);
    }
    if (_fWantsAllNames) {
        _fResult.names.lines.Reserve(bytes / kBytesOfLine + 1);
        _fResult.names.occurrences.items.Reserve(bytes / kBytesOfOccurrence + 1);
    }
}

void CFileAnalyzer::_GiveRoomBack() {
    _fResult.lines.Shrink();
    _fResult.records.records.Shrink();
    _fResult.records.values.Shrink();
    _fResult.names.Shrink();
}

// Asked after each line; the clock is looked at now and then.
bool CFileAnalyzer::_IsOutOfTime() const {
    constexpr size_t kLinesBetween = 64;
    return _fSettings.time_limit != nullptr && _fResult.lines.size() % kLinesBetween == 0 &&
           _fSettings.time_limit->IsOver();
}

// Rules take back problems of theirs, so the places of others among them are only known at the end.
void CFileAnalyzer::_PlaceFaults() {
    size_t problem_i = 0;
    for (CLineFault& fault : _fFaults) {
        const CProblems& problems = _fResult.problems;
        while (problems[problem_i].start != fault.start || problems[problem_i].code != fault.code)
            ++problem_i;
        fault.problem_i = problem_i++;
    }
}

// Whoever looks for names sees what the rules see.

void CFileAnalyzer::Take(const CRawLogical& part, const CTree& tree) {
    _fChecker.Take(part, tree);
    if (_fIsCollecting) _fNames->Take(part, tree);
    if (_fSettings.wants_names && &part == _fLine) _fSignatures.Take(tree);
}

void CFileAnalyzer::TakeHint(const CTree& tree, const CTreeNode& node, uint32_t shift) {
    if (_fIsCollecting) _fNames->TakeHint(tree, node, shift);
}

void CFileAnalyzer::_BeginNames(const CRawLogical& logical) {
    if (_fIsPart) _fHasTellingNames |= HasTellingName(logical);
    if (_fNames) _FindOutWhetherToCollect(logical);
    if (_fIsCollecting) _fNames->BeginLine(logical, _fChecker.Blocks());
    if (!_fSettings.wants_names) return;
    _fLine = &logical;
    _fSignatures.BeginLine(logical, static_cast<uint32_t>(_fResult.lines.size() - 1));
}

// A declaration concerns the names of the definition around it. What a line imports may say how annotations
// are read.
void CFileAnalyzer::_FindOutWhetherToCollect(const CRawLogical& logical) {
    if (_fWantsAllNames) {
        _fIsCollecting = true;
        return;
    }
    const uint32_t start = logical.StartOf(logical.tokens.front());
    if (logical.type != ELogicalType::kComment && _fChecker.Blocks().Depth() == 0)
        _fIsCollecting = logical.type == ELogicalType::kFromImport || _fDeclarations.MayLieInBlockOf(start);
    _fNeedsAllNames |=
        !_fIsCollecting && _fDeclarations.HasOneIn(start, logical.EndOf(logical.tokens.back()));
}

void CFileAnalyzer::_Leave(const CRawLogical& logical, bool has_fault) {
    _fChecker.Leave(logical, has_fault);
    if (_fIsCollecting) _fNames->EndLine(logical, has_fault, _fChecker.Blocks());
    if (_fSettings.wants_names) _fSignatures.EndLine(has_fault);
}

void CFileAnalyzer::_TakePrintFunction() {
    _fHasPrintFunction = true;
    _SetLanguage(LanguageOf(_fSettings.version, true));
}

void CFileAnalyzer::_SetLanguage(const CLanguage& language) {
    _fLanguage = &language;
    _fAnalyzer.emplace(language);
    _fCauses.reset();
}

void CFileAnalyzer::_BeginLine(const CRawLogical& logical) {
    assert(!logical.tokens.empty());
    const auto first_record = static_cast<uint32_t>(_fResult.records.records.size());
    const CLine line = {logical.StartOf(logical.tokens.front()), logical.EndOf(logical.tokens.back()),
                        first_record, logical.type};
    _fResult.lines.push_back(line);
    _fChecker.Enter(logical);
}

void CFileAnalyzer::_AnalyzeBegunLine(const CRawLogical& logical) {
    const CLine line = _fResult.lines.back();
    if (_fSettings.version < 300 && ImportsPrintFunction(logical)) _TakePrintFunction();
    _BeginNames(logical);
    if (const ETooLong too_long = _fLength.Take(logical); too_long != ETooLong::kNot) [[unlikely]] {
        _Leave(logical, true);
        _fIsFileTooLong |= too_long == ETooLong::kRepeatedTextOfFile;
        const CRawToken& first = logical.tokens.front();
        return _AddProblem(ECode::kLineTooLong, logical.StartOf(first), logical.EndOf(first),
                           CLengthLimits::Message(too_long, logical));
    }
    CLineResult result = _Analyze(logical);
    // `except A, a.b:` binds what isn't a name; in Python 2 that is sound.
    if (result.fault.kind == EFault::kExceptTarget && _fSettings.version < 300) result.fault = {};
    _Leave(logical, static_cast<bool>(result.fault));
    if (result.fault) {
        if (!_IsUnreadable(line)) _AddFault(logical, result.fault);
        return;
    }
    if (result.limit != ELimit::kNone)
        _fResult.limits.push_back({static_cast<uint32_t>(_fResult.lines.size() - 1), result.limit});
    if (_fSettings.wants_records) LeaveSelfOut(logical, _fResult.records, line.first_record);
}

CLineResult CFileAnalyzer::_Analyze(const CRawLogical& logical) {
    CRecords* const records = _fSettings.wants_records ? &_fResult.records : nullptr;
    return _fAnalyzer->Analyze(logical, {.in_async_def = logical.in_async_def,
                                         .first_in_def = logical.first_in_def,
                                         .records = records,
                                         .false_hints = _fSettings.false_hints ? nullptr : &_fFalseHints,
                                         .observer = this});
}

void CFileAnalyzer::_AddFault(const CRawLogical& logical, const CFault& fault) {
    if (!_fCauses) _fCauses.emplace(*_fLanguage);
    CProblem problem = _fCauses->Of(fault, logical);
    if (_fIsPart) {
        _fFaults.push_back({problem.start, problem.code, 0, logical});
        _fFaults.back().line.embedded.clear();
        _fResult.problems.push_back(std::move(problem));
        return;
    }
    if (!_fFollowUps.Take(problem, logical, _fResult.problems))
        _fResult.problems.push_back(std::move(problem));
}

void CFileAnalyzer::_AddProblem(ECode code, uint32_t start, uint32_t end, std::string message) {
    _fResult.problems.push_back({code, start, end, std::move(message), {}, {}});
}

void CFileAnalyzer::_FinishNames() {
    _fNames->Finish();
    BuildScopes(_fResult.names);
    _fNeedsAllNames |= !_fWantsAllNames && DeclaresIn(0, _fResult.names);
    if (_fMayDeclareNames) CheckDeclarations(_fResult.names, _fSettings.version, _fResult.problems);
    if (!_fSettings.wants_names) _fResult.names = {};
}

void CFileAnalyzer::_AddUnreadable() {
    for (const CUnreadable::CFault& fault : _fUnreadable.faults)
        _AddProblem(ECode::kUnreadable, fault.start, fault.end, fault.message);
}

bool CFileAnalyzer::_IsUnreadable(const CLine& line) const {
    const std::vector<uint32_t>& offsets = _fUnreadable.offsets;
    const auto next = std::lower_bound(offsets.begin(), offsets.end(), line.start);
    return next != offsets.end() && *next < line.end;
}

}  // namespace

CFileAnalysis AnalyzeFile(std::string_view text, const CFileSettings& settings,
                          const CUnreadable& unreadable) {
    assert(text.size() <= kMaxTextSize);
    CFileAnalyzer analyzer(text, settings, unreadable, false);
    CFileAnalysis analysis = analyzer.Run();
    if (!analyzer.NeedsAllNames()) return analysis;
    return CFileAnalyzer(text, settings, unreadable, true).Run();
}

CFilePart AnalyzePart(std::string_view text, const CFileSettings& settings, CLiteralNames& literal_names,
                      uint32_t start, const CPartState& state, const std::vector<CBlock>& closed,
                      CPartEnd& part_end) {
    CFileSettings quick = settings;
    quick.wants_records = quick.wants_names = false;
    CFileAnalyzer analyzer(text, quick, literal_names, false);
    CFilePart part = analyzer.RunPart(start, state, closed, part_end);
    if (!analyzer.HasTellingNames()) return part;
    part_end.Restart();
    return CFileAnalyzer(text, quick, literal_names, true).RunPart(start, state, closed, part_end);
}

CFilePart AnalyzeKnownPart(std::string_view text, const CFileSettings& settings, CLiteralNames& literal_names,
                           uint32_t start, uint32_t end, const CPartState& state) {
    CEndAt same_end(end);
    CFileAnalyzer analyzer(text, settings, literal_names, settings.wants_names);
    return analyzer.RunPart(start, state, {}, same_end);
}

bool MayBeInParts(size_t text_size, size_t scanned_in_vain, size_t repeated_text) {
    return scanned_in_vain < CLexer::MostScannedInVain(text_size) &&
           repeated_text <= CLengthLimits::MostRepeatedText(text_size);
}

}  // namespace codeloom
