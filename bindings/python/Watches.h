// Watches of inputs as Python objects.
#pragma once

#include "bindings/python/Session.h"

namespace qor::python {

void bindWatches(py::module_& module);

}  // namespace qor::python
