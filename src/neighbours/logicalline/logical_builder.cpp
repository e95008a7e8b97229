#include "neighbours/logicalline/logical_builder.h"

#include <utility>

#include "neighbours/logicalline/logical_line.h"
#include "tokenizer/tokenizer.h"

namespace codeloom {

nb::list GetLogicalsFromText(nb::str text) {
    const auto source = std::make_shared<const CSourceText>(std::move(text));
    CTokenizer tokenizer(source->Utf8());
    nb::list logicals;
    CRawLogical raw;
    while (tokenizer.NextLogical(raw)) logicals.append(HostLogical(raw, source));
    return logicals;
}

}  // namespace codeloom
