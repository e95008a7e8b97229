// How large a tree is.
#pragma once

#include <cstdint>
#include <vector>

#include "syntax/tree.h"

namespace codeloom {

class CTreeSize {
  public:
    // True when the tree has at most so many nodes, none of them deeper than `most_depth`; 1 at the root.
    bool IsWithin(const CTree& tree, uint32_t most_nodes, uint32_t most_depth);

  private:
    std::vector<uint32_t> _fHeights;  // of the nodes; storage that stays
};

}  // namespace codeloom
