// SPDX-License-Identifier: Apache-2.0
// Data files: the operating system's descriptor calls with the library's status codes, and safe replacement of a file.
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>
#include <cerrno>
#include <cstdio>
#include <cstring>

#include "frame/call.hpp"
#include "frame/memory.hpp"

namespace lx {
namespace {

TRC1_Unit trace_unit = {"Lexaro", "file", 0};

enum OpenMode : uint8_t { kRead = 0, kCreate = 1, kReadWrite = 2 };
constexpr mode_t kNewFilePermissions = 0644;
constexpr char kTemporaryEnding[] = "tmp";

// Room for the parts of a path, as SplitPath delivers them.
struct PathParts {
  char drive[4];
  char directory[256];
  char file[15];
  char extension[5];

  void split(const char* path) { SplitPath(path, drive, directory, file, extension); }
};
constexpr size_t kPathRoom = sizeof(PathParts) + sizeof kTemporaryEnding;

}  // namespace
}  // namespace lx

struct LXFile {
  int32_t descriptor;
  uint8_t mode;
  uint8_t temporary;
  uint8_t at_end;
  char target_base[256];
  char target_extension[5];
};

namespace lx {
namespace {

uint32_t open_error(int error) {
  switch (error) {
    case ENOENT:
      return LX_E_NOFILE;
    case EACCES:
      return LX_E_ACCESS;
    default:
      return LX_E_OPEN;
  }
}

// Notes the target in the handle and names the file that is written in its place. False when the limits of the parts
// would lose something of the path, so that closing would replace another file.
bool prepare_temporary(LXFile& file, const char* path, char* name) {
  PathParts parts;
  parts.split(path);
  char base[kPathRoom];
  MakePath(base, parts.drive, parts.directory, parts.file, "");
  size_t base_length = std::strlen(base);
  if (base_length >= sizeof file.target_base || std::strncmp(path, base, base_length) != 0 ||
      std::strcmp(path + base_length, parts.extension) != 0) {
    return false;
  }
  std::memcpy(file.target_base, base, base_length + 1);
  std::memcpy(file.target_extension, parts.extension, sizeof parts.extension);
  MakePath(name, "", "", base, kTemporaryEnding);
  LX_TRACE(TRC1_LEVEL_DETAIL, "Using temp file %s", name);
  file.temporary = 1;
  return true;
}

// A failed creation is found out when the file is closed; only descriptor 0 is refused here.
uint32_t create_file(LXFile& file, const char* path, bool no_temporary) {
  char name[kPathRoom];
  if (!no_temporary && access(path, F_OK) == 0) {
    if (!prepare_temporary(file, path, name)) return LX_E_FILE;
    path = name;
  }
  file.descriptor = open(path, O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, kNewFilePermissions);
  if (file.descriptor != 0) return LX_OK;
  close(file.descriptor);
  return LX_E_OPEN;
}

uint32_t open_existing(LXFile& file, const char* path, int how) {
  file.descriptor = open(path, how | O_CLOEXEC);
  return file.descriptor >= 0 ? LX_OK : open_error(errno);
}

uint32_t open_by_mode(LXFile& file, const char* path, bool no_temporary) {
  switch (file.mode) {
    case kRead:
      return open_existing(file, path, O_RDONLY | O_NONBLOCK);  // a pipe in place of a file must not hang
    case kReadWrite:
      return open_existing(file, path, O_RDWR);
    case kCreate:
      return create_file(file, path, no_temporary);
    default:
      return LX_OK;
  }
}

bool replace_target(const LXFile& file, bool discard) {
  char temporary[sizeof file.target_base + sizeof kTemporaryEnding];
  MakePath(temporary, "", "", file.target_base, kTemporaryEnding);
  if (discard) return unlink(temporary) == 0;
  char target[sizeof file.target_base + sizeof file.target_extension];
  MakePath(target, "", "", file.target_base, file.target_extension);
  LX_TRACE(TRC1_LEVEL_DETAIL, "Renaming %s to %s", temporary, target);
  if (access(target, W_OK) == 0 && rename(temporary, target) == 0) return true;
  LX_TRACE(TRC1_LEVEL_ERROR, "Close failed, rc = %d", errno);
  return false;
}

// Bytes read, -1 on a system failure; short only at the end of the file.
int64_t read_fully(int descriptor, void* buffer, size_t count) {
  auto* out = static_cast<uint8_t*>(buffer);
  size_t done = 0;
  while (done < count) {
    ssize_t got = read(descriptor, out + done, count - done);
    if (got == 0) break;
    if (got > 0) {
      done += static_cast<size_t>(got);
    } else if (errno != EINTR) {
      return -1;
    }
  }
  return static_cast<int64_t>(done);
}

}  // namespace
}  // namespace lx

using namespace lx;

extern "C" {

LXFile* LXOpenFile(uint32_t /*access_mode*/, const char* path, uint8_t open_mode, int32_t no_temporary,
                   uint32_t* rc) noexcept {
  return exported(trace_unit, __func__, [&]() -> LXFile* {
    set_status(rc, LX_OK);
    if (path == nullptr) {
      set_status(rc, LX_E_ARGUMENT);
      return nullptr;
    }
    LX_TRACE(TRC1_LEVEL_DETAIL, "Opening file %s", path);
    auto file = Owned<LXFile>::zeroed();
    if (!file) {
      set_status(rc, LX_E_MEMORY);
      return nullptr;
    }
    file->descriptor = -1;
    file->mode = open_mode;
    file->at_end = open_mode == kCreate ? 1 : 0;
    uint32_t status = open_by_mode(*file, path, no_temporary != 0);
    set_status(rc, status);
    return status == LX_OK ? file.give_up() : nullptr;
  });
}

uint32_t LXCloseFile(LXFile* handle, int32_t discard) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    if (handle == nullptr || close(handle->descriptor) != 0) return 1;
    Owned<LXFile> file(handle);
    return file->temporary == 0 || replace_target(*file, discard == 1) ? 0 : 1;
  });
}

uint32_t LXReadFile(LXFile* handle, void* buffer, uint32_t count, uint32_t* rc) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    if (handle == nullptr || (buffer == nullptr && count != 0)) {
      set_status(rc, LX_E_ARGUMENT);
      return 0;
    }
    if (handle->mode == kCreate) {
      set_status(rc, LX_E_READMODE);
      return 0;
    }
    int64_t got = read_fully(handle->descriptor, buffer, count);
    set_status(rc, got < 0 ? LX_E_FILE : LX_OK);
    if (got == 0) handle->at_end = 1;
    return got < 0 ? 0 : static_cast<uint32_t>(got);
  });
}

uint32_t LXSeekFile(LXFile* handle, int32_t offset, uint32_t origin) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    if (handle == nullptr) return 1;
    handle->at_end = 0;
    switch (origin) {
      case LX_SEEK_SET:
        return lseek(handle->descriptor, offset, SEEK_SET) < 0 ? 1 : 0;
      case LX_SEEK_CUR:
        return lseek(handle->descriptor, offset, SEEK_CUR) < 0 ? 1 : 0;
      case LX_SEEK_END:
        return lseek(handle->descriptor, offset, SEEK_END) < 0 ? 1 : 0;
      default:
        return 1;
    }
  });
}

void* LXLoadFile(LXFile* handle, uint32_t offset, uint32_t size, uint32_t* rc) noexcept {
  return exported(trace_unit, __func__, [&]() -> void* {
    auto fail = [&](uint32_t status) -> void* {
      set_status(rc, status);
      return nullptr;
    };
    if (handle == nullptr) return fail(LX_E_ARGUMENT);
    if (handle->mode == kCreate) return fail(LX_E_READMODE);
    if (size == 0) return fail(LX_OK);
    auto buffer = Owned<uint8_t>::array(size);
    if (!buffer) return fail(LX_E_MEMORY);
    handle->at_end = 0;
    if (lseek(handle->descriptor, static_cast<off_t>(offset), SEEK_SET) < 0) return fail(LX_E_FILE);
    if (read_fully(handle->descriptor, buffer.get(), size) != static_cast<int64_t>(size)) return fail(LX_E_FILE);
    set_status(rc, LX_OK);
    return buffer.give_up();
  });
}

uint32_t LXUnloadFile(void* buffer) noexcept {
  return exported(trace_unit, __func__, [&]() -> uint32_t {
    if (buffer != nullptr) release(buffer);
    return 0;
  });
}

int32_t LXFileSize(LXFile* handle) noexcept {
  return exported(trace_unit, __func__, [&]() -> int32_t {
    struct stat status;
    if (handle == nullptr || fstat(handle->descriptor, &status) != 0 || status.st_size > INT32_MAX) return -1;
    return static_cast<int32_t>(status.st_size);
  });
}

}  // extern "C"
