// The grammar files, which the build puts into the library: nothing is read at run time.
#pragma once

#include <string_view>

namespace codeloom::grammar_texts {

extern const std::string_view k27;
extern const std::string_view k27PrintFunction;  // without the statement `print`
extern const std::string_view k38;
extern const std::string_view k314;

}  // namespace codeloom::grammar_texts
