// Structures in the compact protocol of Thrift, in which Parquet files say what they hold.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace codeloom {

// Seven bits a byte, the lowest first.
void AddVarint(std::string& bytes, uint64_t value);

// Of both signs, so that small ones are short.
constexpr uint64_t Zigzag(int64_t value) {
    return static_cast<uint64_t>(value) << 1 ^ static_cast<uint64_t>(value >> 63);
}

// Fields are written in the order of their numbers.
class CThriftWriter {
  public:
    CThriftWriter() { _fLast.push_back(0); }

    void Int32(int field, int32_t value);
    void Int64(int field, int64_t value);
    void Text(int field, std::string_view value);
    void Int32List(int field, const std::vector<int32_t>& values);
    void TextList(int field, const std::vector<std::string_view>& values);

    void BeginStruct(int field);
    // So many structures follow, each begun by BeginItem.
    void BeginStructList(int field, size_t count);
    void BeginItem() { _fLast.push_back(0); }
    void EndStruct();

    // The whole structure.
    std::string Finish();

  private:
    enum class EType : uint8_t { kInt32 = 5, kInt64 = 6, kBinary = 8, kList = 9, kStruct = 12 };

    void _Field(int field, EType type);
    void _BeginList(int field, EType element, size_t count);
    void _AddText(std::string_view text);

    std::string _fBytes;
    std::vector<int> _fLast;  // the number of the last field of each structure under way
};

}  // namespace codeloom
