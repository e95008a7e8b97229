// Which operation of the walker takes a node, by the node's class.
//   in     a node
//   out    the row of the table in dispatch.cpp that its class has
//   keeps  the row of each native class that was asked for
#pragma once

#include "walker/node_walker.h"

namespace codeloom {

using CVisit = void (*)(CNodeWalker& walker, CNode& node);

CVisit VisitFor(const CNode& node);

}  // namespace codeloom
