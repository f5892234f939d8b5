// Every allocation of every function fails: the call fails whole and is reported once, and the next one works.
#include <cstdio>
#include <map>

#include "tests/fault/AllocationFault.h"
#include "tests/system/Board.h"

namespace {

using qorsim::chain;
using testing::PrintToString;
using Texts = std::map<std::string, std::string>;

constexpr QOR_CORE_REF first{0, 1, 0};
constexpr unsigned width = 20, bytes = 3;  // a port string of more than 15 characters allocates

// Longer than a string holds in place, so that each copy of a name allocates.
const std::string held = "outputs in an order of their own", pulsed = "outputs that carry pulse trains",
                  seen = "inputs in an order of their own", added = "a name that is not there at first";
constexpr unsigned bits[] = {11, 3, 7, 0};

/// A core with names, inputs that moved since the last read and an image that no transfer has used yet; and
/// what a caller passes and gets.
struct Rig {
  Rig() {
    VioCore used(board, first);
    used.write({{"async_out_data", "0F0"}, {"sync_out_data", "F0F"}});
    used.read();
    used.read();  // no flag is left that a repeated read may report twice
    used.write({{"async_out_data", "3C5"}, {"sync_out_data", "A33"}});
    VioCore core(board, first);
    core.define(held, asyncOut, {11, 3, 7, 0});
    core.define(pulsed, syncOut, {3, 2, 1, 0});
    core.define(seen, asyncIn, {11, 3, 7, 0});
    core.define(seen + " too", syncIn, {1, 0});
    for (int i = 0; i < 99; ++i)
      core.define("n" + std::to_string(i), asyncOut, {0});  // the next one rehashes
    QorJtag_session_setMessageHandler(session, [this](unsigned, const char* text) { report(text); });
  }

  void report(const char* text) {
    allocation_fault::disarm();
    messages.emplace_back(text);
  }
  QorRT::QorVIO_Core* core() {
    return dynamic_cast<QorRT::QorVIO_Core*>(QorRT::Qor_CoreList::getCore(session, first));
  }

  /// What the caller got, and what is defined.
  Texts state() {
    Texts all(map.begin(), map.end());
    all["info"] = std::string(reinterpret_cast<const char*>(&info), sizeof info);
    all["isVio"] = std::to_string(isVio);
    for (const unsigned& size : sizes) all["size " + std::to_string(&size - sizes)] = std::to_string(size);
    for (const Bytes& row : rows) all["row " + std::to_string(&row - rows.data())] = PrintToString(row);
    for (const std::string& name : {held, pulsed, seen, seen + " too", added, std::string("async_in_data")}) {
      for (unsigned isOutput : {0U, 1U}) {
        const char* array[] = {name.c_str()};
        unsigned size = 0;
        if (QorVIO_getSignalSizes(session, first, array, &size, 1, isOutput) == 0)
          all[name + (isOutput != 0 ? " (out)" : " (in)")] = std::to_string(size);
      }
    }
    messages.clear();
    return all;
  }

  /// The values of all inputs, and so of all outputs.
  std::string pins() {
    if (core() == nullptr) {
      EXPECT_EQ(QorVIO_initCore(session, first), 0U);
    }
    Bytes async(bytes), sync(bytes);
    EXPECT_EQ(QorVIO_getPortBits(session, first, async.data(), nullptr, nullptr, width, sync.data(), nullptr,
                                 nullptr, nullptr, nullptr, width),
              0U);
    return PrintToString(async) + PrintToString(sync);
  }

  /// Whole ports, written by name into the strings that are there, and then as rows.
  void expectRoundTrips() {
    pins();
    Bytes ups(bytes);  // and no flag is reported for ever
    EXPECT_EQ(QorVIO_getPortBits(session, first, nullptr, ups.data(), nullptr, width, nullptr, nullptr,
                                 nullptr, nullptr, nullptr, 0),
              0U);
    EXPECT_EQ(ups, Bytes(bytes));
    TextMap values{{"async_out_data", "5A3C1"}, {"sync_out_data", "C3A51"}}, *pointer = &values;
    EXPECT_EQ(QorVIO_writeValues(session, first, &pointer), 0U);
    EXPECT_EQ(pins(), PrintToString(Bytes{0xC1, 0xA3, 0x05}) + PrintToString(Bytes{0x51, 0x3A, 0x0C}));
    EXPECT_EQ(QorVIO_setPortBits(session, first, steps.data(), ones.data(), width, steps.data(), ones.data(),
                                 width),
              0U);
    EXPECT_EQ(QorVIO_readValues(session, first, &pointer), 0U);
    EXPECT_EQ(values["async_in_data"] + " " + values["sync_in_data"], "A5A5A A5A5A");
    EXPECT_THAT(messages, testing::IsEmpty());
  }

  qorsim::CoreSpec loop =
      qorsim::vio().asyncOut(width).asyncIn(width).syncOut(width).syncIn(width).design(qorsim::loopback());
  Board board{chain().device(0x11).core(1, 0, loop).device().cable()};
  const unsigned session = board.session;
  std::vector<std::string> messages;
  TextMap map{{"async_in_data", "what was there"}, {"core_type", "what was there"}, {"mine", "stays"}};
  TextMap outputs{{held, "9"}, {pulsed + ".pulsetrain", std::string(32, '5')}, {"sync_out_data", "5A5"}};
  TextMap *in = &map, *out = &outputs;
  const Bytes ones = Bytes(20 * bytes, 0xFF), steps = Bytes(20 * bytes, 0x5A);
  QORVIO_CORE_INFO info{};
  unsigned isVio = 0;
  unsigned sizes[3] = {99, 99, 99};
  std::vector<Bytes> rows = std::vector<Bytes>(8, Bytes(bytes));
};

/// A member of the core, called as an exported function calls one.
template <class Body>
unsigned asCall(Rig& rig, const Body& body) {
  try {
    QorRT::QorJtagTargetLock lock(rig.session, 100);
    body(*rig.core());
    return 0;
  } catch (const std::exception& failure) {
    rig.report(failure.what());
    return failed;
  }
}

struct Function {
  const char* name;
  unsigned (*call)(Rig& rig);
  bool mayDeliverPart = false;  // each result as it was, or wholly new
  bool mayLoseCore = false;
};

const Function functions[] = {
    {"getInfo", [](Rig& r) { return QorVIO_getInfo(r.session, first, &r.info); }},
    {"isVIOCore", [](Rig& r) { return QorVIO_isVIOCore(r.session, first, &r.isVio); }},
    {"getCoreInfo", [](Rig& r) { return QorVIO_getCoreInfo(r.session, first, &r.in); }, true},
    {"initCore", [](Rig& r) { return QorVIO_initCore(r.session, first); }, false, true},
    {"terminateCore", [](Rig& r) { return QorVIO_terminateCore(r.session, first); }},
    {"defineSignal",
     [](Rig& r) { return QorVIO_defineSignal(r.session, first, added.c_str(), asyncOut, 3); }},
    {"defineBus", [](Rig& r) { return QorVIO_defineBus(r.session, first, added.c_str(), syncOut, bits, 4); }},
    {"undefineName", [](Rig& r) { return QorVIO_undefineName(r.session, first, held.c_str(), asyncOut); }},
    {"getSignalSizes",
     [](Rig& r) {
       const char* names[] = {held.c_str(), pulsed.c_str(), "sync_out_data"};
       return QorVIO_getSignalSizes(r.session, first, names, r.sizes, 3, 1);
     },
     true},
    {"writeValues", [](Rig& r) { return QorVIO_writeValues(r.session, first, &r.out); }},
    {"readValues", [](Rig& r) { return QorVIO_readValues(r.session, first, &r.in); }, true},
    {"setPortBits",
     [](Rig& r) {
       return QorVIO_setPortBits(r.session, first, r.steps.data(), r.ones.data(), width, r.steps.data(),
                                 r.ones.data(), width);
     }},
    {"getPortBits",
     [](Rig& r) {
       const auto at = [&r](std::size_t row) { return r.rows[row].data(); };
       return QorVIO_getPortBits(r.session, first, at(0), at(1), at(2), width, at(3), at(4), at(5), at(6),
                                 at(7), width);
     }},
    {"writeSamples",
     [](Rig& r) {
       return asCall(r, [&](QorRT::QorVIO_Core& core) {
         const unsigned char* values[] = {r.steps.data(), r.ones.data()};
         unsigned room[] = {20, 20 * bytes};
         core.writeValues(r.session, first, {pulsed, "sync_out_data"}, values, room, 2, 20, 1);
       });
     }},
    {"readSamples",
     [](Rig& r) {
       return asCall(r, [&](QorRT::QorVIO_Core& core) {
         unsigned char* values[] = {r.rows[0].data(), r.rows[1].data()};
         unsigned char* ups[] = {r.rows[2].data(), r.rows[3].data()};
         unsigned room[] = {bytes, bytes};
         core.readValues(r.session, first, {seen, "sync_in_data"}, values, ups, nullptr, nullptr, nullptr,
                         room, 2, 1);
       });
     }},
};

/// With a function, and whether all allocations fail from some point on.
class AllocationSweep : public testing::TestWithParam<std::tuple<Function, bool>> {
 protected:
  AllocationSweep() {
    Rig rig;
    EXPECT_EQ(function.call(rig), 0U);
    clean = rig.state();
    cleanPins = rig.pins();
  }

  /// False when the call was over before the allocation that was to fail.
  bool failAt(std::size_t point) {
    Rig rig;
    const Texts before = rig.state();
    allocation_fault::arm(point, all);
    const unsigned code = function.call(rig);
    const bool hasFailed = allocation_fault::disarm();
    EXPECT_EQ(code, hasFailed ? failed : 0U);
    if (!hasFailed) return false;
    EXPECT_THAT(rig.messages, ElementsAre("std::bad_alloc"));
    EXPECT_NO_THROW(QorRT::QorJtagTargetLock(rig.session, 100));
    if (!function.mayLoseCore || rig.core() != nullptr) expectWhole(before, rig.state());
    rig.messages.clear();
    if (!all && !HasFailure()) {
      EXPECT_EQ(function.call(rig), 0U);
      EXPECT_EQ(rig.state(), clean);
      EXPECT_EQ(rig.pins(), cleanPins);
    }
    if (!HasFailure()) rig.expectRoundTrips();
    return true;
  }

  const Function function = std::get<0>(GetParam());
  const bool all = std::get<1>(GetParam());

 private:
  void expectWhole(const Texts& before, const Texts& after) {
    for (const auto& [key, text] : after) {
      const auto old = before.find(key);
      const auto fresh = clean.find(key);
      const bool isOld = old != before.end() && old->second == text;
      EXPECT_TRUE(isOld || (function.mayDeliverPart && fresh != clean.end() && fresh->second == text)) << key;
    }
    for (const auto& [key, text] : before) EXPECT_EQ(after.count(key), 1U) << key;
  }

  Texts clean;
  std::string cleanPins;
};

TEST_P(AllocationSweep, FailsWholeAtEveryPoint) {
  std::size_t points = 0;
  for (bool goesOn = true; goesOn && !HasFailure();) {
    SCOPED_TRACE("allocation " + std::to_string(points));
    const std::size_t before = allocation_fault::liveBlocks();
    goesOn = failAt(points);
    if (!HasFailure()) {
      EXPECT_EQ(allocation_fault::liveBlocks(), before) << "blocks leaked";
    }
    points += goesOn ? 1 : 0;
  }
  std::printf("%-14s %4zu failure points, %s\n", function.name, points,
              all ? "all from there on" : "one each");
}

INSTANTIATE_TEST_SUITE_P(, AllocationSweep, testing::Combine(testing::ValuesIn(functions), testing::Bool()),
                         [](const auto& sweep) {
                           return std::string(std::get<0>(sweep.param).name) +
                                  (std::get<1>(sweep.param) ? "All" : "One");
                         });

}  // namespace
