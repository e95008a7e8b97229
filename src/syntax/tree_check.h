// What holds for every tree, checked in builds with assertions.
#pragma once

namespace codeloom {

class CTree;

// Ends the process at a tree that no parser should make: children outside the tree or of two parents, tokens
// outside the line or out of order. Does nothing in builds without assertions.
void CheckTree(const CTree& tree);

}  // namespace codeloom
