// The rules of `global` and `nonlocal`, doing nothing, so that no names are collected for them. The linker
// takes these instead of the library's own.

#include "scopes/declaration_places.h"
#include "scopes/declarations.h"

namespace codeloom {

CDeclarationPlaces::CDeclarationPlaces(std::string_view) {}

bool CDeclarationPlaces::MayLieInBlockOf(uint32_t) {
    return false;
}

bool CDeclarationPlaces::HasOneIn(uint32_t, uint32_t) {
    return false;
}

bool DeclaresInModule(const CTextNames&) {
    return false;
}

void CheckDeclarations(const CTextNames&, int, CProblems&) {}

}  // namespace codeloom
