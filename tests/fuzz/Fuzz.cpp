#include "tests/fuzz/Fuzz.h"

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>

void require(bool condition, const std::string& what) {
  if (condition) return;
  std::fprintf(stderr, "not so: %s\n", what.c_str());
  std::abort();
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

std::string grown(std::string_view text) {
  std::string all;
  for (const std::string& line : split(text, '\n')) {
    const std::size_t blank = line.find(' ');
    if (line.empty() || line[0] != '~' || blank == line.npos) {
      all += line + '\n';
      continue;
    }
    for (unsigned long i = std::strtoul(&line[1], nullptr, 10); i > 0 && all.size() < (256 << 10); --i)
      all.append(line, blank + 1);
  }
  return all;
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
      require(file.is_open(), "it can be read");
      fuzz(input);
      ++count;
    }
  }
  require(count != 0, "there are inputs to replay");
}
#endif
