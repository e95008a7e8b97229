#include "hints/type_hint_walker.h"

#include "tree/atom_nodes.h"

namespace codeloom {

void CTypeHintWalker::Init(nb::object version_triple, nb::object grammar_file,
                           CRef<CNodeWalker> general_node_walker) {
    nb::dict visits;
    visits[nb::type<CNameLiteral>()] = false;
    CDispatchWalker::Init(std::move(visits));
    _fGeneralNodeWalker = std::move(general_node_walker);
    _fHintParser = NewInstance<CPGenParserImpl>(std::move(version_triple), std::move(grammar_file));
}

void CTypeHintWalker::Walk(CNodeRef node, CLogicalLine& logical, bool first_in_def) {
    if (node) CDispatchWalker::Walk(std::move(node), logical, first_in_def);
}

void BindTypeHintWalker(nb::module_& module) {
    nb::class_<CTypeHintWalker, CDispatchWalker, TDispatchWalkerOperations<CTypeHintWalker>> binding(
        module, "CTypeHintWalker", Collected<CTypeHintWalker>(), "Records the type hints of a logical line.");
    binding.def(TInit<nb::object, nb::object, CRef<CNodeWalker>>(), "version_triple"_a.none(),
                "grammar_file"_a, "general_node_walker"_a.none());
    BindOperations(binding);
}

}  // namespace codeloom
