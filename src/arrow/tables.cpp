#include "arrow/tables.h"

#include <algorithm>
#include <array>

#include "arrow/line_rows.h"
#include "arrow/name_rows.h"
#include "arrow/signature_rows.h"
#include "arrow/table_builder.h"

namespace codeloom {

std::span<const CTableKind> TableKinds() {
    static const auto kinds = std::to_array<CTableKind>({
        TableKindOf<CProblemSource>("problems", "What is wrong.", false, false),
        TableKindOf<CLineSource>("lines", "Logical lines, in the order of the text.", false, false),
        TableKindOf<CRecordSource>("records", "What lines say of names.", true, false),
        TableKindOf<CLimitSource>("limits", "Lines that lack some of their records.", true, false),
        TableKindOf<COccurrenceSource>("occurrences", "Every appearance of a name.", false, true),
        TableKindOf<CScopeSource>("scopes", "Modules, classes, functions and what else has names of its own.",
                                  false, true),
        TableKindOf<CSymbolSource>("symbols", "The names of each scope, as the module `symtable` sees them.",
                                   false, true),
        TableKindOf<CSignatureSource>("signatures", "The header of each sound `def`.", false, true),
        TableKindOf<CParameterSource>("parameters", "The parameters of signatures.", false, true),
        TableKindOf<CHintSource>("hints", "Type hints, in annotations and in comments.", false, true),
    });
    return kinds;
}

const CTableKind* FindTable(std::string_view name) {
    const std::span<const CTableKind> kinds = TableKinds();
    const auto found =
        std::find_if(kinds.begin(), kinds.end(), [&](const CTableKind& kind) { return kind.name == name; });
    return found == kinds.end() ? nullptr : &*found;
}

}  // namespace codeloom
