// SPDX-License-Identifier: Apache-2.0
#include "fuzz_support.hpp"

#include <fcntl.h>
#include <unistd.h>

#include <cstdio>
#include <cstdlib>

namespace lx::fuzz {

void demand(const char* wrong) {
  if (wrong == nullptr) return;
  std::fprintf(stderr, "broken: %s\n", wrong);
  std::abort();
}

void demand(bool holds, const char* what) { demand(holds ? nullptr : what); }

InputFile::InputFile(const test::DataDirectory& directory, std::string_view name)
    : descriptor_(open(directory.file(name).c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0600)) {
  demand(descriptor_ >= 0, "the input file cannot be made");
}

InputFile::~InputFile() { close(descriptor_); }

void InputFile::write(const uint8_t* data, size_t size) const {
  bool written = ftruncate(descriptor_, 0) == 0 && pwrite(descriptor_, data, size, 0) == static_cast<ssize_t>(size);
  demand(written, "the input file cannot be written");
}

}  // namespace lx::fuzz
