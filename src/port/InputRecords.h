// What a read brings: one record of digits for each input bit, taken apart into one string for each kind of digit.
#pragma once

#include <array>
#include <cstddef>

namespace QorRT {

/// Value, activity up, activity down, one unused.
inline constexpr std::size_t asyncRecordDigits = 4;
/// Value, activity up, activity down, sync activity up, sync activity down, one unused.
inline constexpr std::size_t syncRecordDigits = 6;

/// Digit k of record i becomes character i of column k. `digits` contains `count` records, each column has room for as many
/// characters.
void splitAsyncRecords(const char* digits, std::size_t count, const std::array<char*, 3>& columns);
void splitSyncRecords(const char* digits, std::size_t count, const std::array<char*, 5>& columns);

}  // namespace QorRT
