#include "neighbours/logicalline/logical_builder.h"

#include "host/text.h"
#include "neighbours/logicalline/logical_line.h"
#include "neighbours/logicalline/logical_types_host.h"
#include "neighbours/logicalline/token_texts.h"
#include "neighbours/token_type.h"
#include "neighbours/tokenizer/tokenizer.h"

namespace codeloom {

namespace {

CTokenTexts& TokenTexts() {
    static CTokenTexts& texts = *new CTokenTexts;  // holds host objects: never destroyed
    return texts;
}

nb::object BuildLogical(const CRawLogical& raw);

nb::tuple BuildEmbedded(const std::vector<CRawLogical>& embedded) {
    return MakeTuple(static_cast<Py_ssize_t>(embedded.size()),
                     [&](Py_ssize_t i) { return BuildLogical(embedded[static_cast<size_t>(i)]); });
}

nb::object BuildLogical(const CRawLogical& raw) {
    const size_t count = raw.tokens.size();
    CTokenTexts& texts = TokenTexts();
    nb::tuple toks = MakeTuple(static_cast<Py_ssize_t>(count), [&](Py_ssize_t i) {
        const CRawToken& token = raw.tokens[static_cast<size_t>(i)];
        return texts.Get(token.text, token.type == kTokenId_NAME);
    });
    auto places = std::make_unique_for_overwrite<CLogicalLine::CTokenPlace[]>(count);
    for (size_t i = 0; i < count; ++i) places[i] = {raw.tokens[i].position, raw.tokens[i].type};
    CRef<CLogicalLine> logical = MakeInstance<CLogicalLine>();
    logical->InitFromTokens(HostText(raw.type), std::move(toks), std::move(places), raw.first_row,
                            BuildEmbedded(raw.embedded));
    logical->fOrigin = raw.origin;
    logical->fInAsyncDef = raw.in_async_def;
    logical->fFirstInDef = raw.first_in_def;
    return logical.Release();
}

}  // namespace

nb::list GetLogicalsFromText(nb::str text) {
    const CUtf8 utf8(text);
    CTokenizer tokenizer(utf8);
    nb::list logicals;
    CRawLogical raw;
    while (tokenizer.NextLogical(raw)) logicals.append(BuildLogical(raw));
    return logicals;
}

}  // namespace codeloom
