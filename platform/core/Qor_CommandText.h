// Command texts: lines of seven fields separated by single blanks and joined by line feeds.
//
// device   user chain   core    code       capture   bit count   data 2 digits 1 digit      1 digit 2 digits
// 0 or 1    8 digits    digits; "0" on every line but code 01
//
// Numbers are hexadecimal. Lines come in pairs with one address: 01 and 02 write, 03 and 04 read.
#pragma once

#include <cstddef>
#include <string_view>
#include <vector>

#include "QorCore_Records.h"

namespace QorRT {

/// What one pair of lines asks for.
struct Qor_PortCommand {
  QOR_CORE_REF coreRef;
  bool isRead;
  std::size_t bitCount;                // write: of the payload; read: of the records
  std::vector<unsigned char> payload;  // write: bit i of the data is bit (i mod 8) of byte i / 8

  /// The bytes it takes in the result: records and their CRC, then one byte with the flags.
  std::size_t resultBytes() const;
};

/// The pairs of a text in their order. Throws logic_error with the line, the field and what is there,
/// such as "command text line 2, code: 07".
std::vector<Qor_PortCommand> parseCommandText(std::string_view text);

}  // namespace QorRT
