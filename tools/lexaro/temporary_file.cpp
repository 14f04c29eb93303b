// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/temporary_file.hpp"

#include <fcntl.h>
#include <limits.h>

#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <cstring>

#include "tools/lexaro/failure.hpp"

namespace lx::tool {
namespace {

constexpr int kEndingSignals[] = {SIGHUP, SIGINT, SIGTERM};

// Where a signal handler finds what to remove: it may touch neither the heap nor a half-changed string.
struct Slot {
  volatile std::sig_atomic_t used;
  char path[PATH_MAX];
};
Slot slots[4];

extern "C" void remove_temporary_files(int signal_number) {
  for (const Slot& slot : slots) {
    if (slot.used) ::unlink(slot.path);
  }
  std::raise(signal_number);  // the handler was reset on entry: this ends the process with the signal's own status
}

// While a file appears or disappears, the slots must not disagree with the directory.
class SignalsHeld {
 public:
  SignalsHeld() {
    sigset_t ending;
    sigemptyset(&ending);
    for (int signal_number : kEndingSignals) sigaddset(&ending, signal_number);
    sigprocmask(SIG_BLOCK, &ending, &before_);
  }
  ~SignalsHeld() {
    const int error_number = errno;
    sigprocmask(SIG_SETMASK, &before_, nullptr);
    errno = error_number;
  }

 private:
  sigset_t before_{};
};

int claim_slot(const std::string& path) {
  for (int i = 0; i < static_cast<int>(std::size(slots)); ++i) {
    if (slots[i].used || path.size() >= sizeof slots[i].path) continue;
    std::memcpy(slots[i].path, path.c_str(), path.size() + 1);
    slots[i].used = 1;
    return i;
  }
  return -1;
}

}  // namespace

TemporaryFile::TemporaryFile(std::string target) : target_(std::move(target)) {
  const std::size_t slash = target_.rfind('/');
  path_ = (slash == std::string::npos ? std::string() : target_.substr(0, slash + 1)) + ".lexaro-XXXXXX";
  const SignalsHeld held;
  descriptor_ = FileDescriptor(::mkostemp(path_.data(), O_CLOEXEC));
  const int error_number = errno;
  if (!descriptor_)
    throw system_failure(message("{0}: cannot create a temporary file beside it", display_name(target_)), error_number);
  slot_ = claim_slot(path_);
}

TemporaryFile::~TemporaryFile() {
  if (path_.empty()) return;
  const SignalsHeld held;
  ::unlink(path_.c_str());
  if (slot_ >= 0) slots[slot_].used = 0;
}

bool TemporaryFile::rename_to_target() {
  const SignalsHeld held;
  if (std::rename(path_.c_str(), target_.c_str()) != 0) return false;
  if (slot_ >= 0) slots[slot_].used = 0;
  path_.clear();
  return true;
}

void install_signal_handling() {
  std::signal(SIGPIPE, SIG_IGN);
  std::signal(SIGXFSZ, SIG_IGN);
  struct sigaction ending {};
  ending.sa_handler = remove_temporary_files;
  ending.sa_flags = static_cast<int>(SA_RESETHAND) | SA_NODEFER;
  sigemptyset(&ending.sa_mask);
  for (int signal_number : kEndingSignals) {
    struct sigaction before {};
    sigaction(signal_number, nullptr, &before);
    if (before.sa_handler != SIG_IGN) sigaction(signal_number, &ending, nullptr);  // nohup stays in force
  }
}

}  // namespace lx::tool
