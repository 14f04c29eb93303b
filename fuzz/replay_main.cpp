// SPDX-License-Identifier: Apache-2.0
// Runs a fuzz target over the files named on the command line, and all files of the directories named there.
#include <cstdint>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size);

namespace {

void replay(const std::filesystem::path& path) {
  std::ifstream file(path, std::ios::binary);
  const std::string bytes{std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
  // A copy of exactly that size: what is read beyond its end is seen by a memory checker.
  const std::vector<uint8_t> input(bytes.begin(), bytes.end());
  std::fprintf(stderr, "%s\n", path.c_str());
  LLVMFuzzerTestOneInput(input.data(), input.size());
}

}  // namespace

int main(int count, char** names) {
  size_t replayed = 0;
  for (int i = 1; i < count; ++i) {
    if (!std::filesystem::is_directory(names[i])) {
      replay(names[i]);
      ++replayed;
      continue;
    }
    for (const auto& entry : std::filesystem::directory_iterator(names[i])) {
      replay(entry.path());
      ++replayed;
    }
  }
  std::fprintf(stderr, "%zu inputs\n", replayed);
  return replayed != 0 ? 0 : 1;
}
