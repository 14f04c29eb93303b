// SPDX-License-Identifier: Apache-2.0
#include <gnu/libc-version.h>
#include <iconv.h>
#include <unicode/uvernum.h>

#include "bench/convert/peers.hpp"

namespace lx::bench {
namespace {

class Iconv : public Peer {
 public:
  Iconv(const Page& from, const Page& to)
      : shifted_(from.shifted || to.shifted), descriptor_(iconv_open(to.iconv, from.iconv)) {
    if (descriptor_ == reinterpret_cast<iconv_t>(-1)) throw Failure("iconv_open failed");
  }
  ~Iconv() override { iconv_close(descriptor_); }

  size_t convert(const char* in, size_t length, char* out, size_t room) override {
    char* text = const_cast<char*>(in);
    size_t left = room;
    size_t status = iconv(descriptor_, &text, &length, &out, &left);
    if (shifted_) status |= iconv(descriptor_, nullptr, nullptr, &out, &left);
    if (status != 0) throw Failure("iconv failed");
    return room - left;
  }

 private:
  bool shifted_;
  iconv_t descriptor_;
};

}  // namespace

PeerPtr iconv_peer(const Page& from, const Page& to) { return std::make_unique<Iconv>(from, to); }

std::string peer_versions() { return std::string("glibc ") + gnu_get_libc_version() + ", ICU " U_ICU_VERSION; }

}  // namespace lx::bench
