// Value change dumps: one variable a signal; one "moved" bit a signal, for activity between polls; a count of missed
// polls.
#include "SampleWriter.h"

namespace tool {
namespace {

// Viewers take brackets for bits of a vector, and dots for scopes.
std::string vcdName(std::string name) {
  for (char& letter : name)
    if (letter == '.' || letter == '[' || letter == ']' || letter == ':') letter = '_';
  return name;
}

class VcdWriter : public SampleWriter {
 public:
  explicit VcdWriter(const std::string& path) : file_(path) {}

  void begin(const std::vector<Signal>& signals, const std::string& core) override {
    signals_ = signals;
    shownMoved_.assign(signals.size(), false);
    std::string& text = file_.text();
    text += "$version qorvio $end\n$timescale 1 ns $end\n$scope module core_" + vcdName(core) + " $end\n";
    for (std::size_t i = 0; i < signals.size(); ++i) variable(signals[i].width(), 2 * i, signals[i].name);
    for (std::size_t i = 0; i < signals.size(); ++i) variable(1, 2 * i + 1, signals[i].name + "_moved");
    variable(32, 2 * signals.size(), "missed_polls");
    text += "$upscope $end\n$enddefinitions $end\n";
  }

  void add(const Poll& poll) override {
    const std::size_t before = file_.text().size();
    file_.text() += '#';
    file_.text() += std::to_string(poll.nanoseconds);
    file_.text() += '\n';
    const std::size_t stamped = file_.text().size();
    for (std::size_t i : poll.changed) value(i, poll.values[i]);
    for (std::size_t i = 0; i < signals_.size(); ++i)
      if (isFirst_ || poll.moved[i] != shownMoved_[i]) moved(i, poll.moved[i]);
    if (isFirst_ || poll.missed != 0) missed(poll.missed);
    isFirst_ = false;
    last_ = poll.nanoseconds;
    // A poll that shows nothing new needs no time stamp; the last one gets its own at the end.
    if (file_.text().size() == stamped) file_.text().resize(before);
    file_.spill();
  }

  void end() override {
    file_.text() += "#" + std::to_string(last_ + 1) + "\n";
    file_.close();
  }

 private:
  static void appendId(std::string& text, std::size_t number) {
    do {
      text += static_cast<char>('!' + number % 94);
      number /= 94;
    } while (number-- != 0);
  }

  void variable(unsigned width, std::size_t number, const std::string& name) {
    std::string& text = file_.text();
    text += "$var wire " + std::to_string(width) + ' ';
    appendId(text, number);
    text += ' ' + vcdName(name) + " $end\n";
  }

  void value(std::size_t i, const Bytes& value) {
    std::string& text = file_.text();
    const bool isScalar = signals_[i].width() == 1;
    if (!isScalar) text += 'b';
    appendDigits(text, value, signals_[i].width(), Radix::bin);
    if (!isScalar) text += ' ';
    appendId(text, 2 * i);
    text += '\n';
  }

  void moved(std::size_t i, bool isMoved) {
    file_.text() += isMoved ? '1' : '0';
    appendId(file_.text(), 2 * i + 1);
    file_.text() += '\n';
    shownMoved_[i] = isMoved;
  }

  void missed(std::uint64_t count) {
    missed_ += count;
    file_.text() += 'b';
    for (unsigned bit = 32; bit-- > 0;) file_.text() += static_cast<char>('0' + (missed_ >> bit & 1));
    file_.text() += ' ';
    appendId(file_.text(), 2 * signals_.size());
    file_.text() += '\n';
  }

  OutputFile file_;
  std::vector<Signal> signals_;
  std::vector<bool> shownMoved_;
  std::uint64_t missed_ = 0;
  std::uint64_t last_ = 0;
  bool isFirst_ = true;
};

}  // namespace

std::unique_ptr<SampleWriter> vcdWriter(const std::string& path) {
  return std::make_unique<VcdWriter>(path);
}

}  // namespace tool
