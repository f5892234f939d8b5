#include "board/session/CableUrl.h"

#include <filesystem>
#include <string_view>

namespace qor {
namespace {

std::string lowered(std::string_view text) {
  std::string small(text);
  for (char& letter : small)
    if (letter >= 'A' && letter <= 'Z') letter = static_cast<char>(letter - 'A' + 'a');
  return small;
}

// The value of an option, "config=FILE" after ? or &.
std::string option(std::string_view options, std::string_view key) {
  while (!options.empty()) {
    const std::string_view each = options.substr(0, options.find('&'));
    if (each.substr(0, key.size()) == key) return std::string(each.substr(key.size()));
    options.remove_prefix(each.size() == options.size() ? each.size() : each.size() + 1);
  }
  return {};
}

std::string portNumber(std::string_view digits) {
  const std::size_t first = digits.find_first_not_of('0');
  return std::string(first == digits.npos ? digits : digits.substr(first));
}

// "HOST:PORT" as numbers where they are this machine's.
std::string placeOf(std::string_view kind, std::string_view place) {
  const std::size_t colon = place.rfind(':');
  std::string host = lowered(place.substr(0, colon));
  std::string port = colon == place.npos ? "" : portNumber(place.substr(colon + 1));
  if (host.empty() || host == "localhost") host = "127.0.0.1";
  if (port.empty() && kind == "openocd") port = "6666";
  return host + ":" + port;
}

}  // namespace

std::string boardName(const std::string& url) {
  const std::size_t colon = url.find(':');
  if (colon == url.npos) return url;
  const std::string kind = lowered(std::string_view(url).substr(0, colon));
  const std::string_view rest = std::string_view(url).substr(colon + 1);
  if (kind != "rbb" && kind != "openocd") return url;
  const std::size_t question = rest.find('?');
  const std::string config = question == rest.npos ? "" : option(rest.substr(question + 1), "config=");
  if (config.empty()) return kind + ":" + placeOf(kind, rest.substr(0, question));
  std::error_code failed;
  const std::filesystem::path whole = std::filesystem::weakly_canonical(config, failed);
  return kind + ":?config=" + (failed ? config : whole.string());
}

bool isNewBoard(const std::string& url) {
  return lowered(std::string_view(url).substr(0, 4)) == "sim:";
}

}  // namespace qor
