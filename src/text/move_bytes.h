// Moving what says of itself which bytes of a text it is about, when these are elsewhere.
#pragma once

#include <cstdint>

namespace codeloom {

// `item` is any struct with `start` and `end`. Offsets wrap, so that a negative shift moves back.
template <class Item>
void MoveBytes(Item& item, uint32_t shift) {
    item.start += shift;
    item.end += shift;
}

// The same for one that is about nothing where its range is empty.
template <class Item>
void MoveBytesIfAny(Item& item, uint32_t shift) {
    if (item.start != item.end) MoveBytes(item, shift);
}

}  // namespace codeloom
