#include "syntax/nodes.h"

namespace codeloom {

CSpan SpanAfterLastToken(const CTree& tree) {
    const CRawLogical& line = tree.Line();
    if (line.tokens.empty()) return {};
    const uint32_t end = line.EndOf(line.tokens.back());
    return {end, end};
}

}  // namespace codeloom
