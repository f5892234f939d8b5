// A value in a TOML file, with the place that messages name.
#pragma once

#include <toml++/toml.h>
#include <string>
#include <string_view>
#include <vector>

#include "board/Export.h"

namespace qor {

/// Reads a file within the bounds of QorRT::readTomlText(). Throws WrongUse, "FILE:LINE: what is wrong", when it cannot be read or is no TOML.
QORBOARD_API toml::table readToml(const std::string& path);

class QORBOARD_API TomlPlace {
 public:
  TomlPlace(const std::string& file, const toml::node& node, std::string key)
      : file_(&file), node_(&node), key_(std::move(key)) {}

  const toml::node& node() const { return *node_; }

  /// Throws WrongUse, "FILE:LINE: KEY: problem".
  [[noreturn]] void fail(const std::string& problem) const;

  /// Throw WrongUse when the value is of another kind.
  const toml::table& table() const;
  std::string text() const;

  /// The entry of a table. Throws WrongUse when it is missing.
  TomlPlace at(std::string_view name) const;
  bool has(std::string_view name) const { return table().contains(name); }

  /// Throws WrongUse for the first key of the table that is none of these.
  void requireKeys(const std::vector<std::string_view>& known) const;

 private:
  const std::string* file_;
  const toml::node* node_;
  std::string key_;
};

}  // namespace qor
