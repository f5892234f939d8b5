// Reading a board file: one format for real chains and for simulated ones.
#pragma once

#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "platform/jtag/cable/boardfile/DeviceEntry.h"
#include "platform/jtag/cable/boardfile/TomlEntry.h"

namespace QorRT {

/// One device, with its table for messages. The cores are tables too: only a simulation needs to know what they are.
struct BoardDevice : DeviceEntry {
  explicit BoardDevice(TomlEntry itself) : table(std::move(itself)) {}

  TomlEntry table;
  std::vector<TomlEntry> cores{};
};

struct BoardFile {
  std::shared_ptr<const void> text;  ///< what the tables of the devices are views of
  std::vector<BoardDevice> devices;  ///< the one nearest to TDO first
  unsigned tcksPerClock = 1;         ///< of the simulated design clocks
};

/// Throws invalid_argument, "FILE:LINE: KEY: what is wrong". `file` is the name that messages give the text.
BoardFile readBoard(const std::string& text, const std::string& file);

}  // namespace QorRT
