// SPDX-License-Identifier: Apache-2.0
// One call: its arguments placed at the edges of memory, one of them perhaps changed, a fault perhaps on its way.
#pragma once

#include "faults/campaign/entry.hpp"
#include "faults/campaign/world.hpp"
#include "faults/failing_calls.hpp"

namespace lx::test {

/*
 * What another argument may be depends on who answers for it. A length promises that much text, so a text always ends
 * where its length says and at an unmapped page. A room promises that much memory too; as most functions use no more
 * than they have to write, the largest one is memory of which only a little is ever touched. Whole characters, handles
 * and terminators are promised by the caller. All else may be anything.
 */
struct Change {
  enum Kind { none, null, null_room, number, cut, measured, hostile, hostile_measured, room };
  Kind kind = none;
  size_t parameter = 0;
  int64_t value = 0;
  uint32_t options = 0;  // besides the good ones
};

struct Fault {
  enum Kind { none, allocation, allocations, system_call, transfer };  // one allocation, or all from there on
  Kind kind = none;
  int at = 0;
  Call call = Call::open;
  int error = 0;

  bool of_memory() const { return kind == allocation || kind == allocations; }
};

struct Outcome {
  int64_t result = 0;   // pointers: whether there is one
  uint32_t status = 0;  // where there is one
  bool has_status = false;
  uint64_t written = 0;  // a hash of all that the caller has in memory
  bool locale_kept = true;
  int allocations = 0;
  bool faulted = false;  // the fault has come
  int left = 0;          // blocks more than before the call, before its result is released, and at last
  int leaked = 0;
  bool overrun = false;  // bytes before a room were changed
};

Outcome call(World& world, const Entry& entry, const Change& change, const Fault& fault);
const char* current_call();  // for those who have to say which one does not end

}  // namespace lx::test
