#include "neighbours/logicalline/logical_line.h"

#include "host/errors.h"
#include "host/text.h"
#include "neighbours/token_type.h"

namespace codeloom {

namespace {

nb::object TypesOf(nb::handle toks) {
    return MakeTuple(TupleSize(toks), [&](Py_ssize_t i) -> nb::object {
        const nb::handle tok = TupleItem(toks, i);
        return nb::int_(tok.is_none() ? -1 : GetTokenType(CUtf8(tok)));
    });
}

}  // namespace

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
    fToks = std::move(toks);
    _fPositions = std::move(positions);
    _fTokTypes = std::move(types);
    _fExpLogicals = std::move(exp_logicals);
}

void CLogicalLine::InitFromTokens(nb::object type, nb::tuple toks, std::unique_ptr<CTokenPlace[]> places,
                                  int32_t first_line, nb::tuple exp_logicals) {
    fType = std::move(type);
    fTokenCount = static_cast<int32_t>(TupleSize(toks));
    fFirstLine = first_line;
    fToks = std::move(toks);
    _fPlaces = std::move(places);
    _fExpLogicals = std::move(exp_logicals);
}

int CLogicalLine::GetTokenType(Py_ssize_t i) {
    if (_fPlaces == nullptr) return ResultFromHost<int>(nb::object(GetTokTypes()[i]));
    if (i < 0) i += fTokenCount;
    if (i < 0 || i >= fTokenCount) RaiseIndexError("token index out of range");
    return _fPlaces[i].type;
}

void CLogicalLine::AppendTypeEquiv(nb::handle name, nb::handle equiv) {
    fTypeEquivs.Append(name, equiv);
}

void CLogicalLine::AppendArgTypeEquiv(nb::handle name, nb::handle equiv) {
    fArgTypeEquivs.Append(name, equiv);
}

void CLogicalLine::MarkParsed(bool parsed) {
    fParsed = parsed;
}

void CLogicalLine::ClearDerivedInfo() {
    fTypeEquivs.Clear();
    fArgTypeEquivs.Clear();
    if (_fExpLogicals.is_none()) return;
    for (nb::handle exp_logical : nb::borrow<nb::tuple>(_fExpLogicals)) {
        const CRecursionScope recursion;  // a host may nest them without end
        Instance<CLogicalLine>(exp_logical)->ClearDerivedInfo();
    }
}

nb::object CLogicalLine::GetExpLogicals() {
    return _fExpLogicals;
}

nb::object CLogicalLine::GetPositions() {
    if (_fPositions.is_none() && _fPlaces != nullptr)
        _fPositions = MakeTuple(fTokenCount, [&](Py_ssize_t i) -> nb::object {
            return nb::make_tuple(_fPlaces[i].position.row, _fPlaces[i].position.col);
        });
    return _fPositions;
}

nb::object CLogicalLine::GetTokTypes() {
    if (_fTokTypes.is_none() && _fPlaces != nullptr)
        _fTokTypes = MakeTuple(fTokenCount, [&](Py_ssize_t i) -> nb::object {
            return nb::int_(static_cast<int>(_fPlaces[i].type));
        });
    return _fTokTypes;
}

}  // namespace codeloom
