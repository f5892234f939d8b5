// The keys that a kind of table may have, as data.
#pragma once

#include <algorithm>
#include <array>
#include <string_view>
#include <vector>

#include "platform/jtag/cable/Qor_Spelling.h"
#include "platform/jtag/cable/boardfile/TomlEntry.h"

namespace QorRT {

/// A key, and what it does to the thing that the table describes. Keys without an effect of their own are read
/// where the thing is made.
template <class Thing>
struct TomlKey {
  std::string_view name;
  void (*apply)(const TomlEntry& entry, Thing& thing);
};

/// Applies every key of the table, in the order of their names. Fails at one that is not among `keys`.
template <class Thing, std::size_t count>
void applyTomlKeys(const TomlEntry& table, const std::array<TomlKey<Thing>, count>& keys, Thing& thing) {
  for (const auto& [name, node] : table.table()) {
    const std::string_view spelled = name.str();
    const auto key = std::find_if(keys.begin(), keys.end(),
                                  [&](const TomlKey<Thing>& each) { return each.name == spelled; });
    if (key == keys.end()) {
      std::vector<std::string_view> known;
      for (const TomlKey<Thing>& each : keys) known.push_back(each.name);
      table.failAt(spelled, "is no key of a board file" + didYouMean(spelled, known));
    }
    if (key->apply != nullptr) key->apply(table.at(spelled), thing);
  }
}

}  // namespace QorRT
