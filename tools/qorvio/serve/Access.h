// Who may speak to a server: its token, and the names under which browsers may reach it.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace qor::tool {

class Access {
 public:
  /// An empty token: none is wanted. `hosts` are the names that the server goes by; empty: any.
  Access(std::string token, std::vector<std::string> hosts);

  bool wantsToken() const { return !token_.empty(); }

  /// In a time that depends on the length of `given` alone.
  bool isToken(std::string_view given) const;

  /// A Host header, "localhost:9825", of a name that the server goes by. Another one is a page that had its name
  /// resolved to this machine.
  bool isHost(std::string_view host) const;

  /// An Origin header of a page that came from that host, over whatever scheme; an empty one is no browser.
  static bool isOrigin(std::string_view origin, std::string_view host);

 private:
  std::string token_;
  std::vector<std::string> hosts_;
};

}  // namespace qor::tool
