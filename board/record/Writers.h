// The kinds of files.
#pragma once

#include "board/record/SampleWriter.h"

namespace qor {

std::unique_ptr<SampleWriter> vcdWriter(const std::string& path);
std::unique_ptr<SampleWriter> csvWriter(const std::string& path);
std::unique_ptr<SampleWriter> jsonLinesWriter(const std::string& path);

}  // namespace qor
