#include "board/model/TomlPlace.h"

#include <algorithm>
#include <stdexcept>

#include "QorJtag_Host.h"
#include "board/model/Errors.h"
#include "platform/jtag/cable/Qor_Spelling.h"

namespace qor {

toml::table readToml(const std::string& path) {
  try {
    return toml::parse(QorRT::readTomlText(path));
  } catch (const toml::parse_error& wrong) {
    throw WrongUse(path + ":" + std::to_string(wrong.source().begin.line) + ": " +
                   std::string(wrong.description()));
  } catch (const std::invalid_argument& error) {
    throw WrongUse(error.what());
  }
}

void TomlPlace::fail(const std::string& problem) const {
  throw WrongUse(*file_ + ":" + std::to_string(node_->source().begin.line) + ": " +
                 (key_.empty() ? "" : key_ + ": ") + problem);
}

const toml::table& TomlPlace::table() const {
  if (const toml::table* table = node_->as_table()) return *table;
  fail("must be a table");
}

std::string TomlPlace::text() const {
  if (const auto* text = node_->as_string()) return text->get();
  fail("must be a text");
}

TomlPlace TomlPlace::at(std::string_view name) const {
  const std::string key = key_.empty() ? std::string(name) : key_ + "." + std::string(name);
  if (const toml::node* node = table().get(name)) return {*file_, *node, key};
  TomlPlace(*file_, *node_, key).fail("is missing");
}

void TomlPlace::requireKeys(const std::vector<std::string_view>& known) const {
  for (const auto& [key, node] : table()) {
    if (std::find(known.begin(), known.end(), key.str()) == known.end())
      at(key.str()).fail("is no key of this file" + QorRT::didYouMean(key.str(), known));
  }
}

}  // namespace qor
