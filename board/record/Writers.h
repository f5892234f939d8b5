// The kinds of files.
#pragma once

#include "board/record/SampleWriter.h"

namespace qor {

/// A signal's name, and a core's scope, in a value change dump.
/// @{
std::string vcdName(std::string name);
std::string vcdScope(QOR_CORE_REF core);
/// @}

std::unique_ptr<SampleWriter> vcdWriter(const std::string& path);
std::unique_ptr<SampleWriter> csvWriter(const std::string& path);
std::unique_ptr<SampleWriter> jsonLinesWriter(const std::string& path);

}  // namespace qor
