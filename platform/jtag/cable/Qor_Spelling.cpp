#include "platform/jtag/cable/Qor_Spelling.h"

#include <algorithm>
#include <utility>

namespace QorRT {
namespace {

char folded(char letter) {
  return letter >= 'A' && letter <= 'Z' ? static_cast<char>(letter - 'A' + 'a') : letter;
}

// How many letters to add, drop or change.
std::size_t distance(std::string_view a, std::string_view b) {
  std::vector<std::size_t> row(b.size() + 1);
  for (std::size_t j = 0; j <= b.size(); ++j) row[j] = j;
  for (std::size_t i = 1; i <= a.size(); ++i) {
    std::size_t diagonal = std::exchange(row[0], i);
    for (std::size_t j = 1; j <= b.size(); ++j) {
      const std::size_t changed = diagonal + (folded(a[i - 1]) == folded(b[j - 1]) ? 0 : 1);
      diagonal = std::exchange(row[j], std::min({row[j] + 1, row[j - 1] + 1, changed}));
    }
  }
  return row[b.size()];
}

}  // namespace

std::string didYouMean(std::string_view name, const std::vector<std::string_view>& known) {
  std::string_view best;
  std::size_t least = std::max<std::size_t>(2, name.size() / 3) + 1;
  for (const std::string_view each : known) {
    const std::size_t far = distance(name, each);
    if (far >= least) continue;
    least = far;
    best = each;
  }
  return best.empty() ? "" : " (did you mean " + std::string(best) + "?)";
}

}  // namespace QorRT
