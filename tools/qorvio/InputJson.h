// Inputs as the JSON of read and watch.
#pragma once

#include <string>

#include <nlohmann/json.hpp>

#include "board/model/Sample.h"
#include "board/model/Value.h"

namespace qor::tool {

/// Name, width, value and activity flags, in the order of the man page. `radix` as in shown().
nlohmann::ordered_json jsonOf(const Signal& input, const Sample& sample, const Radix* radix = nullptr);

/// Adds the activity flags under their names, each followed by `ending`.
void addActivity(nlohmann::ordered_json& entry, const Signal& input, const Sample& sample,
                 const std::string& ending);

}  // namespace qor::tool
