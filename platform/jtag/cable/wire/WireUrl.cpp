#include "platform/jtag/cable/wire/WireUrl.h"

#include <charconv>
#include <stdexcept>
#include <string_view>

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

// An IPv6 address stands in brackets.
Endpoint endpointOf(const std::string& text) {
  const std::size_t colon = text.rfind(':');
  if (colon == text.npos || colon == 0 || !isPort(std::string_view(text).substr(colon + 1))) return {};
  std::string host = text.substr(0, colon);
  if (host.size() > 2 && host.front() == '[' && host.back() == ']') host = host.substr(1, host.size() - 2);
  return {host, text.substr(colon + 1)};
}

}  // namespace

WireUrl parseWireUrl(const std::string& kind, const std::string& rest) {
  auto [server, options] = split(rest, '?');
  WireUrl url;
  if (!server.empty() && (url.endpoint = endpointOf(server)).host.empty())
    fail(kind, rest, "names no server: HOST:PORT is due, with a port of 1 to 65535");
  while (!options.empty()) {
    const auto [option, others] = split(options, '&');
    const auto [name, value] = split(option, '=');
    double seconds = 0;
    if (value.empty())
      fail(kind, rest, "gives the option \"" + name + "\" no value");
    else if (name == "board")
      url.board = boardDevices(value);
    else if (name == "config")
      url.config = value;
    else if (name != "timeout")
      fail(kind, rest, "has the unknown option \"" + name + "\"; known: board, config, timeout");
    else if (!isTimeout(value, seconds))
      fail(kind, rest, "has a timeout that is not 0 to 3600 seconds");
    else
      url.timeout = TcpStream::Seconds(seconds);
    options = others;
  }
  return url;
}

}  // namespace QorRT
