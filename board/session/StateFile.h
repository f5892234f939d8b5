// Files about a board that stay from run to run, for all hosts of this user.
#pragma once

#include <optional>
#include <string>

#include <nlohmann/json.hpp>

#include "board/model/Bits.h"
#include "os/FileLock.h"

namespace qor {

class StateFile {
 public:
  /// Of no board: has no content and takes none.
  StateFile() = default;

  /// `key` names board and core, in any characters; `ending` the kind of file.
  StateFile(const std::string& folder, const std::string& key, const std::string& ending);

  const std::string& path() const { return path_; }

  /// Whether it can be kept up to date.
  bool isUsable() const;

  /// Makes its folder, where that can be done.
  void makeFolder() const;

  /// An object; an empty one when there is none, or it is damaged.
  nlohmann::json content() const;

  /// While the lock lives, no other host changes a file of this folder. Throws std::system_error,
  /// timed_out when others have kept it locked for two seconds.
  os::FileLock lock() const;

  /// Puts this in its place, whole or not at all. Throws std::system_error.
  void replace(const nlohmann::ordered_json& content) const;

 private:
  std::string path_;
};

/// An image of a port as such files have it: one number.
/// @{
std::string imageText(const Bytes& image);
/// Nothing when there is none that fits.
std::optional<Bytes> imageIn(const nlohmann::json& file, const std::string& key, unsigned width);
/// @}

}  // namespace qor
