// SPDX-License-Identifier: Apache-2.0
// The contenders: each holds opened converters for one pair of pages.
#pragma once

#include <cstddef>
#include <memory>
#include <string>

#include "bench/convert/page.hpp"
#include "bench/support/program.hpp"

namespace lx::bench {

class Peer {
 public:
  virtual ~Peer() = default;
  // Converts a whole text; returns the bytes written. UCS-2 is in machine order and aligned.
  virtual size_t convert(const char* in, size_t length, char* out, size_t room) = 0;
};
using PeerPtr = std::unique_ptr<Peer>;

PeerPtr lexaro_peer(const Page& from, const Page& to);
PeerPtr iconv_peer(const Page& from, const Page& to);
// ucnv_toUnicode and ucnv_fromUnicode, with a piece of UTF-16 between them when neither side is UCS-2.
PeerPtr icu_pivot_peer(const Page& from, const Page& to);
// ucnv_convertEx; null when one side is UCS-2.
PeerPtr icu_direct_peer(const Page& from, const Page& to);

// UCS-2 text as bytes of the page.
std::string encode(const Page& page, const std::u16string& text);

std::string peer_versions();

}  // namespace lx::bench
