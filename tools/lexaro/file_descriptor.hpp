// SPDX-License-Identifier: Apache-2.0
// Ownership of a file descriptor, and the calls on it that a signal may interrupt.
#pragma once

#include <poll.h>
#include <sys/types.h>
#include <unistd.h>

#include <cerrno>
#include <cstddef>
#include <utility>

namespace lx::tool {

class FileDescriptor {
 public:
  FileDescriptor() = default;
  explicit FileDescriptor(int fd) : fd_(fd) {}
  FileDescriptor(FileDescriptor&& other) noexcept : fd_(std::exchange(other.fd_, -1)) {}
  FileDescriptor& operator=(FileDescriptor&& other) noexcept {
    std::swap(fd_, other.fd_);
    return *this;
  }
  ~FileDescriptor() {
    if (fd_ >= 0) ::close(fd_);
  }
  int get() const { return fd_; }
  explicit operator bool() const { return fd_ >= 0; }

  // False with errno when the system reports late that written data are lost.
  bool close() {
    const int fd = std::exchange(fd_, -1);
    return fd < 0 || ::close(fd) == 0 || errno == EINTR;
  }

 private:
  int fd_ = -1;
};

// Repeats a read or write that a signal interrupted, and waits when the descriptor came to us non-blocking.
template <class Call>
ssize_t persist(int fd, short events, Call call) {
  for (;;) {
    const ssize_t count = call();
    if (count >= 0) return count;
    if (errno == EINTR) continue;
    if (errno != EAGAIN && errno != EWOULDBLOCK) return count;
    pollfd waiting{fd, events, 0};
    if (::poll(&waiting, 1, -1) < 0 && errno != EINTR) return -1;
  }
}

}  // namespace lx::tool
