#include "tokenizer/comment_hint.h"

#include "text/white_space.h"

namespace codeloom {

namespace {

constexpr std::string_view kIgnore = "ignore";

// The first mark in a comment. Most comments hold no colon, and that is quickly found.
size_t FindTypeMark(std::string_view comment) {
    constexpr size_t kWordLength = kTypeMark.size() - 1;
    size_t colon = comment.find(kTypeMark.back());
    while (colon != std::string_view::npos && !comment.substr(0, colon + 1).ends_with(kTypeMark))
        colon = comment.find(kTypeMark.back(), colon + 1);
    return colon == std::string_view::npos ? colon : colon - kWordLength;
}

}  // namespace

std::optional<std::string_view> HintInComment(std::string_view comment) {
    const size_t mark = FindTypeMark(comment);
    if (mark == std::string_view::npos) return std::nullopt;
    if (!WithoutSpaceAtEnd(comment.substr(0, mark)).ends_with('#')) return std::nullopt;
    std::string_view hint = comment.substr(mark + kTypeMark.size());
    hint = hint.substr(0, hint.find('#'));
    if (WithoutSpaceAround(hint) == kIgnore) return std::nullopt;
    return hint;
}

bool IsIgnoreWithMore(std::string_view hint) {
    hint = WithoutSpaceAround(hint);
    return hint.starts_with(kIgnore) && hint.size() > kIgnore.size() &&
           WordCharLength(hint, kIgnore.size()) == 0;
}

}  // namespace codeloom
