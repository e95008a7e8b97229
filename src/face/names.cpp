#include "face/names.h"

#include <string>
#include <vector>

#include <nanobind/stl/vector.h>

#include "face/settings.h"
#include "file/file_analyzer.h"
#include "host/errors.h"
#include "host/text.h"
#include "names/name_walker.h"
#include "names/record_kinds.h"
#include "scopes/join_names.h"
#include "syntax/line_parser.h"
#include "tokenizer/tokenizer.h"

namespace nb = nanobind;
using namespace nb::literals;

namespace codeloom {

namespace {

// Parses and walks lines one by one.
class CLineNames {
  public:
    explicit CLineNames(const CLanguage& language) : _fParser(language), _fWalker(language.IsPython3()) {}

    // (what is wrong, the index of its token, the limit, records), the records as (name, info bytes, whether
    // of an argument, first byte, end).
    nb::tuple NamesOf(const CRawLogical& logical, bool in_async_def, bool with_records) {
        _fRecords = CRecords();
        CWalkResult result;
        result.fault = _fParser.Parse(logical, in_async_def, _fTree);
        if (!result.fault) result = _fWalker.Walk(_fTree, with_records ? &_fRecords : nullptr);
        nb::list records;
        for (const CRecord& record : _fRecords.records) records.append(_Shown(record));
        return nb::make_tuple(static_cast<int>(result.fault.kind), result.fault.token_i,
                              static_cast<int>(result.limit), records);
    }

  private:
    nb::tuple _Shown(const CRecord& record) const {
        std::string info;
        if (record.kind != kPlainEquivKind) info.append({':', record.kind, ':'});
        info += _fRecords.Value(record);
        const std::string_view name = _fRecords.Name(record);
        return nb::make_tuple(nb::bytes(name.data(), name.size()), nb::bytes(info.data(), info.size()),
                              record.of_arg, record.start, record.end);
    }

    CLineParser _fParser;
    CNameWalker _fWalker;
    CTree _fTree;
    CRecords _fRecords;
};

nb::list DumpNames(nb::str text, int version, bool has_print_function, bool with_records) {
    CheckVersion(version);
    const CUtf8 utf8(text);
    CTokenizer tokenizer(utf8);
    CLineNames names(LanguageOf(version, has_print_function));
    CRawLogical logical;
    nb::list lines;
    while (tokenizer.NextLogical(logical)) {
        lines.append(names.NamesOf(logical, logical.in_async_def, with_records));
        for (const CRawLogical& embedded : logical.embedded)
            lines.append(names.NamesOf(embedded, logical.in_async_def, with_records));
    }
    return lines;
}

// Everything about a text's names.
std::string ShownNames(const CTextNames& names) {
    std::string shown;
    const auto add = [&](auto... numbers) { ((shown += std::to_string(numbers) + ' '), ...); };
    const auto add_name = [&](uint32_t name) { (shown += names.occurrences.names->Text(name)) += '\n'; };
    for (uint32_t i = 0; i < names.occurrences.items.size(); ++i) {
        const COccurrence& item = names.occurrences.items[i];
        add(item.start, item.end, item.object_start, item.object_end, static_cast<int>(item.role), item.flags,
            names.ScopeOfOccurrence(i), names.scopes.symbol_of[i]);
        add_name(item.name);
    }
    for (const CScope& scope : names.scopes.scopes) {
        add(static_cast<int>(scope.kind), scope.parent, scope.start, scope.end, scope.has_lost_lines);
        add_name(scope.name);
    }
    for (const CSymbol& symbol : names.scopes.symbols) {
        add(symbol.scope, symbol.home, symbol.flags, static_cast<int>(symbol.binding));
        add_name(symbol.name);
    }
    return shown;
}

nb::tuple DumpJoinedNames(nb::str text, int version, const std::vector<uint32_t>& starts) {
    CFileSettings settings = SettingsFor(version, false);
    const CUtf8 utf8(text);
    const std::string_view whole = utf8;
    settings.wants_names = true;
    settings.names = std::make_shared<CNameTable>();
    std::vector<CFileAnalysis> analyses;
    for (size_t i = 0; i < starts.size(); ++i) {
        const size_t end = i + 1 < starts.size() ? starts[i + 1] : whole.size();
        if (starts[i] > end || end > whole.size()) RaiseHost(PyExc_ValueError, "starts are out of order");
        analyses.push_back(AnalyzeFile(whole.substr(starts[i], end - starts[i]), settings, {}));
    }
    std::vector<CNamePart> parts;
    for (size_t i = 0; i < starts.size(); ++i) parts.push_back({&analyses[i].names, starts[i]});
    const std::string joined = ShownNames(JoinNames(parts, settings.names));
    const std::string in_one_go = ShownNames(AnalyzeFile(whole, settings, {}).names);
    return nb::make_tuple(nb::str(joined.data(), joined.size()), nb::str(in_one_go.data(), in_one_go.size()));
}

}  // namespace

void BindNames(nb::module_& module) {
    module.def(
        "DumpNames", &DumpNames, "text"_a, "version"_a, "has_print_function"_a = false,
        "with_records"_a = true,
        nb::sig("def DumpNames(text: str, version: int, has_print_function: bool = False, with_records: bool "
                "= True) -> list[tuple[int, int, int, list[tuple[bytes, bytes, bool, int, int]]]]"),
        "For developers: what the walk for names records of each logical line of a text, and of each "
        "expression embedded in it.\n\n"
        "Each is the kind of its fault (0 for none), the token at fault, the limit that the walk hit (0 for "
        "none), and the records: name, info bytes, whether of an argument, and the bytes of the text at "
        "which "
        "the name is. `version` is 312 for Python 3.12.");
    module.def("DumpJoinedNames", &DumpJoinedNames, "text"_a, "version"_a, "starts"_a,
               nb::sig("def DumpJoinedNames(text: str, version: int, starts: list[int]) -> tuple[str, str]"),
               "For developers: the names of a text joined from those of its parts, which begin at these "
               "bytes, and those of the text in one go. Both are the same where each part begins with a "
               "statement of the module.");
}

}  // namespace codeloom
