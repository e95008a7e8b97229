// Functions of neighbour modules that are looked up on their module at each call, so that a host or a test
// can replace them: `treesift.reflect.ReportCurrentException = ...`.
#pragma once

#include <nanobind/nanobind.h>

namespace nb = nanobind;

namespace codeloom {

// The module whose globals name the neighbours; set once, while it loads.
void SetHomeModule(nb::module_ module);
nb::module_ HomeModule();

// `module_name`.`function_name`, with the module as the home module's global of that name.
class CNeighbourFunction {
  public:
    constexpr CNeighbourFunction(const char* module_name, const char* function_name)
        : _fModuleName(module_name), _fFunctionName(function_name) {}

    template <class... Arguments>
    nb::object operator()(Arguments&&... arguments) const {
        return Find()(std::forward<Arguments>(arguments)...);
    }

    nb::object Find() const;

  private:
    const char* _fModuleName;
    const char* _fFunctionName;
};

}  // namespace codeloom
