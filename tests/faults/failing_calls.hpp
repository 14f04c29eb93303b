// SPDX-License-Identifier: Apache-2.0
// Calls of the system that fail when they are told to.
#pragma once

#include <cstddef>

namespace lx::test {

enum class Call { open, read, seek, close, status };

// As long as the object lives, the n-th call of that kind (from 0) fails with that error.
class FailingCall {
 public:
  FailingCall(Call call, int n, int error);
  ~FailingCall();
  FailingCall(const FailingCall&) = delete;
  FailingCall& operator=(const FailingCall&) = delete;
  bool happened() const;
};

// Reads deliver no more bytes than that at a time, and every other one is interrupted first. 0: as usual.
void read_in_pieces(size_t at_most);

}  // namespace lx::test
