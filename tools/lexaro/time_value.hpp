// SPDX-License-Identifier: Apache-2.0
// Times as the tool reads and writes them: as ISO 8601 does.
#pragma once

#include <optional>
#include <string>

#include "lexaro/lexaro.h"

namespace lx::tool {

// "2026-11-22", "2026-11-22T13:05:09" (or a blank, and no seconds), "13:05", "now" (the local time), "@86400" (seconds
// since 1970 in UTC). A time without a date is of the first day of 1970. Nothing for anything else.
std::optional<LXTime> read_time(const std::string& text);

// No field is known.
LXTime unknown_time();
// The fields that are known: date and time where they are whole, "name=value" for others.
std::string known_fields(const LXTime& time);

}  // namespace lx::tool
