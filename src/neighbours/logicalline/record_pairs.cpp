#include "neighbours/logicalline/record_pairs.h"

#include <cassert>

#include "host/text.h"

namespace codeloom {

namespace {

bool IsBytes(nb::handle candidate) {
    return PyBytes_CheckExact(candidate.ptr());
}

}  // namespace

void CRecordPairs::Append(nb::handle name, nb::handle equiv) {
    if (_fPacked.IsEmpty() && _fHostPairs.is_none() && IsBytes(name) && IsBytes(equiv)) {
        if (_fPairs.empty()) _fPairs.reserve(kUsualCount);
        _fPairs.emplace_back(nb::borrow(name), nb::borrow(equiv));
        return;
    }
    if (IsEmpty()) _fHostPairs = nb::list();
    nb::borrow<nb::list>(AsHost()).append(nb::make_tuple(name, equiv));
}

void CRecordPairs::Clear() {
    _fPacked = {};
    _fPairs.clear();
    _fHostPairs = nb::none();
}

void CRecordPairs::Set(CPackedRecords records) {
    assert(IsEmpty());
    _fPacked = std::move(records);
}

CRecordPairs::CPairs CRecordPairs::_Unpacked() const {
    CPairs pairs;
    _fPacked.ForEach([&](std::string_view name, std::string_view equiv) {
        pairs.emplace_back(BytesFromUtf8(name), BytesFromUtf8(equiv));
    });
    return pairs;
}

nb::object CRecordPairs::AsHost() {
    if (!_fPacked.IsEmpty()) _fPairs = _Unpacked();
    _fPacked = {};
    if (_fPairs.empty()) return _fHostPairs;
    const CNoCollection steady;
    nb::list pairs;
    for (const auto& [name, equiv] : _fPairs) pairs.append(nb::make_tuple(name, equiv));
    _fPairs = {};
    return _fHostPairs = std::move(pairs);
}

}  // namespace codeloom
