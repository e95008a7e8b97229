// The records of one line: pairs of a name and what is said of it, in order of arrival.
//   in     byte strings, from the walkers; or the packed records of an analysis on plain data
//   out    the same to native readers; to the host a list of tuples, made when it first looks
// From then on the list is where the records are, since the host may change it.
#pragma once

#include <utility>
#include <vector>

#include <nanobind/nanobind.h>

#include "host/collections.h"
#include "host/hosted.h"
#include "neighbours/logicalline/packed_records.h"

namespace codeloom {

class CRecordPairs {
  public:
    void Append(nb::handle name, nb::handle equiv);
    void Clear();

    // Requires: there is no record.
    void Set(CPackedRecords records);

    // The list; none when there is no record.
    nb::object AsHost();

    bool IsEmpty() const { return _fPacked.IsEmpty() && _fPairs.empty() && _fHostPairs.is_none(); }

    // Calls visit(name, equiv) for each record that is there now. ValueError for an item of the host's that
    // isn't a pair.
    template <class Visit>
    void ForEach(Visit visit) const {
        if (!_fHostPairs.is_none()) return _ForEachOfHost(visit);
        for (const auto& [name, equiv] : _Unpacked()) visit(name, equiv);
        for (const auto& [name, equiv] : std::vector(_fPairs)) visit(name, equiv);
    }

    template <class Visitor>
    void References(Visitor&& visit) {
        visit(_fHostPairs);  // the native ones are byte strings, which hold nothing
    }

  private:
    using CPairs = std::vector<std::pair<nb::object, nb::object>>;

    CPairs _Unpacked() const;

    template <class Visit>
    void _ForEachOfHost(Visit visit) const {
        // A copy: what is visited may append to the records, or drop them.
        for (nb::handle item : ListSlice(_fHostPairs, 0, ListSize(_fHostPairs))) {
            const nb::tuple pair(nb::borrow(item));
            if (pair.size() != 2)
                throw nb::value_error("a record of a line must be a pair of name and equiv");
            visit(nb::object(pair[0]), nb::object(pair[1]));
        }
    }

    static constexpr size_t kUsualCount = 8;

    // At most one of these holds records.
    CPackedRecords _fPacked;
    CPairs _fPairs;
    nb::object _fHostPairs = nb::none();
};

}  // namespace codeloom
