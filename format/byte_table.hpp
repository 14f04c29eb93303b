// SPDX-License-Identifier: Apache-2.0
// Plain arrays have no other way to be made from a constant: the 256 values that `of` is indexed for.
#pragma once

// clang-format off
#define LX_TABLE_4(of, at) of[at], of[(at) + 1], of[(at) + 2], of[(at) + 3]
#define LX_TABLE_16(of, at) \
  LX_TABLE_4(of, at), LX_TABLE_4(of, (at) + 4), LX_TABLE_4(of, (at) + 8), LX_TABLE_4(of, (at) + 12)
#define LX_TABLE_64(of, at) \
  LX_TABLE_16(of, at), LX_TABLE_16(of, (at) + 16), LX_TABLE_16(of, (at) + 32), LX_TABLE_16(of, (at) + 48)
#define LX_TABLE_256(of) LX_TABLE_64(of, 0), LX_TABLE_64(of, 64), LX_TABLE_64(of, 128), LX_TABLE_64(of, 192)
// clang-format on
