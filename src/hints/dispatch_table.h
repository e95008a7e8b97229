// A dispatch dictionary, with what was last read of it at hand.
//   in     the host's dictionary, exact node class to visit, which may change at any time
//   out    what is to be done for a node, by its class
//   keeps  one entry for each class that was asked for, until the dictionary changes
#pragma once

#include <array>
#include <cstdint>
#include <vector>

#include <nanobind/nanobind.h>

#include "host/collections.h"
#include "tree/node.h"

namespace codeloom {

class CDispatchWalker;

// A visit of a native class: what stands in the dictionary, and the shorter road to it. Its result says by
// its truth whether the children are wanted.
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
        PyObject* node_class = nullptr;  // for comparison only
        EAction action = EAction::kVisitChildren;
        CNativeVisit::Function function = nullptr;
        nb::handle callable;  // the dictionary holds it
    };

    // A dictionary, or none. `native_visits` are values of it that native code may call directly.
    void Set(nb::object dict, std::vector<CNativeVisit> native_visits = {});

    // Good until host code runs.
    const CEntry& Find(nb::handle node_class) {
        if (_fVersion != DictVersion(_fDict)) _Forget();
        CEntry& entry = _fEntries[_Slot(node_class)];
        if (entry.node_class != node_class.ptr()) entry = _Read(node_class);
        return entry;
    }

    const nb::object& Dict() const { return _fDict; }

    template <class Visitor>
    void References(Visitor&& visit) {
        visit(_fDict);
        for (CNativeVisit& native : _fNativeVisits) visit(native.callable);
    }

  private:
    static constexpr size_t kSlotBits = 6;

    static size_t _Slot(nb::handle node_class) {
        constexpr uint64_t kSpread = 0x9E3779B97F4A7C15;
        return static_cast<size_t>((reinterpret_cast<uintptr_t>(node_class.ptr()) * kSpread) >>
                                   (64 - kSlotBits));
    }

    void _Forget();
    CEntry _Read(nb::handle node_class) const;

    nb::object _fDict = nb::none();
    std::vector<CNativeVisit> _fNativeVisits;
    uint64_t _fVersion = 0;  // of the dictionary that the entries were read from
    std::array<CEntry, size_t{1} << kSlotBits> _fEntries{};
};

}  // namespace codeloom
