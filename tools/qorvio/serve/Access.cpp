#include "tools/qorvio/serve/Access.h"

#include <algorithm>

namespace qor::tool {
namespace {

std::string lowered(std::string_view text) {
  std::string small(text);
  for (char& letter : small)
    if (letter >= 'A' && letter <= 'Z') letter = static_cast<char>(letter - 'A' + 'a');
  return small;
}

// Without the port; an IPv6 address is in brackets.
std::string_view nameIn(std::string_view host) {
  const std::size_t colon = host.rfind(':'), bracket = host.rfind(']');
  const bool hasPort = colon != host.npos && (bracket == host.npos || colon > bracket);
  return host.substr(0, hasPort ? colon : host.npos);
}

}  // namespace

Access::Access(std::string token, std::vector<std::string> hosts)
    : token_(std::move(token)), hosts_(std::move(hosts)) {
  for (std::string& each : hosts_) each = lowered(each);
}

bool Access::isToken(std::string_view given) const {
  if (token_.empty()) return true;
  std::size_t differences = given.size() ^ token_.size();
  for (std::size_t i = 0; i < given.size(); ++i)
    differences |= static_cast<unsigned char>(given[i] ^ token_[i % token_.size()]);
  return differences == 0;
}

bool Access::isHost(std::string_view host) const {
  return hosts_.empty() || std::find(hosts_.begin(), hosts_.end(), lowered(nameIn(host))) != hosts_.end();
}

bool Access::isOrigin(std::string_view origin, std::string_view host) {
  if (origin.empty()) return true;
  const std::size_t scheme = origin.find("://");
  return scheme != origin.npos && lowered(origin.substr(scheme + 3)) == lowered(host);
}

}  // namespace qor::tool
