#include "text/text_hash.h"

#include <random>

namespace codeloom {

const uint64_t gTextHashSeed = uint64_t{std::random_device()()} << 32 | std::random_device()();

}  // namespace codeloom
