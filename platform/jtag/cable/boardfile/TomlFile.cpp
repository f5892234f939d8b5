#include "platform/jtag/cable/boardfile/TomlFile.h"

#include <array>
#include <cerrno>
#include <fstream>
#include <stdexcept>
#include <system_error>

namespace QorRT {

std::string fileContents(const std::string& path) {
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

toml::table parseToml(const std::string& text, const std::string& file) {
  try {
    return toml::parse(text);
  } catch (const toml::parse_error& error) {
    throw std::runtime_error(file + ":" + std::to_string(error.source().begin.line) + ": " +
                             std::string(error.description()));
  }
}

}  // namespace QorRT
