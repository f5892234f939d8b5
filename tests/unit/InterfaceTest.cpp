// What hosts compile against and no symbol shows: signatures of the plain functions, records, constants, sizes, virtual
// slots. The symbols: tests/abi/QorVIO.symbols.
#include <cstdint>
#include <cstring>
#include <type_traits>

#include "QorVIO_Signal.h"
#include "tests/unit/VioTest.h"

namespace {

using QorRT::Qor_SignalBase;
using QorRT::QorVIO_Signal;
using QorRT::QorVIO_SignalGroup;
using Core = QorRT::QorVIO_Core;
using Map = std::unordered_map<std::string, std::string>**;
using Bits = const unsigned char*;
using Room = unsigned char*;

template <class Actual, class... Arguments>
constexpr bool takes = std::is_same_v<Actual, unsigned(unsigned, QOR_CORE_REF, Arguments...)>;

static_assert(takes<decltype(QorVIO_getInfo), QORVIO_CORE_INFO*>);
static_assert(takes<decltype(QorVIO_isVIOCore), unsigned*>);
static_assert(takes<decltype(QorVIO_getCoreInfo), Map>);
static_assert(takes<decltype(QorVIO_initCore)>);
static_assert(takes<decltype(QorVIO_terminateCore)>);
static_assert(takes<decltype(QorVIO_defineSignal), const char*, unsigned, unsigned>);
static_assert(takes<decltype(QorVIO_defineBus), const char*, unsigned, const unsigned*, unsigned>);
static_assert(takes<decltype(QorVIO_undefineName), const char*, unsigned>);
static_assert(takes<decltype(QorVIO_getSignalSizes), const char**, unsigned*, unsigned, unsigned>);
static_assert(takes<decltype(QorVIO_writeValues), Map>);
static_assert(takes<decltype(QorVIO_readValues), Map>);
static_assert(takes<decltype(QorVIO_setPortBits), Bits, Bits, unsigned, Bits, Bits, unsigned>);
static_assert(
    takes<decltype(QorVIO_getPortBits), Room, Room, Room, unsigned, Room, Room, Room, Room, Room, unsigned>);

constexpr QOR_CORE_REF address{1, 2, 3};
static_assert(address.device_index == 1 && address.user_chain_number == 2 && address.core_index == 3);
constexpr QORVIO_CORE_INFO info{1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12};
static_assert(info.manufacturer_id == 1 && info.core_type == 2 && info.core_major_version == 3 &&
              info.core_minor_version == 4 && info.core_revision == 5 && info.cg_major_version == 6 &&
              info.cg_minor_version == 7 && info.cg_minor_version_alpha == 8 && info.async_input_count == 9 &&
              info.sync_input_count == 10 && info.async_output_count == 11 && info.sync_output_count == 12);
static_assert(sizeof address == 12 && sizeof info == 48 && sizeof(QOR_CORE_INFO) == 20);
static_assert(sizeof(QorVIO_Signal) == sizeof(QorRT::Qor_Signal));
static_assert(sizeof(QorVIO_SignalGroup) ==
              sizeof(QorRT::Qor_SignalGroup) + sizeof(std::string) + sizeof(void*));

// The offsets are in InformationTest.cpp.
static_assert(Core::BEFORE_062_PORT_BIT_LEN == 8 && Core::BEFORE_101_PORT_BIT_LEN == 16 &&
              Core::PORT_BIT_LEN == 16);

static_assert(std::is_same_v<decltype(&QorVIO_SignalGroup::size), unsigned (QorVIO_SignalGroup::*)() const>);

/// The place of a virtual member in its class's table: its offset is in the pointer's first word.
template <class Member>
std::uintptr_t slotOf(Member member) {
  std::uintptr_t word;
  static_assert(sizeof member > sizeof word);
  std::memcpy(&word, &member, sizeof word);
  return word / sizeof(void*);
}

struct Protected : Core {
  static constexpr auto counts = &Protected::setCorePhysicalSignalCounts;
};

template <class Class>
std::vector<std::uintptr_t> propertySlots() {
  return {slotOf<std::string (Class::*)(const std::string&) const>(&Class::getProperty),
          slotOf<void (Class::*)(const char*, const char*)>(&Class::setProperty),
          slotOf<void (Class::*)(std::string&, std::string&)>(&Class::setProperty)};
}

TEST(Interface, HasItsVirtualSlotsInOrder) {
  EXPECT_EQ(slotOf<bool (Core::*)(unsigned)>(&Core::initFromStatusWord), 2U);  // after two destructors
  EXPECT_EQ(slotOf<bool (Core::*)()>(&Core::isQorVbrnSlave), 3U);
  EXPECT_EQ(slotOf<void (Core::*)(Qor_SignalBase*)>(&Core::addSignal), 4U);
  EXPECT_EQ(slotOf<Qor_SignalBase* (Core::*)(const std::string&, unsigned, unsigned)>(&Core::getSignal), 5U);
  EXPECT_EQ(slotOf<void (Core::*)(Qor_SignalBase*)>(&Core::removeSignal), 6U);
  EXPECT_EQ(slotOf<void (Core::*)()>(Protected::counts), 7U);
  EXPECT_THAT(propertySlots<QorVIO_Signal>(), ElementsAre(0, 1, 2));
  EXPECT_THAT(propertySlots<QorVIO_SignalGroup>(), ElementsAre(0, 1, 2));
}

}  // namespace
