#include <algorithm>

#include "Sim.h"
#include "platform/jtag/cable/boardfile/BoardFile.h"
#include "platform/jtag/cable/boardfile/TomlFile.h"
#include "platform/jtag/cable/boardfile/TomlKeys.h"
#include "sim/BoardError.h"

namespace qorsim {
namespace {

using QorRT::applyTomlKeys;
using QorRT::TomlEntry;
using QorRT::TomlKey;

std::shared_ptr<Design> designNamed(const TomlEntry& entry) {
  const std::string name = entry.text();
  if (name == "loopback") return loopback();
  if (name == "counter") return counter();
  if (name == "toggle") return toggle();
  if (name == "idle") return idle();
  entry.fail("must be \"loopback\", \"counter\", \"toggle\" or \"idle\", is \"" + name + "\"");
}

constexpr std::array<TomlKey<CoreSpec>, 12> coreKeys{{
    {"user_chain", nullptr},
    {"index", nullptr},
    {"type", nullptr},
    {"version",
     [](const TomlEntry& entry, CoreSpec& core) {
       const std::vector<unsigned> parts = entry.version(2);
       core.version(parts[0], parts[1]);
     }},
    {"revision", [](const TomlEntry& entry, CoreSpec& core) { core.revision(entry.number()); }},
    {"manufacturer", [](const TomlEntry& entry, CoreSpec& core) { core.manufacturer(entry.number()); }},
    {"cg_version",
     [](const TomlEntry& entry, CoreSpec& core) {
       const std::vector<unsigned> parts = entry.version(3);
       core.cgVersion(parts[0], parts[1], parts[2]);
     }},
    {"async_in", [](const TomlEntry& entry, CoreSpec& core) { core.asyncIn(entry.number()); }},
    {"sync_in", [](const TomlEntry& entry, CoreSpec& core) { core.syncIn(entry.number()); }},
    {"async_out", [](const TomlEntry& entry, CoreSpec& core) { core.asyncOut(entry.number()); }},
    {"sync_out", [](const TomlEntry& entry, CoreSpec& core) { core.syncOut(entry.number()); }},
    {"design", [](const TomlEntry& entry, CoreSpec& core) { core.design(designNamed(entry)); }},
}};

CoreSpec coreOfType(const TomlEntry& type) {
  if (!type.isText()) return otherCore(type.number());
  if (type.text() != "vio") type.fail("must be \"vio\" or a number, is \"" + type.text() + "\"");
  return vio();
}

void addCore(const TomlEntry& table, ChainBuilder& board) {
  CoreSpec core = coreOfType(table.at("type"));
  applyTomlKeys(table, coreKeys, core);
  const unsigned userChain = table.at("user_chain").number(), index = table.at("index").number();
  try {
    board.core(userChain, index, core);
  } catch (const BoardError& error) {
    table.failAt(error.key(), error.problem());
  }
}

std::vector<unsigned> opcodesOf(const QorRT::UserOpcodes& all) {
  const auto end = std::find(all.begin(), all.end(), QorRT::noOpcode);
  return {all.begin(), end};
}

void addDevice(const QorRT::BoardDevice& device, ChainBuilder& board) {
  board.device(device.idcode.value_or(0));
  if (!device.name.empty()) board.named(device.name);
  try {
    if (device.irLength) board.irLength(*device.irLength);
    if (device.userOpcodes) board.userOpcodes(opcodesOf(*device.userOpcodes));
  } catch (const BoardError& error) {
    device.table.failAt(error.key(), error.problem());
  }
  for (const TomlEntry& core : device.cores) addCore(core, board);
}

}  // namespace

ChainBuilder boardFile(const std::string& path) {
  return boardText(QorRT::fileContents(path), path);
}

ChainBuilder boardText(const std::string& text, const std::string& file) {
  const QorRT::BoardFile described = QorRT::readBoard(text, file);
  ChainBuilder board = chain();
  board.tcksPerClock(described.tcksPerClock);
  for (const QorRT::BoardDevice& device : described.devices) addDevice(device, board);
  return board;
}

}  // namespace qorsim
