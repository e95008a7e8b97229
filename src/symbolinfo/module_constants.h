// Constants that the engine computes once its neighbours are there, while it loads.
#pragma once

#include <string_view>

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

inline constexpr const char* kPy2DefaultGrammar = "Python-Grammar-2.7";
inline constexpr const char* kPy3DefaultGrammar = "Python-Grammar-3.8";

// Names that are values.
constexpr bool IsKeywordLiteral(std::string_view text) {
    return text == "None" || text == "True" || text == "False";
}

// CONSTANT(name, class)
#define CODELOOM_INSTANCE_NAMES(CONSTANT)     \
    CONSTANT(kListInstanceName, "list")       \
    CONSTANT(kDictInstanceName, "dict")       \
    CONSTANT(kSetInstanceName, "set")         \
    CONSTANT(kTupleInstanceName, "tuple")     \
    CONSTANT(kStringInstanceName, "str")      \
    CONSTANT(kUnicodeInstanceName, "unicode") \
    CONSTANT(kBytesInstanceName, "bytes")     \
    CONSTANT(kIntLiteralName, "int")          \
    CONSTANT(kFloatLiteralName, "float")

// The equivs of instances of builtin classes, byte strings that live as long as the process.
struct CInstanceNames {
#define CODELOOM_INSTANCE_NAME_FIELD(name, cls_name) nb::handle name;
    CODELOOM_INSTANCE_NAMES(CODELOOM_INSTANCE_NAME_FIELD)
#undef CODELOOM_INSTANCE_NAME_FIELD
};
inline CInstanceNames gInstanceNames;

}  // namespace codeloom
