#include "platform/jtag/cable/wire/WireUrl.h"

#include <algorithm>
#include <charconv>
#include <stdexcept>
#include <string_view>
#include <utility>

namespace QorRT {
namespace {

[[noreturn]] void fail(const std::string& kind, const std::string& rest, const std::string& problem) {
  throw std::logic_error("the cable URL \"" + kind + ":" + rest + "\" " + problem);
}

bool isPort(std::string_view text) {
  unsigned port = 0;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), port);
  return error == std::errc() && end == text.data() + text.size() && port >= 1 && port <= 65535;
}

bool isTimeout(std::string_view text, double& seconds) {
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), seconds);
  return error == std::errc() && end == text.data() + text.size() && seconds > 0 && seconds <= 3600;
}

// Splits at the first of that character; the second part is empty without one.
std::pair<std::string, std::string> split(const std::string& text, char at) {
  const std::size_t place = text.find(at);
  if (place == text.npos) return {text, ""};
  return {text.substr(0, place), text.substr(place + 1)};
}

// An IPv6 address is in brackets.
Endpoint endpointOf(const std::string& text) {
  const std::size_t colon = text.rfind(':');
  if (colon == text.npos || colon == 0 || !isPort(std::string_view(text).substr(colon + 1))) return {};
  std::string host = text.substr(0, colon);
  if (host.size() > 2 && host.front() == '[' && host.back() == ']') host = host.substr(1, host.size() - 2);
  return {host, text.substr(colon + 1)};
}

// False for a "%" without two hexadecimal digits after it.
bool decode(std::string& text) {
  std::string plain;
  for (std::size_t i = 0; i < text.size(); ++i) {
    unsigned byte = static_cast<unsigned char>(text[i]);
    if (text[i] == '%') {
      const char* const digits = text.data() + i + 1;
      const char* const end = text.data() + std::min(i + 3, text.size());
      if (end - digits != 2 || std::from_chars(digits, end, byte, 16).ptr != end) return false;
      i += 2;
    }
    plain += static_cast<char>(byte);
  }
  text = std::move(plain);
  return true;
}

std::string listOf(const std::vector<std::string>& names) {
  std::string list;
  for (const std::string& name : names) list.append(list.empty() ? "" : ", ").append(name);
  return list;
}

}  // namespace

WireUrl parseWireUrl(const std::string& kind, const std::string& rest,
                     const std::vector<std::string>& options) {
  auto [server, left] = split(rest, '?');
  WireUrl url;
  if (!server.empty() && (url.endpoint = endpointOf(server)).host.empty())
    fail(kind, rest, "names no server: HOST:PORT is due, with a port of 1 to 65535");
  while (!left.empty()) {
    const auto [option, others] = split(left, '&');
    auto [name, value] = split(option, '=');
    double seconds = 0;
    if (std::find(options.begin(), options.end(), name) == options.end())
      fail(kind, rest, "has the unknown option \"" + name + "\"; known: " + listOf(options));
    if (value.empty()) fail(kind, rest, "gives the option \"" + name + "\" no value");
    if (!decode(value)) fail(kind, rest, "has a \"%\" without two hexadecimal digits after it");
    if (name == "board") url.board = value;
    if (name == "config") url.config = value;
    if (name == "timeout" && !isTimeout(value, seconds))
      fail(kind, rest, "has a timeout that is not 0 to 3600 seconds");
    if (name == "timeout") url.timeout = Seconds(seconds);
    left = others;
  }
  return url;
}

}  // namespace QorRT
