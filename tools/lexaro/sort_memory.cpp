// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/sort_memory.hpp"

#include <unistd.h>

#include <algorithm>
#include <cstring>
#include <fstream>
#include <limits>
#include <string>

#include "tools/lexaro/failure.hpp"

namespace lx::tool {
namespace {

constexpr uint64_t kUnlimited = std::numeric_limits<uint64_t>::max();
constexpr std::size_t kBlockSize = std::size_t{1} << 20;

// What the system could give without pressing other programs.
uint64_t machine_memory() {
  std::ifstream info("/proc/meminfo");
  uint64_t kib = 0;
  for (std::string word; info >> word;) {
    if (word == "MemAvailable:" && info >> kib) return kib * 1024;
  }
  const long pages = ::sysconf(_SC_PHYS_PAGES);
  const long page_size = ::sysconf(_SC_PAGESIZE);
  return pages > 0 && page_size > 0 ? static_cast<uint64_t>(pages) * static_cast<uint64_t>(page_size) : kUnlimited;
}

// What a container leaves.
uint64_t container_memory() {
  uint64_t most = 0;
  uint64_t used = 0;
  if (!(std::ifstream("/sys/fs/cgroup/memory.max") >> most)) return kUnlimited;
  if (!(std::ifstream("/sys/fs/cgroup/memory.current") >> used)) return most;
  return most > used ? most - used : 0;
}

}  // namespace

MemoryBudget::MemoryBudget() : room_(std::min(machine_memory(), container_memory())) { room_ -= room_ / 8; }

void MemoryBudget::take(uint64_t bytes) {
  if (bytes > room_ - taken_) fail();
  taken_ += bytes;
}

void MemoryBudget::fail() {
  throw Failure(ExitStatus::kInputOutput,
                message("not enough memory: sorting takes some five times the size of the text. Sort it in parts, and "
                        "merge those by the keys that --keys prints"));
}

const char* ByteStore::keep(std::string_view bytes) {
  if (bytes.size() > room_) {
    const std::size_t size = std::max(bytes.size(), kBlockSize);
    budget_.take(size);
    blocks_.push_back(std::unique_ptr<char[]>(new char[size]));
    at_ = blocks_.back().get();
    room_ = size;
  }
  char* kept = at_;
  if (!bytes.empty()) std::memcpy(kept, bytes.data(), bytes.size());
  at_ += bytes.size();
  room_ -= bytes.size();
  return kept;
}

}  // namespace lx::tool
