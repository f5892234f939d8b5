// Calls with any arguments, on a simulated core whose outputs loop back. Input: the widths of its asynchronous and its
// synchronous ports, then a call per line, words separated by blanks:
//   d TYPE NAME BIT...         defines a name
//   u TYPE NAME                removes a name
//   w KEY=TEXT...              writes values by name
//   a NAME SAMPLES SIZE BURST  writes SAMPLES values of a name from SIZE bytes
// A call that fails reports it once and sends nothing. What was read can be written again and changes nothing.
#include <sstream>

#include "QorJtag_Host.h"
#include "QorVIO.h"
#include "QorVIO_Core.h"
#include "Sim.h"
#include "tests/fuzz/Fuzz.h"

namespace {

using Bytes = std::vector<unsigned char>;
using TextMap = QorRT::hash_map<std::string, std::string>;

constexpr QOR_CORE_REF ref{0, 1, 0};

class Run {
 public:
  Run(unsigned async, unsigned sync) : async_(async), sync_(sync) {
    auto core = qorsim::vio().asyncOut(async).asyncIn(async).syncOut(sync).syncIn(sync);
    auto cable = qorsim::chain().device().core(1, 0, core.design(qorsim::loopback())).cable();
    board_ = cable.get();
    session_ = QorJtag_session_openCable(std::move(cable));
    QorJtag_session_setMessageHandler(session_, [this](unsigned, const char*) { ++messages_; });
    require(QorVIO_initCore(session_, ref) == 0, "a core");
  }
  ~Run() { QorJtag_session_close(session_); }
  Run(const Run&) = delete;
  Run& operator=(const Run&) = delete;

  void call(const std::string& line) {
    std::istringstream words(line);
    char letter = 0;
    words >> letter;
    const std::size_t sent = board_->exchanges();
    messages_ = 0;
    const bool done = isDone(letter, words);
    require(messages_ == (done ? 0 : 1), "one message for a failure: " + line);
    require(done || board_->exchanges() == sent, "nothing is sent by a failure: " + line);
    if (done && (letter == 'w' || letter == 'a')) checkRoundTrip(line);
  }

 private:
  bool isDone(char letter, std::istream& words) {
    if (letter == 'd') return define(words);
    if (letter == 'u') return undefine(words);
    if (letter == 'w') return write(words);
    return letter != 'a' || writeSamples(words);
  }

  template <class Value>
  static Value next(std::istream& words) {
    Value value{};
    words >> value;
    return value;
  }

  bool define(std::istream& words) {
    const auto type = next<unsigned>(words);
    const auto name = next<std::string>(words);
    std::vector<unsigned> bits;
    for (unsigned bit = 0; words >> bit;) bits.push_back(bit);
    return QorVIO_defineBus(session_, ref, name.c_str(), type, bits.data(),
                            static_cast<unsigned>(bits.size())) == 0;
  }

  bool undefine(std::istream& words) {
    const auto type = next<unsigned>(words);
    return QorVIO_undefineName(session_, ref, next<std::string>(words).c_str(), type) == 0;
  }

  bool write(std::istream& words) {
    TextMap map, *pointer = &map;
    for (std::string word; words >> word;) {
      const std::size_t end = word.find('=');
      map[word.substr(0, end)] = end == word.npos ? "" : word.substr(end + 1);
    }
    return QorVIO_writeValues(session_, ref, &pointer) == 0;
  }

  bool writeSamples(std::istream& words) {
    auto* core = dynamic_cast<QorRT::QorVIO_Core*>(QorRT::Qor_CoreList::getCore(session_, ref));
    const auto name = next<std::string>(words);
    const auto samples = next<unsigned>(words);
    unsigned size = next<unsigned>(words) % 100;
    const Bytes bytes(size + 1, 0x5A);
    const unsigned char* values = bytes.data();
    const auto burst = next<unsigned>(words);
    const std::string wrong =
        thrownBy([&] { core->writeValues(session_, ref, {name}, &values, &size, 1, samples, burst); });
    messages_ = wrong.empty() ? 0 : 1;
    return wrong.empty();
  }

  /// The values of both ports.
  Bytes pins() {
    Bytes bytes(2 * 9);
    QorVIO_getPortBits(session_, ref, bytes.data(), nullptr, nullptr, async_, bytes.data() + 9, nullptr,
                       nullptr, nullptr, nullptr, sync_);
    return bytes;
  }

  /// Writes to whole ports what was read, as texts.
  void checkRoundTrip(const std::string& line) {
    const Bytes before = pins();
    TextMap map, *pointer = &map;
    require(QorVIO_readValues(session_, ref, &pointer) == 0, "a read");
    TextMap back;
    for (const char* port : {"async", "sync"})
      if (const auto value = map.find(port + std::string("_in_data")); value != map.end())
        back[port + std::string("_out_data")] = value->second;
    pointer = &back;
    if (QorVIO_writeValues(session_, ref, &pointer) == 0) require(pins() == before, "a round trip: " + line);
  }

  unsigned async_, sync_, session_ = 0;
  const qorsim::SimCable* board_ = nullptr;
  unsigned messages_ = 0;
};

}  // namespace

void fuzz(std::string_view input) {
  const std::vector<std::string> lines = split(input, '\n');
  std::istringstream widths(lines.front());
  unsigned async = 0, sync = 0;
  widths >> async >> sync;
  Run run(async % 70, sync % 70);
  for (std::size_t i = 1; i < lines.size(); ++i) run.call(lines[i]);
}
