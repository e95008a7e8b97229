#include "host/neighbour_watch.h"

#include <algorithm>

#include "host/collections.h"
#include "host/neighbour_call.h"
#include "host/text.h"

namespace codeloom {

void CNeighbourWatch::Watch(const char* name) {
    _WatchIn(HomeModule(), name);
}

void CNeighbourWatch::Watch(const char* module_name, std::initializer_list<const char*> functions) {
    Watch(module_name);
    const nb::object module = HomeModule().attr(module_name);
    for (const char* function : functions) _WatchIn(module, function);
}

uint64_t CNeighbourWatch::_VersionOf(const CModule& module) {
    return DictVersion(module.dict);
}

// The dictionary of a module, which is looked at from now on.
nb::handle CNeighbourWatch::_DictOf(nb::handle module) {
    const nb::object dict = module.attr("__dict__");
    const auto is_it = [&](const CModule& known) { return known.dict.is(dict); };
    if (std::none_of(_fModules.begin(), _fModules.end(), is_it))
        _fModules.push_back({nb::object(dict).release(), 0});
    return dict;
}

void CNeighbourWatch::_WatchIn(nb::handle module, const char* name) {
    _fNames.push_back(
        {_DictOf(module), InternedText(name).release(), nb::object(module.attr(name)).release()});
}

bool CNeighbourWatch::_LookAgain() {
    for (CModule& module : _fModules) module.version = _VersionOf(module);
    _fIsUntouched = std::all_of(_fNames.begin(), _fNames.end(), [](const CName& name) {
        return FindInDict(name.dict, name.key).is(name.value);
    });
    return _fIsUntouched;
}

}  // namespace codeloom
