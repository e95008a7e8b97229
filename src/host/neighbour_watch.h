// Whether functions of neighbour modules are still those that were there when the engine was loaded. Asking
// costs a few comparisons as long as no module changes.
#pragma once

#include <cstdint>
#include <initializer_list>
#include <vector>

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

class CNeighbourWatch {
  public:
    // Watches a global of the home module.
    void Watch(const char* name);

    // Watches functions of a module that is a global of the home module, and that global.
    void Watch(const char* module_name, std::initializer_list<const char*> functions);

    bool IsUntouched() {
        for (const CModule& module : _fModules)
            if (_VersionOf(module) != module.version) return _LookAgain();
        return _fIsUntouched;
    }

  private:
    // Everything lives as long as the process.
    struct CModule {
        nb::handle dict;
        uint64_t version;  // of the dictionary when it was last looked at
    };
    struct CName {
        nb::handle dict;
        nb::handle key;
        nb::handle value;
    };

    static uint64_t _VersionOf(const CModule& module);
    nb::handle _DictOf(nb::handle module);
    void _WatchIn(nb::handle module, const char* name);
    bool _LookAgain();

    std::vector<CModule> _fModules;
    std::vector<CName> _fNames;
    bool _fIsUntouched = false;
};

}  // namespace codeloom
