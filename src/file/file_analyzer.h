// All logical lines of a text, one after the other.
#pragma once

#include <cstdint>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "file/file_analysis.h"

namespace codeloom {

// What of a file was no text: places, by their bytes in the text that stands for it.
struct CUnreadable {
    struct CFault {
        uint32_t start = 0;
        uint32_t end = 0;
        std::string message;
    };
    std::vector<CFault> faults;     // what is reported, by place
    std::vector<uint32_t> offsets;  // every replaced character, by place; a line that holds one isn't blamed
};

// Any thread may call it. Requires: `text` is UTF-8 and not longer than kMaxTextSize; the version is known.
CFileAnalysis AnalyzeFile(std::string_view text, const CFileSettings& settings,
                          const CUnreadable& unreadable);

}  // namespace codeloom
