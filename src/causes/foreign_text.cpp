// Text that isn't Python at all: markers of a merge, prompts, commands of a shell, markup, comments of other
// languages.

#include <algorithm>
#include <array>

#include "causes/recognisers.h"
#include "text/char_class.h"

namespace codeloom {

namespace {

constexpr size_t kMarkerLength = 7;

// The row of the file from `start` on.
std::string_view RowAt(std::string_view text, size_t start) {
    return text.substr(start, std::min(text.find('\n', start), text.size()) - start);
}

bool IsRowStart(std::string_view text, size_t pos) {
    return pos == 0 || text[pos - 1] == '\n';
}

// `<<<<<<< HEAD`, `=======`
bool IsMarker(std::string_view row) {
    if (row.size() < kMarkerLength || std::string_view("<=>|").find(row[0]) == std::string_view::npos)
        return false;
    return row.find_first_not_of(row[0]) == (row.size() == kMarkerLength ? row.npos : kMarkerLength) &&
           (row.size() == kMarkerLength || IsBlank(row[kMarkerLength]) || row[kMarkerLength] == '\r');
}

CProblem ForeignText(const CFaultyLine& line, int last_i, std::string message, std::string hint) {
    return line.Problem(ECode::kForeignText, 0, last_i, std::move(message), std::move(hint));
}

// The text of the line from its first token on, up to the row's end.
std::string_view FirstRow(const CFaultyLine& line) {
    return RowAt(line.FileText(), line.Token(0).start);
}

CCause Prompt(const CFaultyLine& line) {
    const std::string_view row = FirstRow(line);
    const std::string_view sign = row.substr(0, 3);
    if ((sign == ">>>" || sign == "...") && (row.size() == 3 || IsBlank(row[3])))
        return ForeignText(line, sign == "..." ? 0 : 1, "a prompt of the interpreter isn't part of a program",
                           "remove the prompts, and what was printed");
    if (row.starts_with("$ ") || row.starts_with("% "))
        return ForeignText(line, line.Count() - 1, "a command of the shell isn't part of a program",
                           "run it in a terminal");
    if (row.starts_with('!') || row.starts_with('%'))
        return ForeignText(line, line.Count() - 1, "a command of a notebook isn't part of a program",
                           "run it in a notebook or a terminal");
    return {};
}

// Two words side by side, and the first one is a program that people run.
CCause ShellCommand(const CFaultyLine& line) {
    constexpr auto kPrograms = std::to_array<std::string_view>(
        {"pip",  "pip3", "pipx", "uv",     "conda", "poetry", "python", "python3",
         "py",   "cd",   "ls",   "mkdir",  "echo",  "export", "sudo",   "apt",
         "brew", "npm",  "git",  "docker", "curl",  "wget",   "source", "chmod"});
    const std::string_view program = line.Text(0);
    const bool has_option =
        line.Is(1, kTokenId_MINUS) || line.Is(1, kTokenId_SLASH) || line.Is(1, kTokenId_TILDE);
    if (!line.IsName(0) || !(line.At() == 1 || (has_option && line.At() > 1))) return {};
    if (std::find(kPrograms.begin(), kPrograms.end(), program) == kPrograms.end()) return {};
    return ForeignText(line, line.Count() - 1,
                       Joined(Quoted(program), " is a command of the shell, not of Python"),
                       "run it in a terminal");
}

CCause Markup(const CFaultyLine& line) {
    const std::string_view row = FirstRow(line);
    if (row.empty()) return {};
    if (row.starts_with("```"))
        return line.ProblemAt(ECode::kForeignText, line.Token(0).start, line.Token(0).start + 3,
                              "'```' belongs to Markdown, not to Python", "remove the rows of the fence");
    const char second = row.size() > 1 ? row[1] : ' ';
    const bool is_tag =
        row[0] == '<' && (IsNameByte(second) || second == '/' || second == '!' || second == '?');
    if (is_tag && row.find('>') != std::string_view::npos)
        return ForeignText(line, line.Count() - 1, "this looks like HTML or XML, not like Python",
                           "put markup into a string, or into a file of its own");
    if (row.starts_with("Traceback (most recent") || row.starts_with("File \""))
        return ForeignText(line, line.Count() - 1, "a traceback isn't part of a program", "remove it");
    return {};
}

// `// text`, `/* text */`
CCause ForeignComment(const CFaultyLine& line) {
    const auto begins = [&](int i) {
        const bool is_wide = line.Is(i, kTokenId_SLASH) && line.Is(i + 1, kTokenId_STAR);
        return is_wide && line.IsAdjacent(i + 1);
    };
    for (int i = 0; i <= line.At(); ++i) {
        const bool is_row = i == 0 && line.Is(i, kTokenId_DOUBLESLASH);
        if (!is_row && (!begins(i) || line.IsInBrackets(i))) continue;
        return line.Problem(ECode::kForeignText, i, is_row ? i : i + 1,
                            Joined("'", is_row ? "//" : "/*", "' doesn't begin a comment in Python"),
                            "begin a comment with '#'");
    }
    return {};
}

}  // namespace

CCause ConflictMarker(const CFaultyLine& line) {
    const std::string_view text = line.FileText();
    for (int i = 0; i < line.Count(); ++i) {
        const uint32_t start = line.Token(i).start;
        if (!IsRowStart(text, start) || !IsMarker(RowAt(text, start))) continue;
        std::string_view row = RowAt(text, start);
        if (row.ends_with('\r')) row.remove_suffix(1);
        return line.ProblemAt(ECode::kConflictMarker, start, static_cast<uint32_t>(start + row.size()),
                              "a merge conflict isn't resolved",
                              "keep what is meant, and remove the rows of the markers");
    }
    return {};
}

CCause ForeignText(const CFaultyLine& line) {
    if (line.IsField() || line.IsHint()) return {};
    for (const auto recogniser : {Prompt, Markup, ForeignComment, ShellCommand})
        if (CCause cause = recogniser(line)) return cause;
    return {};
}

}  // namespace codeloom
