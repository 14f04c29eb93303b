// SPDX-License-Identifier: Apache-2.0
#include <unicode/ucnv.h>

#include "bench/convert/peers.hpp"

namespace lx::bench {
namespace {

class Converter {
 public:
  explicit Converter(const Page& page) {
    if (page.icu == nullptr) return;
    UErrorCode error = U_ZERO_ERROR;
    converter_ = ucnv_open(page.icu, &error);
    if (U_FAILURE(error)) throw Failure(std::string("ucnv_open failed for ") + page.icu);
  }
  ~Converter() {
    if (converter_ != nullptr) ucnv_close(converter_);
  }
  Converter(const Converter&) = delete;
  Converter& operator=(const Converter&) = delete;
  UConverter* get() const { return converter_; }

 private:
  UConverter* converter_ = nullptr;
};

void check(UErrorCode error, const char* function) {
  if (U_FAILURE(error) && error != U_BUFFER_OVERFLOW_ERROR) {
    throw Failure(std::string(function) + ": " + u_errorName(error));
  }
}

class ToUcs2 : public Peer {
 public:
  explicit ToUcs2(const Page& from) : from_(from) {}

  size_t convert(const char* in, size_t length, char* out, size_t room) override {
    auto* units = reinterpret_cast<UChar*>(out);
    UChar* at = units;
    UErrorCode error = U_ZERO_ERROR;
    ucnv_toUnicode(from_.get(), &at, units + room / 2, &in, in + length, nullptr, true, &error);
    check(error, "ucnv_toUnicode");
    return static_cast<size_t>(at - units) * 2;
  }

 private:
  Converter from_;
};

class FromUcs2 : public Peer {
 public:
  explicit FromUcs2(const Page& to) : to_(to) {}

  size_t convert(const char* in, size_t length, char* out, size_t room) override {
    const auto* units = reinterpret_cast<const UChar*>(in);
    char* at = out;
    UErrorCode error = U_ZERO_ERROR;
    ucnv_fromUnicode(to_.get(), &at, out + room, &units, units + length / 2, nullptr, true, &error);
    check(error, "ucnv_fromUnicode");
    return static_cast<size_t>(at - out);
  }

 private:
  Converter to_;
};

// The text between the two converters stays in the first-level cache.
constexpr size_t kPivotUnits = 4096;

class Pivot : public Peer {
 public:
  Pivot(const Page& from, const Page& to) : from_(from), to_(to) {}

  size_t convert(const char* in, size_t length, char* out, size_t room) override {
    const char* end = in + length;
    char* at = out;
    for (bool last = false; !last;) {
      UErrorCode error = U_ZERO_ERROR;
      UChar* filled = pivot_;
      ucnv_toUnicode(from_.get(), &filled, pivot_ + kPivotUnits, &in, end, nullptr, true, &error);
      check(error, "ucnv_toUnicode");
      last = error != U_BUFFER_OVERFLOW_ERROR;
      error = U_ZERO_ERROR;
      const UChar* units = pivot_;
      ucnv_fromUnicode(to_.get(), &at, out + room, &units, filled, nullptr, last, &error);
      check(error, "ucnv_fromUnicode");
    }
    return static_cast<size_t>(at - out);
  }

 private:
  Converter from_;
  Converter to_;
  UChar pivot_[kPivotUnits];
};

class Direct : public Peer {
 public:
  Direct(const Page& from, const Page& to) : from_(from), to_(to) {}

  size_t convert(const char* in, size_t length, char* out, size_t room) override {
    char* at = out;
    UChar* pivot_in = pivot_;
    UChar* pivot_out = pivot_;
    UErrorCode error = U_ZERO_ERROR;
    ucnv_convertEx(to_.get(), from_.get(), &at, out + room, &in, in + length, pivot_, &pivot_in, &pivot_out,
                   pivot_ + kPivotUnits, true, true, &error);
    check(error, "ucnv_convertEx");
    return static_cast<size_t>(at - out);
  }

 private:
  Converter from_;
  Converter to_;
  UChar pivot_[kPivotUnits];
};

}  // namespace

PeerPtr icu_pivot_peer(const Page& from, const Page& to) {
  if (is_ucs2(to)) return std::make_unique<ToUcs2>(from);
  if (is_ucs2(from)) return std::make_unique<FromUcs2>(to);
  return std::make_unique<Pivot>(from, to);
}

PeerPtr icu_direct_peer(const Page& from, const Page& to) {
  if (is_ucs2(to) || is_ucs2(from)) return nullptr;
  return std::make_unique<Direct>(from, to);
}

std::string encode(const Page& page, const std::u16string& text) {
  std::string bytes(text.size() * 4 + 8, '\0');
  if (is_ucs2(page)) return {reinterpret_cast<const char*>(text.data()), text.size() * 2};
  bytes.resize(
      FromUcs2(page).convert(reinterpret_cast<const char*>(text.data()), text.size() * 2, bytes.data(), bytes.size()));
  return bytes;
}

}  // namespace lx::bench
