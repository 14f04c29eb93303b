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

void InputFile::write(std::string_view bytes) const {
  const bool written = ftruncate(descriptor_, 0) == 0 &&
                       pwrite(descriptor_, bytes.data(), bytes.size(), 0) == static_cast<ssize_t>(bytes.size());
  demand(written, "the input file cannot be written");
}

void Target::start(const char* directory, const std::string& before, const std::vector<std::string>& names,
                   const std::string& after) {
  LXInit(directory, nullptr, nullptr, nullptr, LX_INIT_NO_DEFAULTS);
  for (const std::string& name : names) {
    locales_.push_back(LXGetLocale((before + name + after).c_str(), 0, nullptr));
    demand(locales_.back() != nullptr, name.c_str());
  }
}

Target::~Target() {
  for (LXLocale* locale : locales_) LXReleaseLocale(locale, 0);
  LXTerm();
}

}  // namespace lx::fuzz

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  static const std::unique_ptr<lx::fuzz::Target> target = lx::fuzz::make_target();
  target->run({data, size});
  return 0;
}
