#include "hints/dispatch_table.h"

#include "host/errors.h"

namespace codeloom {

void CDispatchTable::Set(nb::object dict, std::vector<CNativeVisit> native_visits) {
    _fDict = std::move(dict);
    _fNativeVisits = std::move(native_visits);
    _Forget();
}

void CDispatchTable::_Forget() {
    _fEntries.Clear();
    _fVersion = DictVersion(_fDict);
}

CDispatchTable::CEntry CDispatchTable::_Read(nb::handle node_class) const {
    CEntry entry;
    const uint64_t version = DictVersion(_fDict);
    const nb::object visit = FindInDict(_fDict, node_class);
    if (DictVersion(_fDict) != version)  // by the comparison of a key
        RaiseHost(PyExc_ValueError, "the dispatch dictionary changed while a visit was looked up in it");
    if (!visit.is_valid() || visit.is_none()) return entry;
    entry.action = visit.is(Py_False) ? EAction::kSkip : EAction::kCallHost;
    entry.callable = visit;
    for (const CNativeVisit& native : _fNativeVisits) {
        if (!visit.is(native.callable)) continue;
        entry.action = EAction::kCallNative;
        entry.function = native.function;
    }
    return entry;
}

}  // namespace codeloom
