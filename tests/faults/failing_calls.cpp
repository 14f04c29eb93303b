// SPDX-License-Identifier: Apache-2.0
#include "failing_calls.hpp"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdarg>

namespace {

using lx::test::Call;

struct {
  bool armed = false;
  Call call{};
  int countdown = 0;
  int error = 0;
} g_fault;
size_t g_piece;
bool g_interrupt;

bool fails(Call call) {
  if (!g_fault.armed || g_fault.call != call || g_fault.countdown-- != 0) return false;
  errno = g_fault.error;
  return true;
}

}  // namespace

extern "C" {

int __real_open(const char* path, int flags, ...);
ssize_t __real_read(int descriptor, void* buffer, size_t count);
off_t __real_lseek(int descriptor, off_t offset, int origin);
int __real_close(int descriptor);
int __real_fstat(int descriptor, struct stat* status);

int __wrap_open(const char* path, int flags, ...) {
  mode_t mode = 0;
  if ((flags & O_CREAT) != 0) {
    va_list arguments;
    va_start(arguments, flags);
    mode = va_arg(arguments, mode_t);
    va_end(arguments);
  }
  return fails(Call::open) ? -1 : __real_open(path, flags, mode);
}

ssize_t __wrap_read(int descriptor, void* buffer, size_t count) {
  if (fails(Call::read)) return -1;
  if (g_piece == 0) return __real_read(descriptor, buffer, count);
  g_interrupt = !g_interrupt;
  if (g_interrupt) {
    errno = EINTR;
    return -1;
  }
  return __real_read(descriptor, buffer, std::min(count, g_piece));
}

off_t __wrap_lseek(int descriptor, off_t offset, int origin) {
  return fails(Call::seek) ? -1 : __real_lseek(descriptor, offset, origin);
}

// As the system does: the descriptor is gone even so.
int __wrap_close(int descriptor) {
  bool failing = fails(Call::close);
  int error = errno;
  int result = __real_close(descriptor);
  if (!failing) return result;
  errno = error;
  return -1;
}

int __wrap_fstat(int descriptor, struct stat* status) {
  return fails(Call::status) ? -1 : __real_fstat(descriptor, status);
}

}  // extern "C"

namespace lx::test {

FailingCall::FailingCall(Call call, int n, int error) { g_fault = {true, call, n, error}; }
FailingCall::~FailingCall() { g_fault.armed = false; }
bool FailingCall::happened() const { return g_fault.countdown < 0; }

void read_in_pieces(size_t at_most) { g_piece = at_most; }

}  // namespace lx::test
