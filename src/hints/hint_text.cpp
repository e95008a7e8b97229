#include "hints/hint_text.h"

#include <string>

#include "host/collections.h"
#include "host/text.h"
#include "text/white_space.h"
#include "tokenizer/comment_hint.h"
#include "typing/function_hint.h"

namespace codeloom {

bool HoldsTypeMark(nb::handle comment) {
    return IsText(comment) && CUtf8(comment)->find(kTypeMark) != std::string_view::npos;
}

CTextOrNone AlignedHintInComment(const nb::str& comment) {
    const CUtf8 utf8(comment);
    const std::optional<std::string_view> hint = HintInComment(utf8);
    if (!hint) return CTextOrNone();
    const auto start = static_cast<size_t>(hint->data() - std::string_view(utf8).data());
    return TextFromUtf8(WithoutSpaceAtEnd(std::string(start, ' ').append(*hint)));
}

CRewrittenHint RewriteFunctionHint(const nb::str& hint) {
    const CDefForHint def = DefForHint(CUtf8(hint));
    CRewrittenHint rewritten;
    for (const CDefForHint::CToken& token : def.tokens) {
        rewritten.toks.append(InternedText(def.Text(token)));
        rewritten.utf8_offsets.append(token.offset);
    }
    return rewritten;
}

}  // namespace codeloom
