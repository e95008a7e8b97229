#include "face/plain_file.h"

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

// True when a coding comment may be in the first two rows.
bool MayNameItsEncoding(std::string_view text) {
    const size_t first_end = text.find('\n');
    const size_t second_end =
        first_end == std::string_view::npos ? first_end : text.find('\n', first_end + 1);
    return text.substr(0, second_end).find("coding") != std::string_view::npos;
}

}  // namespace

bool IsPlainSource(std::string_view text) {
    return !text.starts_with("\xEF\xBB\xBF") && !MayNameItsEncoding(text) && IsSourceText(text);
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
