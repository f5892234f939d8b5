// The module qorvio._qorvio: the engine's board for the package around it.
#include <pybind11/stl.h>

#include <cmath>
#include <optional>

#include "bindings/python/Frames.h"
#include "bindings/python/Samplings.h"
#include "bindings/python/Session.h"
#include "bindings/python/Signals.h"
#include "bindings/python/SimBoards.h"
#include "bindings/python/Watches.h"
#include "board/model/CoreAddress.h"
#include "board/session/OutputMemory.h"

namespace qor::python {
namespace {

void raise(const char* name, const std::exception& error) {
  PyErr_SetString(py::module_::import("qorvio.errors").attr(name).ptr(), error.what());
}

void translate(std::exception_ptr thrown) {
  try {
    if (thrown) std::rethrow_exception(thrown);
  } catch (const UnknownSignal& error) {
    raise("UnknownSignal", error);
  } catch (const WrongUse& error) {
    raise("UsageError", error);
  } catch (const Failure& error) {
    raise("LinkError", error);
  } catch (const Timeout& error) {
    raise("Timeout", error);
  } catch (const Error& error) {
    raise("Error", error);
  } catch (const std::invalid_argument& error) {  // of a simulated board that there cannot be
    raise("UsageError", error);
  }
}

// The input and the output of that name; of an unknown one the message that knows a name near to it.
BoardSignal signalNamed(const std::shared_ptr<Session>& session, const py::str& name) {
  const Field *input = nullptr, *output = nullptr;
  std::optional<UnknownSignal> unknown;
  const auto find = [&](Direction direction, const Field*& field) {
    try {
      field = &session->names().find(name, direction);
    } catch (const UnknownSignal& error) {
      const auto isHelpful = [](const UnknownSignal& each) {
        return std::string_view(each.what()).find("did you mean") != std::string_view::npos;
      };
      if (!unknown || (!isHelpful(*unknown) && isHelpful(error))) unknown = error;
    }
  };
  find(Direction::input, input);
  find(Direction::output, output);
  if (input == nullptr && output == nullptr) throw UnknownSignal(*unknown);
  return {session, input, output};
}

BoardSignal signalOf(const std::shared_ptr<Session>& session, const py::str& name,
                     const std::string& direction) {
  if (direction == "input") return {session, &session->names().find(name, Direction::input), nullptr};
  if (direction == "output") return {session, nullptr, &session->names().find(name, Direction::output)};
  return signalNamed(session, name);
}

Drive driveOf(Session& session, py::handle name, py::handle what) {
  const Signal& signal = session.names().find(name, Direction::output).signal;
  if (py::isinstance<Pulse>(what)) return {signal.name, py::cast<Pulse>(what)};
  if (!py::isinstance<py::tuple>(what)) return {signal.name, valueFrom(what, signal)};
  Train train;
  for (const py::handle each : py::reinterpret_borrow<py::tuple>(what))
    train.values.push_back(valueFrom(each, signal));
  return {signal.name, std::move(train)};
}

void write(Session& session, const py::dict& values) {
  std::vector<Drive> drives;
  drives.reserve(values.size());
  for (const auto& [name, what] : values) drives.push_back(driveOf(session, name, what));
  session.run([&](Board& board) { return board.write(drives), true; });
}

Condition conditionOf(Session& session, const py::object& condition) {
  if (!py::isinstance<py::str>(condition)) return conditionFrom(condition, session.sharedNames());
  return Condition::parse(py::cast<std::string>(condition), session.names().table());
}

BoardFrame waitFor(Session& session, const py::object& condition, std::optional<double> timeout) {
  const Condition wanted = conditionOf(session, condition);
  const auto longest = std::chrono::nanoseconds::max();
  const bool isBounded = timeout && *timeout * 1e9 < static_cast<double>(longest.count());
  const auto time = isBounded ? std::chrono::nanoseconds(std::llround(*timeout * 1e9)) : longest;
  return {session.sharedNames(), session.run([&](Board& board) { return board.waitFor(wanted, time); })};
}

BoardFrame frameOf(Session& session, bool takesActivity) {
  const std::shared_ptr<Names> names = session.sharedNames();
  const std::shared_ptr<const SignalTable> table(names, &names->table());
  return {names, session.run([&](Board& board) {
            return Frame(table, takesActivity ? session.look(board) : session.peek(board));
          })};
}

// Name, whether it is an input, and the core, of each signal of the file, or of all.
py::list signalsOf(Session& session, bool all) {
  const SignalTable& table = session.names().table();
  py::list list;
  const std::size_t count = all || table.fileSignals() == 0 ? table.signals().size() : table.fileSignals();
  for (std::size_t i = 0; i < count; ++i) {
    const Signal& each = table.signals()[i];
    list.append(py::make_tuple(each.name, isInput(each.port), refText(table.cores()[each.core])));
  }
  return list;
}

py::dict coresOf(Session& session) {
  py::dict cores;
  for (std::size_t i = 0; i < session.names().table().cores().size(); ++i) {
    const QORVIO_CORE_INFO info = session.run([&](Board& board) { return board.core(i).info(); });
    py::dict widths;
    for (const Port port : {Port::asyncOut, Port::syncOut, Port::asyncIn, Port::syncIn})
      widths[portName(port)] = widthOf(info, port);
    const auto version = py::make_tuple(info.core_major_version, info.core_minor_version);
    cores[py::str(refText(session.names().table().cores()[i]))] = py::make_tuple(version, widths);
  }
  return cores;
}

void bindSession(py::module_& module) {
  py::class_<Session, std::shared_ptr<Session>>(module, "_Session")
      .def(py::init(
          [](const std::string& url, const std::string& signals, const std::string& core, bool remember) {
            return std::make_shared<Session>(url, nullptr, signals, core, remember ? userStateFolder() : "");
          }))
      .def("close", &Session::close)
      .def_property_readonly("is_closed", &Session::isClosed)
      .def_property_readonly("url", &Session::url)
      .def("signal", signalOf)
      .def("signals", signalsOf)
      .def("cores", coresOf)
      .def("write", write)
      .def("frame", frameOf)
      .def("condition",
           [](Session& self, const std::string& text) {
             return BoardCondition{Condition::parse(text, self.names().table()), self.sharedNames()};
           })
      .def("wait_for", waitFor);
}

void bindPulse(py::module_& module) {
  py::class_<Pulse>(module, "Pulse",
                    "A pulse for `Board.write`: `width` clocks of the design, from clock `at` on.")
      .def(py::init([](unsigned width, unsigned at) {
             return Pulse{width, at};
           }),
           py::arg("width") = 1, py::arg("at") = 0);
}

}  // namespace
}  // namespace qor::python

PYBIND11_MODULE(_qorvio, module) {
  using namespace qor::python;
  py::register_exception_translator(translate);
  bindSession(module);
  bindConditions(module);
  bindSignals(module);
  bindFrames(module);
  bindWatches(module);
  bindSamplings(module);
  bindPulse(module);
  bindSimBoards(module);
}
