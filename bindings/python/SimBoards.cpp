#include "bindings/python/SimBoards.h"

#include "Sim.h"
#include "bindings/python/Session.h"

namespace qor::python {
namespace {

using qorsim::Ports;

// The ports of a core in one design clock; afterwards there are none.
class ClockPorts {
 public:
  explicit ClockPorts(Ports& ports) : ports_(&ports) {}

  void end() { ports_ = nullptr; }

  Ports& ports() const {
    if (ports_ == nullptr) throw WrongUse("the ports of a design can be used in its own clock only");
    return *ports_;
  }

 private:
  Ports* ports_;
};

template <class Bits>
py::object numberOf(const Bits& bits) {
  Bytes bytes((bits.size() + 7) / 8);
  for (unsigned i = 0; i < bits.size(); ++i) setBit(bytes, i, bits[i]);
  return py::reinterpret_steal<py::object>(_PyLong_FromByteArray(bytes.data(), bytes.size(), 1, 0));
}

// The low bits of the number, of a negative one too.
void setNumber(const qorsim::PortBits<unsigned char>& bits, const py::int_& number) {
  const py::int_ low = number & ((py::int_(1) << py::int_(bits.size())) - py::int_(1));
  Bytes bytes((bits.size() + 7) / 8);
  if (_PyLong_AsByteArray(reinterpret_cast<PyLongObject*>(low.ptr()), bytes.data(), bytes.size(), 1, 0) != 0)
    throw py::error_already_set();
  for (unsigned i = 0; i < bits.size(); ++i) bits[i] = static_cast<unsigned char>(bitAt(bytes, i));
}

// A callable, called and destroyed with the GIL wherever the engine does so. What it raises comes out of the call of the
// board that ran the clock.
class PythonClock {
 public:
  explicit PythonClock(py::object callable)
      : callable_(new py::object(std::move(callable)), [](py::object* each) {
          const py::gil_scoped_acquire acquired;
          delete each;
        }) {}

  void operator()(Ports& ports) const {
    const py::gil_scoped_acquire acquired;
    auto clock = std::make_shared<ClockPorts>(ports);
    try {
      (*callable_)(clock);
    } catch (py::error_already_set& raised) {
      clock->end();
      keepRaised(std::move(raised));
      throw std::runtime_error("the design has raised an exception");
    }
    clock->end();
  }

 private:
  std::shared_ptr<py::object> callable_;
};

std::shared_ptr<qorsim::Design> designOf(const py::object& design) {
  if (py::isinstance<py::str>(design)) {
    const auto name = py::cast<std::string>(design);
    if (name == "loopback") return qorsim::loopback();
    if (name == "counter") return qorsim::counter();
    if (name == "toggle") return qorsim::toggle();
    if (name == "idle") return qorsim::idle();
    throw WrongUse("no design of that name, there are loopback, counter, toggle and idle: " + name);
  }
  if (PyCallable_Check(design.ptr()) == 0)
    throw py::type_error("a design is a name or is called once a design clock, not: " +
                         py::cast<std::string>(py::repr(design)));
  return qorsim::callback(PythonClock(design));
}

void addCore(qorsim::ChainBuilder& board, unsigned userChain, unsigned index, unsigned asyncOut,
             unsigned syncOut, unsigned asyncIn, unsigned syncIn, const py::object& design) {
  qorsim::CoreSpec core = qorsim::vio();
  core.asyncOut(asyncOut).syncOut(syncOut).asyncIn(asyncIn).syncIn(syncIn).design(designOf(design));
  board.core(userChain, index, core);
}

void bindPorts(py::module_& module) {
  py::class_<ClockPorts, std::shared_ptr<ClockPorts>>(module, "Ports",
                                                      R"(The ports of a core in one clock of its design.

Numbers of the width of each port; of what is set the low bits count. Outputs go to the design, inputs come from it and
keep their values until it changes them.)")
      .def_property_readonly("async_out",
                             [](const ClockPorts& self) { return numberOf(self.ports().asyncOut); })
      .def_property_readonly("sync_out",
                             [](const ClockPorts& self) { return numberOf(self.ports().syncOut); })
      .def_property(
          "async_in", [](const ClockPorts& self) { return numberOf(self.ports().asyncIn); },
          [](const ClockPorts& self, const py::int_& number) { setNumber(self.ports().asyncIn, number); })
      .def_property(
          "sync_in", [](const ClockPorts& self) { return numberOf(self.ports().syncIn); },
          [](const ClockPorts& self, const py::int_& number) { setNumber(self.ports().syncIn, number); })
      .def(
          "glitch_async_in", [](const ClockPorts& self, std::size_t bit) { self.ports().glitchAsyncIn(bit); },
          py::arg("bit"), "A pulse on an input that is over before the design clock samples it.")
      .def(
          "glitch_sync_in", [](const ClockPorts& self, std::size_t bit) { self.ports().glitchSyncIn(bit); },
          py::arg("bit"), "A pulse on an input that is over before the design clock samples it.");
}

}  // namespace

void bindSimBoards(py::module_& module) {
  bindPorts(module);
  py::class_<qorsim::ChainBuilder>(module, "_Chain")
      .def(py::init(&qorsim::chain))
      .def("device", [](qorsim::ChainBuilder& self, unsigned idcode, const std::string& name,
                        unsigned irLength) { self.device(idcode).irLength(irLength).named(name); })
      .def("tcks_per_clock", [](qorsim::ChainBuilder& self, unsigned tcks) { self.tcksPerClock(tcks); })
      .def("core", addCore)
      .def("open", [](const qorsim::ChainBuilder& self, const std::string& signals, const std::string& core) {
        return std::make_shared<Session>("sim:", self.cable(), signals, core, "");
      });
}

}  // namespace qor::python
