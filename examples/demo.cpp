// A guided demo of the main job: what is on the board, names for bits, values out and in, a pulse train,
// whole ports, samples, and a mistake. Ends with a nonzero status if any value is not what it should be.
//
//     demo [URL]        the demo board at that cable; the simulated one when it is left out
#include <cstdio>
#include <exception>
#include <string>
#include <vector>

#include "QorJtag_Host.h"
#include "QorVIO.h"
#include "QorVIO_Core.h"

namespace {

using TextMap = QorRT::hash_map<std::string, std::string>;

enum PortType : unsigned { syncOutput, syncInput, asyncOutput, asyncInput };

constexpr QOR_CORE_REF loopbackCore{0, 1, 0};
constexpr QOR_CORE_REF counterCore{1, 1, 0};

int surprises = 0;

void expect(const std::string& what, const std::string& got, const std::string& wanted) {
  bool right = got == wanted;
  std::printf("   %-38s %s%s\n", what.c_str(), got.c_str(), right ? "" : ("   EXPECTED " + wanted).c_str());
  if (!right) ++surprises;
}

void mustSucceed(unsigned code) {
  if (code != 0) ++surprises;
}

void define(unsigned session, const char* name, PortType type, const std::vector<unsigned>& bits) {
  const char* const ports[] = {"synchronous output", "synchronous input", "asynchronous output",
                               "asynchronous input"};
  mustSucceed(
      QorVIO_defineBus(session, loopbackCore, name, type, bits.data(), static_cast<unsigned>(bits.size())));
  std::printf("   %-8s = %zu bit%s of the %s port, from bit %u\n", name, bits.size(),
              bits.size() == 1 ? "" : "s", ports[type], bits.front());
}

unsigned write(unsigned session, TextMap values) {
  TextMap* map = &values;
  return QorVIO_writeValues(session, loopbackCore, &map);
}

TextMap read(unsigned session) {
  TextMap values;
  TextMap* map = &values;
  mustSucceed(QorVIO_readValues(session, loopbackCore, &map));
  return values;
}

void showChain(unsigned session) {
  std::printf("1. What is on the chain\n");
  std::vector<QorRT::Qor_Device> devices;
  QorJtag_session_getDevices(session, devices);
  for (unsigned device = 0; device < devices.size(); ++device) {
    std::printf("   device %u: %-8s IDCODE %08X, IR of %u bits\n", device, devices[device].name.c_str(),
                devices[device].idcode, devices[device].irLength);
  }
  for (QOR_CORE_REF core : {loopbackCore, QOR_CORE_REF{0, 1, 1}, counterCore}) {
    unsigned isVio = 0;
    mustSucceed(QorVIO_isVIOCore(session, core, &isVio));
    std::printf("   device %u, user chain %u, core %u: %s\n", core.device_index, core.user_chain_number,
                core.core_index, isVio != 0 ? "a VIO core" : "a core of another type");
  }
}

void showInformation(unsigned session) {
  std::printf("\n2. What the first core says of itself\n");
  TextMap fields;
  TextMap* map = &fields;
  mustSucceed(QorVIO_getCoreInfo(session, loopbackCore, &map));
  for (const char* key : {"manufacturer_id", "core_type", "core_major_version", "core_minor_version",
                          "core_revision", "cg_major_version", "cg_minor_version", "cg_minor_version_alpha",
                          "async_input_count", "sync_input_count", "async_output_count", "sync_output_count"})
    std::printf("   %-24s %s\n", key, fields[key].c_str());
  expect("ports, in all",
         fields["async_input_count"] + fields["sync_input_count"] + fields["async_output_count"] +
             fields["sync_output_count"],
         "8888");
}

void nameSignals(unsigned session) {
  std::printf(
      "\n3. Names for its bits; its design loops every output back to the input of the same "
      "number\n");
  mustSucceed(QorVIO_initCore(session, loopbackCore));
  define(session, "leds", asyncOutput, {0, 1, 2, 3});
  define(session, "leds_in", asyncInput, {0, 1, 2, 3});
  define(session, "strobe", syncOutput, {5});
  define(session, "seen", syncInput, {5});
}

void writeAndReadBack(unsigned session) {
  std::printf("\n4. A bus written, and read back with its activity\n");
  read(session);  // clears the activity so far
  mustSucceed(write(session, {{"leds", "A"}}));
  TextMap first = read(session);
  expect("leds = A, so leds_in is", first["leds_in"], "A");
  expect("bits that rose since the last read", first["leds_in.activity_up"], "A");
  expect("bits that fell", first["leds_in.activity_down"], "0");
  mustSucceed(write(session, {{"leds", "3"}}));
  TextMap second = read(session);
  expect("leds = 3, so leds_in is", second["leds_in"], "3");
  expect("bits that rose", second["leds_in.activity_up"], "1");
  expect("bits that fell", second["leds_in.activity_down"], "8");
}

void playPulseTrain(unsigned session) {
  std::printf("\n5. A pulse train: strobe is 1 at step 3 of 16 alone, for one clock of the design\n");
  mustSucceed(write(session, {{"strobe.pulsetrain", "01000000"}}));
  TextMap values = read(session);
  expect("seen is low again", values["seen"], "0");
  expect("but it rose", values["seen.sync_activity_up"], "1");
  expect("and fell, on the design's clock", values["seen.sync_activity_down"], "1");
  values = read(session);
  expect("nothing since that read", values["seen.sync_activity_up"], "0");
}

void writeWholePort(unsigned session) {
  std::printf("\n6. The whole asynchronous port: 5A, with a mask that lets only the upper half through\n");
  const unsigned char value = 0x5A;
  const unsigned char mask = 0xF0;
  mustSucceed(QorVIO_setPortBits(session, loopbackCore, &value, &mask, 8, nullptr, nullptr, 0));
  expect("the port reads", read(session)["async_in_data"], "53");
}

void readSamples(unsigned session) {
  std::printf("\n7. Four samples of a 16-bit counter in the second device, by array\n");
  mustSucceed(QorVIO_initCore(session, counterCore));
  auto* core = dynamic_cast<QorRT::QorVIO_Core*>(QorRT::Qor_CoreList::getCore(session, counterCore));
  unsigned char bytes[4 * 2] = {};  // two bytes per sample, the lower one first
  unsigned char* values[] = {bytes};
  unsigned sizes[] = {sizeof bytes};
  {
    QorRT::QorJtagTargetLock lock(session, 60000);
    core->readValues(session, counterCore, {"async_in_data"}, values, nullptr, nullptr, nullptr, nullptr,
                     sizes, 1, 4);
  }
  unsigned samples[4];
  for (int i = 0; i < 4; ++i) samples[i] = bytes[2 * i] | static_cast<unsigned>(bytes[2 * i + 1]) << 8;
  std::printf("   the counter read                       %u %u %u %u\n", samples[0], samples[1], samples[2],
              samples[3]);
  for (int i = 1; i < 4; ++i)
    expect("it counted on to the next read", samples[i] != samples[i - 1] ? "yes" : "no", "yes");
}

void makeAMistake(unsigned session) {
  std::printf("\n8. A mistake: writing to a name that was never defined\n");
  std::string message;
  QorJtag_session_setMessageHandler(session, [&](unsigned, const char* text) { message = text; });
  unsigned code = write(session, {{"ledz", "1"}});
  expect("the call returns", code == 0x80000000 ? "80000000" : "something else", "80000000");
  expect("the session says", message, "Could not find a signal with the name: ledz");
  QorJtag_session_setMessageHandler(session, nullptr);
}

// A board at a server is as the last host left it.
void startFromZero(unsigned session) {
  mustSucceed(write(session, {{"async_out_data", "00"}, {"sync_out_data", "00"}}));
  read(session);
}

void runOn(unsigned session) {
  showChain(session);
  showInformation(session);
  nameSignals(session);
  startFromZero(session);
  writeAndReadBack(session);
  playPulseTrain(session);
  writeWholePort(session);
  readSamples(session);
  makeAMistake(session);
}

}  // namespace

int main(int argc, char** argv) {
  unsigned session = 0;
  try {
    session = QorJtag_session_open(argc > 1 ? argv[1] : "sim:");
  } catch (const std::exception& error) {
    std::fprintf(stderr, "demo: %s\n", error.what());
    return 1;
  }
  runOn(session);
  QorJtag_session_close(session);
  std::printf("\n%s\n",
              surprises == 0 ? "Every value was what it should be." : "SOMETHING WAS NOT WHAT IT SHOULD BE.");
  return surprises == 0 ? 0 : 1;
}
