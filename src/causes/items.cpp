// What is wrong between brackets: arguments, entries of dictionaries, comprehensions.

#include "causes/recognisers.h"

namespace codeloom {

namespace {

bool EndsItem(int type) {
    return type == kTokenId_COMMA || IsCloserType(type);
}

}  // namespace

CCause ArgumentFault(const CFaultyLine& line) {
    const int i = line.At();
    const int opener_i = line.OpenerBefore(i);
    const bool is_starred = line.Is(opener_i - 1, kTokenId_STAR);
    if (opener_i < 0 || (!line.FollowsOperand(opener_i) && !is_starred)) return {};
    const int start = line.ItemStart(i);
    if (EndsItem(line.Type(i)) && line.Is(i - 1, kTokenId_EQUAL))
        return line.Problem(ECode::kMissingArgumentValue, start, i - 1, "expected argument value expression");
    if (line.Is(i, kTokenId_EQUAL) && line.Is(start, kTokenId_STAR))
        return line.Problem(ECode::kCannotAssign, start, i - 1,
                            "cannot assign to iterable argument unpacking");
    if (line.Is(i, kTokenId_EQUAL) && line.Is(start, kTokenId_DOUBLESTAR))
        return line.Problem(ECode::kCannotAssign, start, i - 1,
                            "cannot assign to keyword argument unpacking");
    const bool has_star = line.Is(start, kTokenId_STAR);
    const bool is_star_alone =
        line.Is(i - 1, kTokenId_STAR) && (EndsItem(line.Type(i)) || line.Is(i, kTokenId_COLON));
    if (has_star && (is_star_alone || (line.Is(i, kTokenId_COLON) && line.OpenerBefore(i) > opener_i)))
        return line.Problem(ECode::kMisplacedStar, start, i - 1, "Invalid star expression");
    const bool is_keyword_generator =
        line.Is(i, EWord::kFor) && line.IsName(start) && line.Is(start + 1, kTokenId_EQUAL);
    if (line.Is(i, kTokenId_COLON) && is_starred)
        return line.Problem(ECode::kMisplacedStar, opener_i - 1, i - 1, "Invalid star expression");
    if (is_keyword_generator)
        return line.Problem(ECode::kAssignmentForComparison, start, start + 1,
                            "invalid syntax. Maybe you meant '==' or ':=' instead of '='?",
                            "put parentheses around a generator expression that is a keyword's value");
    return {};
}

// `f(a: 1)`, `[a: 1]`, `{1, a: 2}`
CCause MisplacedEntry(const CFaultyLine& line) {
    const int i = line.At();
    const int opener_i = line.OpenerBefore(i);
    if (opener_i < 0 || line.IsField() || !line.Is(i, kTokenId_COLON)) return {};
    if (!line.EndsOperand(i - 1) || !line.BeginsOperand(i + 1)) return {};
    const bool is_call = line.Is(opener_i, kTokenId_LPAR) && line.FollowsOperand(opener_i);
    const bool is_list = line.Is(opener_i, kTokenId_LSQB) && !line.FollowsOperand(opener_i);
    if (!is_call && !is_list && !line.Is(opener_i, kTokenId_LBRACE)) return {};
    if (is_call && !line.IsSoundWith({i, 1, {kTokenId_EQUAL}}) && !line.IsSoundWith({i, 1, {kTokenId_COMMA}}))
        return {};
    return line.Problem(ECode::kDictionaryEntry, line.ItemStart(i), i,
                        Joined("an entry of a dictionary can't be in ", is_call   ? "a call"
                                                                        : is_list ? "a list"
                                                                                  : "a set"),
                        is_call   ? "write '=' to give an argument by its name"
                        : is_list ? "write a dictionary in braces"
                                  : "write ':' and a value after each key");
}

CCause DictionaryFault(const CFaultyLine& line) {
    if (CCause cause = MisplacedEntry(line)) return cause;
    const int i = line.At();
    const int opener_i = line.OpenerBefore(i);
    if (opener_i < 0 || !line.Is(opener_i, kTokenId_LBRACE)) return {};
    const int start = line.ItemStart(i);
    const int colon_i = line.FindBack(start, i, kTokenId_COLON);
    if (colon_i == i - 1 && EndsItem(line.Type(i)))
        return line.Problem(ECode::kDictionaryEntry, start, colon_i,
                            "expression expected after dictionary key and ':'");
    if (colon_i == i - 1 && line.Is(i, kTokenId_STAR))
        return line.Problem(ECode::kDictionaryEntry, i, i,
                            "cannot use a starred expression in a dictionary value");
    const bool is_dictionary =
        line.FindBack(opener_i + 1, start, kTokenId_COLON) >= 0 || line.Is(opener_i + 1, kTokenId_DOUBLESTAR);
    if (is_dictionary && colon_i < 0 && EndsItem(line.Type(i)) && i > start && line.Takes(kTokenId_COLON))
        return line.Problem(ECode::kDictionaryEntry, start, i - 1, "':' expected after dictionary key");
    if (is_dictionary && colon_i < 0 && line.EndsOperand(i - 1) && line.BeginsOperand(i) &&
        line.Takes(kTokenId_COLON))
        return line.Problem(ECode::kDictionaryEntry, start, i, "':' expected after dictionary key",
                            Joined("write ':' before ", Quoted(line.Text(i))));
    if (is_dictionary && line.Is(i, kTokenId_EQUAL) && colon_i < 0)
        return line.Problem(ECode::kDictionaryEntry, i, i, "':' expected after dictionary key",
                            "write ':' instead of '='");
    return {};
}

CCause ComprehensionFault(const CFaultyLine& line) {
    const int i = line.At();
    const int opener_i = line.OpenerBefore(i);
    const bool is_for = line.Is(i, EWord::kFor) || (line.Is(i, EWord::kAsync) && line.Is(i + 1, EWord::kFor));
    if (opener_i < 0 || !is_for) return {};
    const int start = opener_i + 1;
    if (line.Is(start, kTokenId_STAR) && line.ItemStart(i) == start)
        return line.Problem(ECode::kUnpackingInComprehension, start, i - 1,
                            "iterable unpacking cannot be used in comprehension");
    if (line.Is(start, kTokenId_DOUBLESTAR) && line.ItemStart(i) == start)
        return line.Problem(ECode::kUnpackingInComprehension, start, i - 1,
                            "dict unpacking cannot be used in dict comprehension");
    if (line.FindBack(start, i, kTokenId_COMMA) < 0) return {};
    return line.Problem(ECode::kComprehensionTarget, start, i - 1,
                        "did you forget parentheses around the comprehension target?");
}

}  // namespace codeloom
