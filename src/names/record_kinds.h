// The kinds of records: one table for the prefixes, the kind bytes, the words of the readable form and the
// documentation.
//
// A record is `:`, a kind byte, `:` and a payload; anything else is a plain equiv, the text of what a name
// stands for.
#pragma once

#include <array>
#include <cstddef>
#include <string_view>

namespace codeloom {

// What follows the prefix.
//   none      nothing
//   text      a text as it stands
//   index     the decimal number of a token
//   import    a module, a blank, and a name or `*`
//   literal   a type, `:` and, where the value is known, a blank and the value
//
// KIND(name, kind byte, word, payload, meaning, a line of source that yields it, its readable form)
#define CODELOOM_RECORD_KINDS(KIND)                                                                         \
    KIND(Set, "s", "set", "none", "The name is bound here.", "x = 1", "set  x")                             \
    KIND(Get, "g", "get", "none", "The name is read here.", "print(x)", "get  x")                           \
    KIND(Global, "G", "global", "none", "The name is declared `global`.", "global x", "global x")           \
    KIND(Nonlocal, "N", "nonlocal", "none", "The name is declared `nonlocal`.", "nonlocal x", "nonlocal x") \
    KIND(WithinExpr, "w", "within", "index",                                                                \
         "The name is bound inside an expression and for it alone, at the token of this index.",            \
         "[x for x in y]", "within x  3")                                                                   \
    KIND(Import, "i", "import", "text", "The name is this module.", "import a.b as c", "import c  a.b")     \
    KIND(FromImport, "f", "from", "import", "The name is taken from a module, or `*` is.",                  \
         "from m import a as b", "from b  m a")                                                             \
    KIND(ImportAsName, "n", "as", "text", "The name was given by `as`.", "import a.b as c", "as   c  c")    \
    KIND(Called, "c", "called", "text", "The name is called, with these arguments.", "f(a, 1)",             \
         "called f  (a,1)")                                                                                 \
    KIND(TypedLiteral, "l", "literal", "literal", "The name stands for a value of this type.", "x = 'a'",   \
         "literal x  str: 'a'")                                                                             \
    KIND(ExpressionEquiv, "e", "expression", "text", "The name stands for the value of this expression.",   \
         "x = a + b", "expression x  a + b")                                                                \
    KIND(TypeParameter, "p", "typeparam", "text", "The name is a type parameter: its stars and its bound.", \
         "def f[T: int](): pass", "arg typeparam T  int")                                                   \
    KIND(TypeHint, "h", "hint", "text", "The name is hinted to be this.", "x: int", "hint x  int")          \
    KIND(SetTypeHint, "H", "set-hint", "text", "The name is hinted where it is bound.", "",                 \
         "set-hint x  int")                                                                                 \
    KIND(Decorator, "d", "decorator", "text", "The name is decorated with this.", "",                       \
         "decorator f  a.cache")                                                                            \
    KIND(SpecificScope, "x", "scope", "text", "What follows is to be looked up in this scope.", "",         \
         "scope x  A.f")                                                                                    \
    KIND(SpecificUrl, "u", "url", "text", "What follows is to be looked up in the file at this address.",   \
         "", "url  x  file:///a.py")                                                                        \
    KIND(BuiltinModule, "b", "builtin-module", "text", "A module of the interpreter.", "",                  \
         "builtin-module x  sys")                                                                           \
    KIND(TypingModule, "t", "typing-module", "text", "A name of the module of type hints.", "",             \
         "typing-module x  Any")                                                                            \
    KIND(BuiltinClass, "B", "builtin-class", "text", "A class of the interpreter.", "",                     \
         "builtin-class x  list")                                                                           \
    KIND(Arg, "a", "argument", "text", "An argument, by its index from zero, perhaps with its name.", "",   \
         "argument x  0")                                                                                   \
    KIND(Method, "m", "method", "text", "A method of an instance.", "", "method x  A.f")                    \
    KIND(UnboundMethod, "U", "unbound-method", "text", "A method of a class, without an instance.", "",     \
         "unbound-method x  A.f")                                                                           \
    KIND(Function, "F", "function", "text", "A function.", "", "function x  f")                             \
    KIND(Class, "C", "class", "text", "A class.", "", "class x  A")                                         \
    KIND(Self, "S", "self", "text", "The instance that a method of this class is called on.", "",           \
         "self x  A")                                                                                       \
    KIND(Instance, "I", "instance", "text", "An instance of this class.", "", "instance x  A")              \
    KIND(Module, "M", "module", "text", "A module.", "", "module x  a.b")                                   \
    KIND(InferredTypeHint, "y", "inferred-hint", "text",                                                    \
         "A hint that nobody wrote but that the code implies.", "", "inferred-hint x  int")                 \
    KIND(Conditional, "q", "conditional", "text", "What the name stands for under a condition.", "",        \
         "conditional x  a")                                                                                \
    KIND(GenericTypeAlias, "T", "type-alias", "text", "A type alias with parameters of its own.", "",       \
         "type-alias x  list[T]")                                                                           \
    KIND(DefLineScope, "D", "def-line", "text",                                                             \
         "What follows is to be looked up in the scope of a def line.", "", "def-line x  f")

// The kind of a record without any prefix, likewise.
#define CODELOOM_PLAIN_KIND(KIND) \
    KIND(PlainEquiv, "P", "is", "text", "The name stands for what this text says.", "x = a.b", "is   x  a.b")

struct CRecordKind {
    std::string_view name;    // as in `kSetPrefix` and `kSetKind`
    std::string_view prefix;  // of a plain equiv: what may say so openly
    char kind;
    std::string_view word;
    std::string_view payload;
    std::string_view meaning;
    std::string_view source;  // empty where the engine doesn't write such records
    std::string_view example;
};

// NOLINTBEGIN(bugprone-macro-parentheses): the byte is a literal, joined with others
#define CODELOOM_KIND_ENTRY(name, byte, word, payload, meaning, source, example) \
    CRecordKind{#name, ":" byte ":", byte[0], word, payload, meaning, source, example},
inline constexpr auto kRecordKinds = std::to_array<CRecordKind>(
    {CODELOOM_RECORD_KINDS(CODELOOM_KIND_ENTRY) CODELOOM_PLAIN_KIND(CODELOOM_KIND_ENTRY)});
#undef CODELOOM_KIND_ENTRY

// `kSetPrefix`, `kSetKind` and so on.
#define CODELOOM_KIND_CONSTANTS(name, byte, ...)                      \
    inline constexpr std::string_view k##name##Prefix = ":" byte ":"; \
    inline constexpr char k##name##Kind = byte[0];
// NOLINTEND(bugprone-macro-parentheses)
CODELOOM_RECORD_KINDS(CODELOOM_KIND_CONSTANTS)
#undef CODELOOM_KIND_CONSTANTS
inline constexpr char kPlainEquivKind = kRecordKinds.back().kind;
inline constexpr std::string_view kPlainEquivSpec = kRecordKinds.back().prefix;

// The common length of a prefix.
inline constexpr std::ptrdiff_t kPrefixLen = 3;

// After an equiv: what iterating over it gives.
inline constexpr std::string_view kIterationSubscript = "[*]";

// After the name of a class: an instance of it.
inline constexpr std::string_view kClassInstanceSuffix = ":";

static_assert(
    [] {
        std::array<bool, 256> taken{};
        // Records of one name are joined by ";" for a while.
        taken[';'] = taken[':'] = taken[0] = true;
        for (const CRecordKind& kind : kRecordKinds) {
            const auto byte = static_cast<unsigned char>(kind.kind);
            if (kind.prefix.size() != kPrefixLen || taken[byte]) return false;
            taken[byte] = true;
        }
        return true;
    }(),
    "prefixes are of one length, and kind bytes are unique");

}  // namespace codeloom
