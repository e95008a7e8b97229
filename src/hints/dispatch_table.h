// A dispatch dictionary, with what was last read of it at hand.
//   in     the host's dictionary, exact node class to visit, which may change at any time
//   out    what is to be done for a node, by its class
//   keeps  one entry for each class that was asked for, until the dictionary changes
#pragma once

#include <cstdint>
#include <vector>

#include <nanobind/nanobind.h>

#include "host/collections.h"
#include "tree/class_cache.h"
#include "tree/node.h"

namespace codeloom {

class CDispatchWalker;

// A visit of a native class: what is in the dictionary, and the shorter road to it. The truth value of
// its result says whether the children are wanted.
struct CNativeVisit {
    using Function = nb::object (*)(CDispatchWalker& walker, CNode& node);

    nb::handle node_class;
    nb::object callable;  // of (walker, node), for the dictionary
    Function function;
};

class CDispatchTable {
  public:
    enum class EAction : uint8_t { kVisitChildren, kSkip, kCallNative, kCallHost };

    struct CEntry {
        EAction action = EAction::kVisitChildren;
        CNativeVisit::Function function = nullptr;
        nb::handle callable;  // the dictionary holds it
    };

    // A dictionary, or none. `native_visits` are values of it that native code may call directly.
    void Set(nb::object dict, std::vector<CNativeVisit> native_visits = {});

    // Good until host code runs.
    const CEntry& Find(nb::handle node_class) {
        if (_fVersion != DictVersion(_fDict)) _Forget();
        const CEntry* const entry = _fEntries.Find(node_class);
        return entry != nullptr ? *entry : _fEntries.Put(node_class, _Read(node_class));
    }

    const nb::object& Dict() const { return _fDict; }

    template <class Visitor>
    void References(Visitor&& visit) {
        visit(_fDict);
        for (CNativeVisit& native : _fNativeVisits) visit(native.callable);
    }

  private:
    void _Forget();
    CEntry _Read(nb::handle node_class) const;

    nb::object _fDict = nb::none();
    std::vector<CNativeVisit> _fNativeVisits;
    uint64_t _fVersion = 0;            // of the dictionary that the entries were read from
    CClassCache<CEntry, 6> _fEntries;  // a class that went and came back has no other answer
};

}  // namespace codeloom
