// Value change dumps: one variable per signal; one "moved" bit per signal, for activity between polls; a count of missed
// polls, unknown (x) from the poll before them to the poll after.
#include <algorithm>

#include "board/model/CoreAddress.h"
#include "board/model/Value.h"
#include "board/record/OutputFile.h"
#include "board/record/Writers.h"

namespace qor {

// Viewers take brackets for bits of a vector, and dots for scopes.
std::string vcdName(std::string name) {
  for (char& letter : name)
    if (letter == '.' || letter == '[' || letter == ']' || letter == ':' || letter == '/') letter = '_';
  return name;
}

std::string vcdScope(QOR_CORE_REF core) {
  return "core_" + vcdName(refText(core));
}

namespace {

class VcdWriter : public SampleWriter {
 public:
  explicit VcdWriter(const std::string& path) : file_(path) {}

  // A scope for each core with signals; what is of the recording is in the last one.
  void begin(const Heading& heading) override {
    signals_ = heading.signals;
    isTriggered_ = !heading.when.empty();
    hasMoved_.resize(signals_.size());
    for (std::size_t i = 0; i <= triggerNumber(); ++i) ids_.push_back(idOf(i));
    file_.text() += "$version qorvio $end\n$timescale 1 ns $end\n";
    if (isTriggered_) file_.text() += "$comment trigger: " + commentText(heading.when) + " $end\n";
    for (std::size_t core = 0; core < heading.cores.size(); ++core) scope(core, heading.cores[core]);
    file_.text() += "$enddefinitions $end\n";
  }

  void add(const Poll& poll) override {
    if (poll.missed != 0 && !isFirst_ && poll.nanoseconds > last_ + 1) missing();
    const std::size_t before = file_.text().size();
    file_.text() += '#';
    file_.text() += std::to_string(poll.nanoseconds);
    file_.text() += '\n';
    const std::size_t stamped = file_.text().size();
    for (std::size_t i : poll.changed) value(i, poll.values[i]);
    for (std::size_t i : isFirst_ ? poll.changed : poll.movedOtherwise) moved(i, (poll.moved[i] & 3) != 0);
    if (isFirst_ || poll.missed != 0) missed(poll.missed);
    if (isTriggered_ && (isFirst_ || poll.isTrigger != wasTrigger_)) bit(triggerNumber(), poll.isTrigger);
    wasTrigger_ = poll.isTrigger;
    isFirst_ = false;
    last_ = poll.nanoseconds;
    // A poll that shows nothing new needs no time stamp; the last one gets its own at the end.
    if (file_.text().size() == stamped) file_.text().resize(before);
    file_.spill(poll.nanoseconds);
  }

  void addMissed(std::uint64_t nanoseconds, std::uint64_t count) override {
    if (!isFirst_ && nanoseconds > last_ + 1) missing();
    file_.text() += '#' + std::to_string(nanoseconds) + '\n';
    missed(count);
    last_ = nanoseconds;
  }

  void end() override {
    file_.text() += "#" + std::to_string(last_ + 1) + "\n";
    file_.close();
  }

 private:
  std::size_t triggerNumber() const { return 2 * signals_.size() + 1; }

  // No $end of its own.
  static std::string commentText(std::string text) {
    std::replace(text.begin(), text.end(), '$', '_');
    return text;
  }

  static std::string idOf(std::size_t number) {
    std::string id;
    do {
      id += static_cast<char>('!' + number % 94);
      number /= 94;
    } while (number-- != 0);
    return id;
  }

  void scope(std::size_t core, QOR_CORE_REF ref) {
    const bool isLast = core == lastCore();
    const bool isUsed =
        std::any_of(signals_.begin(), signals_.end(), [&](const Signal& each) { return each.core == core; });
    if (!isUsed && !isLast) return;
    file_.text() += "$scope module " + vcdScope(ref) + " $end\n";
    for (std::size_t i = 0; i < signals_.size(); ++i)
      if (signals_[i].core == core) variable(signals_[i].width(), 2 * i, signals_[i].name);
    for (std::size_t i = 0; i < signals_.size(); ++i)
      if (signals_[i].core == core) variable(1, 2 * i + 1, signals_[i].name + "_moved");
    if (isLast) variable(32, 2 * signals_.size(), "missed_polls");
    if (isLast && isTriggered_) variable(1, triggerNumber(), "trigger");
    file_.text() += "$upscope $end\n";
  }

  std::size_t lastCore() const {
    std::size_t last = 0;
    for (const Signal& each : signals_) last = std::max(last, each.core);
    return last;
  }

  void variable(unsigned width, std::size_t number, const std::string& name) {
    file_.text() +=
        "$var wire " + std::to_string(width) + ' ' + ids_[number] + ' ' + vcdName(name) + " $end\n";
  }

  void endValue(std::size_t number) { (file_.text() += ids_[number]) += '\n'; }

  void value(std::size_t i, const Bytes& value) {
    std::string& text = file_.text();
    if (signals_[i].width() == 1) {
      text += static_cast<char>('0' + value[0]);
    } else {
      text += 'b';
      appendDigits(text, value, signals_[i].width(), Radix::bin);
      text += ' ';
    }
    endValue(2 * i);
  }

  void moved(std::size_t i, bool isMoved) {
    if (!isFirst_ && isMoved == hasMoved_[i]) return;
    hasMoved_[i] = isMoved;
    bit(2 * i + 1, isMoved);
  }

  void bit(std::size_t number, bool value) {
    file_.text() += value ? '1' : '0';
    endValue(number);
  }

  void missing() {
    file_.text() += '#' + std::to_string(last_ + 1) + "\nbx ";
    endValue(2 * signals_.size());
  }

  void missed(std::uint64_t count) {
    missed_ += count;
    file_.text() += 'b';
    for (unsigned bit = 32; bit-- > 0;) file_.text() += static_cast<char>('0' + (missed_ >> bit & 1));
    file_.text() += ' ';
    endValue(2 * signals_.size());
  }

  OutputFile file_;
  std::vector<Signal> signals_;
  std::vector<std::string> ids_;
  std::uint64_t missed_ = 0;
  std::uint64_t last_ = 0;
  bool isFirst_ = true, isTriggered_ = false, wasTrigger_ = false;
  std::vector<bool> hasMoved_;
};

}  // namespace

std::unique_ptr<SampleWriter> vcdWriter(const std::string& path) {
  return std::make_unique<VcdWriter>(path);
}

}  // namespace qor
