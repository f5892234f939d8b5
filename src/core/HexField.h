// Value texts: hexadecimal numbers of any length, fitted to the width of what they are written to.
#pragma once

#include <memory>
#include <string_view>

#include "QorUtil.h"

namespace QorRT {

/// The value bytes of a text, ceil(bitWidth / 8) of them, least significant first. A text shorter than the
/// field of two digits a byte is extended to the left by the top bit of its first digit; of a longer one the
/// rightmost digits count. Throws "Invalid Hex String: " and the text (or the first character, where that is
/// to be extended) when a digit is not hexadecimal, or the text is empty; throws length_error when the field
/// does not fit a buffer. `bitWidth` is at least 1.
std::unique_ptr<Qor_ByteBuffer> fitHexField(std::string_view text, unsigned long long bitWidth);

}  // namespace QorRT
