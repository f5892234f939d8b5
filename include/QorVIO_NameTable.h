/// @file
/// The table of a core's named groups.
///
/// Conventions
///
///  1. Two names are the same if their lengths and bytes are the same; A to Z equal a to z. Every other byte,
///     NUL included, must match exactly.
///  2. A key is a view of the name in its group, so a group must live longer than its entry. Looking a
///     name up copies nothing and adds no entry.
#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string_view>
#include <unordered_map>

#include "QorVIO_SignalGroup.h"

namespace QorRT {

/// Compares names as the conventions say.
struct QorVIO_NameEqual {
  /// The byte, A to Z as a to z.
  static unsigned char folded(char letter) {
    auto byte = static_cast<unsigned char>(letter);
    return byte >= 'A' && byte <= 'Z' ? static_cast<unsigned char>(byte - 'A' + 'a') : byte;
  }

  /// True when the names are the same.
  bool operator()(std::string_view one, std::string_view other) const {
    if (one.size() != other.size()) return false;
    for (std::size_t i = 0; i < one.size(); ++i)
      if (folded(one[i]) != folded(other[i])) return false;
    return true;
  }
};

/// FNV-1a over the folded bytes. Not noexcept on purpose: the table then stores each hash instead of
/// computing it again when it searches a bucket.
struct QorVIO_NameHash {
  /// The same for names that are the same.
  std::size_t operator()(std::string_view name) const {
    std::uint64_t hash = 14695981039346656037U;
    for (char letter : name) hash = (hash ^ QorVIO_NameEqual::folded(letter)) * 1099511628211U;
    return static_cast<std::size_t>(hash);
  }
};

/// The groups by name. Each entry owns its group.
using QorVIO_NameTable = std::unordered_map<std::string_view, std::unique_ptr<QorVIO_SignalGroup>,
                                            QorVIO_NameHash, QorVIO_NameEqual>;

}  // namespace QorRT
