// Where a text may declare names, before its lines are known.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string_view>
#include <vector>

namespace codeloom {

// Where `global` and `nonlocal` may begin a statement, so that names are collected there alone. A place may
// also lie in a string.
class CDeclarationPlaces {
  public:
    explicit CDeclarationPlaces(std::string_view text);

    bool IsEmpty() const { return _fPlaces.empty(); }

    // True for a line of the module, beginning at the byte, that a place may belong to the block of: no
    // definition begins between the two. Call in the order of the file.
    bool MayLieInBlockOf(uint32_t line_start);

    // True when one lies in [start, end). Call in the order of the file.
    bool HasOneIn(uint32_t start, uint32_t end);

  private:
    struct CPlace {
        uint32_t start;
        uint32_t definition;  // the last one before it that begins a row at column 0; zero without one
    };

    void _AddPlaces(std::string_view text, size_t start, size_t end);
    void _AddPlace(std::string_view text, size_t start, std::string_view word);
    const CPlace* _From(uint32_t start);

    std::vector<CPlace> _fPlaces;
    size_t _fNext = 0;
};

}  // namespace codeloom
