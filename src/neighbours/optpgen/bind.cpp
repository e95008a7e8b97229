#include "neighbours/bind.h"

#include <nanobind/stl/string.h>

#include "host/binding.h"
#include "neighbours/optpgen/grammar.h"
#include "neighbours/optpgen/node_converter.h"
#include "neighbours/optpgen/parse_error.h"
#include "neighbours/optpgen/parser.h"
#include "neighbours/optpgen/parser_impl.h"

namespace codeloom {

namespace {

constexpr const char* kParserGeneratorDoc =
    "Reads a grammar file.\n\n"
    "ParserGenerator(grammar_file, tok_number2name, op_text2number): the path of a grammar text in pgen\n"
    "notation, a dict from token type (int) to its name (str), and one from operator text (str) to token\n"
    "type. The first rule is the start symbol. Raises OSError when the file can't be read, and ValueError\n"
    "with file, row and reason when it isn't a grammar.";

constexpr const char* kMakeGrammarDoc =
    "The Grammar that the file defines.\n\n"
    "Raises ValueError with file, row and reason on an unknown name or operator, a rule that is defined\n"
    "twice, can be empty or begins with itself, and a choice that the next token alone doesn't decide.";

constexpr const char* kGrammarDoc =
    "The rules of a grammar, as tables that a parser runs on. ParserGenerator.make_grammar makes it.";

constexpr const char* kParserImplDoc =
    "The parser that runs on a grammar's tables.\n\n"
    "ParserImpl(grammar, node_converter=None, promotesinglechild=True): a NodeConverter makes the nodes;\n"
    "None stands for one that gives tuples (type, value, context, children). With promotesinglechild a\n"
    "rule that has a single child is replaced by that child. Each parse is setup, addtoken for each\n"
    "token, finish; after an exception the next setup begins anew. The operations can't be called from\n"
    "within one another.";

void BindGrammar(nb::module_& module) {
    nb::class_<CGrammar>(module, "Grammar", Collected<CGrammar>(), kGrammarDoc)
        .def_ro("symbol2number", &CGrammar::symbol2number,
                "Rule names to rule numbers: 256 for the start symbol, then the other names in order.")
        .def_ro("number2symbol", &CGrammar::number2symbol, "Rule numbers to rule names.")
        .def("__repr__", &CGrammar::Repr);
    nb::class_<ParserGenerator>(module, "ParserGenerator", Plain(), kParserGeneratorDoc)
        .def(TInit<nb::object, nb::dict, nb::dict>(), "grammar_file"_a, "tok_number2name"_a,
             "op_text2number"_a)
        .def("make_grammar", &ParserGenerator::make_grammar, kMakeGrammarDoc);
}

void BindNodeConverter(nb::module_& module) {
    nb::class_<NodeConverter, THostSubclass<NodeConverter>> binding(
        module, "NodeConverter", Plain(), "Makes the nodes of a parse; derive from it to make your own.");
    binding.def(TInit<>());
    BindOperations(binding);
}

void BindParser(nb::module_& module) {
    nb::class_<Parser, THostSubclass<Parser>> binding(
        module, "Parser", Plain(), "What takes the tokens of a text one by one. CreateParser makes one.");
    binding.def(TInit<>());
    BindOperations(binding);

    nb::class_<ParserImpl, Parser, THostSubclass<ParserImpl>> impl(module, "ParserImpl",
                                                                   Collected<ParserImpl>(), kParserImplDoc);
    impl.def(TInit<CGrammar&, CRef<NodeConverter>, bool>(), "grammar"_a, "node_converter"_a = nb::none(),
             "promotesinglechild"_a = true);
    BindOperations(impl);
    module.def(
        "CreateParser",
        [](CGrammar& grammar, CRef<NodeConverter> node_converter, bool promotesinglechild) -> CRef<Parser> {
            const CRef<ParserImpl> parser = MakeInstance<ParserImpl>();
            parser->Init(grammar, std::move(node_converter), promotesinglechild);
            return CRef<Parser>(parser.get());
        },
        "grammar"_a, "node_converter"_a = nb::none(), "promotesinglechild"_a = true,
        "A Parser for a grammar, whose nodes `node_converter` makes. See ParserImpl.");
}

}  // namespace

void BindOptpgen(nb::module_& module) {
    BindParseError(module);
    BindGrammar(module);
    BindNodeConverter(module);
    BindParser(module);
}

}  // namespace codeloom
