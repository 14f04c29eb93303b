// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/progress.hpp"

#include <unistd.h>

#include <algorithm>
#include <cstdio>

#include "tools/lexaro/terminal_text.hpp"

namespace lx::tool {
namespace {

using namespace std::chrono_literals;

bool wanted(Progress::When when) {
  if (when == Progress::When::kAutomatic) return ::isatty(STDERR_FILENO) != 0;
  return when == Progress::When::kAlways;
}

std::string megabytes(double bytes) {
  char text[32];
  std::snprintf(text, sizeof text, "%.1f MB", bytes / 1e6);
  return text;
}

void show(const std::string& text) {
  std::fwrite(text.data(), 1, text.size(), stderr);
  std::fflush(stderr);
}

}  // namespace

Progress::Progress(When when, std::optional<uint64_t> total_bytes)
    : enabled_(wanted(when)), total_(total_bytes), next_(start_ + (when == When::kAlways ? 0s : 1s)) {}

void Progress::advance(uint64_t bytes) {
  done_ += bytes;
  if (!enabled_) return;
  const Clock::time_point now = Clock::now();
  if (now < next_) return;
  next_ = now + 200ms;
  const Message state = line(now);
  std::string text = state.shown;
  const std::size_t width = display_width(state.utf8);
  if (width < shown_width_) text.append(shown_width_ - width, ' ');
  shown_width_ = width;
  show("\r" + text);
}

void Progress::clear() {
  if (shown_width_ == 0) return;
  show("\r" + std::string(shown_width_, ' ') + "\r");
  shown_width_ = 0;
}

Message Progress::line(Clock::time_point now) const {
  const double seconds = std::max(std::chrono::duration<double>(now - start_).count(), 1e-3);
  const std::string done = megabytes(static_cast<double>(done_));
  const std::string rate = megabytes(static_cast<double>(done_) / seconds);
  if (!total_ || *total_ == 0) return message("lexaro: {0}, {1}/s", done, rate);
  const double percent = std::min(100.0, 100.0 * static_cast<double>(done_) / static_cast<double>(*total_));
  return message("lexaro: {0} of {1} ({2}%), {3}/s", done, megabytes(static_cast<double>(*total_)),
                 static_cast<int>(percent), rate);
}

}  // namespace lx::tool
