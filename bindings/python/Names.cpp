#include "bindings/python/Names.h"

#include <pybind11/stl.h>

#include "board/model/Errors.h"
#include "board/model/Value.h"

namespace qor::python {
namespace {

py::object steal(PyObject* object) {
  if (object == nullptr) throw py::error_already_set();
  return py::reinterpret_steal<py::object>(object);
}

bool isSigned(const Signal& signal) {
  return signal.radix == Radix::signedDec;
}

py::object wideNumber(const Signal& signal, const Bytes& value) {
  Bytes extended = value;
  const unsigned spare = signal.width() % 8;
  if (isSigned(signal) && spare != 0 && bitAt(value, signal.width() - 1) != 0)
    extended.back() = static_cast<unsigned char>(extended.back() | 0xFFU << spare);
  return steal(_PyLong_FromByteArray(extended.data(), extended.size(), 1, isSigned(signal) ? 1 : 0));
}

// The top bit as the sign.
std::int64_t signedNumber(unsigned width, std::uint64_t bits) {
  const bool isBelowZero = (bits >> (width - 1) & 1) != 0;
  return static_cast<std::int64_t>(isBelowZero && width < 64 ? bits | ~std::uint64_t{0} << width : bits);
}

Field fieldOf(Signal signal) {
  Field field{std::move(signal), py::none(), py::dict(), py::none()};
  const py::module_ values = py::module_::import("qorvio.values");
  if (!field.signal.names.empty()) {
    field.enumeration = values.attr("enumeration")(field.signal.name, field.signal.names);
    for (const auto& each : field.signal.names)
      field.members[py::int_(each.second)] = field.enumeration(each.second);
  } else if (field.signal.scale != 0) {
    field.quantity = values.attr("quantity")(field.signal.unit);
  }
  return field;
}

Value wideValue(py::handle number) {
  if (py::bool_(number < py::int_(0))) return py::cast<std::string>(steal(PyNumber_ToBase(number.ptr(), 16)));
  const auto width = static_cast<unsigned>(_PyLong_NumBits(number.ptr()));
  Bytes bits(byteCount(width));
  if (_PyLong_AsByteArray(reinterpret_cast<PyLongObject*>(number.ptr()), bits.data(), bits.size(), 1, 0) != 0)
    throw py::error_already_set();
  return bits;
}

Value numberFrom(py::handle number) {
  int overflow = 0;
  const long long value = PyLong_AsLongLongAndOverflow(number.ptr(), &overflow);
  if (overflow == 0) return value;
  const unsigned long long large = PyLong_AsUnsignedLongLong(number.ptr());
  if (PyErr_Occurred() == nullptr) return large;
  PyErr_Clear();
  return wideValue(number);
}

Value bytesFrom(py::handle object) {
  Py_buffer view;
  if (PyObject_GetBuffer(object.ptr(), &view, PyBUF_SIMPLE) != 0) throw py::error_already_set();
  const auto* first = static_cast<const unsigned char*>(view.buf);
  Bytes bits(first, first + view.len);
  PyBuffer_Release(&view);
  return bits;
}

// Arrays of more than one byte are no number, and numbers of numpy are no bytes.
bool isBytes(py::handle object) {
  return PyObject_CheckBuffer(object.ptr()) != 0 && PySequence_Check(object.ptr()) != 0;
}

}  // namespace

py::object Field::named(py::object number) const {
  PyObject* const member = PyDict_GetItemWithError(members.ptr(), number.ptr());
  return member != nullptr ? py::reinterpret_borrow<py::object>(member) : enumeration(number);
}

py::object Field::valueIn(const Sample& sample) const {
  const Bytes& image = sample.values(signal.port);
  if (isNarrow()) return valueOf(lowBits(signal, image));
  Bytes value;
  extract(signal, image, value);
  return valueOf(value);
}

py::object Field::valueOf(const Bytes& value) const {
  if (!quantity.is_none()) return quantity(numberIn(signal, value) * signal.scale);
  py::object number = wideNumber(signal, value);
  return enumeration.is_none() ? number : named(std::move(number));
}

py::object Field::valueOf(std::uint64_t value) const {
  const std::int64_t number = isSigned(signal) ? signedNumber(signal.width(), value) : 0;
  if (!quantity.is_none())
    return quantity(signal.scale *
                    (isSigned(signal) ? static_cast<double>(number) : static_cast<double>(value)));
  py::object whole =
      steal(isSigned(signal) ? PyLong_FromLongLong(number) : PyLong_FromUnsignedLongLong(value));
  return enumeration.is_none() ? whole : named(std::move(whole));
}

Value valueFrom(py::handle object, const Signal& signal) {
  if (PyLong_Check(object.ptr()) != 0) return numberFrom(object);
  if (PyFloat_Check(object.ptr()) != 0) return PyFloat_AsDouble(object.ptr());
  if (PyUnicode_Check(object.ptr()) != 0) return py::cast<std::string>(object);
  if (isBytes(object)) return bytesFrom(object);
  if (PyIndex_Check(object.ptr()) != 0) return numberFrom(steal(PyNumber_Index(object.ptr())));
  if (PyNumber_Check(object.ptr()) != 0) return PyFloat_AsDouble(steal(PyNumber_Float(object.ptr())).ptr());
  throw py::type_error("neither a number, a text nor bytes, for " + signal.name + ": " +
                       py::cast<std::string>(py::repr(object)));
}

const Field& Names::find(py::handle name, Direction direction) {
  py::dict& places = places_[direction == Direction::input ? 0 : 1];
  if (PyObject* const place = PyDict_GetItemWithError(places.ptr(), name.ptr()))
    return *fields_[PyLong_AsSize_t(place)];
  if (PyUnicode_Check(name.ptr()) == 0)
    throw py::type_error("a signal is named by a text, not: " + py::cast<std::string>(py::repr(name)));
  auto field = std::make_unique<Field>(fieldOf(table_.find(py::cast<std::string>(name), direction)));
  places[name] = fields_.size();
  fields_.push_back(std::move(field));
  return *fields_.back();
}

const Field* Names::attribute(py::handle name) const {
  PyObject* const place = PyDict_GetItemWithError(attributes_.ptr(), name.ptr());
  return place != nullptr ? fields_[PyLong_AsSize_t(place)].get() : nullptr;
}

const Field& Names::findAttribute(py::handle name) {
  const Field& field = find(name, Direction::input);
  attributes_[name] = places_[0][name];
  return field;
}

}  // namespace qor::python
