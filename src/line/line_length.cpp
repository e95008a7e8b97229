#include "line/line_length.h"

#include "line/repeated_text.h"

namespace codeloom {

namespace {

struct CMeasures {
    size_t token_count = 0;
    size_t repeated_text = 0;
};

// Of the parts that have more than a few tokens.
CMeasures Measure(const CRawLogical& line, size_t few_tokens) {
    CMeasures measures;
    const auto add = [&](const CRawLogical& part) {
        if (part.tokens.size() <= few_tokens) return;
        measures.token_count += part.tokens.size();
        measures.repeated_text += RepeatedText(part);
    };
    add(line);
    for (const CRawLogical& embedded : line.embedded) add(embedded);
    return measures;
}

// `1,234,567`
std::string WithCommas(size_t number) {
    std::string text = std::to_string(number);
    for (size_t end = text.size(); end > 3; end -= 3) text.insert(end - 3, ",");
    return text;
}

}  // namespace

ETooLong CLengthLimits::_Measure(const CRawLogical& line) {
    const CMeasures measures = Measure(line, kFewTokens);
    if (measures.token_count > kMostTokens) return ETooLong::kTokens;
    if (measures.repeated_text > kMostRepeatedText) return ETooLong::kRepeatedText;
    if (measures.repeated_text > _fRepeatedTextLeft) return ETooLong::kRepeatedTextOfFile;
    _fRepeatedTextLeft -= measures.repeated_text;
    return ETooLong::kNot;
}

std::string CLengthLimits::Message(ETooLong what, const CRawLogical& line) {
    const CMeasures measures = Measure(line, kFewTokens);
    std::string text = "this logical line is too long and isn't analysed: ";
    switch (what) {
        case ETooLong::kTokens:
            text += "it has " + WithCommas(measures.token_count) + " tokens, more than " +
                    WithCommas(kMostTokens);
            break;
        case ETooLong::kRepeatedText:
            text += "it has so many parts in a chain, or so many targets, that their texts come to " +
                    WithCommas(measures.repeated_text) + " bytes, more than " + WithCommas(kMostRepeatedText);
            break;
        case ETooLong::kRepeatedTextOfFile:
            text += "the texts of its parts in a chain, or of its targets, come to " +
                    WithCommas(measures.repeated_text) +
                    " bytes, more than the lines before have left of what "
                    "a file of this size may have";
            break;
        case ETooLong::kNot:
            return {};
    }
    return text + "; split it into several";
}

}  // namespace codeloom
