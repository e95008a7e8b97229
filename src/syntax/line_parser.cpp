#include "syntax/line_parser.h"

#include <algorithm>

#include "syntax/span_parser.h"
#include "syntax/tree_check.h"

namespace codeloom {

struct CLineParser::CParts {
    explicit CParts(const CLanguage& language) : parser(language) {}

    CSpanParser parser;
};

namespace {

CFault RefusedAt(const CRawLogical& logical, const CRefusal& refusal) {
    const auto count = static_cast<uint32_t>(logical.tokens.size());
    return {.kind = EFault::kInvalidSyntax, .token_i = std::min(refusal.token_i, count)};
}

void Finish(const CParsed& node, CTree& tree) {
    tree.fIsEmpty = !static_cast<bool>(node);
    if (node) tree.fRoot = *node;
    CheckTree(tree);
}

}  // namespace

CLineParser::CLineParser(const CLanguage& language) : _fParts(std::make_unique<CParts>(language)) {}

CLineParser::~CLineParser() = default;

CFault CLineParser::Parse(const CRawLogical& logical, bool in_async_def, CTree& tree) {
    CSpanParser& parser = _fParts->parser;
    tree.Reset(logical);
    parser.Begin(tree);
    try {
        Finish(parser.Parse(CTokenSpan::OfLine(logical, in_async_def)), tree);
    } catch (const CRefusal& refusal) {
        return RefusedAt(logical, refusal);
    }
    if (parser.Forms().Found() == nullptr) return {};
    return {.kind = EFault::kNewerForm, .form = parser.Forms().Found(), .token_i = parser.Forms().Token()};
}

CFault CLineParser::ParseTokens(const CRawLogical& logical, bool in_async_def, CTree& tree) {
    CSpanParser& parser = _fParts->parser;
    tree.Reset(logical);
    parser.Begin(tree);
    try {
        Finish(parser.ParseByGrammar(CTokenSpan::OfLine(logical, in_async_def)), tree);
    } catch (const CRefusal& refusal) {
        return RefusedAt(logical, refusal);
    }
    return {};
}

}  // namespace codeloom
