#include "bindings/python/Frames.h"

#include <pybind11/stl.h>

#include "board/model/Errors.h"

namespace qor::python {
namespace {

py::object valueIn(const BoardFrame& self, py::handle name) {
  const Field& field = self.names->find(name, Direction::input);
  return field.valueIn(self.frame.samples()[field.signal.core]);
}

// What the class has, then signals. Names of signals that were found so are looked up first the next time.
PyObject* attribute(PyObject* object, PyObject* name) {
  try {
    const auto& self = py::cast<BoardFrame&>(py::handle(object));
    if (const Field* field = self.names->attribute(name))
      return field->valueIn(self.frame.samples()[field->signal.core]).release().ptr();
    PyObject* const found = PyObject_GenericGetAttr(object, name);
    if (found != nullptr || PyErr_ExceptionMatches(PyExc_AttributeError) == 0) return found;
    PyErr_Clear();
    const Field& field = self.names->findAttribute(name);
    return field.valueIn(self.frame.samples()[field.signal.core]).release().ptr();
  } catch (const UnknownSignal& unknown) {
    PyErr_SetString(py::module_::import("qorvio.errors").attr("UnknownSignal").ptr(), unknown.what());
  } catch (const WrongUse& wrong) {
    PyErr_SetString(py::module_::import("qorvio.errors").attr("UsageError").ptr(), wrong.what());
  } catch (py::error_already_set& raised) {
    raised.restore();
  } catch (const std::exception& error) {
    PyErr_SetString(PyExc_RuntimeError, error.what());
  }
  return nullptr;
}

void setUp(PyHeapTypeObject* type) {
  type->ht_type.tp_getattro = attribute;
}

const Sample& sampleOf(const BoardFrame& self, const Field& field) {
  return self.frame.samples()[field.signal.core];
}

template <bool (Reading::*flag)() const>
bool edge(const BoardFrame& self, const py::object& name) {
  return (self.frame[self.names->find(name, Direction::input).signal].*flag)();
}

// As `qorvio read` shows them: name, value, rose, fell, and what the design's clock saw, None for asynchronous inputs.
py::list rows(const BoardFrame& self) {
  py::list list;
  for (const Signal& each : self.names->table().select({}, Direction::input)) {
    const Reading reading = self.frame[each];
    const bool isSync = each.port == Port::syncIn;
    list.append(py::make_tuple(each.name, reading.text(), reading.rose(), reading.fell(),
                               isSync ? py::object(py::bool_(reading.syncRose())) : py::none(),
                               isSync ? py::object(py::bool_(reading.syncFell())) : py::none()));
  }
  return list;
}

py::list keys(const BoardFrame& self) {
  py::list names;
  for (const Signal& each : self.names->table().select({}, Direction::input)) names.append(each.name);
  return names;
}

}  // namespace

void bindFrames(py::module_& module) {
  py::class_<BoardFrame>(module, "Frame", py::custom_type_setup(setUp),
                         R"(One coherent snapshot of the inputs of each core.

`frame.state` or `frame["state"]`, a slice `frame["leds[3]"]` too, is the value, as `Signal.value` has it. What moved is
counted since the frame before, or for one from `wait_for` since the last poll before the wait. Independent of its board.)")
      .def("__getitem__", valueIn)
      .def("rose", edge<&Reading::rose>, py::arg("name"),
           "Whether any bit of the input went from 0 to 1, however short.")
      .def("fell", edge<&Reading::fell>, py::arg("name"),
           "Whether any bit of the input went from 1 to 0, however short.")
      .def("moved", edge<&Reading::moved>, py::arg("name"), "Whether any bit of the input rose or fell.")
      .def("sync_rose", edge<&Reading::syncRose>, py::arg("name"),
           "Whether the design's clock saw any bit rise; False for an asynchronous input.")
      .def("sync_fell", edge<&Reading::syncFell>, py::arg("name"),
           "Whether the design's clock saw any bit fall; False for an asynchronous input.")
      .def(
          "text",
          [](const BoardFrame& self, const py::object& name) {
            return self.frame[self.names->find(name, Direction::input).signal].text();
          },
          py::arg("name"), "The value as `qorvio read` shows it: a name, a number with its unit, or digits.")
      .def(
          "to_bytes",
          [](const BoardFrame& self, const py::object& name) {
            const Field& field = self.names->find(name, Direction::input);
            Bytes bits;
            extract(field.signal, sampleOf(self, field).values(field.signal.port), bits);
            return py::bytes(reinterpret_cast<const char*>(bits.data()), bits.size());
          },
          py::arg("name"), "The bits of an input: lowest byte first, as many as its width needs.")
      .def("keys", keys, "The names of the inputs: those of the signals file, else the whole ports.")
      .def("__iter__", [](const BoardFrame& self) { return py::iter(keys(self)); })
      .def("__len__", [](const BoardFrame& self) { return py::len(keys(self)); })
      .def("_rows", rows)
      .def("__dir__",
           [](const py::object& self) {
             py::list names = py::module_::import("builtins").attr("object").attr("__dir__")(self);
             for (const py::handle each : keys(py::cast<BoardFrame&>(self))) names.append(each);
             return names;
           })
      .def("__repr__",
           [](const BoardFrame& self) {
             return py::module_::import("qorvio.tables").attr("text")(rows(self));
           })
      .def("_repr_html_", [](const BoardFrame& self) {
        return py::module_::import("qorvio.tables").attr("html")(rows(self));
      });
}

}  // namespace qor::python
