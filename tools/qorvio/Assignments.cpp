#include "tools/qorvio/Assignments.h"

#include "tools/qorvio/Report.h"

namespace qor::tool {

void printWritten(const Context& context, const std::vector<Assignment>& assignments) {
  if (!context.settings.json) return;
  nlohmann::ordered_json json = nlohmann::ordered_json::array();
  for (const Assignment& each : assignments) {
    nlohmann::ordered_json steps = nlohmann::ordered_json::array();
    for (const Bytes& step : each.steps) steps.push_back(hexText(step, each.signal.width()));
    json.push_back({{"name", each.signal.name}, {"width", each.signal.width()}, {"steps", steps}});
  }
  print({{}, json}, true);
}

}  // namespace qor::tool
