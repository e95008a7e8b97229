// Parentheses, brackets and braces that don't match.

#include "causes/recognisers.h"

namespace codeloom {

namespace {

bool Matches(int opener, int closer) {
    return closer == opener + 1;
}
static_assert(kTokenId_RPAR == kTokenId_LPAR + 1 && kTokenId_RSQB == kTokenId_LSQB + 1 &&
              kTokenId_RBRACE == kTokenId_LBRACE + 1);

CProblem NeverClosedAt(const CFaultyLine& line, int opener_i) {
    return line.Problem(ECode::kNeverClosed, opener_i, opener_i,
                        Joined(Quoted(line.Text(opener_i)), " was never closed"));
}

}  // namespace

CCause UnmatchedCloser(const CFaultyLine& line) {
    const int i = line.At();
    if (!IsCloserType(line.Type(i))) return {};
    const int opener_i = line.OpenerBefore(i);
    const std::string_view prefix = line.IsField() ? "f-string: " : "";
    if (opener_i < 0)
        return line.Problem(ECode::kUnmatchedCloser, i, i,
                            Joined(prefix, "unmatched ", Quoted(line.Text(i))));
    if (Matches(line.Type(opener_i), line.Type(i))) return {};
    CProblem problem =
        line.Problem(ECode::kMismatchedCloser, i, i,
                     Joined("closing parenthesis ", Quoted(line.Text(i)),
                            " does not match opening parenthesis ", Quoted(line.Text(opener_i))));
    problem.related.push_back(line.Related(opener_i, "opened here"));
    return problem;
}

CCause NeverClosed(const CFaultyLine& line) {
    const int opener_i = line.OpenerBefore(line.At());
    if (opener_i < 0 || line.IsField()) return {};
    const auto closer = static_cast<int16_t>(line.Type(opener_i) + 1);
    const bool ends_open = line.CloserOf(opener_i) == line.Count();
    if (ends_open && (line.IsAtEnd() || line.IsSoundWith({line.At(), 0, {closer}})))
        return NeverClosedAt(line, opener_i);
    return {};
}

CCause StillOpen(const CFaultyLine& line) {
    const int opener_i = line.OpenerBefore(line.Count());
    if (opener_i < 0 || line.IsField()) return {};
    return NeverClosedAt(line, opener_i);
}

CCause LaterUnmatchedCloser(const CFaultyLine& line) {
    int open = 0;
    for (int i = 0; i < line.Count() && !line.IsField(); ++i) {
        open += IsOpenerType(line.Type(i)) - IsCloserType(line.Type(i));
        if (open < 0)
            return line.Problem(ECode::kUnmatchedCloser, i, i, Joined("unmatched ", Quoted(line.Text(i))));
    }
    return {};
}

}  // namespace codeloom
