#pragma once

#include <cstddef>

namespace qor {

/// A file of the console's page, compressed by gzip.
struct ConsoleFile {
  const char* path;  ///< of the request: "/", "/app.js"
  const char* contentType;
  const unsigned char* bytes;
  std::size_t size;
  const char* etag;  ///< with its quotes
};

const ConsoleFile* consoleFiles();
std::size_t consoleFileCount();

}  // namespace qor
