// The pages of a column, and what the file says of them.
#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <string_view>
#include <vector>

#include "arrow/table.h"
#include "parquet/thrift.h"

namespace codeloom {

// Gives bytes compressed by Zstandard.
using CCompress = std::function<std::string(std::string_view)>;

// The numbers of the format.
enum class EParquetType : uint8_t { kBool = 0, kInt32 = 1, kInt64 = 2, kByteArray = 6 };
enum class EEncoding : uint8_t { kPlain = 0, kLevels = 3, kDeltas = 5, kDeltaLengths = 6, kDictionary = 8 };

EParquetType ParquetTypeOf(const CColumn& column);

class CColumnChunk {
  public:
    // Adds the values of a column as a page.
    void Add(const CTable::CField& field, const CCompress& compress);

    // Adds all pages to a file, that of the dictionary first. No page can be added afterwards.
    void Write(const CColumn& column, const CCompress& compress, std::string& file);

    // What the file says of it, as a structure of the list under way.
    void Describe(const CTable::CField& field, CThriftWriter& out) const;

    int64_t RawSize() const { return _fRawSize; }

  private:
    struct CPage {
        EEncoding encoding;
        std::string body;
    };

    EEncoding _Encode(const CColumn& column, std::string& body);
    EEncoding _EncodeLongs(const CColumn& column, std::string& body);
    void _AddPage(std::string_view body, EEncoding encoding, size_t count, bool is_dictionary,
                  const CCompress& compress);
    std::string _Dictionary(const CColumn& column) const;

    std::string _fPages;          // compressed, each after its header
    std::string _fDictionary;     // of the same form
    std::vector<int64_t> _fRuns;  // values that come several times in a row
    std::vector<EEncoding> _fEncodings;
    int64_t _fCount = 0;
    int64_t _fRawSize = 0;  // of all pages, with their headers, before they are compressed
    int64_t _fStart = 0;    // in the file
};

}  // namespace codeloom
