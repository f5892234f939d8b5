// Opens "lossy:N" in the place of all other cables: the demo board behind a link that goes down after N exchanges.
#include <charconv>
#include <stdexcept>
#include <string_view>

#include "FaultyCable.h"
#include "QorJtag_Host.h"
#include "Sim.h"

namespace QorRT {

std::unique_ptr<Qor_Cable> openCable(const char* url) {
  const std::string_view text(url), kind = "lossy:";
  unsigned exchanges = 0;
  const char* const end = text.data() + text.size();
  const bool isKind = text.substr(0, kind.size()) == kind;
  const auto [rest, error] = std::from_chars(isKind ? text.data() + kind.size() : end, end, exchanges);
  if (error != std::errc() || rest != end) throw std::logic_error("not lossy:N: " + std::string(text));
  auto cable = std::make_unique<qorsim::FaultyCable>(qorsim::demoBoard().cable());
  for (unsigned i = 0; i < exchanges; ++i) cable->next({});
  cable->next({[link = cable.get()](qorsim::PassingExchange&) {
    link->drop();
    throw std::runtime_error("the link is down");
  }});
  return cable;
}

}  // namespace QorRT
