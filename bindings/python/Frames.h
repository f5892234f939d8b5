// Frames as Python objects.
#pragma once

#include "bindings/python/Session.h"

namespace qor::python {

struct BoardFrame {
  std::shared_ptr<Names> names;
  Frame frame;
};

void bindFrames(py::module_& module);

}  // namespace qor::python
