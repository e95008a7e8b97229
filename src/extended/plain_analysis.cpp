#include "extended/plain_analysis.h"

#include <fstream>
#include <iterator>
#include <string>
#include <string_view>
#include <unordered_set>

#include "analysis/embedded.h"
#include "host/neighbour_call.h"
#include "host/neighbour_watch.h"
#include "host/text.h"
#include "line/fault_words.h"
#include "neighbours/imported_names.h"
#include "parse/syntax_error.h"
#include "syntax/grammar_texts.h"
#include "syntax/syntax_grammar.h"

namespace codeloom {

namespace {

CNeighbourWatch gNeighbours;

// The version of a tuple of integers; 0 for one that the plain road doesn't know.
int PlainVersionOf(nb::handle version_triple) {
    if (!nb::isinstance<nb::tuple>(version_triple) || TupleSize(version_triple) < 2) return 0;
    int major = 0, minor = 0;
    const bool is_read = nb::try_cast(TupleItem(version_triple, 0), major) &&
                         nb::try_cast(TupleItem(version_triple, 1), minor);
    const bool is_known = is_read && major == 3 && minor >= 0 && minor < 100 && IsKnownVersion(300 + minor);
    return is_known ? 300 + minor : 0;
}

bool HasText(const nb::object& grammar_file, std::string_view text) {
    std::ifstream file(std::string(CUtf8(PathOfGrammar(grammar_file))), std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(file), {}) == text;
}

// The keywords are those of the language.
bool AreKeywordsOf(const CLanguage& language, nb::object keyword_seq) {
    if (keyword_seq.is_none()) keyword_seq = HomeModule().attr("keyword").attr("kwlist");
    std::unordered_set<EWord> keywords;
    for (nb::handle keyword : keyword_seq) {
        const EWord word = IsText(keyword) ? WordOf(CUtf8(keyword)) : EWord::kNone;
        if (word == EWord::kNone || !language.IsKeyword(word)) return false;
        keywords.insert(word);
    }
    size_t count = 0;
    for (size_t word_i = 1; word_i < static_cast<size_t>(EWord::kCount); ++word_i)
        count += language.IsKeyword(static_cast<EWord>(word_i));
    return keywords.size() == count;
}

// What a fault of the line or of one embedded in it is to the host.
nb::object ErrorFor(CLogicalLine& logical, const CFault& fault, const std::string& message) {
    const nb::int_ context(fault.token_i);
    nb::object part_owner = nb::borrow(logical.Self());
    if (fault.embedded_i >= 0) part_owner = nb::borrow(TupleItem(logical.GetExpLogicals(), fault.embedded_i));
    CLogicalLine& part = *Instance<CLogicalLine>(part_owner);
    if (fault.kind == EFault::kInvalidSyntax && fault.embedded_i >= 0)
        return EmbeddedError(logical, part, context);
    const nb::object place_in_token =
        fault.kind == EFault::kInvalidHint
            ? nb::object(HomeModule().attr("TextPosInfo")(0, -1, int64_t{fault.byte_in_token}))
            : nb::none();
    return CreateSyntaxError(nb::str(message.c_str()), part_owner, context, place_in_token);
}

}  // namespace

void WatchNeighbours() {
    gNeighbours.Watch("BuildArgInfo");
    gNeighbours.Watch("TextPosInfo");
    gNeighbours.Watch("logicalline", {"IsScopeStartLogical", "FindMatchOrCaseType"});
    gNeighbours.Watch("logicalinspect", {"TextFromTokens"});
    gNeighbours.Watch("optpgen", {"ParserGenerator", "CreateParser", "ParseError"});
    gNeighbours.Watch("utils", {"GetLogicalsFromText"});
}

std::unique_ptr<CPlainAnalysis> CPlainAnalysis::TryMake(const CAnalyzerParameters& parameters,
                                                        const CExtendedParser& parser) {
    const int version = PlainVersionOf(parameters.version_triple);
    if (version == 0 || !parameters.py3_grammar || !gNeighbours.IsUntouched()) return nullptr;
    const CLanguage& language = LanguageOf(version);
    const bool is_plain = AreKeywordsOf(language, parameters.keyword_seq) &&
                          HasText(parameters.grammar_file, language.grammar->Text()) &&
                          HasText(parameters.hint_grammar_file, grammar_texts::k314) &&
                          parser.HasOriginalClasses();
    return is_plain ? std::make_unique<CPlainAnalysis>(language) : nullptr;
}

bool CPlainAnalysis::CanTake(const CLogicalLine& logical) {
    return logical.IsFromText() && !nb::inst_python_derived(logical.Self()) && gNeighbours.IsUntouched();
}

std::optional<nb::object> CPlainAnalysis::Analyze(CLogicalLine& logical, bool in_async_def,
                                                  bool first_in_def) {
    _MakeRoom();
    logical.CopyTo(_fLine);
    const CLineResult result = _fAnalyzer.Analyze(_fLine, {.in_async_def = in_async_def,
                                                           .first_in_def = first_in_def,
                                                           .records = &_fRecords,
                                                           .asks_for_more = true});
    if (_fAnalyzer.HasMoreToTell()) return std::nullopt;
    logical.fParsed = true;
    _SetRecords(logical);
    if (!result.fault) return nb::none();
    const std::string message = MessageOf(result.fault, _fLine);
    return ErrorFor(logical, result.fault, message);
}

void CPlainAnalysis::_SetRecords(CLogicalLine& logical) {
    const size_t count = _fRecords.records.size();
    const std::span<const uint32_t> ends = _fAnalyzer.RecordEnds();
    std::vector<CPackedRecords> embedded;
    for (size_t i = 1; i < ends.size() && count != 0; ++i)
        embedded.emplace_back(_fRecords, ends[i - 1], ends[i], false);
    logical.SetRecords({_fRecords, 0, count, false}, {_fRecords, 0, count, true}, std::move(embedded));
}

// Forgets the line before. Names stay while they are few: the next line has many of them again.
void CPlainAnalysis::_MakeRoom() {
    constexpr uint32_t kMostNames = 20'000;
    _fRecords.records.clear();
    _fRecords.values.clear();
    if (_fRecords.names->Count() > kMostNames) _fRecords.names->Clear();
}

}  // namespace codeloom
