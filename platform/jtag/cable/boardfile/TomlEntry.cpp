#include "platform/jtag/cable/boardfile/TomlEntry.h"

#include <charconv>
#include <limits>
#include <stdexcept>
#include <utility>

namespace QorRT {
namespace {

std::string quoted(std::string_view text) {
  return '"' + std::string(text) + '"';
}

std::string shown(const toml::node& node) {
  if (const auto* text = node.as_string()) return quoted(text->get());
  if (const auto* number = node.as_integer()) return std::to_string(number->get());
  if (const auto* truth = node.as_boolean()) return truth->get() ? "true" : "false";
  if (node.is_array_of_tables()) return "an array of tables";
  if (node.is_array()) return "an array";
  if (node.is_table()) return "a table";
  return node.is_floating_point() ? "a number with a fraction" : "a date or a time";
}

}  // namespace

TomlEntry::TomlEntry(const std::string& file, const toml::node& node, std::string key)
    : file_(&file), node_(&node), key_(std::move(key)) {}

void TomlEntry::fail(const std::string& problem) const {
  const std::string line = std::to_string(node_->source().begin.line);
  throw std::invalid_argument(*file_ + ":" + line + ": " + key_ + ": " + problem);
}

void TomlEntry::failKind(const char* wanted) const {
  fail(std::string("must be ") + wanted + ", is " + shown(*node_));
}

const toml::table& TomlEntry::table() const {
  if (const toml::table* table = node_->as_table()) return *table;
  failKind("a table");
}

std::string TomlEntry::text() const {
  if (const auto* text = node_->as_string()) return text->get();
  failKind("a text");
}

unsigned TomlEntry::number() const {
  const auto* number = node_->as_integer();
  if (number == nullptr) failKind("a whole number");
  if (number->get() < 0 || number->get() > std::numeric_limits<std::uint32_t>::max())
    failKind("0 to 4294967295");
  return static_cast<unsigned>(number->get());
}

std::vector<unsigned> TomlEntry::numbers() const {
  if (!node_->is_array()) failKind("an array of numbers");
  std::vector<unsigned> all;
  for (const toml::node& each : *node_->as_array())
    all.push_back(TomlEntry(*file_, each, key_ + "[" + std::to_string(all.size()) + "]").number());
  return all;
}

std::vector<unsigned> TomlEntry::version(std::size_t count) const {
  const std::string whole = text();
  const char* const end = whole.data() + whole.size();
  std::vector<unsigned> parts(count);
  const char* next = whole.data();
  bool good = true;
  for (unsigned& part : parts) {
    if (&part != &parts.front()) good = good && next != end && *next++ == '.';
    const auto [rest, error] = std::from_chars(next, end, part);
    good = good && error == std::errc();
    next = rest;
  }
  if (!good || next != end)
    fail("must be " + std::to_string(count) + " numbers with dots between, is " + quoted(whole));
  return parts;
}

std::vector<TomlEntry> TomlEntry::tables() const {
  if (!node_->is_array_of_tables()) failKind("an array of tables");
  std::vector<TomlEntry> entries;
  for (const toml::node& each : *node_->as_array())
    entries.emplace_back(*file_, each, key_ + "[" + std::to_string(entries.size()) + "]");
  return entries;
}

TomlEntry TomlEntry::at(std::string_view name) const {
  if (const toml::node* node = table().get(name)) return {*file_, *node, pathOf(name)};
  failAt(name, "is missing");
}

void TomlEntry::failAt(std::string_view name, const std::string& problem) const {
  const toml::node* node = table().get(name);
  TomlEntry(*file_, node != nullptr ? *node : *node_, pathOf(name)).fail(problem);
}

std::string TomlEntry::pathOf(std::string_view name) const {
  return key_.empty() ? std::string(name) : key_ + "." + std::string(name);
}

}  // namespace QorRT
