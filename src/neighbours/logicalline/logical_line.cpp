#include "neighbours/logicalline/logical_line.h"

#include "host/errors.h"
#include "host/text.h"
#include "neighbours/logicalline/logical_types_host.h"
#include "neighbours/logicalline/token_texts.h"
#include "text/token_type.h"

namespace codeloom {

namespace {

nb::object TypesOf(nb::handle toks) {
    return MakeTuple(TupleSize(toks), [&](Py_ssize_t i) -> nb::object {
        const nb::handle tok = TupleItem(toks, i);
        return nb::int_(tok.is_none() ? -1 : GetTokenType(CUtf8(tok)));
    });
}

// A tuple that is made on demand has been made.
bool IsMade(const nb::object& tuple) {
    return tuple.is_valid() && !tuple.is_none();
}

nb::object HostTextOf(const CRawToken& token, std::string_view text) {
    static CTokenTexts& texts = *new CTokenTexts;  // holds host objects: never destroyed
    return texts.Get(TextOf(token, text), token.type == kTokenId_NAME);
}

}  // namespace

nb::object HostLogical(const CRawLogical& raw, const CSourceTextRef& source) {
    CRef<CLogicalLine> logical = MakeInstance<CLogicalLine>();
    logical->InitFromRaw(raw, HostText(raw.type), source);
    HideFromCollector(logical->Self());  // nothing that the host could tie into a cycle is in it yet
    return logical.Release();
}

void CLogicalLine::Init(nb::object type, nb::tuple toks, nb::tuple positions, int32_t first_line,
                        nb::tuple exp_logicals, nb::object tok_types) {
    if (!IsText(type)) RaiseWrongType("str", type);
    for (nb::handle exp_logical : exp_logicals) Instance<CLogicalLine>(exp_logical);
    nb::object types = tok_types.is_none() ? TypesOf(toks) : tok_types;
    if (!nb::isinstance<nb::tuple>(types)) RaiseWrongType("tuple", types);
    if (nb::len(positions) != nb::len(toks) || nb::len(types) != nb::len(toks))
        throw nb::value_error("toks, positions and tok_types of a logical must be of one length");
    fType = std::move(type);
    fFirstLine = first_line;
    fTokenCount = static_cast<int32_t>(nb::len(toks));
    fOrigin = {first_line, 0};
    _fToks = std::move(toks);
    _fPositions = std::move(positions);
    _fTokTypes = std::move(types);
    _fExpLogicals = std::move(exp_logicals);
}

void CLogicalLine::InitFromRaw(const CRawLogical& raw, nb::object type, CSourceTextRef source) {
    fType = std::move(type);
    fFirstLine = raw.first_row;
    fTokenCount = static_cast<int32_t>(raw.tokens.size());
    fOrigin = raw.origin;
    fInAsyncDef = raw.in_async_def;
    fFirstInDef = raw.first_in_def;
    _fSource = std::move(source);
    _fFacts = raw;
    _fTokens = TSmallArray<CRawToken>(raw.tokens);
    if (!raw.embedded.empty()) _fEmbedded = std::make_unique<const std::vector<CRawLogical>>(raw.embedded);
}

void CLogicalLine::CopyTo(CRawLogical& raw) const {
    const std::span<const CRawToken> tokens = _fTokens.View();
    static_cast<CLogicalFacts&>(raw) = _fFacts;
    raw.tokens.assign(tokens.begin(), tokens.end());
    if (_fEmbedded) {
        raw.embedded = *_fEmbedded;
    } else {
        raw.embedded.clear();
    }
}

int CLogicalLine::GetTokenType(Py_ssize_t i) {
    if (!_fSource) return ResultFromHost<int>(nb::object(GetTokTypes()[i]));
    if (i < 0) i += fTokenCount;
    if (i < 0 || i >= fTokenCount) RaiseIndexError("token index out of range");
    return _fTokens.View()[static_cast<size_t>(i)].type;
}

void CLogicalLine::AppendTypeEquiv(nb::handle name, nb::handle equiv) {
    _ShowToCollector();
    fTypeEquivs.Append(name, equiv);
}

void CLogicalLine::AppendArgTypeEquiv(nb::handle name, nb::handle equiv) {
    _ShowToCollector();
    fArgTypeEquivs.Append(name, equiv);
}

nb::object CLogicalLine::GetTypeEquivs() {
    _ShowToCollector();
    return fTypeEquivs.AsHost();
}

nb::object CLogicalLine::GetArgTypeEquivs() {
    _ShowToCollector();
    return fArgTypeEquivs.AsHost();
}

void CLogicalLine::MarkParsed(bool parsed) {
    fParsed = parsed;
}

void CLogicalLine::ClearDerivedInfo() {
    fTypeEquivs.Clear();
    fArgTypeEquivs.Clear();
    _fEmbeddedRecords.clear();
    if (!IsMade(_fExpLogicals)) return;
    for (nb::handle exp_logical : nb::borrow<nb::tuple>(_fExpLogicals)) {
        const CRecursionScope recursion;  // a host may nest them without end
        Instance<CLogicalLine>(exp_logical)->ClearDerivedInfo();
    }
}

template <class Make>
nb::object CLogicalLine::_Made(nb::object& tuple, Make make_item) {
    if (!IsMade(tuple)) {
        if (!_fSource) return nb::none();
        tuple = MakeTuple(fTokenCount,
                          [&](Py_ssize_t i) { return make_item(_fTokens.View()[static_cast<size_t>(i)]); });
    }
    return tuple;
}

nb::object CLogicalLine::GetToks() {
    return _Made(_fToks, [&](const CRawToken& token) { return HostTextOf(token, _fFacts.file_text); });
}

nb::object CLogicalLine::GetPositions() {
    return _Made(_fPositions, [](const CRawToken& token) -> nb::object {
        return nb::make_tuple(token.position.row, token.position.col);
    });
}

nb::object CLogicalLine::GetTokTypes() {
    return _Made(_fTokTypes, [](const CRawToken& token) -> nb::object { return nb::int_(int{token.type}); });
}

nb::object CLogicalLine::GetExpLogicals() {
    if (!IsMade(_fExpLogicals)) {
        if (!_fSource) return nb::none();
        _ShowToCollector();
        const auto count = static_cast<Py_ssize_t>(_fEmbedded ? _fEmbedded->size() : 0);
        _fExpLogicals = MakeTuple(count, [&](Py_ssize_t i) {
            return HostLogical((*_fEmbedded)[static_cast<size_t>(i)], _fSource);
        });
        _HandOutRecords();
    }
    return _fExpLogicals;
}

void CLogicalLine::SetRecords(CPackedRecords equivs, CPackedRecords arg_equivs,
                              std::vector<CPackedRecords> embedded) {
    CLogicalLine::ClearDerivedInfo();
    fTypeEquivs.Set(std::move(equivs));
    fArgTypeEquivs.Set(std::move(arg_equivs));
    _fEmbeddedRecords = std::move(embedded);
    if (IsMade(_fExpLogicals)) _HandOutRecords();
}

// Gives the embedded logicals their records.
void CLogicalLine::_HandOutRecords() {
    std::vector<CPackedRecords> records = std::move(_fEmbeddedRecords);
    _fEmbeddedRecords.clear();
    for (size_t i = 0; i < records.size(); ++i)
        Instance<CLogicalLine>(TupleItem(_fExpLogicals, static_cast<Py_ssize_t>(i)))
            ->fTypeEquivs.Set(std::move(records[i]));
}

}  // namespace codeloom
