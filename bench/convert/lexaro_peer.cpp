// SPDX-License-Identifier: Apache-2.0
#include <lexaro/lexaro.h>

#include "bench/convert/peers.hpp"

namespace lx::bench {
namespace {

class Locale {
 public:
  explicit Locale(const Page& page) {
    std::string name = std::string("English_UnitedStates.") + page.lexaro + "@BINARY";
    locale_ = LXGetLocale(name.c_str(), 0, nullptr);
    if (locale_ == nullptr) throw Failure("cannot open " + name);
  }
  ~Locale() { LXReleaseLocale(locale_, 0); }
  Locale(const Locale&) = delete;
  Locale& operator=(const Locale&) = delete;
  LXLocale* get() const { return locale_; }

 private:
  LXLocale* locale_;
};

class BytesToBytes : public Peer {
 public:
  BytesToBytes(const Page& from, const Page& to)
      : from_(from), to_(to), shifted_(to.shifted), handle_(LXOpenConversion(to_.get(), from_.get(), 0)) {}
  ~BytesToBytes() override { LXCloseConversion(handle_); }

  size_t convert(const char* in, size_t length, char* out, size_t room) override {
    auto in_left = static_cast<int32_t>(length);
    auto out_room = static_cast<int32_t>(room);
    uint32_t status = LXConvertBuffer(handle_, &out, &out_room, &in, &in_left, 0);
    if (shifted_) status |= LXFinishConversion(handle_, &out, &out_room);
    if (status != LX_OK) throw Failure("LXConvertBuffer failed");
    return room - static_cast<size_t>(out_room);
  }

 private:
  Locale from_;
  Locale to_;
  bool shifted_;
  LXConversion* handle_;
};

// The Ex forms do on pages without shift bytes what the plain ones do.
class ToUcs2 : public Peer {
 public:
  explicit ToUcs2(const Page& from) : from_(from), shifted_(from.shifted) {}

  size_t convert(const char* in, size_t length, char* out, size_t room) override {
    auto* units = reinterpret_cast<LXUChar*>(out);
    auto size = static_cast<int32_t>(room / 2);
    auto count = static_cast<int32_t>(length);
    int32_t written = shifted_ ? LXStringToUnicodeEx(from_.get(), units, size, in, 0, count, 0)
                               : LXStringToUnicode(from_.get(), units, size, in, count, 0);
    return static_cast<size_t>(written) * 2;
  }

 private:
  Locale from_;
  bool shifted_;
};

class FromUcs2 : public Peer {
 public:
  explicit FromUcs2(const Page& to) : to_(to), shifted_(to.shifted) {}

  size_t convert(const char* in, size_t length, char* out, size_t room) override {
    const auto* units = reinterpret_cast<const LXUChar*>(in);
    auto size = static_cast<int32_t>(room);
    auto count = static_cast<int32_t>(length / 2);
    int32_t written = shifted_ ? LXUnicodeToStringEx(to_.get(), out, 0, size, units, count, 0)
                               : LXUnicodeToString(to_.get(), out, size, units, count, 0);
    return static_cast<size_t>(written);
  }

 private:
  Locale to_;
  bool shifted_;
};

}  // namespace

PeerPtr lexaro_peer(const Page& from, const Page& to) {
  if (is_ucs2(to)) return std::make_unique<ToUcs2>(from);
  if (is_ucs2(from)) return std::make_unique<FromUcs2>(to);
  return std::make_unique<BytesToBytes>(from, to);
}

}  // namespace lx::bench
