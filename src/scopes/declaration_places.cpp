#include "scopes/declaration_places.h"

#include <algorithm>
#include <array>
#include <bit>
#include <cstring>

#include "text/char_class.h"

namespace codeloom {

namespace {

using CBytes [[gnu::vector_size(16)]] = unsigned char;
constexpr size_t kStep = sizeof(CBytes);
constexpr size_t kBlock = 4 * kStep;

CBytes Load(const char* bytes) {
    CBytes loaded;
    std::memcpy(&loaded, bytes, kStep);
    return loaded;
}

// Both words hold this, as few others do.
constexpr size_t kPatternLength = 5;

// For each of sixteen bytes, whether "l..al" begins there.
auto BeginsPattern(const char* bytes) {
    return (Load(bytes) == 'l') & (Load(bytes + 3) == 'a') & (Load(bytes + 4) == 'l');
}

// The same for any byte of a block, without a branch.
bool HasPattern(const char* bytes) {
    const auto found = BeginsPattern(bytes) | BeginsPattern(bytes + kStep) |
                       BeginsPattern(bytes + 2 * kStep) | BeginsPattern(bytes + 3 * kStep);
    const auto halves = std::bit_cast<std::array<uint64_t, 2>>(found);
    return (halves[0] | halves[1]) != 0;
}

// The word is where a statement may begin, with a blank after it.
bool MayBeginStatement(std::string_view text, size_t pos, size_t length) {
    const char next = ByteAt(text, pos + length);
    if (!IsBlank(next) && next != '\\') return false;
    while (pos > 0 && IsBlank(text[pos - 1])) --pos;
    const char last = pos == 0 ? '\n' : text[pos - 1];
    return IsRowEnd(last) || last == ';' || last == ':';
}

// The last definition before `end` that begins a row at column 0, from `start` on; `start` when there is
// none.
size_t LastDefinition(std::string_view text, size_t start, size_t end) {
    for (size_t pos = end; pos > start;) {
        pos = text.find_last_of('\n', pos - 1);
        if (pos == std::string_view::npos || pos < start) return start;
        const std::string_view row = text.substr(pos + 1, 6);
        if (row.starts_with("def ") || row.starts_with("class ") || row.starts_with("async ")) return pos + 1;
    }
    return start;
}

}  // namespace

CDeclarationPlaces::CDeclarationPlaces(std::string_view text) {
    size_t start = 0;
    for (; start + kBlock + kPatternLength <= text.size(); start += kBlock)
        if (HasPattern(text.data() + start)) _AddPlaces(text, start, start + kBlock);
    _AddPlaces(text, start, text.size());
}

// Of the words whose "l..al" begins in [start, end).
void CDeclarationPlaces::_AddPlaces(std::string_view text, size_t start, size_t end) {
    constexpr std::string_view kGlobal = "global", kNonlocal = "nonlocal";
    constexpr size_t kBeforeOfGlobal = 1, kBeforeOfNonlocal = 3;
    for (size_t pos = start; pos < end; ++pos) {
        if (text[pos] != 'l') continue;
        if (pos >= kBeforeOfGlobal && text.substr(pos - kBeforeOfGlobal).starts_with(kGlobal))
            _AddPlace(text, pos - kBeforeOfGlobal, kGlobal);
        if (pos >= kBeforeOfNonlocal && text.substr(pos - kBeforeOfNonlocal).starts_with(kNonlocal))
            _AddPlace(text, pos - kBeforeOfNonlocal, kNonlocal);
    }
}

void CDeclarationPlaces::_AddPlace(std::string_view text, size_t start, std::string_view word) {
    if (!MayBeginStatement(text, start, word.size())) return;
    const size_t known = _fPlaces.empty() ? 0 : _fPlaces.back().definition;
    const size_t definition = LastDefinition(text, known, start);
    _fPlaces.push_back({static_cast<uint32_t>(start), static_cast<uint32_t>(definition)});
}

const CDeclarationPlaces::CPlace* CDeclarationPlaces::_From(uint32_t start) {
    while (_fNext < _fPlaces.size() && _fPlaces[_fNext].start < start) ++_fNext;
    return _fNext < _fPlaces.size() ? &_fPlaces[_fNext] : nullptr;
}

bool CDeclarationPlaces::MayLieInBlockOf(uint32_t line_start) {
    const CPlace* const place = _From(line_start);
    return place != nullptr && place->definition <= line_start;
}

bool CDeclarationPlaces::HasOneIn(uint32_t start, uint32_t end) {
    const CPlace* const place = _From(start);
    return place != nullptr && place->start < end;
}

}  // namespace codeloom
