#include "neighbours/logicalline/token_texts.h"

#include <cstring>

#include "host/collections.h"
#include "host/text.h"

namespace codeloom {

namespace {

uint64_t HashOf(std::string_view token) {
    uint64_t hash = 0x9E3779B97F4A7C15u ^ token.size();
    while (token.size() >= 8) {
        uint64_t word;
        std::memcpy(&word, token.data(), 8);
        hash = (hash ^ word) * 0xFF51AFD7ED558CCDu;
        hash ^= hash >> 32;
        token.remove_prefix(8);
    }
    uint64_t rest = 0;
    std::memcpy(&rest, token.data(), token.size());
    hash = (hash ^ rest) * 0xC4CEB9FE1A85EC53u;
    return hash ^ (hash >> 29);
}

}  // namespace

nb::object CTokenTexts::Get(std::string_view token, bool is_name) {
    if (token.size() > kMaxKeptLength) return TextFromUtf8(token);
    const uint64_t hash = HashOf(token);
    CSlot& slot = _fSlots[hash % kSlotCount];
    if (slot.hash == hash && slot.text.is_valid() && CUtf8(slot.text) == token) return slot.text;
    slot.hash = hash;
    slot.text = is_name ? InternedText(token) : TextFromUtf8(token);
    return slot.text;
}

}  // namespace codeloom
