#include "typing/function_hint.h"

#include <utility>

#include "tokenizer/string_tokens.h"

namespace codeloom {

namespace {

constexpr uint32_t kNameLength = 1;
constexpr uint32_t kDefStart = 2;            // in the head, after the name and its colon
constexpr size_t kTokensBeforeEllipsis = 3;  // def function (

// Collects the tokens of the `def`, one by one.
class CDefWriter {
  public:
    explicit CDefWriter(std::vector<CDefForHint::CToken>& tokens) : _fTokens(tokens) {}

    void Add(std::string_view text, size_t open_count, const CDefForHint::CToken& token) {
        // A token that is directly among the parameters may begin one.
        const bool is_direct = _fNesting == 1 && open_count == 1 && text != "]" && text != "}";
        ++_fCount;
        const std::string_view last = std::exchange(_fLast, text);
        if (text == "(") {
            ++_fNesting;
        } else if (text == ")") {
            --_fNesting;
        } else if (is_direct) {
            const bool is_first = last == "(";
            if (text == "..." && is_first && _fCount == kTokensBeforeEllipsis + 1) return;
            if (is_first || last == ",") _AddName(token.offset);
        }
        _fTokens.push_back(token);
    }

  private:
    void _AddName(int32_t offset) {
        _fTokens.push_back({0, kNameLength, offset});
        _fTokens.push_back({kNameLength, kDefStart - kNameLength, offset});
    }

    std::vector<CDefForHint::CToken>& _fTokens;
    std::string_view _fLast;
    size_t _fCount = 0;
    int _fNesting = 0;
};

}  // namespace

CDefForHint DefForHint(std::string_view hint) {
    CDefForHint def;
    def.text.append(CDefForHint::kHead).append(hint).append(":");
    CDefWriter writer(def.tokens);
    for (CStringTokens tokens(std::string_view(def.text).substr(kDefStart)); !tokens.IsAtEnd();
         tokens.Next()) {
        const auto start = static_cast<uint32_t>(tokens.Pos()) + kDefStart;
        const auto offset = static_cast<int32_t>(start) - static_cast<int32_t>(CDefForHint::kHead.size());
        writer.Add(tokens.Token(), tokens.NestCount(),
                   {start, static_cast<uint32_t>(tokens.Token().size()), offset});
    }
    return def;
}

bool HasFunctionForm(std::string_view hint) {
    return CStringTokens(hint).Token() == "(";
}

}  // namespace codeloom
