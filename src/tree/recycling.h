// Finished trees go back to the free lists of the records that made their nodes.
#pragma once

#include <nanobind/nanobind.h>

#include "tree/node.h"

namespace codeloom {

// Recycles the tree under `node`. Nobody may hold a node of it afterwards. Nodes deeper than 100 levels are
// left to the collector, with a printed line for each.
void FinishedWithNode(nb::handle node);

}  // namespace codeloom
