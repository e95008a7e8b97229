// One logical line: its tokens, and what the analysis has recorded on it.
//   in     a raw logical from the tokenizer; or texts, types and positions, by hand
//   out    the same to the engine and the host; the host's tuples are made when the host first looks
//   keeps  the text of the file, which all logicals of it share
// Everything the engine needs is inline or virtual, since the engine is an extension of its own.
#pragma once

#include <cstdint>
#include <memory>
#include <vector>

#include <nanobind/nanobind.h>

#include "host/binding.h"
#include "host/collections.h"
#include "host/small_array.h"
#include "neighbours/logicalline/record_pairs.h"
#include "neighbours/logicalline/source_text.h"
#include "tokenizer/raw_logical.h"

namespace codeloom {

class CLogicalLine : public CHosted {
  public:
    // A record made by hand. Token types that aren't given are computed, -1 for a removed token.
    void Init(nb::object type, nb::tuple toks, nb::tuple positions, int32_t first_line,
              nb::tuple exp_logicals, nb::object tok_types);

    // A record made by the tokenizer. `raw` lies in `source`.
    void InitFromRaw(const CRawLogical& raw, nb::object type, CSourceTextRef source);

    bool IsFromText() const { return _fSource != nullptr; }

    // What the tokenizer found. Requires: IsFromText().
    void CopyTo(CRawLogical& raw) const;

    // The tokens as the tokenizer found them; null for a record made by hand.
    const CRawToken* Tokens() const { return _fSource ? _fTokens.View().data() : nullptr; }

    // The records of an analysis on plain data, which replace all that were there: of the line, of
    // its arguments, and those of each embedded logical. Requires: the tokenizer made the record.
    void SetRecords(CPackedRecords equivs, CPackedRecords arg_equivs, std::vector<CPackedRecords> embedded);

    OPERATIONS_OF(CLogicalLine, CNoOperations)
    OPERATION(int, GetTokenType, (Py_ssize_t i), "The token type, an integer, of the token at index `i`.",
              "i"_a);
    OPERATION(void, AppendTypeEquiv, (nb::handle name, nb::handle equiv),
              "Append the pair (name, equiv) of UTF-8 byte strings to `fTypeEquivs`.", "name"_a, "equiv"_a);
    OPERATION(void, AppendArgTypeEquiv, (nb::handle name, nb::handle equiv),
              "Append the pair (name, equiv) of UTF-8 byte strings to `fArgTypeEquivs`.", "name"_a,
              "equiv"_a);
    OPERATION(void, MarkParsed, (bool parsed),
              "Set or clear `fParsed`; a logical that is marked isn't analyzed again.", "parsed"_a);
    OPERATION(void, ClearDerivedInfo, (),
              "Drop all that analysis has recorded on this logical and on its embedded logicals.");
    OPERATION(nb::object, GetExpLogicals, (), "The embedded logicals, a tuple in source order.");
    END_OPERATIONS

    // The host's tuples, made on demand; none in a record whose Init failed.
    virtual nb::object GetToks();
    virtual nb::object GetPositions();
    virtual nb::object GetTokTypes();

    // The lists of records as the host sees them.
    nb::object GetTypeEquivs();
    nb::object GetArgTypeEquivs();

    // `toks` is the tuple that the host sees.
    bool HasToks(const nb::tuple& toks) const { return _fToks.is(toks); }

    template <class Visitor>
    void References(Visitor&& visit) {
        visit(fType);
        visit(_fToks);
        fTypeEquivs.References(visit);
        fArgTypeEquivs.References(visit);
        visit(_fExpLogicals);
        visit(_fPositions);
        visit(_fTokTypes);
    }

    nb::object fType = nb::none();
    bool fParsed = false;
    int32_t fFirstLine = 0;
    int32_t fTokenCount = 0;
    CRecordPairs fTypeEquivs;
    CRecordPairs fArgTypeEquivs;

    // What the tokenizer knows beyond the line itself.
    CPosition fOrigin;  // the place in the file of position (0, 0); columns of row 0 count from it
    bool fInAsyncDef = false;
    bool fFirstInDef = false;

  private:
    template <class Make>
    nb::object _Made(nb::object& tuple, Make make_item);
    void _HandOutRecords();
    void _ShowToCollector() const { ShowToCollector(Self()); }

    // Of the embedded logicals, until somebody looks at these.
    std::vector<CPackedRecords> _fEmbeddedRecords;

    CSourceTextRef _fSource;  // null in a record made by hand
    CLogicalFacts _fFacts;
    TSmallArray<CRawToken> _fTokens;
    std::unique_ptr<const std::vector<CRawLogical>> _fEmbedded;  // null for most lines
    nb::object _fToks;  // these four are invalid, or none, until somebody looks
    nb::object _fPositions;
    nb::object _fTokTypes;
    nb::object _fExpLogicals;
};

// The record of a logical that the tokenizer made; it lies in `source`.
nb::object HostLogical(const CRawLogical& raw, const CSourceTextRef& source);

// The positions of a token tuple: a tuple of (row, col), those of a logical, or none.
class CPositions {
  public:
    CPositions() = default;
    explicit CPositions(CLogicalLine& logical) : _fLogical(&logical) {}
    explicit CPositions(nb::object positions) : _fPositions(std::move(positions)) {}

    bool IsNone() const { return _fLogical == nullptr && (!_fPositions.is_valid() || _fPositions.is_none()); }

    // What the tokenizer found for `toks`, when these are those of a logical that it made; or null.
    const CRawToken* TokensOf(const nb::tuple& toks) const {
        return _fLogical != nullptr && _fLogical->HasToks(toks) ? _fLogical->Tokens() : nullptr;
    }

    // The host's tuple, or none.
    nb::object AsHost() const {
        if (_fLogical != nullptr) return _fLogical->GetPositions();
        return _fPositions.is_valid() ? _fPositions : nb::none();
    }

  private:
    CLogicalLine* _fLogical = nullptr;
    nb::object _fPositions;
};

}  // namespace codeloom

namespace nanobind::detail {

template <>
struct type_caster<codeloom::CPositions> {
    NB_TYPE_CASTER(codeloom::CPositions, const_name("tuple[tuple[int, int], ...]"))

    bool from_python(handle source, uint32_t, cleanup_list*) noexcept {
        if (!source.is_none() && !PyTuple_Check(source.ptr())) return false;
        value = codeloom::CPositions(borrow<object>(source));
        return true;
    }

    static handle from_cpp(const codeloom::CPositions& source, rv_policy, cleanup_list*) {
        return source.AsHost().release();
    }
};

}  // namespace nanobind::detail
