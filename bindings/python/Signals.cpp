#include "bindings/python/Signals.h"

#include "board/model/CoreAddress.h"
#include "board/model/Errors.h"

namespace qor::python {
namespace {

Bytes bitsOf(const BoardSignal& self) {
  const Signal& signal = self.forReading().signal;
  return self.session->run([&](Board& board) {
    Bytes bits;
    extract(signal, self.session->peek(board, signal.core).values(signal.port), bits);
    return bits;
  });
}

py::object read(const BoardSignal& self) {
  if (!self.input->isNarrow()) return self.input->valueOf(bitsOf(self));
  const Signal& signal = self.input->signal;
  return self.input->valueOf(self.session->run([&](Board& board) {
    return lowBits(signal, self.session->peek(board, signal.core).values(signal.port));
  }));
}

py::object valueOf(const BoardSignal& self) {
  if (self.input != nullptr) return read(self);
  const auto given = self.session->run([&](Board& board) { return board.lastGiven(self.output->signal); });
  if (given) return self.output->valueOf(*given);
  throw WrongUse("it is not known what the output was given last: " + self.output->signal.name);
}

void give(Session& session, const std::vector<Assignment>& assignments) {
  session.run([&](Board& board) { return board.give(assignments), true; });
}

void setValue(const BoardSignal& self, const py::object& value) {
  const Signal& signal = self.forWriting().signal;
  give(*self.session, {level(signal, valueFrom(value, signal).bitsFor(signal))});
}

py::object given(const BoardSignal& self) {
  const Field& field = self.forWriting();
  const auto bits = self.session->run([&](Board& board) { return board.lastGiven(field.signal); });
  return bits ? field.valueOf(*bits) : py::none();
}

Train trainFrom(const py::iterable& values, const Signal& signal) {
  Train train;
  for (const py::handle each : values) train.values.push_back(valueFrom(each, signal));
  return train;
}

void play(const BoardSignal& self, const py::iterable& values) {
  const Signal& signal = self.forWriting().signal;
  give(*self.session,
       assignmentsOf({{signal.name, trainFrom(values, signal)}}, self.session->names().table()));
}

py::bytes bytesOf(const BoardSignal& self) {
  const Bytes bits = bitsOf(self);
  return {reinterpret_cast<const char*>(bits.data()), bits.size()};
}

py::object arrayOf(const BoardSignal& self) {
  return py::module_::import("numpy").attr("frombuffer")(bytesOf(self), "uint8");
}

template <Relation relation>
BoardCondition compare(const BoardSignal& self, const py::object& value) {
  const Signal& signal = self.forReading().signal;
  return self.condition(Condition::compare(signal, relation, valueFrom(value, signal)));
}

template <Edge kind>
BoardCondition edge(const BoardSignal& self) {
  return self.condition(Condition::edge(self.forReading().signal, kind));
}

bool refuseTruth(const py::object&) {
  throw py::type_error(
      "a signal or condition is neither true nor false by itself: use .value, or wait_for()");
}

template <class Class>
void bindLogic(Class& bound) {
  const auto both = [](const py::object& a, const py::object& b, bool isAnd) {
    const bool isSignal = py::isinstance<BoardSignal>(a);
    const std::shared_ptr<Names> names =
        isSignal ? py::cast<BoardSignal&>(a).session->sharedNames() : py::cast<BoardCondition&>(a).names;
    const Condition left = conditionFrom(a, names), right = conditionFrom(b, names);
    return BoardCondition{isAnd ? left && right : left || right, names};
  };
  bound.def("__and__", [both](const py::object& a, const py::object& b) { return both(a, b, true); })
      .def("__or__", [both](const py::object& a, const py::object& b) { return both(a, b, false); })
      .def("__bool__", refuseTruth);
}

}  // namespace

const Field& BoardSignal::forReading() const {
  if (input == nullptr) throw WrongUse("an output cannot be read: " + output->signal.name);
  return *input;
}

const Field& BoardSignal::forWriting() const {
  if (output == nullptr) throw WrongUse("an input cannot be written: " + input->signal.name);
  return *output;
}

Condition conditionFrom(py::handle object, const std::shared_ptr<Names>& names) {
  const bool isSignal = py::isinstance<BoardSignal>(object);
  if (!isSignal && !py::isinstance<BoardCondition>(object))
    throw py::type_error("not a condition: " + py::cast<std::string>(py::repr(object)));
  const BoardCondition condition = isSignal ? py::cast<BoardSignal&>(object).condition(Condition::isNotZero(
                                                  py::cast<BoardSignal&>(object).forReading().signal))
                                            : py::cast<BoardCondition>(object);
  if (condition.names != names) throw WrongUse("a condition of another board: " + condition.condition.text());
  return condition.condition;
}

void bindSignals(py::module_& module) {
  py::class_<BoardSignal> signal(module, "Signal", R"(A named row of bits of a board.

`value` reads an input and writes an output. Compared with a value, or by `rises`, `falls` and `moves`, an input makes a
condition for `Board.wait_for`.)");
  signal
      .def_property("value", valueOf, setValue, R"(The value, in one exchange with its core.

An int; a member of the signal's enumeration; with a scale a float, in the signal's unit. Reading takes no activity: what
moved is still reported by the next `Board.read()`. Of an output alone it is what it was given last.

Set to a number, a member or a name of the enumeration, a text as `qorvio write` takes it, or bytes, lowest first.
Raises UsageError, with nothing sent, and LinkError.)")
      .def_property_readonly("given", given, "What the output was given last; None where that is not known.")
      .def("train", play, py::arg("values"),
           R"(Gives a synchronous output up to 16 values, one a clock of the design.

The last one stays. For an output of one bit a text will do: "0011". Raises UsageError and LinkError.)")
      .def(
          "pulse",
          [](const BoardSignal& self, unsigned width, unsigned at) {
            give(*self.session, {pulseOf(self.forWriting().signal, {width, at})});
          },
          py::arg("width") = 1, py::arg("at") = 0,
          R"(A synchronous output of one bit is 1 for `width` clocks of the design, from clock `at` on.

Both within 16 clocks. Raises UsageError and LinkError.)")
      .def(
          "toggle",
          [](const BoardSignal& self) {
            const std::string& name = self.forWriting().signal.name;
            return self.session->run([&](Board& board) { return board.toggle(name); });
          },
          "Gives a one-bit output the opposite of what it was given last, and returns that. Raises "
          "UsageError.")
      .def("to_bytes", bytesOf,
           "The bits of an input, read now: lowest byte first, as many as its width needs.")
      .def_property_readonly(
          "array", arrayOf,
          "The same as an array of numpy, uint8, which is not to be written. `value` takes one.")
      .def_property_readonly("rises", edge<Edge::rises>,
                             "True when any bit went from 0 to 1 since the last poll.")
      .def_property_readonly("falls", edge<Edge::falls>,
                             "True when any bit went from 1 to 0 since the last poll.")
      .def_property_readonly("moves", edge<Edge::moves>,
                             "True when any bit rose or fell since the last poll.")
      .def("__eq__", compare<Relation::equal>)
      .def("__ne__", compare<Relation::notEqual>)
      .def("__lt__", compare<Relation::less>)
      .def("__gt__", compare<Relation::greater>)
      .def("__le__", compare<Relation::lessOrEqual>)
      .def("__ge__", compare<Relation::greaterOrEqual>)
      .def("__invert__",
           [](const BoardSignal& self) {
             return self.condition(!Condition::isNotZero(self.forReading().signal));
           })
      .def_property_readonly("name", [](const BoardSignal& self) { return self.signal().name; })
      .def_property_readonly(
          "width", [](const BoardSignal& self) { return self.signal().width(); }, "In bits.")
      .def_property_readonly(
          "unit", [](const BoardSignal& self) { return self.signal().unit; }, "Of a scaled value, or \"\".")
      .def_property_readonly(
          "scale", [](const BoardSignal& self) { return self.signal().scale; },
          "What one step is worth; 0 without a scale.")
      .def_property_readonly("description", [](const BoardSignal& self) { return self.signal().description; })
      .def_property_readonly(
          "enum",
          [](const BoardSignal& self) {
            return (self.input != nullptr ? self.input : self.output)->enumeration;
          },
          "The enumeration, an enum.IntEnum; None without one.")
      .def_property_readonly(
          "is_input", [](const BoardSignal& self) { return self.input != nullptr; },
          "Whether it can be read.")
      .def_property_readonly(
          "is_output", [](const BoardSignal& self) { return self.output != nullptr; },
          "Whether it can be written.")
      .def_property_readonly(
          "core",
          [](const BoardSignal& self) {
            return refText(self.session->names().table().cores()[self.signal().core]);
          },
          "The address of its core.")
      .def("__repr__", [](const BoardSignal& self) {
        const Signal& each = self.signal();
        return "<qorvio.Signal " + each.name + ": " + portName(each.port) + ", " +
               std::to_string(each.width()) + (each.width() == 1 ? " bit>" : " bits>");
      });
  signal.attr("__class_getitem__") = py::reinterpret_steal<py::object>(PyClassMethod_New(
      py::cpp_function([](const py::object& type, const py::object&) { return type; }).ptr()));
  bindLogic(signal);
}

void bindConditions(py::module_& module) {
  py::class_<BoardCondition> condition(module, "Condition", R"(What `Board.wait_for` waits for.

Made of signals: `(board.state == "RUN") & board.irq.rises`, with `&`, `|` and `~`.)");
  condition
      .def("__invert__",
           [](const BoardCondition& self) {
             return BoardCondition{!self.condition, self.names};
           })
      .def("__repr__",
           [](const BoardCondition& self) { return "<qorvio.Condition " + self.condition.text() + ">"; });
  bindLogic(condition);
}

}  // namespace qor::python
