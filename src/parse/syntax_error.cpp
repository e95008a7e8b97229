#include "parse/syntax_error.h"

#include "host/collections.h"
#include "host/errors.h"
#include "host/neighbour_call.h"
#include "host/overrides.h"
#include "host/text.h"

namespace codeloom {

namespace {

constexpr CNeighbourFunction kTextFromTokens("logicalinspect", "TextFromTokens");

struct CPlace {
    nb::object row;
    nb::object offset;
};

// A pair of the host as a place; ValueError when it doesn't have two items.
CPlace Unpack(nb::handle pair) {
    nb::tuple items(nb::borrow(pair));
    if (items.size() != 2) {
        PyErr_Format(PyExc_ValueError, "expected a (row, column) pair, %zd items found", TupleSize(items));
        throw nb::python_error();
    }
    return {items[0], items[1]};
}

// Just after the last token; a removed one has no length.
CPlace PlaceAtEnd(nb::handle logical) {
    const nb::object last_token = logical.attr("fToks")[-1];
    CPlace place = Unpack(logical.attr("fPositions")[-1]);
    if (!last_token.is_none()) place.offset = place.offset + nb::int_(CUtf8(last_token)->size());
    return place;
}

// `pos_info_in_tok` counts from the start of the token, which may span several rows.
CPlace Refine(CPlace place, nb::handle pos_info_in_tok) {
    const nb::object rows_down = pos_info_in_tok.attr("lineno");
    const nb::object col = pos_info_in_tok.attr("utf8_col");
    if (rows_down.equal(nb::int_(0))) return {place.row, place.offset + col};
    return {place.row + rows_down, col};
}

CPlace PlaceOf(nb::handle logical, nb::handle context, nb::handle pos_info_in_tok) {
    const nb::object token_count = logical.attr("fTokenCount");
    if (token_count.equal(nb::int_(0))) return {nb::int_(0), nb::int_(0)};
    if (nb::isinstance<nb::tuple>(context)) return Unpack(context);
    if (!(context < token_count)) return PlaceAtEnd(logical);
    const nb::object token = logical.attr("fToks")[context];  // a context beyond the tokens fails here
    CPlace place = Unpack(logical.attr("fPositions")[context]);
    return pos_info_in_tok.is_none() ? place : Refine(std::move(place), pos_info_in_tok);
}

}  // namespace

nb::object CreateSyntaxError(nb::handle msg, nb::handle logical, nb::handle context,
                             nb::handle pos_info_in_tok) {
    const nb::object kept_context = nb::borrow(context);  // its node may be given back meanwhile
    const CPlace place = PlaceOf(logical, kept_context, pos_info_in_tok);
    const nb::object src = kTextFromTokens(logical);
    const nb::int_ one(1);
    return nb::borrow(PyExc_SyntaxError)(
        msg, nb::make_tuple("<string>", place.row + one, place.offset + one, src));
}

nb::object NextNonRemovedTokenInTuple(nb::handle toks, Py_ssize_t i) {
    while (++i < TupleSize(toks)) {
        const nb::handle tok = TupleItem(toks, i);
        const CUtf8 text(tok);
        if (text->empty()) RaiseIndexError("string index out of range");
        if (text->front() != '\\' && text->front() != '#') return nb::borrow(tok);
    }
    return nb::none();
}

void BindSyntaxError(nb::module_& module) {
    module.def(
        "CreateSyntaxError", &CreateSyntaxError, "msg"_a.none(), "logical"_a, "context"_a.none(),
        "pos_info_in_tok"_a.none() = nb::none(),
        " Create a SyntaxError exception instance for an error occuring at the\n    given token index of the "
        "logical ");
}

}  // namespace codeloom
