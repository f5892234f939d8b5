// Every allocation of every function fails: the call fails whole and is told once, and the next one works.
#include <cstdio>
#include <map>

#include "tests/fault/AllocationFault.h"
#include "tests/system/Board.h"

namespace {

using allocation_fault::Extent;
using qorsim::chain;
using qorsim::loopback;
using qorsim::vio;
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
  Rig()
      : board(chain()
                  .device(0x11)
                  .core(1, 0,
                        vio().asyncOut(width).asyncIn(width).syncOut(width).syncIn(width).design(loopback()))
                  .device()
                  .cable()) {
    VioCore used(board, first);
    used.write({{"async_out_data", "0F0"}, {"sync_out_data", "F0F"}});
    used.read();
    used.read();  // no flag is left that a repeated read may tell twice
    used.write({{"async_out_data", "3C5"}, {"sync_out_data", "A33"}});
    VioCore core(board, first);
    core.define(held, asyncOut, {11, 3, 7, 0});
    core.define(pulsed, syncOut, {3, 2, 1, 0});
    core.define(seen, asyncIn, {11, 3, 7, 0});
    core.define(seen + " too", syncIn, {1, 0});
    for (int i = 0; i < 99; ++i)
      core.define("n" + std::to_string(i), asyncOut, {0});  // the next one rehashes
    QorJtag_session_setMessageHandler(session(), [this](unsigned, const char* text) { tell(text); });
  }

  unsigned session() const { return board.session; }
  void tell(const char* text) {
    allocation_fault::disarm();
    messages.emplace_back(text);
  }
  QorRT::QorVIO_Core* core() {
    return dynamic_cast<QorRT::QorVIO_Core*>(QorRT::Qor_CoreList::getCore(session(), first));
  }

  /// What the caller got.
  Texts results() const {
    Texts all(map.begin(), map.end());
    all["info"] = std::string(reinterpret_cast<const char*>(&info), sizeof info);
    all["isVio"] = std::to_string(isVio);
    for (unsigned i = 0; i < 3; ++i) all["size " + std::to_string(i)] = std::to_string(sizes[i]);
    for (unsigned i = 0; i < 8; ++i) all["row " + std::to_string(i)] = testing::PrintToString(rows[i]);
    return all;
  }

  /// What is defined; empty without a core.
  Texts names() {
    Texts sizesByName;
    for (const std::string& name :
         {held, pulsed, seen, seen + " too", added, std::string("n98"), std::string("async_in_data")}) {
      for (unsigned isOutput : {0U, 1U}) {
        const char* array[] = {name.c_str()};
        unsigned size = 0;
        if (QorVIO_getSignalSizes(session(), first, array, &size, 1, isOutput) == 0)
          sizesByName[name + (isOutput != 0 ? " (out)" : " (in)")] = std::to_string(size);
      }
    }
    messages.clear();
    return sizesByName;
  }

  /// The values of all inputs, and so of all outputs.
  std::string pins() {
    if (core() == nullptr) {
      EXPECT_EQ(QorVIO_initCore(session(), first), 0U);
    }
    Bytes async(bytes), sync(bytes);
    EXPECT_EQ(QorVIO_getPortBits(session(), first, async.data(), nullptr, nullptr, width, sync.data(),
                                 nullptr, nullptr, nullptr, nullptr, width),
              0U);
    return testing::PrintToString(async) + testing::PrintToString(sync);
  }

  /// Whole ports, written by name into the strings that are there, and then as rows.
  void expectRoundTrips() {
    EXPECT_NE(pins(), "");
    Bytes ups(bytes);  // and no flag is told for ever
    EXPECT_EQ(QorVIO_getPortBits(session(), first, nullptr, ups.data(), nullptr, width, nullptr, nullptr,
                                 nullptr, nullptr, nullptr, 0),
              0U);
    EXPECT_EQ(ups, Bytes(bytes));
    TextMap values{{"async_out_data", "5A3C1"}, {"sync_out_data", "C3A51"}}, *pointer = &values;
    EXPECT_EQ(QorVIO_writeValues(session(), first, &pointer), 0U);
    EXPECT_EQ(pins(), testing::PrintToString(Bytes{0xC1, 0xA3, 0x05}) +
                          testing::PrintToString(Bytes{0x51, 0x3A, 0x0C}));
    const Bytes async{0x5C, 0xCA, 0x0A}, trains(16 * bytes, 0x06);
    EXPECT_EQ(QorVIO_setPortBits(session(), first, async.data(), ones.data(), width, trains.data(),
                                 ones.data(), width),
              0U);
    EXPECT_EQ(QorVIO_readValues(session(), first, &pointer), 0U);
    EXPECT_EQ(values["async_in_data"] + " " + values["sync_in_data"], "ACA5C 60606");
    EXPECT_THAT(messages, testing::IsEmpty());
  }

  Board board;
  std::vector<std::string> messages;
  TextMap map{{"async_in_data", "what was there"}, {"core_type", "what was there"}, {"mine", "stays"}};
  TextMap* mapPointer = &map;
  TextMap outputs{
      {held, "9"}, {pulsed + ".pulsetrain", "0123456789ABCDEF0123456789ABCDEF"}, {"sync_out_data", "5A5"}};
  TextMap* outputsPointer = &outputs;
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
    QorRT::QorJtagTargetLock lock(rig.session(), 100);
    body();
    return 0;
  } catch (const std::exception& failure) {
    rig.tell(failure.what());
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
    {"getInfo", [](Rig& rig) { return QorVIO_getInfo(rig.session(), first, &rig.info); }},
    {"isVIOCore", [](Rig& rig) { return QorVIO_isVIOCore(rig.session(), first, &rig.isVio); }},
    {"getCoreInfo", [](Rig& rig) { return QorVIO_getCoreInfo(rig.session(), first, &rig.mapPointer); }, true},
    {"initCore", [](Rig& rig) { return QorVIO_initCore(rig.session(), first); }, false, true},
    {"terminateCore", [](Rig& rig) { return QorVIO_terminateCore(rig.session(), first); }},
    {"defineSignal",
     [](Rig& rig) { return QorVIO_defineSignal(rig.session(), first, added.c_str(), asyncOut, 3); }},
    {"defineBus",
     [](Rig& rig) { return QorVIO_defineBus(rig.session(), first, added.c_str(), syncOut, bits, 4); }},
    {"undefineName",
     [](Rig& rig) { return QorVIO_undefineName(rig.session(), first, held.c_str(), asyncOut); }},
    {"getSignalSizes",
     [](Rig& rig) {
       const char* names[] = {held.c_str(), pulsed.c_str(), "sync_out_data"};
       return QorVIO_getSignalSizes(rig.session(), first, names, rig.sizes, 3, 1);
     },
     true},
    {"writeValues", [](Rig& rig) { return QorVIO_writeValues(rig.session(), first, &rig.outputsPointer); }},
    {"readValues", [](Rig& rig) { return QorVIO_readValues(rig.session(), first, &rig.mapPointer); }, true},
    {"setPortBits",
     [](Rig& rig) {
       return QorVIO_setPortBits(rig.session(), first, rig.steps.data(), rig.ones.data(), width,
                                 rig.steps.data(), rig.ones.data(), width);
     }},
    {"getPortBits",
     [](Rig& rig) {
       auto& rows = rig.rows;
       return QorVIO_getPortBits(rig.session(), first, rows[0].data(), rows[1].data(), rows[2].data(), width,
                                 rows[3].data(), rows[4].data(), rows[5].data(), rows[6].data(),
                                 rows[7].data(), width);
     }},
    {"writeSamples",
     [](Rig& rig) {
       return asCall(rig, [&] {
         const unsigned char* values[] = {rig.steps.data(), rig.ones.data()};
         unsigned room[] = {20, 20 * bytes};
         rig.core()->writeValues(rig.session(), first, {pulsed, "sync_out_data"}, values, room, 2, 20, 1);
       });
     }},
    {"readSamples",
     [](Rig& rig) {
       return asCall(rig, [&] {
         unsigned char* values[] = {rig.rows[0].data(), rig.rows[1].data()};
         unsigned char* ups[] = {rig.rows[2].data(), rig.rows[3].data()};
         unsigned room[] = {bytes, bytes};
         rig.core()->readValues(rig.session(), first, {seen, "sync_in_data"}, values, ups, nullptr, nullptr,
                                nullptr, room, 2, 1);
       });
     }},
};

struct Outcome {
  Texts results, names;
  std::string pins;
};

Outcome outcomeOf(Rig& rig) {
  Outcome outcome{rig.results(), rig.names(), {}};
  outcome.pins = rig.pins();
  return outcome;
}

std::string textAt(const Texts& texts, const std::string& key) {
  const auto entry = texts.find(key);
  return entry == texts.end() ? "(none)" : entry->second;
}

void expectFailedWhole(Rig& rig, const Function& function, const Texts& resultsBefore,
                       const Texts& namesBefore, const Outcome& clean) {
  EXPECT_THAT(rig.messages, ElementsAre("std::bad_alloc"));
  ASSERT_NO_THROW(QorRT::QorJtagTargetLock(rig.session(), 100));
  Texts results = rig.results();
  EXPECT_LE(results.size(), clean.results.size());
  for (const auto& [key, fresh] : clean.results) {
    if (function.mayDeliverPart && textAt(results, key) == fresh) continue;
    EXPECT_EQ(textAt(results, key), textAt(resultsBefore, key)) << key;
  }
  if (!function.mayLoseCore || rig.core() != nullptr) {
    EXPECT_EQ(rig.names(), namesBefore);
  }
  rig.messages.clear();
}

/// False when the call was over before the allocation that was to fail.
bool failAt(std::size_t point, Extent extent, const Function& function, const Outcome& clean) {
  Rig rig;
  const Texts results = rig.results(), names = rig.names();
  allocation_fault::arm(point, extent);
  const unsigned code = function.call(rig);
  const bool hasFailed = allocation_fault::disarm();
  EXPECT_EQ(code, hasFailed ? failed : 0U);
  if (!hasFailed) return false;
  expectFailedWhole(rig, function, results, names, clean);
  if (testing::Test::HasFailure()) return true;
  if (extent == Extent::one) {
    EXPECT_EQ(function.call(rig), 0U);
    EXPECT_EQ(rig.results(), clean.results);
    EXPECT_EQ(rig.names(), clean.names);
    EXPECT_EQ(rig.pins(), clean.pins);
  }
  rig.expectRoundTrips();
  return true;
}

class AllocationSweep : public testing::TestWithParam<std::tuple<Function, Extent>> {};

TEST_P(AllocationSweep, FailsWholeAtEveryPoint) {
  const auto& [function, extent] = GetParam();
  Outcome clean;
  {
    Rig rig;
    ASSERT_EQ(function.call(rig), 0U);
    clean = outcomeOf(rig);
  }
  std::size_t points = 0;
  for (bool goesOn = true; goesOn && !HasFailure();) {
    SCOPED_TRACE("allocation " + std::to_string(points));
    const std::size_t before = allocation_fault::liveBlocks();
    goesOn = failAt(points, extent, function, clean);
    if (!HasFailure()) {
      EXPECT_EQ(allocation_fault::liveBlocks(), before) << "blocks leaked";
    }
    if (goesOn) ++points;
  }
  std::printf("%-14s %4zu failure points, %s\n", function.name, points,
              extent == Extent::one ? "one each" : "everything from there on");
}

INSTANTIATE_TEST_SUITE_P(, AllocationSweep,
                         testing::Combine(testing::ValuesIn(functions),
                                          testing::Values(Extent::one, Extent::allFromThereOn)),
                         [](const auto& sweep) {
                           return std::string(std::get<0>(sweep.param).name) +
                                  (std::get<1>(sweep.param) == Extent::one ? "One" : "All");
                         });

}  // namespace
