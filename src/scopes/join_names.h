// The names of a text out of those of its parts. What a part says of names doesn't change with its place, so
// that after an edit only the part around it is visited again, and the scopes are made of what is there.
#pragma once

#include <memory>
#include <span>

#include "scopes/text_names.h"

namespace codeloom {

// A part begins with a statement of the module, or right in a class, which is its scope 1 then. Its places
// count from its beginning; scopes needn't be built.
struct CNamePart {
    const CTextNames* names = nullptr;
    uint32_t start = 0;  // of the part, in bytes of the text
    bool begins_in_class = false;
    uint32_t open_scope = 0;  // around its end: the class that the next part begins in
};

// The names with their scopes, as those of the text in one go. All parts have their names in `table`.
CTextNames JoinNames(std::span<const CNamePart> parts, std::shared_ptr<CNameTable> table);

}  // namespace codeloom
