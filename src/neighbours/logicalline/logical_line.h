// One logical line: its tokens, and what the analysis has recorded on it.
//   in     tokens, types and positions, from the tokenizer or by hand
//   out    the same to the engine and the host; the host's tuples are made when the host first looks
// Everything the engine needs is inline or virtual, since the engine is an extension of its own.
#pragma once

#include <cstdint>
#include <memory>

#include <nanobind/nanobind.h>

#include "host/binding.h"
#include "host/collections.h"
#include "neighbours/logicalline/record_pairs.h"
#include "neighbours/tokenizer/raw_logical.h"

namespace codeloom {

class CLogicalLine : public CHosted {
  public:
    // Where a token starts and what it is, as the tokenizer found it.
    struct CTokenPlace {
        CPosition position;
        int16_t type;
    };

    // A record made by hand. Token types that aren't given are computed, -1 for a removed token.
    void Init(nb::object type, nb::tuple toks, nb::tuple positions, int32_t first_line,
              nb::tuple exp_logicals, nb::object tok_types);

    // A record made by the tokenizer.
    void InitFromTokens(nb::object type, nb::tuple toks, std::unique_ptr<CTokenPlace[]> places,
                        int32_t first_line, nb::tuple exp_logicals);

    virtual int GetTokenType(Py_ssize_t i);
    virtual void AppendTypeEquiv(nb::handle name, nb::handle equiv);
    virtual void AppendArgTypeEquiv(nb::handle name, nb::handle equiv);
    virtual void MarkParsed(bool parsed);
    virtual void ClearDerivedInfo();
    virtual nb::object GetExpLogicals();

    // The places of the tokens as the tokenizer found them; null for a record made by hand.
    const CTokenPlace* Places() const { return _fPlaces.get(); }

    // The host's tuples, made on demand.
    virtual nb::object GetPositions();
    virtual nb::object GetTokTypes();

    template <class Visitor>
    void References(Visitor&& visit) {
        visit(fType);
        visit(fToks);
        fTypeEquivs.References(visit);
        fArgTypeEquivs.References(visit);
        visit(_fExpLogicals);
        visit(_fPositions);
        visit(_fTokTypes);
    }

    nb::object fType = nb::none();
    nb::object fToks = nb::none();  // a tuple once Init is through
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
    nb::object _fExpLogicals = nb::none();
    std::unique_ptr<CTokenPlace[]> _fPlaces;  // one a token; none in a record made by hand
    nb::object _fPositions = nb::none();      // none until the host looks
    nb::object _fTokTypes = nb::none();
};

template <class Class>
class TLogicalLineOperations : public Class {
    FIRST_OPERATIONS
    OPERATION(GetTokenType, "The token type, an integer, of the token at index `i`.", "i"_a)
    OPERATION(AppendTypeEquiv, "Append the pair (name, equiv) of UTF-8 byte strings to `fTypeEquivs`.",
              "name"_a, "equiv"_a)
    OPERATION(AppendArgTypeEquiv, "Append the pair (name, equiv) of UTF-8 byte strings to `fArgTypeEquivs`.",
              "name"_a, "equiv"_a)
    OPERATION(MarkParsed, "Set or clear `fParsed`; a logical that is marked isn't analyzed again.",
              "parsed"_a)
    OPERATION(ClearDerivedInfo,
              "Drop all that analysis has recorded on this logical and on its embedded logicals.")
    OPERATION(GetExpLogicals, "The embedded logicals, a tuple in source order.")
    END_OPERATIONS
};

// The positions of a token tuple: a tuple of (row, col), those of a logical, or none.
class CPositions {
  public:
    CPositions() = default;
    explicit CPositions(CLogicalLine& logical) : _fLogical(&logical) {}
    explicit CPositions(nb::object positions) : _fPositions(std::move(positions)) {}

    bool IsNone() const { return _fLogical == nullptr && (!_fPositions.is_valid() || _fPositions.is_none()); }

    // The places of `toks`, when these are those of a logical and the tokenizer found them; or null.
    const CLogicalLine::CTokenPlace* PlacesOf(const nb::tuple& toks) const {
        return _fLogical != nullptr && _fLogical->fToks.is(toks) ? _fLogical->Places() : nullptr;
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
