// Arrays of values and whole ports, of any sizes. Input: four widths (inputs, outputs; asynchronous first),
// then one operation a line, every number decimal:
//   d TYPE BIT...                  defines the next name: n0, n1, ...
//   w BURST SAMPLES SIZE NAME...   writes arrays; a name by its number
//   r WANTED SAMPLES SIZE NAME...  reads arrays; bit i of WANTED asks for the i-th kind of buffer
//   s GIVEN ASYNC SYNC             writes whole ports; bit i of GIVEN gives the i-th array, then both counts
//   g WANTED ASYNC SYNC            reads whole ports, likewise
#include <functional>
#include <map>
#include <random>
#include <sstream>

#include "QorVIO.h"
#include "QorVIO_Core.h"
#include "tests/fuzz/OutputModel.h"
#include "tests/unit/fakes/FakePlatform.h"

namespace {

using Bytes = std::vector<unsigned char>;

constexpr QOR_CORE_REF ref{0, 1, 0};
constexpr unsigned most = 40;  // samples of a call that is to succeed, and names of a call

bool bitOf(const Bytes& bytes, std::size_t bit) {
  return (bytes[bit / 8] >> bit % 8 & 1) != 0;
}

void setBit(Bytes& bytes, std::size_t bit, bool value) {
  const unsigned mask = 1U << bit % 8;
  bytes[bit / 8] = static_cast<unsigned char>(value ? bytes[bit / 8] | mask : bytes[bit / 8] & ~mask);
}

std::size_t bytesOf(std::size_t bits) {
  return (bits + 7) / 8;
}

class Run {
 public:
  explicit Run(std::istream& widths)
      : asyncIn_(number(widths) % 70),
        syncIn_(number(widths) % 70),
        asyncOut_(number(widths) % 70),
        syncOut_(number(widths) % 70),
        model_(asyncOut_, syncOut_) {
    fake::reset();
    fake::platform().answerAsVioCore(asyncIn_, syncIn_, asyncOut_, syncOut_);
    require(QorVIO_initCore(7, ref) == 0, "a core");
    core_ = dynamic_cast<QorRT::QorVIO_Core*>(QorRT::Qor_CoreList::getCore(7, ref));
    fake::platform().take();
    fake::platform().before["sequence"] = [this] { answer(); };
  }
  ~Run() { fake::reset(); }
  Run(const Run&) = delete;
  Run& operator=(const Run&) = delete;

  void operation(const std::string& line) {
    std::istringstream words(line);
    char letter = 0;
    words >> letter;
    records_.clear();
    expected_.clear();
    if (letter == 'd') define(words);
    if (letter == 'w') write(words);
    if (letter == 'r') read(words);
    if (letter == 's') setPorts(words);
    if (letter == 'g') getPorts(words);
    std::string told;
    for (const std::string& call : fake::platform().take())
      if (call.rfind("sequence ", 0) == 0 || call.rfind("message ", 0) == 0) told += call + "\n";
    requireEqual(told, expected_);
  }

 private:
  static unsigned number(std::istream& words) {
    unsigned value = 0;
    words >> value;
    return value;
  }

  static std::vector<unsigned> rest(std::istream& words) {
    std::vector<unsigned> values;
    for (unsigned value = 0; values.size() < most && words >> value;) values.push_back(value);
    return values;
  }

  Bytes noise(std::size_t count) {
    Bytes bytes(count);
    for (unsigned char& byte : bytes) byte = static_cast<unsigned char>(random_());
    return bytes;
  }

  /// New records for the next read.
  void answer() {
    std::string digits;
    for (unsigned i = 0; i < 4 * asyncIn_ + 6 * syncIn_; ++i) digits += random_() % 2 != 0 ? '1' : '0';
    records_.push_back(digits);
    fake::platform().readDigits = digits;
  }

  /// Of an input: value, activity up and down, clocked activity up and down.
  bool recordBit(std::size_t sample, bool isSync, unsigned position, unsigned kind) const {
    return records_[sample][isSync ? 4 * asyncIn_ + 6 * position + kind : 4 * position + kind] == '1';
  }

  void expectRead() {
    const unsigned bits = 4 * asyncIn_ + 6 * syncIn_ + 16;
    if (bits == 16) return;
    expected_ += "sequence 00 1 0 03 1 " + hexText(bits, 8) + " 0\n00 1 0 04 1 00000004 0 -> " +
                 std::to_string(8 * bytesOf(bits) + 8) + "\n";
  }

  void define(std::istream& words) {
    const unsigned type = number(words);
    std::vector<unsigned> bits = rest(words);
    const std::string name = "n" + std::to_string(groups_.size());
    const std::string wrong = thrownBy([&] { core_->defineSignal(name, type, bits); });
    const unsigned widths[] = {syncOut_, syncIn_, asyncOut_, asyncIn_};
    bool good = !bits.empty() && type < 4;
    for (const unsigned bit : bits) good = good && bit < widths[type];
    require(good == wrong.empty(), wrong);
    if (good) groups_.push_back({type % 2 == 1, type < 2, bits});
  }

  /// What is wrong with the i-th name of an array call.
  std::string nameFault(unsigned name, bool isInput, bool isBurst, unsigned size, unsigned samples) const {
    const std::string text = "n" + std::to_string(name);
    if (name >= groups_.size() || groups_[name].isInput != isInput)
      return "Could not find a signal with the name: " + text;
    if (isBurst && !groups_[name].isSync)
      return "Burst mode cannot be used with the non-synchronous output: " + text;
    if (size < 1ULL * groups_[name].bytes() * samples)
      return "The size of the value is not large enough for the signal: " + text;
    return "";
  }

  /// What is wrong with an array call. One that is good has few samples.
  std::string callFault(const std::vector<unsigned>& names, bool isInput, bool isBurst, unsigned size,
                        unsigned& samples) const {
    for (const unsigned name : names)
      if (std::string wrong = nameFault(name, isInput, isBurst, size, samples); !wrong.empty()) return wrong;
    samples %= most;
    return "";
  }

  static std::vector<std::string> textsOf(const std::vector<unsigned>& names) {
    std::vector<std::string> texts;
    texts.reserve(names.size());
    for (const unsigned name : names) texts.push_back("n" + std::to_string(name));
    return texts;
  }

  void write(std::istream& words) {
    const unsigned burst = number(words);
    unsigned samples = number(words), size = number(words);
    const std::vector<unsigned> names = rest(words);
    const std::string fault = callFault(names, false, burst == 1, size, samples);
    std::vector<Bytes> values(names.size(), Bytes(1));  // one byte where nobody is to look
    std::vector<const unsigned char*> pointers(names.size());
    for (unsigned n = 0; n < names.size(); ++n) {
      if (fault.empty() && samples != 0) values[n] = noise(std::size_t{groups_[names[n]].bytes()} * samples);
      pointers[n] = values[n].data();
    }
    std::vector<unsigned> sizes(names.size(), size);
    const auto count = static_cast<unsigned>(names.size());
    requireEqual(thrownBy([&] {
                   core_->writeValues(7, ref, textsOf(names), pointers.data(), sizes.data(), count, samples,
                                      burst);
                 }),
                 fault);
    if (!fault.empty()) return;
    const unsigned chunk = burst == 1 ? 16 : 1;
    for (unsigned first = 0; first < samples; first += chunk) {
      const unsigned last = std::min(first + chunk, samples) - 1;
      model_.clearMasks();
      for (unsigned n = 0; n < count; ++n) {
        const Group& group = groups_[names[n]];
        model_.stage(group, [&](unsigned s, unsigned i) {
          return bitOf(values[n], std::size_t{8} * group.bytes() * std::min(first + s, last) + i);
        });
      }
      expected_ += model_.command();
    }
  }

  void read(std::istream& words) {
    const unsigned wanted = number(words);
    unsigned samples = number(words), size = number(words);
    const std::vector<unsigned> names = rest(words);
    const std::string fault = callFault(names, true, false, size, samples);
    std::vector<Bytes> buffers[5];
    std::vector<unsigned char*> pointers[5];
    unsigned char** arrays[5] = {};
    for (unsigned kind = 0; kind < 5; ++kind) {
      for (const unsigned name : names)
        buffers[kind].emplace_back(fault.empty() ? std::size_t{groups_[name].bytes()} * samples : 0);
      for (Bytes& bytes : buffers[kind]) pointers[kind].push_back(bytes.empty() ? nullptr : bytes.data());
      if ((wanted >> kind & 1) != 0) arrays[kind] = pointers[kind].data();
    }
    std::vector<unsigned> sizes(names.size(), size);
    requireEqual(thrownBy([&] {
                   core_->readValues(7, ref, textsOf(names), arrays[0], arrays[1], arrays[2], arrays[3],
                                     arrays[4], sizes.data(), static_cast<unsigned>(names.size()), samples);
                 }),
                 fault);
    if (!fault.empty()) return;
    for (unsigned sample = 0; sample < samples; ++sample) expectRead();
    for (unsigned kind = 0; kind < 5; ++kind) {
      for (unsigned n = 0; n < names.size(); ++n)
        require(buffers[kind][n] == samplesOf(groups_[names[n]], arrays[kind] == nullptr ? 5 : kind, samples),
                "n" + std::to_string(names[n]) + " of " + std::to_string(kind));
    }
  }

  /// The samples of a group: nothing but zeros of a kind that it does not have.
  Bytes samplesOf(const Group& group, unsigned kind, unsigned samples) const {
    Bytes bytes(std::size_t{group.bytes()} * samples);
    if (kind >= (group.isSync ? 5 : 3)) return bytes;
    for (unsigned sample = 0; sample < samples; ++sample) {
      for (unsigned i = 0; i < group.bits.size(); ++i)
        setBit(bytes, std::size_t{8} * group.bytes() * sample + i,
               recordBit(sample, group.isSync, group.bits[i], kind));
    }
    return bytes;
  }

  /// Two counts that do not both fit, as the exported functions tell it.
  std::string countFault(const std::string& function, unsigned async, unsigned asyncWidth, unsigned sync,
                         unsigned syncWidth, const char* direction) const {
    const bool isAsync = async != 0 && async != asyncWidth;
    if (!isAsync && (sync == 0 || sync == syncWidth)) return "";
    const std::string upper = direction == std::string("In") ? "INPUT" : "OUTPUT";
    const std::string count = (isAsync ? "async" : "sync") + std::string(direction) + "DataBitCount";
    return function + "() arg. failed:(" + count +
           " == core->getCorePhysicalSignalCount(Qor_SignalBase::SIGNAL_TYPE_VIO_" + (isAsync ? "A" : "") +
           "SYNC_" + upper + ")) || (" + count + " == 0)";
  }

  void expectMessage(unsigned status, const std::string& fault) {
    require(status == (fault.empty() ? 0 : 0x80000000), fault);
    if (!fault.empty()) expected_ = "message 100 " + fault + "\n";
  }

  void setPorts(std::istream& words) {
    const unsigned given = number(words), async = number(words), sync = number(words);
    const std::size_t planeBytes = bytesOf(syncOut_);
    const Bytes arrays[] = {noise(bytesOf(asyncOut_)), noise(bytesOf(asyncOut_)), noise(16 * planeBytes),
                            noise(planeBytes)};
    const auto array = [&](unsigned i) { return (given >> i & 1) != 0 ? arrays[i].data() : nullptr; };
    const char* const names[] = {"asyncOutValueBits", "asyncOutMaskBits", "syncOutStepBits",
                                 "syncOutMaskBits"};
    std::string fault = countFault("QorVIO_setPortBits", async, asyncOut_, sync, syncOut_, "Out");
    for (unsigned i = 0; i < 4; ++i)
      if (fault.empty() && (i < 2 ? async : sync) != 0 && array(i) == nullptr)
        fault = "QorVIO_setPortBits() arg. failed:" + std::string(names[i]) + "!=0";
    expectMessage(QorVIO_setPortBits(7, ref, array(0), array(1), async, array(2), array(3), sync), fault);
    if (!fault.empty()) return;
    model_.clearMasks();
    for (unsigned i = 0; i < async; ++i) {
      model_.async[i] = bitOf(arrays[0], i) ? '1' : '0';
      model_.asyncMask[i] = bitOf(arrays[1], i) ? '1' : '0';
    }
    for (unsigned i = 0; i < sync; ++i) {
      for (unsigned s = 0; s < 16; ++s)
        model_.trains[i][s] = bitOf(arrays[2], 8 * planeBytes * s + i) ? '1' : '0';
      model_.syncMask[i] = bitOf(arrays[3], i) ? '1' : '0';
    }
    expected_ = model_.command();
  }

  void getPorts(std::istream& words) {
    const unsigned wanted = number(words), async = number(words), sync = number(words);
    Bytes buffers[8], before[8];
    unsigned char* pointers[8] = {};
    for (unsigned i = 0; i < 8; ++i) {
      buffers[i] = before[i] = noise(bytesOf(i < 3 ? asyncIn_ : syncIn_));
      if ((wanted >> i & 1) != 0) pointers[i] = buffers[i].data();
    }
    const std::string fault = countFault("QorVIO_getPortBits", async, asyncIn_, sync, syncIn_, "In");
    expectMessage(QorVIO_getPortBits(7, ref, pointers[0], pointers[1], pointers[2], async, pointers[3],
                                     pointers[4], pointers[5], pointers[6], pointers[7], sync),
                  fault);
    if (fault.empty()) expectRead();
    for (unsigned i = 0; i < 8; ++i) {
      const bool isSync = i >= 3, isDelivered = fault.empty() && pointers[i] != nullptr;
      for (unsigned bit = 0; isDelivered && bit < (isSync ? sync : async); ++bit)
        setBit(before[i], bit, recordBit(0, isSync, bit, isSync ? i - 3 : i));
      require(buffers[i] == before[i], "buffer " + std::to_string(i));
    }
  }

  unsigned asyncIn_, syncIn_, asyncOut_, syncOut_;
  OutputModel model_;
  QorRT::QorVIO_Core* core_ = nullptr;
  std::vector<Group> groups_;
  std::vector<std::string> records_;  // what each read of the operation has brought
  std::string expected_;              // what the operation sends and tells
  std::minstd_rand random_{1};
};

}  // namespace

void fuzz(std::string_view input) {
  const std::vector<std::string> lines = split(input, '\n');
  std::istringstream widths(lines.front());
  Run run(widths);
  for (std::size_t i = 1; i < lines.size(); ++i) run.operation(lines[i]);
}
