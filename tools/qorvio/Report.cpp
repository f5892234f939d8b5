#include "tools/qorvio/Report.h"

#include <cstdio>

namespace qor::tool {
namespace {

using nlohmann::ordered_json;

constexpr auto replaced = ordered_json::error_handler_t::replace;

}  // namespace

void print(const Report& report, bool asJson) {
  const std::string text = asJson ? report.json.dump(2, ' ', false, replaced) + '\n' : report.text;
  std::fwrite(text.data(), 1, text.size(), stdout);
}

std::string jsonLine(const ordered_json& json) {
  return json.dump(-1, ' ', false, replaced);
}

}  // namespace qor::tool
