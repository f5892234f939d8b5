#include "os/Folder.h"

#include <unistd.h>

namespace os {

bool isWritableFolder(const std::string& path) {
  return access((path + "/.").c_str(), W_OK | X_OK) == 0;
}

}  // namespace os
