#include "tests/fuzz/Fuzz.h"

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>

void require(bool holds, const std::string& what) {
  if (holds) return;
  std::fprintf(stderr, "not as the model says: %s\n", what.c_str());
  std::abort();
}

void requireEqual(const std::string& seen, const std::string& wanted) {
  require(seen == wanted, "\n   seen: " + seen + "\n wanted: " + wanted);
}

std::vector<std::string> split(std::string_view text, char separator) {
  std::vector<std::string> parts(1);
  for (const char c : text) {
    if (c == separator)
      parts.emplace_back();
    else
      parts.back() += c;
  }
  return parts;
}

int digitValue(char c) {
  const std::size_t at = std::string_view("0123456789ABCDEFabcdef").find(c);
  return at == std::string_view::npos ? -1 : static_cast<int>(at < 16 ? at : at - 6);
}

std::string hexText(unsigned value, int count) {
  char text[16];
  std::snprintf(text, sizeof text, "%0*X", count, value);
  return text;
}

extern "C" int LLVMFuzzerTestOneInput(const unsigned char* data, std::size_t size) {
  fuzz({reinterpret_cast<const char*>(data), size});
  return 0;
}

#ifdef QORVIO_REPLAY
/// Without libFuzzer: every file of the folders that are named.
int main(int argc, char** argv) {
  std::size_t count = 0;
  for (int i = 1; i < argc; ++i) {
    for (const auto& entry : std::filesystem::directory_iterator(argv[i])) {
      std::ifstream file(entry.path(), std::ios::binary);
      const std::string input{std::istreambuf_iterator<char>(file), {}};
      std::printf("%s\n", entry.path().c_str());
      fuzz(input);
      ++count;
    }
  }
  require(count != 0, "there are inputs to replay");
}
#endif
