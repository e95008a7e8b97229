#include "neighbours/logicalline/logical_types_host.h"

#include <array>

#include "host/text.h"

namespace codeloom {

namespace {

struct CLogicalTypeName {
    const char* name;
    const char* text;
};

constexpr CLogicalTypeName kLogicalTypeNames[] = {
#define CODELOOM_LOGICAL_TYPE_NAME(name, text) {#name, text},
    CODELOOM_LOGICAL_TYPES(CODELOOM_LOGICAL_TYPE_NAME)
#undef CODELOOM_LOGICAL_TYPE_NAME
};

using CHostTexts = std::array<nb::object, std::size(kLogicalTypeNames)>;

const CHostTexts& HostTexts() {
    static const CHostTexts& texts = *[] {
        auto* made = new CHostTexts;  // holds host objects: never destroyed
        for (size_t i = 0; i < made->size(); ++i) (*made)[i] = InternedText(kLogicalTypeNames[i].text);
        return made;
    }();
    return texts;
}

}  // namespace

nb::object HostText(ELogicalType type) {
    return HostTexts()[static_cast<size_t>(type)];
}

void BindLogicalTypes(nb::module_& module) {
    for (size_t i = 0; i < std::size(kLogicalTypeNames); ++i)
        module.attr(kLogicalTypeNames[i].name) = HostTexts()[i];
}

}  // namespace codeloom
