#include "bindings/python/Samplings.h"

#include <pybind11/stl.h>

#include <cmath>
#include <memory>

#include "bindings/python/Frames.h"
#include "board/record/Recording.h"

namespace qor::python {
namespace {

// What was recorded, with what files of it need to know.
struct Sampling {
  Samples samples;
  std::vector<Signal> inputs;
  std::vector<QOR_CORE_REF> cores;
};

// The polls of a sampling, as if they were being recorded.
class Replay {
 public:
  Replay(const Samples& samples, const std::vector<Signal>& inputs)
      : samples_(samples), values_(inputs.size()), moved_(inputs.size()) {}

  Poll poll(std::size_t number) {
    changed_.clear();
    movedOtherwise_.clear();
    for (std::size_t i = 0; i < values_.size(); ++i) take(i, number);
    return {static_cast<std::uint64_t>(samples_.nanoseconds[number]),
            samples_.missed[number],
            values_,
            changed_,
            moved_,
            movedOtherwise_};
  }

 private:
  void take(std::size_t i, std::size_t number) {
    const SampledInput& input = samples_.inputs[i];
    const auto first = input.values.begin() + static_cast<std::ptrdiff_t>(number * input.bytesEach);
    const Bytes value(first, first + static_cast<std::ptrdiff_t>(input.bytesEach));
    const unsigned char moved = input.moves[number];
    if (number == 0 || value != values_[i]) changed_.push_back(i);
    if (number == 0 || moved != moved_[i]) movedOtherwise_.push_back(i);
    values_[i] = value;
    moved_[i] = moved;
  }

  const Samples& samples_;
  std::vector<Bytes> values_;
  std::vector<unsigned char> moved_;
  std::vector<std::size_t> changed_, movedOtherwise_;
};

// A row of bytes of a sampling, which it keeps alive; for numpy.
struct Column {
  std::shared_ptr<const Sampling> sampling;
  const void* first;
  std::size_t size;
};

template <class Element>
Column columnOf(const std::shared_ptr<const Sampling>& sampling, const std::vector<Element>& elements) {
  return {sampling, elements.data(), elements.size() * sizeof(Element)};
}

py::buffer_info bufferOf(Column& column) {
  return {const_cast<void*>(column.first),
          1,
          py::format_descriptor<unsigned char>::format(),
          1,
          {column.size},
          {1},
          true};
}

std::shared_ptr<Sampling> sample(Session& session, const py::sequence& named, std::uint64_t count,
                                 double seconds, double period) {
  const auto nanoseconds = [](double time) { return std::chrono::nanoseconds(std::llround(time * 1e9)); };
  const Limits limits{count, nanoseconds(seconds), nanoseconds(period)};
  auto sampling = std::make_shared<Sampling>();
  for (const py::handle each : named)
    sampling->inputs.push_back(session.names().find(each, Direction::input).signal);
  if (sampling->inputs.empty()) sampling->inputs = session.names().table().select({}, Direction::input);
  return session.run([&](Board& board) {
    sampling->cores = board.poller().cores();
    sampling->samples = recordToArrays(board.poller(), sampling->inputs, limits, board.stop());
    return sampling;
  });
}

// Of frames, one a poll, at those seconds.
std::shared_ptr<Sampling> samplingOf(Session& session, const std::vector<double>& times,
                                     const py::list& frames) {
  auto sampling = std::make_shared<Sampling>();
  sampling->inputs = session.names().table().select({}, Direction::input);
  sampling->cores = session.names().table().cores();
  for (const Signal& each : sampling->inputs)
    sampling->samples.inputs.push_back({byteCount(each.width()), {}, {}});
  for (const double each : times) sampling->samples.nanoseconds.push_back(std::llround(each * 1e9));
  sampling->samples.missed.resize(times.size());
  for (const py::handle frame : frames) {
    for (std::size_t i = 0; i < sampling->inputs.size(); ++i) {
      const Reading reading = py::cast<BoardFrame&>(frame).frame[sampling->inputs[i]];
      Bytes& values = sampling->samples.inputs[i].values;
      values.insert(values.end(), reading.bits().begin(), reading.bits().end());
      sampling->samples.inputs[i].moves.push_back(
          static_cast<unsigned char>((reading.rose() ? 1 : 0) + (reading.fell() ? 2 : 0)));
    }
  }
  return sampling;
}

void save(const Sampling& self, const std::string& path) {
  const py::gil_scoped_release released;
  const std::unique_ptr<SampleWriter> writer = sampleWriter(path);
  Replay replay(self.samples, self.inputs);
  writer->begin({self.inputs, self.cores, {}});
  for (std::size_t i = 0; i < self.samples.nanoseconds.size(); ++i) writer->add(replay.poll(i));
  writer->end();
}

}  // namespace

void bindSamplings(py::module_& module) {
  py::class_<Column>(module, "_Column", py::buffer_protocol()).def_buffer(bufferOf);
  py::class_<Sampling, std::shared_ptr<Sampling>>(module, "_Sampling")
      .def(py::init(&sample))
      .def_static("of_frames", samplingOf)
      .def("nanoseconds",
           [](const std::shared_ptr<Sampling>& self) { return columnOf(self, self->samples.nanoseconds); })
      .def("missed",
           [](const std::shared_ptr<Sampling>& self) { return columnOf(self, self->samples.missed); })
      .def("values", [](const std::shared_ptr<Sampling>& self,
                        std::size_t input) { return columnOf(self, self->samples.inputs.at(input).values); })
      .def("moves", [](const std::shared_ptr<Sampling>& self,
                       std::size_t input) { return columnOf(self, self->samples.inputs.at(input).moves); })
      .def("names",
           [](const Sampling& self) {
             py::list names;
             for (const Signal& each : self.inputs) names.append(each.name);
             return names;
           })
      .def("is_signed", [](const Sampling& self,
                           std::size_t input) { return self.inputs.at(input).radix == Radix::signedDec; })
      .def("bytes_each",
           [](const Sampling& self, std::size_t input) { return self.samples.inputs.at(input).bytesEach; })
      .def("save", save);
}

}  // namespace qor::python
