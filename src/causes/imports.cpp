// `import a from b`, `from a import b,`, and imports of nothing.

#include "causes/recognisers.h"

namespace codeloom {

namespace {

CCause FromImportFault(const CFaultyLine& line, int start) {
    const int i = line.At();
    if (i == start + 1 && line.Is(i, EWord::kImport))
        return line.Problem(ECode::kMissingName, start, start, "expected the name of a module after 'from'");
    const int import_i = line.FindBack(start, i, EWord::kImport);
    if (import_i < 0) {
        const bool is_missing =
            line.IsAtEnd() ? line.EndsOperand(i - 1) : line.IsSoundWith({i, 0, {EWord::kImport}});
        if (!is_missing) return {};
        return line.Problem(ECode::kMissingToken, i - 1, i - 1, "expected 'import' after the module's name");
    }
    if (line.IsAtEnd() && import_i + 1 == i)
        return line.Problem(ECode::kMissingNames, import_i, import_i,
                            "Expected one or more names after 'import'");
    if (line.Is(i, kTokenId_RPAR) && line.Is(i - 1, kTokenId_LPAR))
        return line.Problem(ECode::kMissingNames, i - 1, i, "Expected one or more names after 'import'");
    if (line.IsAtEnd() && line.Is(i - 1, kTokenId_COMMA))
        return line.Problem(ECode::kTrailingComma, i - 1, i - 1,
                            "trailing comma not allowed without surrounding parentheses",
                            "a list of names that goes on in the next row needs parentheses");
    if (line.Is(i, kTokenId_DOT) && line.IsName(i - 1))
        return line.Problem(ECode::kDottedName, i - 1, i + 1, "a name to import can't have a '.'",
                            "name the whole module between 'from' and 'import'");
    return {};
}

}  // namespace

CCause ImportFault(const CFaultyLine& line) {
    const int i = line.At();
    const int start = line.StatementStart(i);
    const bool imports = line.Is(start, EWord::kFrom) || line.Is(start, EWord::kImport);
    if (imports && line.Is(i, kTokenId_MINUS) && line.IsName(i - 1))
        return line.Problem(ECode::kMissingName, i - 1, i + 1, "a name can't have a '-'",
                            "a module to import has a plain name");
    if (line.Is(start, EWord::kFrom)) return FromImportFault(line, start);
    if (!line.Is(start, EWord::kImport)) return {};
    if (line.Is(i, EWord::kFrom) && i > start + 1)
        return line.Problem(ECode::kImportFrom, start, i,
                            "Did you mean to use 'from ... import ...' instead?");
    if (line.IsAtEnd() && i == start + 1)
        return line.Problem(ECode::kMissingNames, start, start, "Expected one or more names after 'import'");
    if (line.IsAtEnd() && line.Is(i - 1, kTokenId_COMMA))
        return line.Problem(ECode::kTrailingComma, i - 1, i - 1, "trailing comma not allowed after 'import'");
    if (line.Is(i, kTokenId_DOT) && line.Is(i - 2, EWord::kAs))
        return line.Problem(ECode::kDottedName, i - 1, i + 1, "cannot use attribute as import target");
    if (line.Is(i, kTokenId_DOT) || line.Is(i, kTokenId_ELLIPSIS))
        return line.Problem(ECode::kDottedName, i, i, "a relative import needs 'from'",
                            "write from . import name");
    return {};
}

}  // namespace codeloom
