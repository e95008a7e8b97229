#include "face/trees.h"

#include "face/settings.h"
#include "host/text.h"
#include "syntax/forms.h"
#include "syntax/line_parser.h"
#include "syntax/tree_dump.h"
#include "tokenizer/tokenizer.h"

namespace nb = nanobind;
using namespace nb::literals;

namespace codeloom {

namespace {

// (dump, None, -1), or ("", what is wrong, index of the token).
nb::tuple TreeOf(CLineParser& parser, const CRawLogical& logical, bool in_async_def, CTree& tree) {
    const CFault fault = parser.Parse(logical, in_async_def, tree);
    if (!fault) return nb::make_tuple(TextFromUtf8(DumpOf(tree)), nb::none(), -1);
    const char* const what = fault.form != nullptr ? fault.form->name : "invalid syntax";
    return nb::make_tuple("", what, fault.token_i);
}

nb::list DumpTrees(nb::str text, int version, bool has_print_function) {
    CheckVersion(version);
    const CUtf8 utf8(text);
    CTokenizer tokenizer(utf8);
    CLineParser parser(LanguageOf(version, has_print_function));
    CRawLogical logical;
    CTree tree;
    nb::list trees;
    while (tokenizer.NextLogical(logical)) {
        trees.append(TreeOf(parser, logical, logical.in_async_def, tree));
        for (const CRawLogical& embedded : logical.embedded)
            trees.append(TreeOf(parser, embedded, logical.in_async_def, tree));
    }
    return trees;
}

}  // namespace

void BindTrees(nb::module_& module) {
    module.def(
        "DumpTrees", &DumpTrees, "text"_a, "version"_a, "has_print_function"_a = false,
        nb::sig("def DumpTrees(text: str, version: int, has_print_function: bool = False)"
                " -> list[tuple[str, str | None, int]]"),
        "For developers: the tree of each logical line of a text, and of each expression embedded in "
        "it, as text.\n\n"
        "Each is (dump, None, -1), or (\"\", what is wrong, the index of the token at fault). `version` "
        "is 312 for Python 3.12.");
}

}  // namespace codeloom
