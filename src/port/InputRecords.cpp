#include "src/port/InputRecords.h"

#include "src/port/CharBlock.h"

namespace QorRT {

namespace {

std::uint64_t loadAsyncRecord(const char* digits) {
  std::uint32_t record;
  std::memcpy(&record, digits, sizeof record);
  return record;
}

/// Two records in each row: those of bits i and i + 8.
CharBlock sixteenAsyncRecords(const char* digits) {
  CharBlock rows;
  const char* later = digits + asyncRecordDigits * rows.size();
  for (std::size_t row = 0; row < rows.size(); ++row) {
    const std::size_t at = asyncRecordDigits * row;
    rows[row] = loadAsyncRecord(digits + at) | loadAsyncRecord(later + at) << 32;
  }
  transpose(rows);
  return rows;
}

/// One record in each row, and after it two digits of the next one, which must be there.
CharBlock eightSyncRecords(const char* digits) {
  CharBlock rows;
  for (std::size_t row = 0; row < rows.size(); ++row) rows[row] = loadRow(digits + syncRecordDigits * row);
  transpose(rows);
  return rows;
}

template <std::size_t recordDigits, std::size_t kinds>
void splitOneByOne(const char* digits, std::size_t from, std::size_t count,
                   const std::array<char*, kinds>& columns) {
  for (std::size_t i = from; i < count; ++i)
    for (std::size_t kind = 0; kind < kinds; ++kind) columns[kind][i] = digits[recordDigits * i + kind];
}

}  // namespace

void splitAsyncRecords(const char* digits, std::size_t count, const std::array<char*, 3>& columns) {
  std::size_t i = 0;
  for (; i + 16 <= count; i += 16) {
    const CharBlock rows = sixteenAsyncRecords(digits + asyncRecordDigits * i);
    for (std::size_t kind = 0; kind < columns.size(); ++kind) {
      storeRow(rows[kind], columns[kind] + i);
      storeRow(rows[kind + asyncRecordDigits], columns[kind] + i + 8);
    }
  }
  splitOneByOne<asyncRecordDigits>(digits, i, count, columns);
}

void splitSyncRecords(const char* digits, std::size_t count, const std::array<char*, 5>& columns) {
  std::size_t i = 0;
  for (; i + 8 < count; i += 8) {
    const CharBlock rows = eightSyncRecords(digits + syncRecordDigits * i);
    for (std::size_t kind = 0; kind < columns.size(); ++kind) storeRow(rows[kind], columns[kind] + i);
  }
  splitOneByOne<syncRecordDigits>(digits, i, count, columns);
}

}  // namespace QorRT
