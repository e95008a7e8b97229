// Values of a page in the encodings of the Parquet format. What the format leaves free is chosen so that a
// value takes whole bytes: then the bytes of equal sequences are equal, and a compressor finds them.
#pragma once

#include <cstdint>
#include <span>
#include <string>
#include <string_view>

namespace codeloom {

// DELTA_BINARY_PACKED: each number less the one before, blocks of them in as few bytes as the widest needs.
void EncodeDeltas(std::span<const int32_t> numbers, std::string& bytes);

// RLE_DICTIONARY: indexes below `count`, one by one.
void EncodeIndexes(std::span<const int32_t> indexes, size_t count, std::string& bytes);

// The same for indexes that come in runs: `lengths` has that of each, and the index of a run is its own.
void EncodeRuns(std::span<const uint32_t> lengths, uint32_t first_index, std::string& bytes);

// Which of `count` values are there, by bits; all where there are no bits.
void EncodeLevels(const void* validity, size_t count, std::string& bytes);

// PLAIN, a text after its length.
void EncodeText(std::string_view text, std::string& bytes);

}  // namespace codeloom
