// Opens "lossy:N" in the place of all other cables: the demo board on a link that goes down after N exchanges.
// "slow:N" is the same, with a third of a second for each of them. "noisy:" flips bits of what comes back.
#include <charconv>
#include <chrono>
#include <stdexcept>
#include <string_view>
#include <thread>

#include "FaultyCable.h"
#include "QorJtag_Host.h"
#include "Sim.h"

namespace QorRT {

std::unique_ptr<Qor_Cable> openCable(const char* url, StopFunction) {
  const std::string_view text(url);
  if (text == "noisy:") {
    auto noisy = std::make_unique<qorsim::FaultyCable>(qorsim::demoBoard().cable());
    noisy->noise(0, 2e-4);
    return noisy;
  }
  const bool isSlow = text.substr(0, 5) == "slow:";
  const std::string_view kind = isSlow ? "slow:" : "lossy:";
  unsigned exchanges = 0;
  const char* const end = text.data() + text.size();
  const bool isKind = text.substr(0, kind.size()) == kind;
  const auto [rest, error] = std::from_chars(isKind ? text.data() + kind.size() : end, end, exchanges);
  if (error != std::errc() || rest != end)
    throw std::logic_error("neither lossy:N nor slow:N: " + std::string(text));
  auto cable = std::make_unique<qorsim::FaultyCable>(qorsim::demoBoard().cable());
  const qorsim::Fault slow{
      [](qorsim::PassingExchange&) { std::this_thread::sleep_for(std::chrono::milliseconds(333)); }};
  for (unsigned i = 0; i < exchanges; ++i) cable->next(isSlow ? slow : qorsim::Fault{});
  cable->next({[link = cable.get()](qorsim::PassingExchange&) {
    link->drop();
    throw std::runtime_error("the link is down");
  }});
  return cable;
}

}  // namespace QorRT
