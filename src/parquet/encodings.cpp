#include "parquet/encodings.h"

#include <algorithm>
#include <array>
#include <cstring>

#include "parquet/thrift.h"

namespace codeloom {

namespace {

constexpr size_t kBlock = 128;  // numbers
constexpr size_t kMiniBlocks = 4;
constexpr size_t kMiniBlock = kBlock / kMiniBlocks;
// What deltas of most blocks are counted from: were it the least of each block, the same delta would be
// another byte in each.
constexpr int64_t kUsualLeast = -128;

template <class Number>
void AddNumber(Number number, std::string& bytes) {
    bytes.append(reinterpret_cast<const char*>(&number), sizeof number);
}

// Room for more bytes at the end.
char* Extend(std::string& bytes, size_t count) {
    bytes.resize(bytes.size() + count);
    return bytes.data() + bytes.size() - count;
}

// The bytes that numbers up to `most` take.
constexpr size_t WidthFor(uint64_t most) {
    size_t width = 0;
    for (; most != 0; most >>= 8) ++width;
    return width;
}

template <class Number, class Get>
void AddEach(size_t count, Get get, std::string& bytes) {
    char* out = Extend(bytes, count * sizeof(Number));
    for (size_t i = 0; i < count; ++i) {
        const auto number = static_cast<Number>(get(i));
        std::memcpy(out + i * sizeof number, &number, sizeof number);
    }
}

// `get` gives numbers that fit into `width` bytes.
template <class Get>
void AddPacked(size_t width, size_t count, Get get, std::string& bytes) {
    switch (width) {
        case 0:
            return;
        case 1:
            return AddEach<uint8_t>(count, get, bytes);
        case 2:
            return AddEach<uint16_t>(count, get, bytes);
        case 3: {
            char* out = Extend(bytes, count * 3);
            for (size_t i = 0; i < count; ++i, out += 3) {
                const auto number = static_cast<uint32_t>(get(i));
                std::memcpy(out, &number, 3);
            }
            return;
        }
        default:
            return AddEach<uint32_t>(count, get, bytes);
    }
}

using CBlockDeltas = std::array<int32_t, kBlock>;

// The same numbers wrap around where they don't fit, here and in who reads them.
void AddBlock(const CBlockDeltas& deltas, size_t count, std::string& bytes) {
    int32_t least = deltas[0];
    int32_t most = deltas[0];
    for (size_t i = 1; i < count; ++i) {
        least = std::min(least, deltas[i]);
        most = std::max(most, deltas[i]);
    }
    const bool is_usual = least >= kUsualLeast && most <= kUsualLeast + UINT8_MAX && least != most;
    const int64_t base = is_usual ? kUsualLeast : least;
    AddVarint(bytes, Zigzag(base));
    const size_t width = WidthFor(static_cast<uint64_t>(most - base));
    const size_t mini_count = (count + kMiniBlock - 1) / kMiniBlock;
    for (size_t i = 0; i < kMiniBlocks; ++i) bytes += static_cast<char>(i < mini_count ? width * 8 : 0);
    AddPacked(
        width, mini_count * kMiniBlock,
        [&](size_t i) { return i < count ? static_cast<int64_t>(deltas[i]) - base : 0; }, bytes);
}

}  // namespace

void EncodeDeltas(std::span<const int32_t> numbers, std::string& bytes) {
    AddVarint(bytes, kBlock);
    AddVarint(bytes, kMiniBlocks);
    AddVarint(bytes, numbers.size());
    AddVarint(bytes, Zigzag(numbers.empty() ? 0 : numbers.front()));
    CBlockDeltas deltas = {};
    for (size_t start = 1; start < numbers.size(); start += kBlock) {
        const size_t count = std::min(kBlock, numbers.size() - start);
        for (size_t i = 0; i < count; ++i)
            deltas[i] = static_cast<int32_t>(static_cast<uint32_t>(numbers[start + i]) -
                                             static_cast<uint32_t>(numbers[start + i - 1]));
        AddBlock(deltas, count, bytes);
    }
}

void EncodeIndexes(std::span<const int32_t> indexes, size_t count, std::string& bytes) {
    const size_t width = std::max<size_t>(WidthFor(count == 0 ? 0 : count - 1), 1);
    bytes += static_cast<char>(width * 8);
    const size_t groups = (indexes.size() + 7) / 8;
    AddVarint(bytes, groups << 1 | 1);
    AddPacked(width, groups * 8, [&](size_t i) { return i < indexes.size() ? indexes[i] : 0; }, bytes);
}

void EncodeRuns(std::span<const uint32_t> lengths, uint32_t first_index, std::string& bytes) {
    constexpr size_t kWidth = 4;
    bytes += static_cast<char>(kWidth * 8);
    for (size_t i = 0; i < lengths.size(); ++i) {
        AddVarint(bytes, uint64_t{lengths[i]} << 1);
        AddNumber(static_cast<uint32_t>(first_index + i), bytes);
    }
}

void EncodeLevels(const void* validity, size_t count, std::string& bytes) {
    std::string levels;
    if (validity == nullptr) {
        AddVarint(levels, uint64_t{count} << 1);
        levels += '\1';
    } else {
        const size_t groups = (count + 7) / 8;
        AddVarint(levels, groups << 1 | 1);
        levels.append(static_cast<const char*>(validity), groups);
    }
    EncodeText(levels, bytes);
}

void EncodeText(std::string_view text, std::string& bytes) {
    AddNumber(static_cast<uint32_t>(text.size()), bytes);
    bytes += text;
}

}  // namespace codeloom
