#include "platform/jtag/cable/boardfile/BoardFile.h"

#include <array>

#include "platform/jtag/cable/boardfile/TomlFile.h"
#include "platform/jtag/cable/boardfile/TomlKeys.h"

namespace QorRT {
namespace {

constexpr unsigned shortestIr = 2, longestIr = 64;  // bits

/// A parsed file and its name, which entries refer to.
struct Source {
  std::string file;
  toml::table parsed;
};

void setIrLength(const TomlEntry& entry, BoardDevice& device) {
  const unsigned bits = entry.number();
  if (bits < shortestIr || bits > longestIr) entry.fail("must be 2 to 64, is " + std::to_string(bits));
  device.irLength = bits;
}

void setUserOpcodes(const TomlEntry& entry, BoardDevice& device) {
  const std::vector<unsigned> numbers = entry.numbers();
  if (numbers.empty() || numbers.size() > Qor_Cable::userChainCount)
    entry.fail("must be the opcodes of 1 to 4 user registers, is " + std::to_string(numbers.size()));
  UserOpcodes& opcodes = device.userOpcodes.emplace();
  opcodes.fill(noOpcode);
  for (std::size_t i = 0; i < numbers.size(); ++i) opcodes[i] = numbers[i];
}

constexpr std::array<TomlKey<BoardDevice>, 6> deviceKeys{{
    {"idcode", [](const TomlEntry& entry, BoardDevice& device) { device.idcode = entry.number(); }},
    {"ir_length", setIrLength},
    {"user_opcodes", setUserOpcodes},
    {"name", [](const TomlEntry& entry, BoardDevice& device) { device.name = entry.text(); }},
    {"tap", [](const TomlEntry& entry, BoardDevice& device) { device.tap = entry.text(); }},
    {"core", [](const TomlEntry& entry, BoardDevice& device) { device.cores = entry.tables(); }},
}};

void addDevices(const TomlEntry& entry, BoardFile& board) {
  for (const TomlEntry& table : entry.tables())
    applyTomlKeys(table, deviceKeys, board.devices.emplace_back(table));
}

constexpr std::array<TomlKey<BoardFile>, 2> boardKeys{{
    {"device", addDevices},
    {"tcks_per_clock", [](const TomlEntry& entry, BoardFile& board) { board.tcksPerClock = entry.number(); }},
}};

}  // namespace

BoardFile readBoard(const std::string& text, const std::string& file) {
  const auto source = std::make_shared<const Source>(Source{file, parseToml(text, file)});
  const TomlEntry root(source->file, source->parsed, "");
  BoardFile board{source, {}, 1};
  root.at("device");
  applyTomlKeys(root, boardKeys, board);
  return board;
}

}  // namespace QorRT
