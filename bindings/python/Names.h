// The signals of a board as Python sees them: how values of the engine become Python objects, and the other way.
#pragma once

#include <pybind11/pybind11.h>

#include <memory>
#include <vector>

#include "board/model/Assignment.h"
#include "board/model/Sample.h"
#include "board/model/SignalTable.h"

namespace qor::python {

namespace py = pybind11;

/// A signal, with what its values are made of.
struct Field {
  Signal signal;
  py::object enumeration;  ///< an enum.IntEnum; None without names
  py::dict members;        ///< of the enumeration, by number
  py::object quantity;     ///< what a scaled value is given to; None without a scale

  /// An int, a member of the enumeration, or with a scale a float.
  /// @{
  py::object valueIn(const Sample& sample) const;
  py::object valueOf(const Bytes& value) const;
  py::object valueOf(std::uint64_t value) const;  ///< of at most 64 bits
  /// @}

  bool isNarrow() const { return signal.width() <= 64; }

 private:
  py::object named(py::object number) const;
};

/// The value as the engine takes it for that signal. Throws TypeError for what is neither a number, a text nor bytes.
Value valueFrom(py::handle object, const Signal& signal);

/// The fields of one board, found by name; they live as long as this. To be used and destroyed with the GIL held.
class Names {
 public:
  explicit Names(const SignalTable& table) : table_(table) {}

  const SignalTable& table() const { return table_; }

  /// Throws UnknownSignal, and WrongUse for a slice beyond the signal.
  const Field& find(py::handle name, Direction direction);

  /// Inputs that are attributes of frames: null unless findAttribute() has found the name before.
  /// @{
  const Field* attribute(py::handle name) const;
  const Field& findAttribute(py::handle name);
  /// @}

 private:
  SignalTable table_;
  std::vector<std::unique_ptr<Field>> fields_;
  py::dict places_[2];  // by direction: the place in fields_ of a name as it was spelled
  py::dict attributes_;
};

}  // namespace qor::python
