// Files that other users or programs may have laid out.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace os {

/// The whole content of a regular file. Throws std::system_error, without waiting, for anything else: a folder, a pipe, a
/// device; and std::errc::file_too_large beyond `limit` bytes.
std::string readFile(const std::string& path, std::size_t limit);

/// Why others than the user and root could have made this file what it is; empty when they could not. It and its folder
/// must belong to one of them and must not be writable by anybody else. Symbolic links are followed first.
/// Throws std::system_error when there is no such file.
std::string distrust(const std::string& path);

/// Puts a file with this content in the place of `path`, whole or not at all, under the user's umask. Symbolic links in
/// its folder are never written through. Throws std::system_error, with the file as it was.
void replaceFile(const std::string& path, std::string_view content);

}  // namespace os
