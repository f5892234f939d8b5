// Status words of any content, on the recording fakes. Input: the bytes of the word. A VIO core shows, in each way to
// ask, the same widths, and its ports can be transferred whole.
#include <algorithm>

#include "QorVIO.h"
#include "tests/fuzz/Fuzz.h"
#include "tests/unit/fakes/FakePlatform.h"

namespace {

constexpr QOR_CORE_REF ref{0, 1, 0};

void checkWidth(const char* name, unsigned isOutput, unsigned width) {
  unsigned size = 0;
  const bool isThere = QorVIO_getSignalSizes(7, ref, &name, &size, 1, isOutput) == 0;
  require(isThere == (width != 0) && size == width, name);
}

void checkPorts(const QORVIO_CORE_INFO& info) {
  std::vector<unsigned char> bytes(16 * 8192);
  unsigned char *b = bytes.data(), *none = nullptr;
  require(QorVIO_setPortBits(7, ref, b, b, info.async_output_count, b, b, info.sync_output_count) == 0,
          "set");
  const auto get = [&](unsigned async, unsigned sync) {
    return QorVIO_getPortBits(7, ref, b, none, none, async, b, none, none, none, b, sync) == 0;
  };
  require(get(info.async_input_count, info.sync_input_count), "get");
  require(!get(info.async_input_count + 1, 0) && !get(0, info.sync_input_count + 1), "get beyond the port");
}

}  // namespace

void fuzz(std::string_view input) {
  fake::reset();
  fake::Platform& platform = fake::platform();
  platform.word.assign(input.begin(),
                       input.begin() + static_cast<std::ptrdiff_t>(std::min<std::size_t>(input.size(), 154)));
  platform.word.resize(154);
  const auto& word = platform.word;
  platform.info = {word[0], word[1], word[2], word[3], word[4]};
  const bool isVio = word[1] == 9;
  QORVIO_CORE_INFO info{};
  require((QorVIO_getInfo(7, ref, &info) == 0) == isVio && (info.core_type == 9) == isVio, "getInfo");
  require((QorVIO_initCore(7, ref) == 0) == isVio, "initCore");
  if (!isVio) return;
  checkWidth("async_in_data", 0, info.async_input_count);
  checkWidth("sync_in_data", 0, info.sync_input_count);
  checkWidth("async_out_data", 1, info.async_output_count);
  checkWidth("sync_out_data", 1, info.sync_output_count);
  checkPorts(info);
}
