// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/output_file.hpp"

#include <fcntl.h>

#include <filesystem>
#include <system_error>

#include "tools/lexaro/failure.hpp"

namespace lx::tool {
namespace {

namespace fs = std::filesystem;

// Where a path that names no file yet will create one: a symbolic link may already point there.
fs::path follow_links(fs::path path) {
  std::error_code error;
  for (int hops = 0; hops < 40 && fs::is_symlink(path, error); ++hops) {
    path = path.parent_path() / fs::read_symlink(path, error);
  }
  return path;
}

mode_t mode_of_new_files() {
  const mode_t mask = ::umask(0);
  ::umask(mask);
  return 0666 & ~mask;
}

}  // namespace

OutputFile::OutputFile(const std::string& path) : path_(path) {
  if (path == "-") {
    direct_ = FileDescriptor(STDOUT_FILENO);
    return;
  }
  struct stat existing {};
  if (::stat(path.c_str(), &existing) != 0) {
    if (errno != ENOENT) throw failure(errno);
    target_ = follow_links(path);
    open_temporary(nullptr);
    return;
  }
  // A file that may not be written is not replaced either, though its directory would allow it.
  if (::access(path.c_str(), W_OK) != 0) throw failure(errno);
  std::error_code error;
  if (S_ISREG(existing.st_mode)) target_ = fs::canonical(path, error);
  if (!target_.empty()) {
    open_temporary(&existing);
    return;
  }
  direct_ = FileDescriptor(::open(path.c_str(), O_WRONLY | O_CLOEXEC | O_NOCTTY));
  if (!direct_) throw failure(errno);
}

Message OutputFile::name() const { return path_ == "-" ? message("standard output") : display_name(path_); }

Failure OutputFile::failure(int error_number) const { return system_failure(name(), error_number); }

void OutputFile::open_temporary(const struct stat* existing) {
  temporary_ = std::make_unique<TemporaryFile>(target_);
  const int fd = temporary_->descriptor().get();
  mode_t mode = existing ? existing->st_mode & 07777 : mode_of_new_files();
  if (existing && ::fchown(fd, existing->st_uid, existing->st_gid) != 0) {
    // Only the superuser gives files away: what was granted to the former owner's identity is not granted to another.
    mode &= static_cast<mode_t>(::fchown(fd, static_cast<uid_t>(-1), existing->st_gid) == 0 ? 01777 : 01707);
  }
  if (::fchmod(fd, mode) != 0) throw failure(errno);
}

void OutputFile::write(std::string_view bytes) {
  const int fd = descriptor().get();
  while (!bytes.empty()) {
    const ssize_t count = persist(fd, POLLOUT, [&] { return ::write(fd, bytes.data(), bytes.size()); });
    if (count < 0) {
      // A reader that has seen enough is no news: the exit code tells it.
      const int error_number = errno;
      if (error_number == EPIPE)
        throw Failure(ExitStatus::kInputOutput, message("{0}: closed by its reader", name()), true);
      throw system_failure(message("{0}: write error at byte {1}", name(), offset_), error_number);
    }
    offset_ += static_cast<uint64_t>(count);
    bytes.remove_prefix(static_cast<std::size_t>(count));
  }
}

void OutputFile::commit() {
  if (!descriptor().close()) throw failure(errno);
  if (temporary_ && !temporary_->rename_to_target()) throw failure(errno);
}

bool OutputFile::writes_into(const struct stat& file) const {
  struct stat own {};
  if (temporary_ || ::fstat(direct_.get(), &own) != 0) return false;
  return S_ISREG(own.st_mode) && own.st_dev == file.st_dev && own.st_ino == file.st_ino;
}

void print(std::string_view text) {
  OutputFile output("-");
  output.write(text);
  output.commit();
}

}  // namespace lx::tool
