// Status words of any content. Input: hexadecimal digits, the least significant first; any other character
// stands for its low four bits.
#include <memory>

#include "QorJtag_Host.h"
#include "QorVIO.h"
#include "tests/fuzz/Fuzz.h"

namespace {

using Bits = std::vector<bool>;
using TextMap = QorRT::hash_map<std::string, std::string>;

constexpr QOR_CORE_REF ref{0, 1, 0};

void append(Bits& bits, unsigned value, unsigned count) {
  for (unsigned i = 0; i < count; ++i) bits.push_back((value >> i & 1) != 0);
}

unsigned field(const Bits& bits, unsigned offset, unsigned length) {
  unsigned value = 0;
  for (unsigned i = 0; i < length; ++i) value |= (bits[offset + i] ? 1U : 0U) << i;
  return value;
}

/// Answers every scan as a hub whose only core has this status word.
class StatusCable : public QorRT::Qor_Cable {
 public:
  explicit StatusCable(const Bits& word) {
    append(answer_, 0xA000, 16);
    answer_.insert(answer_.end(), word.begin(), word.end());
    unsigned crc = 0xFFFF;
    for (const bool bit : answer_) crc = ((crc ^ (bit ? 1U : 0U)) & 1) != 0 ? crc >> 1 ^ 0x8408 : crc >> 1;
    append(answer_, ~crc ^ 128, 16);
  }
  const std::vector<QorRT::Qor_Device>& devices() const override { return devices_; }

 private:
  void run(std::vector<QorRT::Qor_Scan>& scans) override {
    for (QorRT::Qor_Scan& scan : scans) {
      scan.in.assign(scan.out.size(), 0);
      for (std::size_t i = 0; i < scan.bitCount; ++i)
        if (answer_[i]) scan.in[i / 8] = static_cast<unsigned char>(scan.in[i / 8] | 1U << i % 8);
    }
  }

  Bits answer_;
  std::vector<QorRT::Qor_Device> devices_{{0, "fuzz", 6}};
};

/// The numbers of the word in the order of the record.
std::vector<unsigned> decode(const Bits& word) {
  std::vector<unsigned> numbers;
  for (unsigned i = 0; i < 5; ++i) numbers.push_back(field(word, 8 * i, 8));
  const unsigned version = numbers[2] * 16 | numbers[3];
  const bool isOldest = version < 0x62, isCurrent = version >= 0xA0;
  numbers.push_back(isCurrent ? field(word, 40, 4) : 0);
  numbers.push_back(isCurrent ? field(word, 44, 8) : 0);
  numbers.push_back(isCurrent ? field(word, 52, 8) : 0);
  for (unsigned i = 0; i < 4; ++i)
    numbers.push_back(isOldest ? field(word, 40 + 8 * i, 8)
                               : field(word, (isCurrent ? 60 : 40) + 16 * i, 16));
  return numbers;
}

std::string join(const std::vector<unsigned>& numbers) {
  std::string text;
  for (const unsigned number : numbers) text += std::to_string(number) + ' ';
  return text;
}

std::string shown(const QORVIO_CORE_INFO& i) {
  return join({i.manufacturer_id, i.core_type, i.core_major_version, i.core_minor_version, i.core_revision,
               i.cg_major_version, i.cg_minor_version, i.cg_minor_version_alpha, i.async_input_count,
               i.sync_input_count, i.async_output_count, i.sync_output_count});
}

struct Session {
  explicit Session(const Bits& word)
      : handle(QorJtag_session_openCable(std::make_unique<StatusCable>(word))) {
    QorJtag_session_setMessageHandler(handle, [this](unsigned, const char* text) { told += text; });
  }
  ~Session() { QorJtag_session_close(handle); }

  const unsigned handle;
  std::string told;
};

void checkInformation(Session& session, const std::vector<unsigned>& numbers) {
  const bool isVio = numbers[1] == 9;
  unsigned answer = 2;
  require(QorVIO_isVIOCore(session.handle, ref, &answer) == 0 && answer == (isVio ? 1 : 0),
          "a VIO core or not");
  QORVIO_CORE_INFO info{};
  require((QorVIO_getInfo(session.handle, ref, &info) == 0) == isVio, "getInfo");
  requireEqual(shown(info), join(isVio ? numbers : std::vector<unsigned>(12)));
  TextMap map;
  TextMap* pointer = &map;
  require((QorVIO_getCoreInfo(session.handle, ref, &pointer) == 0) == isVio, "getCoreInfo");
  require(map.size() == (isVio ? 12 : 0), "twelve entries");
  if (isVio) requireEqual(map["sync_output_count"], std::to_string(numbers[11]));
  const std::string wrong =
      "QorVIO_getCoreInfo() for the wrong core type or non-existant core.Qor abort command";
  requireEqual(session.told, isVio ? "" : wrong + wrong);
}

void checkWidth(Session& session, const char* name, unsigned isOutput, bool isVio, unsigned width) {
  unsigned size = 0;
  const bool failed = QorVIO_getSignalSizes(session.handle, ref, &name, &size, 1, isOutput) != 0;
  require(failed == (!isVio || width == 0) && size == (isVio ? width : 0), name);
}

}  // namespace

void fuzz(std::string_view input) {
  Bits word;
  for (const char c : input.substr(0, 32))
    append(word, static_cast<unsigned>(digitValue(c) < 0 ? c : digitValue(c)), 4);
  word.resize(128);
  const std::vector<unsigned> numbers = decode(word);
  const bool isVio = numbers[1] == 9;

  Session session(word);
  checkInformation(session, numbers);
  require((QorVIO_initCore(session.handle, ref) == 0) == isVio, "initCore");
  checkWidth(session, "async_in_data", 0, isVio, numbers[8]);
  checkWidth(session, "sync_in_data", 0, isVio, numbers[9]);
  checkWidth(session, "async_out_data", 1, isVio, numbers[10]);
  checkWidth(session, "sync_out_data", 1, isVio, numbers[11]);
  require(QorVIO_terminateCore(session.handle, ref) == 0, "terminateCore");
}
