#include "platform/jtag/cable/boardfile/TomlFile.h"

#include <array>
#include <cerrno>
#include <filesystem>
#include <fstream>
#include <stdexcept>
#include <system_error>

#include "QorJtag_Host.h"
#include "platform/jtag/cable/boardfile/TomlBounds.h"

namespace QorRT {
namespace {

[[noreturn]] void failToOpen(const std::string& path, const std::string& why) {
  throw std::invalid_argument(path + ": cannot be opened: " + why);
}

// Opening a FIFO would wait for somebody who writes to it.
void requireRegularFile(const std::string& path) {
  std::error_code error;
  const std::filesystem::file_status status = std::filesystem::status(path, error);
  if (error) failToOpen(path, error.message());
  if (std::filesystem::is_directory(status)) failToOpen(path, "it is a directory");
  if (!std::filesystem::is_regular_file(status)) failToOpen(path, "it is not a regular file");
}

}  // namespace

std::string fileContents(const std::string& path) {
  requireRegularFile(path);
  std::ifstream file(path, std::ios::binary);
  const int error = errno;
  if (!file) failToOpen(path, std::generic_category().message(error));
  std::string text;
  std::array<char, 4096> block{};
  while (text.size() <= mostTomlBytes && (file.read(block.data(), block.size()) || file.gcount() > 0))
    text.append(block.data(), static_cast<std::size_t>(file.gcount()));
  if (file.bad()) throw std::invalid_argument(path + ": cannot be read");
  return text;
}

std::string readTomlText(const std::string& path) {
  std::string text = fileContents(path);
  requireTomlBounds(text, path);
  return text;
}

toml::table parseToml(const std::string& text, const std::string& file) {
  requireTomlBounds(text, file);
  try {
    return toml::parse(text);
  } catch (const toml::parse_error& error) {
    throw std::invalid_argument(file + ":" + std::to_string(error.source().begin.line) + ": " +
                                std::string(error.description()));
  }
}

}  // namespace QorRT
