#include "symbolinfo/constants_by_name.h"

#include <string>

#include "host/text.h"
#include "symbolinfo/vocabulary.h"

namespace codeloom {

namespace {

nb::object IntegerOf(char byte) {
    return nb::int_(static_cast<int>(static_cast<unsigned char>(byte)));
}

}  // namespace

nb::dict ConstantsByName() {
    nb::dict constants;
    for (const CRecordKind& kind : kRecordKinds) {
        const std::string name = "k" + std::string(kind.name);
        const bool is_plain = kind.kind == kPlainEquivKind;
        constants[(name + (is_plain ? "Spec" : "Prefix")).c_str()] = BytesFromUtf8(kind.prefix);
        constants[(name + "Kind").c_str()] = IntegerOf(kind.kind);
    }
    constants["kPrefixLen"] = kPrefixLen;
    constants["kIterationSubscript"] = BytesFromUtf8(kIterationSubscript);
    constants["kClassInstanceSuffix"] = BytesFromUtf8(kClassInstanceSuffix);
    constants["kScopeIndexSep"] = TextFromUtf8(kScopeIndexSep);
    constants["kModuleScopeName"] = TextFromUtf8(kModuleScopeName);
    constants["kWildcardScope"] = TextFromUtf8(kWildcardScope);
    constants["kDefLineScopeName"] = TextFromUtf8(kDefLineScopeName);
    constants["_kDotLineScopeName"] = TextFromUtf8(_kDotLineScopeName);
    constants["kTypingModuleSymbol"] = BytesFromUtf8(kTypingModuleSymbol);
    constants["kTypingModuleSymbolDot"] = BytesFromUtf8(kTypingModuleSymbolDot);
    constants["kTypingModuleSymbolDotAny"] = BytesFromUtf8(kTypingModuleSymbolDotAny);
    constants["kTypingModuleSymbolStr"] = TextFromUtf8(kTypingModuleSymbol);
    constants["kTypingModuleSymbolDotStr"] = TextFromUtf8(kTypingModuleSymbolDot);
    constants["kTypingModuleSymbolDotAnyStr"] = TextFromUtf8(kTypingModuleSymbolDotAny);
    return constants;
}

}  // namespace codeloom
