#include "neighbours/logicalline/packed_records.h"

#include <algorithm>
#include <array>
#include <cstring>

#include "names/record_kinds.h"

namespace codeloom {

namespace {

bool HasPrefix(const CRecord& record) {
    return record.kind != kPlainEquivKind;
}

char* Append(char* to, std::string_view text) {
    return std::copy(text.begin(), text.end(), to);
}

char* AppendPrefix(char* to, char kind) {
    const std::array<char, kPrefixLen> prefix = {':', kind, ':'};
    return Append(to, {prefix.data(), prefix.size()});
}

}  // namespace

CPackedRecords::CPackedRecords(const CRecords& records, size_t first, size_t end, bool of_arg) {
    const auto for_each = [&](auto visit) {
        for (size_t i = first; i < end; ++i)
            if (records.records[i].of_arg == of_arg) visit(records.records[i]);
    };
    for_each([&](const CRecord& record) {
        const CLengths lengths = _LengthsOf(record, records);
        _fSize += sizeof lengths + lengths.name + lengths.equiv;
    });
    if (_fSize == 0) return;
    _fBytes.reset(new char[_fSize]);
    char* to = _fBytes.get();
    for_each([&](const CRecord& record) {
        const CLengths lengths = _LengthsOf(record, records);
        std::memcpy(to, &lengths, sizeof lengths);
        to = Append(to + sizeof lengths, records.Name(record));
        if (HasPrefix(record)) to = AppendPrefix(to, record.kind);
        to = Append(to, records.Value(record));
    });
}

CPackedRecords::CLengths CPackedRecords::_LengthsOf(const CRecord& record, const CRecords& records) {
    const uint32_t prefix_length = HasPrefix(record) ? kPrefixLen : 0;
    return {static_cast<uint32_t>(records.Name(record).size()), record.value_length + prefix_length};
}

}  // namespace codeloom
