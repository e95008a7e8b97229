// The list of all node classes. A class joins the tree by standing here: the list binds it, and the parser
// driver finds it in the module's namespace.
//   to add one    declare it in the header of its topic, add its row here
#pragma once

#include "tree/argument_nodes.h"
#include "tree/atom_nodes.h"
#include "tree/expression_nodes.h"
#include "tree/import_nodes.h"
#include "tree/node.h"
#include "tree/statement_nodes.h"

namespace codeloom {

// Binds every node class into `module`, bases first, with its `kSupportedRules`.
void BindNodeClasses(nb::module_& module);

}  // namespace codeloom
