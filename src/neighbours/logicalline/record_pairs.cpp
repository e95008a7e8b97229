#include "neighbours/logicalline/record_pairs.h"

namespace codeloom {

namespace {

bool IsBytes(nb::handle candidate) {
    return PyBytes_CheckExact(candidate.ptr());
}

}  // namespace

void CRecordPairs::Append(nb::handle name, nb::handle equiv) {
    if (_fHostPairs.is_none() && IsBytes(name) && IsBytes(equiv)) {
        if (_fPairs.empty()) _fPairs.reserve(kUsualCount);
        _fPairs.emplace_back(nb::borrow(name), nb::borrow(equiv));
        return;
    }
    if (IsEmpty()) _fHostPairs = nb::list();
    nb::borrow<nb::list>(AsHost()).append(nb::make_tuple(name, equiv));
}

void CRecordPairs::Clear() {
    _fPairs.clear();
    _fHostPairs = nb::none();
}

nb::object CRecordPairs::AsHost() {
    if (_fPairs.empty()) return _fHostPairs;
    nb::list pairs;
    for (const auto& [name, equiv] : _fPairs) pairs.append(nb::make_tuple(name, equiv));
    _fPairs = {};
    return _fHostPairs = std::move(pairs);
}

}  // namespace codeloom
