#include "neighbours/bind.h"

#include "neighbours/logicalline/logical_builder.h"
#include "neighbours/logicalline/logical_line.h"
#include "neighbours/logicalline/logical_types_host.h"

namespace codeloom {

namespace {

constexpr const char* kLogicalLineDoc =
    "One logical line of Python source.\n\n"
    "CLogicalLine(type, toks, positions, first_line=0, exp_logicals=(), tok_types=None)\n"
    "makes one by hand: a logical type (text string), a tuple of token texts (None for a removed token),\n"
    "a tuple of (row, column) pairs with rows from zero from the logical's first row and columns in UTF-8\n"
    "bytes, the source row of the first token, the embedded logicals, and the token types, which are\n"
    "computed when not given. Unequal lengths raise ValueError, wrong types TypeError.\n"
    "utils.GetLogicalsFromText makes them from source text.";

void BindLogicalLine(nb::module_& module) {
    nb::class_<CLogicalLine, THostSubclass<CLogicalLine>> binding(module, "CLogicalLine",
                                                                  Collected<CLogicalLine>(), kLogicalLineDoc);
    binding
        .def(TInit<nb::object, nb::tuple, nb::tuple, int32_t, nb::tuple, nb::object>(), "type"_a, "toks"_a,
             "positions"_a, "first_line"_a = 0, "exp_logicals"_a = nb::tuple(), "tok_types"_a = nb::none())
        .def_ro("fType", &CLogicalLine::fType, "The logical type, one of the constants of logicalline.")
        .def_prop_ro(
            "fToks", [](CLogicalLine& logical) { return logical.CLogicalLine::GetToks(); },
            "Tuple of token texts; None for a removed token.")
        .def_prop_ro("fTokTypes", &CLogicalLine::GetTokTypes, "Tuple of token types, one for each token.")
        .def_prop_ro(
            "fPositions", [](CLogicalLine& logical) { return logical.CLogicalLine::GetPositions(); },
            "Tuple of (row, column): row from zero from the first row, column in UTF-8 bytes from zero.")
        .def_ro("fParsed", &CLogicalLine::fParsed, "True once the logical has been analyzed.")
        .def_ro("fFirstLine", &CLogicalLine::fFirstLine, "Source row of the first token, from zero.")
        .def_ro("fTokenCount", &CLogicalLine::fTokenCount, "Number of tokens.")
        .def_prop_ro(
            "fTypeEquivs", &CLogicalLine::GetTypeEquivs,
            "List of (name, equiv) pairs of byte strings in order of arrival; None when there is none.")
        .def_prop_ro("fArgTypeEquivs", &CLogicalLine::GetArgTypeEquivs,
                     "The same for the arguments of a definition.")
        .def_prop_ro(
            "fOrigin",
            [](const CLogicalLine& logical) {
                return nb::make_tuple(logical.fOrigin.row, logical.fOrigin.col);
            },
            "Where position (0, 0) is in the file, as (row, column in UTF-8 bytes), both from zero. "
            "Columns of row 0 count from it, columns of later rows from the start of the file's row.")
        .def_ro("fInAsyncDef", &CLogicalLine::fInAsyncDef,
                "True in the header and the body of an `async def`.")
        .def_ro("fFirstInDef", &CLogicalLine::fFirstInDef, "True for the first line of a def's body.");
    BindOperations(binding);
}

}  // namespace

void BindLogicals(nb::module_& module) {
    BindLogicalTypes(module);
    BindLogicalLine(module);
    module.def(
        "GetLogicalsFromText", &GetLogicalsFromText, "text"_a,
        "The logical lines of a source text, a list of CLogicalLine. It never fails on what the text says:\n"
        "what isn't Python becomes tokens that the parser refuses, on the line where it is.");
}

}  // namespace codeloom
