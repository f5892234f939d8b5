// Recordings in memory as Python objects.
#pragma once

#include "bindings/python/Session.h"

namespace qor::python {

void bindSamplings(py::module_& module);

}  // namespace qor::python
