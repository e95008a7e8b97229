// Source files that need no decoding, as nearly all do: read without the interpreter.
#pragma once

#include <cstddef>
#include <memory>
#include <optional>
#include <string_view>

namespace codeloom {

// True for UTF-8 text as it is: no byte order mark, no NUL, no coding comment (PEP 263) that may name another
// encoding.
bool IsPlainSource(std::string_view text);

struct CPlainFile {
    std::unique_ptr<char[]> bytes;
    size_t size = 0;

    std::string_view Text() const { return {bytes.get(), size}; }
};

// The bytes of a regular file of UTF-8 text, as they are. None for what the Python layer has to look at: what
// isn't there or can't be read, no regular file, a text of more than kMaxTextSize bytes, and what isn't
// plain.
std::optional<CPlainFile> ReadPlainFile(const char* path);

}  // namespace codeloom
