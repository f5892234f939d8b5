#include <algorithm>
#include <array>
#include <cerrno>
#include <fstream>
#include <stdexcept>
#include <system_error>

#include "BoardEntry.h"
#include "BoardError.h"
#include "Sim.h"

namespace qorsim {
namespace {

// The keys that a kind of table may have, and what each does to the thing that the table describes. Keys
// without an effect of their own are read where the thing is made.
template <class Thing>
struct Key {
  std::string_view name;
  void (*apply)(const BoardEntry& entry, Thing& thing);
};

template <class Thing, std::size_t count>
void applyKeys(const BoardEntry& table, const std::array<Key<Thing>, count>& keys, Thing& thing) {
  for (const auto& [name, node] : table.table()) {
    const std::string_view spelled = name.str();
    const auto key =
        std::find_if(keys.begin(), keys.end(), [&](const Key<Thing>& each) { return each.name == spelled; });
    if (key == keys.end()) table.failAt(spelled, "is no key of a board file");
    if (key->apply != nullptr) key->apply(table.at(spelled), thing);
  }
}

std::shared_ptr<Design> designNamed(const BoardEntry& entry) {
  const std::string name = entry.text();
  if (name == "loopback") return loopback();
  if (name == "counter") return counter();
  if (name == "toggle") return toggle();
  if (name == "idle") return idle();
  entry.fail("must be \"loopback\", \"counter\", \"toggle\" or \"idle\", is \"" + name + "\"");
}

constexpr std::array<Key<CoreSpec>, 12> coreKeys{{
    {"user_chain", nullptr},
    {"index", nullptr},
    {"type", nullptr},
    {"version",
     [](const BoardEntry& entry, CoreSpec& core) {
       const std::vector<unsigned> parts = entry.version(2);
       core.version(parts[0], parts[1]);
     }},
    {"revision", [](const BoardEntry& entry, CoreSpec& core) { core.revision(entry.number()); }},
    {"manufacturer", [](const BoardEntry& entry, CoreSpec& core) { core.manufacturer(entry.number()); }},
    {"cg_version",
     [](const BoardEntry& entry, CoreSpec& core) {
       const std::vector<unsigned> parts = entry.version(3);
       core.cgVersion(parts[0], parts[1], parts[2]);
     }},
    {"async_in", [](const BoardEntry& entry, CoreSpec& core) { core.asyncIn(entry.number()); }},
    {"sync_in", [](const BoardEntry& entry, CoreSpec& core) { core.syncIn(entry.number()); }},
    {"async_out", [](const BoardEntry& entry, CoreSpec& core) { core.asyncOut(entry.number()); }},
    {"sync_out", [](const BoardEntry& entry, CoreSpec& core) { core.syncOut(entry.number()); }},
    {"design", [](const BoardEntry& entry, CoreSpec& core) { core.design(designNamed(entry)); }},
}};

CoreSpec coreOfType(const BoardEntry& type) {
  if (!type.isText()) return otherCore(type.number());
  if (type.text() != "vio") type.fail("must be \"vio\" or a number, is \"" + type.text() + "\"");
  return vio();
}

void addCore(const BoardEntry& table, ChainBuilder& board) {
  CoreSpec core = coreOfType(table.at("type"));
  applyKeys(table, coreKeys, core);
  const unsigned userChain = table.at("user_chain").number(), index = table.at("index").number();
  try {
    board.core(userChain, index, core);
  } catch (const BoardError& error) {
    table.failAt(error.key(), error.problem());
  }
}

void setIrLength(const BoardEntry& entry, ChainBuilder& board) {
  const unsigned bits = entry.number();
  try {
    board.irLength(bits);
  } catch (const BoardError& error) {
    entry.fail(error.problem());
  }
}

void addCores(const BoardEntry& entry, ChainBuilder& board) {
  for (const BoardEntry& core : entry.tables()) addCore(core, board);
}

constexpr std::array<Key<ChainBuilder>, 4> deviceKeys{{
    {"idcode", nullptr},
    {"name", [](const BoardEntry& entry, ChainBuilder& board) { board.named(entry.text()); }},
    {"ir_length", setIrLength},
    {"core", addCores},
}};

void addDevices(const BoardEntry& entry, ChainBuilder& board) {
  for (const BoardEntry& device : entry.tables()) {
    board.device(device.table().contains("idcode") ? device.at("idcode").number() : 0);
    applyKeys(device, deviceKeys, board);
  }
}

constexpr std::array<Key<ChainBuilder>, 2> boardKeys{{
    {"tcks_per_clock",
     [](const BoardEntry& entry, ChainBuilder& board) { board.tcksPerClock(entry.number()); }},
    {"device", addDevices},
}};

std::string contents(const std::string& path) {
  std::ifstream file(path, std::ios::binary);
  const int error = errno;
  if (!file) throw std::runtime_error(path + ": cannot be opened: " + std::generic_category().message(error));
  std::string text;
  std::array<char, 4096> block{};
  while (file.read(block.data(), block.size()) || file.gcount() > 0)
    text.append(block.data(), static_cast<std::size_t>(file.gcount()));
  if (file.bad()) throw std::runtime_error(path + ": cannot be read");
  return text;
}

toml::table parse(const std::string& text, const std::string& file) {
  try {
    return toml::parse(text);
  } catch (const toml::parse_error& error) {
    throw std::runtime_error(file + ":" + std::to_string(error.source().begin.line) + ": " +
                             std::string(error.description()));
  }
}

}  // namespace

ChainBuilder boardFile(const std::string& path) {
  return boardText(contents(path), path);
}

ChainBuilder boardText(const std::string& text, const std::string& file) {
  const toml::table parsed = parse(text, file);
  const BoardEntry root(file, parsed, "");
  ChainBuilder board = chain();
  root.at("device");
  applyKeys(root, boardKeys, board);
  return board;
}

}  // namespace qorsim
