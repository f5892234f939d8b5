// Simulated boards as Python objects.
#pragma once

#include <pybind11/pybind11.h>

namespace qor::python {

void bindSimBoards(pybind11::module_& module);

}  // namespace qor::python
