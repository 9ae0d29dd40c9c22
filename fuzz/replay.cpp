// Calls a target with each file of some folders: inputs that are kept as tests.

#include <algorithm>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

#include "fuzz/Fuzz.h"

namespace {

namespace fs = std::filesystem;

std::vector<fs::path> FilesOf(const char* folder) {
  std::vector<fs::path> files;
  if (!fs::is_directory(folder)) return files;
  for (const fs::directory_entry& entry : fs::directory_iterator(folder)) {
    if (entry.is_regular_file()) files.push_back(entry.path());
  }
  std::sort(files.begin(), files.end());
  return files;
}

}  // namespace

int main(int count, char** words) {
  int replayed = 0;
  for (int i = 1; i < count; ++i) {
    for (const fs::path& file : FilesOf(words[i])) {
      // Said before, so that the last line names the one with which the process ends.
      std::fprintf(stderr, "%s\n", file.filename().c_str());
      std::ifstream stream(file, std::ios::binary);
      const std::string text{std::istreambuf_iterator<char>(stream), {}};
      LLVMFuzzerTestOneInput(reinterpret_cast<const std::uint8_t*>(text.data()), text.size());
      ++replayed;
    }
  }
  std::fprintf(stderr, "%d inputs\n", replayed);
  // A folder that has moved would pass for good.
  return replayed > 0 ? 0 : 1;
}
