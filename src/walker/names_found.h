// The names that a walk has met, until its end turns them into records.
#pragma once

#include <nanobind/nanobind.h>

#include "host/binding.h"
#include "strutils/text.h"

namespace codeloom {

// Names read, and names bound within sub-expressions, each in the order first met.
class CNamesFound {
  public:
    // Later loads of a name change nothing.
    void AddLoad(nb::handle name) { _fLoaded[name] = nb::none(); }

    // Equivs of one name are kept together, in the order met.
    void AddStore(nb::handle name, const nb::object& equiv) {
        const nb::object earlier = FindInDict(_fStored, name);
        _fStored[name] = earlier.is_valid() ? Utf8Concat3(earlier, nb::bytes(";"), equiv) : equiv;
    }

    // Calls visit(name). What it does to the names here doesn't matter.
    template <class Visit>
    void VisitLoads(Visit visit) const {
        if (_fLoaded.size() == 0) return;
        for (const nb::handle name : _fLoaded.keys()) visit(name);
    }

    // Calls visit(name, equiv).
    template <class Visit>
    void VisitStores(Visit visit) const {
        if (_fStored.size() == 0) return;
        for (const nb::handle item : _fStored.items()) {
            const nb::object equivs = item[1].attr("split")(nb::bytes(";"));
            for (const nb::handle equiv : equivs) visit(item[0], equiv);
        }
    }

    void Clear() {
        if (_fLoaded.size() != 0) _fLoaded.clear();
        if (_fStored.size() != 0) _fStored.clear();
    }

  private:
    nb::dict _fLoaded;
    nb::dict _fStored;
};

}  // namespace codeloom
