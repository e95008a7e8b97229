#include "face/plain_file.h"

#include <string>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include "text/utf8.h"
#include "tokenizer/raw_logical.h"

namespace codeloom {

namespace {

class CDescriptor {
  public:
    explicit CDescriptor(int number) : _fNumber(number) {}
    ~CDescriptor() {
        if (_fNumber >= 0) close(_fNumber);
    }
    CDescriptor(const CDescriptor&) = delete;
    CDescriptor& operator=(const CDescriptor&) = delete;

    int Number() const { return _fNumber; }

  private:
    int _fNumber;
};

bool IsRegular(const struct stat& status) {
    return S_ISREG(status.st_mode) && status.st_size >= 0 &&
           static_cast<uint64_t>(status.st_size) <= kMaxTextSize;
}

// All that can be read; none when reading fails, or when the file grows beyond `size` meanwhile.
std::optional<CPlainFile> ReadAll(int descriptor, size_t size) {
    const size_t capacity = size + 1;  // one more, so that the end shows in one call
    CPlainFile file{std::make_unique_for_overwrite<char[]>(capacity)};
    while (file.size < capacity) {
        const ssize_t count = read(descriptor, file.bytes.get() + file.size, capacity - file.size);
        if (count < 0) return std::nullopt;
        if (count == 0) return file;
        file.size += static_cast<size_t>(count);
    }
    return std::nullopt;
}

constexpr std::string_view kCookie = "coding";

// The name of an encoding in what follows `kCookie`, in lower case and with hyphens; empty when there is
// none.
std::string EncodingAfterCookie(std::string_view text) {
    std::string name;
    if (!text.starts_with(':') && !text.starts_with('=')) return name;
    const size_t start = text.find_first_not_of(" \t", 1);
    for (size_t i = start; i < text.size(); ++i) {
        const char c = text[i] == '_' ? '-' : text[i];
        const bool is_upper = c >= 'A' && c <= 'Z';
        if (!is_upper && !(c >= 'a' && c <= 'z') && !(c >= '0' && c <= '9') && c != '-' && c != '.') break;
        name += is_upper ? static_cast<char>(c - 'A' + 'a') : c;
    }
    return name;
}

// True when a coding comment in the first two rows may name something else than UTF-8.
bool MayNameAnotherEncoding(std::string_view text) {
    const size_t first_end = text.find('\n');
    const size_t second_end =
        first_end == std::string_view::npos ? first_end : text.find('\n', first_end + 1);
    const std::string_view head = text.substr(0, second_end);
    for (size_t at = head.find(kCookie); at != std::string_view::npos; at = head.find(kCookie, at + 1)) {
        const std::string name = EncodingAfterCookie(head.substr(at + kCookie.size()));
        if (!name.empty() && name != "utf-8" && name != "utf8") return true;
    }
    return false;
}

}  // namespace

bool IsPlainSource(std::string_view text) {
    return !text.starts_with("\xEF\xBB\xBF") && !MayNameAnotherEncoding(text) && IsSourceText(text);
}

std::optional<CPlainFile> ReadPlainFile(const char* path) {
    struct stat status;
    // Looked at before it is opened: to open a device or a pipe can have effects.
    if (stat(path, &status) != 0 || !IsRegular(status)) return std::nullopt;
    const CDescriptor file(open(path, O_RDONLY | O_CLOEXEC | O_NONBLOCK));
    if (file.Number() < 0 || fstat(file.Number(), &status) != 0 || !IsRegular(status)) return std::nullopt;
    std::optional<CPlainFile> plain = ReadAll(file.Number(), static_cast<size_t>(status.st_size));
    if (plain && !IsPlainSource(plain->Text())) plain.reset();
    return plain;
}

}  // namespace codeloom
