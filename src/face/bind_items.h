// How an item of an analysis, and a sequence of items, reaches the host.
#pragma once

#include <nanobind/nanobind.h>
#include <nanobind/operators.h>

#include "face/arrow_streams.h"
#include "face/items.h"
#include "host/refuse_new.h"
#include "host/sequence_slots.h"

namespace codeloom {

struct CAnalysis {
    CSourceFilePtr file;
};

inline nb::object Attribute(nb::handle object, const char* name) {
    return nb::getattr(object, name);
}

inline nb::object Operator(const char* name) {
    return nb::module_::import_("operator").attr(name);
}

// What all immutable objects of the face have: a copy is the object itself.
template <class Binding>
void BindCopies(Binding& binding) {
    using Class = typename Binding::Type;
    binding.def(
        "__copy__", [](nb::pointer_and_handle<Class> self) { return nb::borrow(self.h); },
        nb::sig("def __copy__(self) -> typing.Self"));
    binding.def(
        "__deepcopy__", [](nb::pointer_and_handle<Class> self, nb::handle) { return nb::borrow(self.h); },
        nb::arg("memo").none(), nb::sig("def __deepcopy__(self, memo: object) -> typing.Self"));
}

template <class Binding>
void BindEquality(Binding& binding) {
    using Class = typename Binding::Type;
    binding.def(
        "__eq__", [](const Class& self, const Class& other) { return self == other; }, nb::is_operator(),
        nb::sig("def __eq__(self, other: object, /) -> bool"));
    binding.def("__hash__", [](const Class& self) { return self.Hash(); });
}

// What every item has.
template <class Item>
nb::class_<Item> BindItem(nb::module_& module, const char* name, const char* documentation) {
    nb::class_<Item> binding(module, name, documentation, nb::pooled(), nb::type_slots(kNotMadeByHost));
    BindEquality(binding);
    BindCopies(binding);
    binding.def(
        "__reduce__",
        [](const Item& self) {
            const nb::object all = Attribute(nb::cast(CAnalysis{self.file}), Item::kSequence);
            return nb::make_tuple(Operator("getitem"), nb::make_tuple(all, self.i));
        },
        nb::sig("def __reduce__(self) -> tuple[typing.Any, ...]"));
    return binding;
}

// A class of the host over TItems, which is a Sequence there. `name` is that of the class, `item` that of its
// items.
template <class Items>
void BindItems(nb::module_& module, const char* name, const char* signature) {
    using Item = typename Items::CItemType;
    nb::class_<Items> items(module, name, nb::type_slots(kSequenceSlots<Items>), nb::sig(signature));
    BindEquality(items);
    BindCopies(items);
    items.def(
        "index",
        [](nb::pointer_and_handle<Items> self, nb::handle value, nb::handle start, nb::handle stop) {
            return SequenceIndex(self.h, value, start, stop);
        },
        nb::arg("value").none(), nb::arg("start") = 0, nb::arg("stop").none() = nb::none(),
        nb::sig("def index(self, value: object, start: int = 0, stop: int | None = None) -> int"));
    items.def(
        "count",
        [](nb::pointer_and_handle<Items> self, nb::handle value) { return SequenceCount(self.h, value); },
        nb::arg("value").none(), nb::sig("def count(self, value: object) -> int"));
    items.def("__repr__", [name](const Items& self) {
        return nb::str("<{} of {!r}: {}>").format(name, self.file->Path(), self.count);
    });
    items.def(
        "__reduce__",
        [](const Items& self) -> nb::object {
            const nb::object analysis = nb::cast(CAnalysis{self.file});
            const nb::object all = Attribute(analysis, Item::kSequence);
            if (self.step == 1 && self.first == 0 && self.count == nb::len(all))
                return nb::make_tuple(nb::module_::import_("builtins").attr("getattr"),
                                      nb::make_tuple(analysis, Item::kSequence));
            return nb::make_tuple(Operator("getitem"), nb::make_tuple(all, self.AsSlice()));
        },
        nb::sig("def __reduce__(self) -> tuple[typing.Any, ...]"));
    items.def(
        "__arrow_c_stream__",
        [](const Items& self, nb::handle) {
            return StreamOfRows(*self.file, Item::kSequence, {self.first, self.step, self.count});
        },
        nb::arg("requested_schema").none() = nb::none(),
        nb::sig("def __arrow_c_stream__(self, requested_schema: object = None) -> object"),
        "The items as a table, for libraries that know the Arrow C stream interface; docs/tables.md lists "
        "its columns. No other schema is made on request.");
    nb::module_::import_("_collections_abc").attr("Sequence").attr("register")(items);
}

}  // namespace codeloom
