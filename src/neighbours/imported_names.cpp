#include "neighbours/imported_names.h"

#include "host/neighbour_call.h"
#include "symbolinfo/constants_by_name.h"
#include "tokenizer/logical_types.h"

namespace codeloom {

CLogicalTypes gLogicalTypes;
CPrefixes gPrefixes;

namespace {

nb::object NameOf(nb::handle neighbour, const char* module_name, const char* name) {
    if (nb::hasattr(neighbour, name)) return neighbour.attr(name);
    PyErr_Format(PyExc_ImportError, "cannot import name '%s' from '%s'", name, module_name);
    throw nb::python_error();
}

void ImportFrom(nb::module_& module, const char* module_name, std::initializer_list<const char*> names) {
    const nb::module_ neighbour = nb::module_::import_(module_name);
    for (const char* name : names) module.attr(name) = NameOf(neighbour, module_name, name);
}

nb::handle Kept(nb::handle module, const char* name) {
    return nb::object(module.attr(name)).release();
}

void ImportClasses(nb::module_& module) {
    ImportFrom(module, "codeloom.optpgen", {"Parser"});
    ImportFrom(module, "bytebuffer", {"CWritableByteBuffer", "CEncodedByteBufferReader"});
    ImportFrom(module, "codeloom.strutils", {"_CTextPosInfo"});
    ImportFrom(module, "codeloom._fastaccess", {"CLogger", "CStringTokenizer", "CNonNestedSearch"});
    ImportFrom(module, "codeloom.logicalline", {"CLogicalLine"});
    ImportFrom(module, "tarnbase.destroyable", {"_CHandlerRecord", "_CEmissionStackItem", "CDestroyable"});
    ImportFrom(module, "codeloom.symbolinfo",
               {"CSingleResolvedInfo", "CLocationCache", "CFullyScopedName", "CDefInfo", "CArgTextInfo",
                "CInfoBytesBuilder", "CKindFilter"});
}

void ImportLogicalTypes(nb::module_& module) {
#define CODELOOM_LOGICAL_TYPE_NAME(name, text) #name,
    ImportFrom(module, "codeloom.logicalline", {CODELOOM_LOGICAL_TYPES(CODELOOM_LOGICAL_TYPE_NAME)});
#undef CODELOOM_LOGICAL_TYPE_NAME
    gLogicalTypes = {Kept(module, "kComment"), Kept(module, "kCommentedTypeHint"),
                     Kept(module, "kStringifiedTypeHint"), Kept(module, "kMatch"), Kept(module, "kCase")};
}

void ImportVocabulary(nb::module_& module) {
#define CODELOOM_KIND_NAMES(name, ...) "k" #name "Prefix", "k" #name "Kind",
    ImportFrom(module, "codeloom.symbolinfo",
               {CODELOOM_RECORD_KINDS(CODELOOM_KIND_NAMES) "kPlainEquivSpec", "kPlainEquivKind"});
#undef CODELOOM_KIND_NAMES
#define CODELOOM_KEPT_PREFIX(name, ...) Kept(module, "k" #name "Prefix"),
    gPrefixes = {CODELOOM_RECORD_KINDS(CODELOOM_KEPT_PREFIX)};
#undef CODELOOM_KEPT_PREFIX
    ImportFrom(
        module, "codeloom.symbolinfo",
        {"kPrefixLen", "kIterationSubscript", "kClassInstanceSuffix", "kScopeIndexSep", "kModuleScopeName",
         "kWildcardScope", "kDefLineScopeName", "_kDotLineScopeName", "kTypingModuleSymbol",
         "kTypingModuleSymbolDot", "kTypingModuleSymbolDotAny", "kTypingModuleSymbolStr",
         "kTypingModuleSymbolDotAnyStr", "kTypingModuleSymbolDotStr", "gInfoBytesBuilder"});
}

[[noreturn]] void RefuseVocabulary(const char* name, const char* reason) {
    PyErr_Format(PyExc_ImportError,
                 "the engine can't write the records of another vocabulary: codeloom.symbolinfo.%s %s", name,
                 reason);
    throw nb::python_error();
}

// The engine composes records natively. Another vocabulary would be honoured in some and missed in others.
void RequireVocabulary() {
    const nb::module_ neighbour = nb::module_::import_("codeloom.symbolinfo");
    const nb::module_ native = nb::module_::import_("codeloom._neighbours");
    for (const auto [name, value] : ConstantsByName()) {
        if (nb::object(neighbour.attr(name)).equal(value)) continue;
        RefuseVocabulary(nb::str(name).c_str(), nb::str("must be {!r}").format(value).c_str());
    }
    for (const char* name :
         {"BuildLiteralInfo", "EncodeStringLiteral", "GetInstanceNameForClass", "JoinTokens"})
        if (!nb::object(neighbour.attr(name)).is(native.attr(name)))
            RefuseVocabulary(name, "must be that of codeloom._neighbours");
}

void ImportFunctions(nb::module_& module) {
    ImportFrom(module, "codeloom._fastaccess", {"GetTokenType", "_FindStringEndNonNested"});
    ImportFrom(module, "codeloom.strutils",
               {"AsUtf8", "AsStr", "BytesForInteger", "Utf8Concat5", "Utf8Len", "IsUtf8LeadByte",
                "_NonInlineUcs4CharAtUtf8Pos", "TextPosInfo"});
    ImportFrom(module, "codeloom.symbolinfo",
               {"BuildLiteralInfo", "BuildArgInfo", "EnsureScopeNameIndicies", "GetInstanceNameForClass",
                "ObjectForStringLiteral", "EncodeStringLiteral", "JoinTokens",
                "_NonInlineNextNonNestedUtf8PtrIndex"});
}

}  // namespace

nb::object ParseErrorClass() {
    static constexpr CNeighbourFunction kParseError("optpgen", "ParseError");
    return kParseError.Find();
}

bool IsParseError(const nb::python_error& error) {
    return error.matches(ParseErrorClass());
}

void RequireNames(const char* module_name, std::initializer_list<const char*> names) {
    const nb::module_ neighbour = nb::module_::import_(module_name);
    for (const char* name : names) NameOf(neighbour, module_name, name);
}

void ImportNames(nb::module_& module) {
    ImportClasses(module);
    ImportLogicalTypes(module);
    ImportVocabulary(module);
    ImportFunctions(module);
    RequireVocabulary();
}

}  // namespace codeloom
