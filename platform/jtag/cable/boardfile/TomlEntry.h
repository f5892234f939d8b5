// A value in a file that describes a board, with the place that messages name.
#pragma once

#include <toml++/toml.h>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace QorRT {

/// A view of a node of the parsed file, which must outlive it. Failures are invalid_argument, "FILE:LINE: KEY:
/// what is wrong".
class TomlEntry {
 public:
  TomlEntry(const std::string& file, const toml::node& node, std::string key);

  /// The key path, such as "device[0].core[1].async_in"; empty for the whole file.
  const std::string& key() const { return key_; }

  [[noreturn]] void fail(const std::string& problem) const;

  /// Fails when the value is of another kind.
  const toml::table& table() const;
  std::string text() const;

  /// 0 to 4294967295.
  unsigned number() const;

  /// An array of such numbers.
  std::vector<unsigned> numbers() const;

  /// `count` decimal numbers, separated by dots, in a text such as "10.0".
  std::vector<unsigned> version(std::size_t count) const;

  /// The tables of an array of tables.
  std::vector<TomlEntry> tables() const;

  /// The entry of a table under `name`. Fails when it is missing.
  TomlEntry at(std::string_view name) const;

  /// Reports a problem with the entry under `name`, or where it would be.
  [[noreturn]] void failAt(std::string_view name, const std::string& problem) const;

  bool isText() const { return node_->is_string(); }

 private:
  std::string pathOf(std::string_view name) const;
  [[noreturn]] void failKind(const char* wanted) const;

  const std::string* file_;
  const toml::node* node_;
  std::string key_;
};

}  // namespace QorRT
