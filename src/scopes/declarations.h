// What is wrong with `global` and `nonlocal`.
#pragma once

#include <cstdint>
#include <string_view>
#include <vector>

#include "rules/problem.h"
#include "scopes/text_names.h"

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

    const CPlace* _From(uint32_t start);

    std::vector<CPlace> _fPlaces;
    size_t _fNext = 0;
};

// True when the module itself declares a name: all of its names count then.
bool DeclaresInModule(const CTextNames& names);

// Nothing is said where a fault may have moved what is around a line. The version is 312 for 3.12.
void CheckDeclarations(const CTextNames& names, int version, CProblems& problems);

}  // namespace codeloom
