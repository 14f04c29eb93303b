// SPDX-License-Identifier: Apache-2.0
// Times written and read beside the C library and ICU. ICU writes from and reads to a point in time, the others go by
// the fields of a time.
#include <benchmark/benchmark.h>
#include <lexaro/lexaro.h>
#include <time.h>
#include <unicode/udat.h>
#include <unicode/ustring.h>

#include <clocale>
#include <cstdio>
#include <cstdlib>
#include <stdexcept>
#include <string>

#include "bench/support/system_locales.hpp"

namespace lx::bench {
namespace {

struct Case {
  const char* name;
  const char* lexaro;
  const char* system;  // source of the C library's locale
  const char* format;
  const char* pattern;  // the same for ICU
};

constexpr Case kCases[] = {
    {"digits", "English.UTF-8", "en_US", "%Y-%m-%d %H:%M:%S", "yyyy-MM-dd HH:mm:ss"},
    {"names", "English.UTF-8", "en_US", "%A, %d %B %Y", "EEEE, dd MMMM yyyy"},
    {"names_de", "German.UTF-8", "de_DE", "%A, %d %B %Y", "EEEE, dd MMMM yyyy"},
    {"short_names", "English.UTF-8", "en_US", "%a %b %d %I:%M %p", "EEE MMM dd hh:mm a"},
    {"date", "German.UTF-8", "de_DE", "%x", "dd.MM.yy"},
    {"time", "English.UTF-8", "en_US", "%X", "h:mm:ss a"},
};

// Tuesday, 13 August 2024, 17:08:09.
constexpr UDate kMoment = 1723568889000.0;
LXTime sample_time() {
  LXTime time = {};
  time_t moment = static_cast<time_t>(kMoment / 1000);
  gmtime_r(&moment, &time);
  return time;
}

// Each contender writes the sample into a buffer, and reads what it wrote.
class Lexaro {
 public:
  explicit Lexaro(const Case& of) : format_(of.format) {
    uint32_t rc = LX_OK;
    locale_ = LXGetLocale(of.lexaro, 0, &rc);
    if (locale_ == nullptr) throw std::runtime_error(of.lexaro);
  }
  ~Lexaro() { LXReleaseLocale(locale_, 0); }
  bool write() { return LXTimeToString(locale_, &time_, text_, sizeof text_, format_, -1, LX_NUM_TERMINATE) > 1; }
  bool read() {
    LXTime time = {};
    return LXStringToTime(locale_, &time, text_, -1, format_, -1, 0) > 0 && time.tm_hour + time.tm_mday > 0;
  }

 private:
  const char* format_;
  LXLocale* locale_;
  LXTime time_ = sample_time();
  char text_[100];
};

class CLibrary {
 public:
  explicit CLibrary(const Case& of)
      : format_(of.format), locale_(newlocale(LC_ALL_MASK, (std::string(of.system) + ".UTF-8").c_str(), nullptr)) {
    if (locale_ == nullptr) throw std::runtime_error(of.system);
    uselocale(locale_);
  }
  ~CLibrary() {
    uselocale(LC_GLOBAL_LOCALE);
    freelocale(locale_);
  }
  bool write() { return strftime_l(text_, sizeof text_, format_, &time_, locale_) > 0; }
  bool read() {
    LXTime time = {};
    return strptime(text_, format_, &time) != nullptr && time.tm_hour + time.tm_mday > 0;
  }

 private:
  const char* format_;
  locale_t locale_;
  LXTime time_ = sample_time();
  char text_[100];
};

class Icu {
 public:
  explicit Icu(const Case& of) {
    UChar pattern[40];
    u_uastrcpy(pattern, of.pattern);
    UErrorCode error = U_ZERO_ERROR;
    format_ = udat_open(UDAT_PATTERN, UDAT_PATTERN, of.system, u"GMT", -1, pattern, -1, &error);
    if (U_FAILURE(error)) throw std::runtime_error(u_errorName(error));
  }
  ~Icu() { udat_close(format_); }
  bool write() {
    UErrorCode error = U_ZERO_ERROR;
    length_ = udat_format(format_, kMoment, text_, 100, nullptr, &error);
    return U_SUCCESS(error) && length_ > 0;
  }
  bool read() {
    UErrorCode error = U_ZERO_ERROR;
    benchmark::DoNotOptimize(udat_parse(format_, text_, length_, nullptr, &error));
    return U_SUCCESS(error);
  }

 private:
  UDateFormat* format_;
  UChar text_[100];
  int32_t length_ = 0;
};

template <class Contender>
void add(const Case& of, const char* contender) {
  auto measure = [&of, contender](const char* what, auto work) {
    benchmark::RegisterBenchmark((std::string(what) + "/" + of.name + "/" + contender).c_str(),
                                 [&of, work](benchmark::State& state) {
                                   Contender one(of);
                                   if (!one.write() || !one.read()) return state.SkipWithError(of.format);
                                   for (auto _ : state) benchmark::DoNotOptimize(work(one));
                                 });
  };
  measure("write", [](Contender& one) { return one.write(); });
  measure("read", [](Contender& one) { return one.read(); });
}

}  // namespace
}  // namespace lx::bench

int main(int argc, char** argv) {
  using namespace lx::bench;
  benchmark::Initialize(&argc, argv);
  const SystemLocales locales({"en_US", "de_DE"});
  if (LXInit(LEXARO_DATA, nullptr, nullptr, nullptr, 0) != LX_OK) return 2;
  for (const Case& one : kCases) {
    add<Lexaro>(one, "lexaro");
    add<CLibrary>(one, "libc");
    add<Icu>(one, "icu");
  }
  benchmark::RunSpecifiedBenchmarks();
  LXTerm();
  return 0;
}
