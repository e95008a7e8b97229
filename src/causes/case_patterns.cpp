// The patterns of a `case`.

#include <algorithm>

#include "causes/recognisers.h"

namespace codeloom {

CCause PatternFault(const CFaultyLine& line) {
    const int i = line.At();
    if (!line.Is(0, EWord::kCase) || i < 2) return {};
    if (line.Is(i, kTokenId_DOUBLESTAR))
        return line.Problem(ECode::kMisplacedPattern, i, i + 1,
                            "double star pattern must be the last one of a mapping pattern");
    const int as_i = line.Is(i, EWord::kAs) ? i : line.FindBack(i - 3, i, EWord::kAs);
    if (as_i < 0) return {};
    return line.Problem(ECode::kMisplacedPattern, as_i + 1, std::max(as_i + 1, i), "invalid pattern target",
                        "'as' binds a plain name");
}

}  // namespace codeloom
