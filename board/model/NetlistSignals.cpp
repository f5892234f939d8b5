#include "board/model/NetlistSignals.h"

#include <algorithm>
#include <set>
#include <tuple>
#include <unordered_map>

#include <nlohmann/json.hpp>

#include "board/model/Errors.h"
#include "board/model/Letters.h"

namespace qor {
namespace {

using nlohmann::json;

constexpr Port ports[] = {Port::asyncOut, Port::syncOut, Port::asyncIn, Port::syncIn};

/// Bit `index` of a net.
struct NetBit {
  std::string net;
  bool isHidden = false;  // people did not name it
  const json* bits = nullptr;
  std::size_t index = 0;
};

struct Instance {
  std::string name;
  const json* module;
  const json* connections;
};

std::string plainName(const std::string& net) {
  std::string name;
  for (const char letter : net) name += isNameByte(letter) && letter != '[' && letter != ']' ? letter : '_';
  return isSignalName(name) ? name : "net";
}

// The part of the net from bit `low` on.
std::string partName(const NetBit& low, std::size_t count) {
  std::string name = plainName(low.net);
  const std::string first = std::to_string(low.index);
  if (count == low.bits->size()) return name;
  return count == 1 ? name + "_" + first : name + "_" + std::to_string(low.index + count - 1) + "_" + first;
}

class Netlist {
 public:
  Netlist(std::string_view text, std::string path) : path_(std::move(path)) {
    root_ = json::parse(text, nullptr, false);
    if (!root_.is_object() || !root_.contains("modules") || !root_["modules"].is_object())
      fail("is no netlist as write_json of yosys makes it");
  }

  std::vector<Signal> signals(const NetlistPlace& place) {
    const std::vector<Instance> found = instances(place.instance);
    if (!place.module.empty() || (found.empty() && place.instance.empty()))
      return ofPorts(moduleNamed(place.module));
    if (found.empty()) fail("has no instance of qor_vio named " + place.instance);
    if (found.size() > 1) fail("has several instances of qor_vio, one is to be named: " + namesOf(found));
    return ofInstance(found.front());
  }

 private:
  [[noreturn]] void fail(const std::string& problem) const { throw WrongUse(path_ + ": " + problem); }

  static const json& member(const json& object, const char* key) {
    static const json none = json::object();
    const auto entry = object.is_object() ? object.find(key) : object.end();
    return entry != object.end() && entry->is_object() ? *entry : none;
  }

  std::vector<Instance> instances(const std::string& wanted) const {
    std::vector<Instance> found;
    for (const auto& [moduleName, module] : root_["modules"].items()) {
      for (const auto& [name, cell] : member(module, "cells").items()) {
        const std::string type = cell.is_object() && cell.contains("type") && cell["type"].is_string()
                                     ? cell["type"].get<std::string>()
                                     : "";
        const bool isVio =
            type == "qor_vio" || (type.size() > 8 && type.substr(type.size() - 8) == "\\qor_vio");
        if (isVio && (wanted.empty() || wanted == name))
          found.push_back({name, &module, &member(cell, "connections")});
      }
    }
    return found;
  }

  static std::string namesOf(const std::vector<Instance>& instances) {
    std::string names;
    for (const Instance& each : instances) names += (names.empty() ? "" : ", ") + each.name;
    return names;
  }

  const json& moduleNamed(const std::string& name) const {
    const json& modules = root_["modules"];
    std::string names;
    for (const auto& [each, module] : modules.items()) {
      if (each == name || (name.empty() && modules.size() == 1)) return module;
      names += (names.empty() ? "" : ", ") + each;
    }
    fail((name.empty() ? "has no instance of qor_vio, a module is to be named: " : "has no such module: ") +
         names);
  }

  std::vector<Signal> ofInstance(const Instance& instance) {
    index(member(*instance.module, "netnames"));
    for (const Port port : ports) {
      const auto bits = instance.connections->find(portName(port));
      if (bits != instance.connections->end() && bits->is_array()) addRuns(port, *bits);
    }
    return std::move(signals_);
  }

  void index(const json& nets) {
    for (const auto& [name, net] : nets.items()) {
      const json& bits = net.is_object() && net.contains("bits") ? net["bits"] : net;
      const bool isHidden = net.is_object() && net.value("hide_name", 0) != 0;
      for (std::size_t i = 0; bits.is_array() && i < bits.size(); ++i)
        if (bits[i].is_number_unsigned()) nets_[bits[i]].push_back({name, isHidden, &bits, i});
    }
  }

  // How many of the bits from `begin` on are those of the net.
  static std::size_t run(const NetBit& net, const json& bits, std::size_t begin) {
    std::size_t count = 0;
    while (net.index + count < net.bits->size() && begin + count < bits.size() &&
           (*net.bits)[net.index + count] == bits[begin + count])
      ++count;
    return count;
  }

  // The net that names most of the bits from `begin` on: one that people named, then the shortest name. Constants have none.
  const NetBit* netOf(const json& bits, std::size_t begin) const {
    const auto nets = bits[begin].is_number_unsigned() ? nets_.find(bits[begin]) : nets_.end();
    if (nets == nets_.end()) return nullptr;
    const auto rank = [&](const NetBit& net) {
      return std::make_tuple(net.isHidden, bits.size() - run(net, bits, begin), net.net.size(), net.net);
    };
    return &*std::min_element(nets->second.begin(), nets->second.end(),
                              [&](const NetBit& a, const NetBit& b) { return rank(a) < rank(b); });
  }

  void addRuns(Port port, const json& bits) {
    for (std::size_t begin = 0, count = 1; begin < bits.size(); begin += count) {
      count = 1;
      const NetBit* const net = netOf(bits, begin);
      if (net == nullptr) continue;
      count = run(*net, bits, begin);
      const std::string name =
          net->isHidden ? std::string(portName(port)) + "_" + std::to_string(begin) : partName(*net, count);
      add(name, port, begin, count);
    }
  }

  std::vector<Signal> ofPorts(const json& module) {
    std::size_t next[] = {0, 0};  // bits of outputs and inputs of the core
    for (const auto& [name, port] : member(module, "ports").items()) {
      const std::string direction = port.is_object() ? port.value("direction", "") : "";
      if (direction != "input" && direction != "output") continue;
      const bool isRead = direction == "output";
      const std::size_t count = port.contains("bits") ? port["bits"].size() : 0;
      if (count != 0)
        add(plainName(name), isRead ? Port::asyncIn : Port::asyncOut, next[isRead ? 1 : 0], count);
      next[isRead ? 1 : 0] += count;
    }
    return std::move(signals_);
  }

  void add(const std::string& name, Port port, std::size_t first, std::size_t count) {
    Signal signal{name, port};
    for (unsigned tries = 2; !taken_.emplace(isInput(port), signal.name).second; ++tries)
      signal.name = name + "_" + std::to_string(tries);
    for (std::size_t i = 0; i < count; ++i) signal.bits.push_back(static_cast<unsigned>(first + i));
    signals_.push_back(std::move(signal));
  }

  std::string path_;
  json root_;
  std::unordered_map<std::size_t, std::vector<NetBit>> nets_;  // those that a bit belongs to
  std::set<std::pair<bool, std::string>> taken_;
  std::vector<Signal> signals_;
};

}  // namespace

std::vector<Signal> netlistSignals(std::string_view text, const std::string& path,
                                   const NetlistPlace& place) {
  try {
    return Netlist(text, path).signals(place);
  } catch (const nlohmann::json::exception& error) {
    throw WrongUse(path + ": is no netlist as write_json of yosys makes it: " + error.what());
  }
}

}  // namespace qor
