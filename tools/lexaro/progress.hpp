// SPDX-License-Identifier: Apache-2.0
// One line on standard error that tells how far long work has come.
#pragma once

#include <chrono>
#include <cstdint>
#include <optional>
#include <string>
#include "tools/messages/message.hpp"

namespace lx::tool {

class Progress {
 public:
  enum class When { kAutomatic, kAlways, kNever };

  // Automatic: on a terminal, once the work has taken a second.
  Progress(When when, std::optional<uint64_t> total_bytes);
  Progress(const Progress&) = delete;
  Progress& operator=(const Progress&) = delete;
  ~Progress() { clear(); }

  void advance(uint64_t bytes);
  // Takes the line away, so that messages stand on lines of their own.
  void clear();

 private:
  using Clock = std::chrono::steady_clock;

  Message line(Clock::time_point now) const;

  bool enabled_;
  std::optional<uint64_t> total_;
  uint64_t done_ = 0;
  Clock::time_point start_ = Clock::now();
  Clock::time_point next_;
  std::size_t shown_width_ = 0;
};

}  // namespace lx::tool
