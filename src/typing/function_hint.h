// The hint of a function, which parses as the header of a `def` once its parameters have names.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace codeloom {

// `(int, str) -> bool` as `def function (a: int, a: str) -> bool:`. Of `(...) -> bool` no parameter is left.
struct CDefForHint {
    // What is before the hint in `text`: the name of all parameters with its colon, and the `def`.
    static constexpr std::string_view kHead = "a:def function ";

    struct CToken {
        uint32_t start;  // in `text`
        uint32_t length;
        int32_t offset;  // in the hint, which a fault at the token is reported at
    };

    std::string text;
    std::vector<CToken> tokens;

    std::string_view Text(const CToken& token) const {
        return std::string_view(text).substr(token.start, token.length);
    }
};

CDefForHint DefForHint(std::string_view hint);

// True for the hint of a function, in parentheses.
bool HasFunctionForm(std::string_view hint);

}  // namespace codeloom
