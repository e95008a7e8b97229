// Misspelled keywords, and those of other languages: `whlie x:`, `function f():`.

#include <algorithm>
#include <array>
#include <string>
#include <vector>

#include "causes/recognisers.h"

namespace codeloom {

namespace {

// What other languages call it.
struct CForeignWord {
    std::string_view text;
    EWord meant;
};

constexpr auto kForeignWords = std::to_array<CForeignWord>({{"function", EWord::kDef},
                                                            {"func", EWord::kDef},
                                                            {"fn", EWord::kDef},
                                                            {"fun", EWord::kDef},
                                                            {"sub", EWord::kDef},
                                                            {"define", EWord::kDef},
                                                            {"elseif", EWord::kElif},
                                                            {"elsif", EWord::kElif},
                                                            {"foreach", EWord::kFor},
                                                            {"catch", EWord::kExcept},
                                                            {"throw", EWord::kRaise},
                                                            {"switch", EWord::kMatch},
                                                            {"using", EWord::kWith},
                                                            {"include", EWord::kImport},
                                                            {"require", EWord::kImport},
                                                            {"struct", EWord::kClass},
                                                            {"delete", EWord::kDel},
                                                            {"until", EWord::kWhile}});

constexpr size_t kTooFar = 100;

// The smallest number of letters to insert, leave out, replace or swap with the next one; `most` + 1 for more
// than that.
size_t Distance(std::string_view one, std::string_view other, size_t most) {
    if (one.size() > other.size() + most || other.size() > one.size() + most) return most + 1;
    std::vector<std::vector<size_t>> rows(one.size() + 1, std::vector<size_t>(other.size() + 1));
    for (size_t i = 0; i <= one.size(); ++i) rows[i][0] = i;
    for (size_t k = 0; k <= other.size(); ++k) rows[0][k] = k;
    for (size_t i = 1; i <= one.size(); ++i)
        for (size_t k = 1; k <= other.size(); ++k) {
            const bool is_same = one[i - 1] == other[k - 1];
            rows[i][k] = std::min({rows[i - 1][k] + 1, rows[i][k - 1] + 1, rows[i - 1][k - 1] + !is_same});
            const bool is_swap = i > 1 && k > 1 && one[i - 1] == other[k - 2] && one[i - 2] == other[k - 1];
            if (is_swap) rows[i][k] = std::min(rows[i][k], rows[i - 2][k - 2] + 1);
        }
    return rows[one.size()][other.size()];
}

std::string Lowered(std::string_view text) {
    std::string lowered(text);
    std::transform(lowered.begin(), lowered.end(), lowered.begin(), [](char c) { return AsLower(c); });
    return lowered;
}

// How far a name is from a keyword; kTooFar when it can't be meant.
size_t DistanceTo(std::string_view text, EWord word) {
    const std::string_view keyword = TextOfWord(word);
    const size_t most = keyword.size() > 5 ? 2 : 1;
    const size_t distance = text.size() > 1 ? Distance(Lowered(text), Lowered(keyword), most) : kTooFar;
    return distance <= most ? distance : kTooFar;
}

CProblem MisspelledAt(const CFaultyLine& line, int i, EWord word) {
    return line.Problem(ECode::kMisspelled, i, i,
                        Joined("invalid syntax. Did you mean ", Quoted(TextOfWord(word)), "?"),
                        Joined("write ", Quoted(TextOfWord(word)), " instead of ", Quoted(line.Text(i))));
}

bool IsMeant(const CFaultyLine& line, int i, EWord word) {
    return line.Language().IsKeyword(word) && line.IsSoundWith({i, 1, {word}});
}

CCause ForeignWordAt(const CFaultyLine& line, int i) {
    for (const CForeignWord& foreign : kForeignWords)
        if (line.Text(i) == foreign.text &&
            line.FaultWith({i, 1, {foreign.meant}}) > std::max(i + 1, line.At()))
            return MisspelledAt(line, i, foreign.meant);
    return {};
}

// Of keywords that are as near as another one, `as` comes after what is imported, entered or caught.
CCause MisspelledName(const CFaultyLine& line, int i) {
    if (!line.IsName(i)) return {};
    if (CCause cause = i == 0 ? ForeignWordAt(line, i) : CCause()) return cause;
    const bool may_have_as = line.Is(0, EWord::kImport) || line.Is(0, EWord::kFrom) ||
                             line.Is(0, EWord::kWith) || line.Is(0, EWord::kExcept);
    EWord nearest = EWord::kNone;
    size_t nearest_distance = kTooFar;
    for (size_t word_i = 1; word_i <= static_cast<size_t>(EWord::kYield); ++word_i) {
        const auto word = static_cast<EWord>(word_i);
        const size_t distance = DistanceTo(line.Text(i), word);
        const bool is_nearer =
            distance < nearest_distance ||
            (distance == nearest_distance && distance < kTooFar && word == EWord::kAs && may_have_as);
        if (!is_nearer || !IsMeant(line, i, word)) continue;
        nearest = word;
        nearest_distance = distance;
    }
    return nearest == EWord::kNone ? CCause() : MisspelledAt(line, i, nearest);
}

}  // namespace

CCause Misspelled(const CFaultyLine& line) {
    const int i = line.At();
    for (const int name_i : {i, i - 1, 0, i - 2})
        if (CCause cause = MisspelledName(line, name_i)) return cause;
    return {};
}

}  // namespace codeloom
