// SPDX-License-Identifier: Apache-2.0
// Numbers and amounts written beside ICU, the C library and {fmt}, and numbers read beside the first two. Exit status:
// 0; 1: a row is slower than the fastest peer; 2: it could not be measured.
#include <lexaro/lexaro.h>
#include <monetary.h>
#include <time.h>
#include <unicode/unum.h>
#include <unicode/unumberformatter.h>
#include <unicode/ustring.h>
#include <unicode/uvernum.h>
#ifdef BENCH_FMT
#include <fmt/core.h>
#include <fmt/format.h>
#endif

#include <algorithm>
#include <clocale>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <limits>
#include <locale>
#include <memory>
#include <random>
#include <stdexcept>
#include <string>
#include <vector>

#include "bench/support/library.hpp"
#include "bench/support/machine.hpp"
#include "bench/support/system_locales.hpp"

namespace lx::bench {
namespace {

struct Country {
  const char* tag;  // of ICU, and the source of the C library's locale
  const char* lexaro;
  const char16_t* currency;
  char separator;
  char point;
};

constexpr Country kCountries[] = {
    {"en_US", "English_UnitedStates.UTF-8", u"currency/USD", ',', '.'},
    {"de_DE", "German_Germany.UTF-8", u"currency/EUR", '.', ','},
};

// ---- Contenders ----

constexpr int32_t kRoom = 128;

union Text {
  char bytes[kRoom];
  char16_t ucs2[kRoom];
};

// A text to read, both forms with a zero behind them.
struct Given {
  std::string utf8;
  std::u16string ucs2;
};

// Each call returns the length of what it wrote, without a terminator, or read; 0: the contender has no such thing.
class Writer {
 public:
  virtual ~Writer() = default;
  virtual int32_t integer(Text& out, int32_t value) = 0;
  virtual int32_t number(Text& out, double value) = 0;  // with two fraction digits
  virtual int32_t money(Text& out, double value) = 0;
  virtual int32_t read_integer(const Given& text) = 0;
  virtual int32_t read_number(const Given& text) = 0;
};

int32_t length_of(const auto& text) { return static_cast<int32_t>(text.size()); }

double value_read = 0;  // so that no compiler leaves the reading out
using WriterPtr = std::unique_ptr<Writer>;

class LexaroBytes : public Writer {
 public:
  explicit LexaroBytes(const Country& country) {
    uint32_t rc = LX_OK;
    locale_.reset(LXGetLocale(country.lexaro, 0, &rc));
    if (!locale_) throw Failure(std::string(country.lexaro) + ": status " + std::to_string(rc));
  }
  int32_t integer(Text& out, int32_t value) override {
    return LXLongToString(locale_.get(), value, out.bytes, kRoom, 0);
  }
  int32_t number(Text& out, double value) override {
    return LXDoubleToString(locale_.get(), value, out.bytes, kRoom, 0);
  }
  int32_t money(Text& out, double value) override {
    return LXCurrencyToString(locale_.get(), value, out.bytes, kRoom, 0);
  }
  int32_t read_integer(const Given& text) override {
    const char* end = nullptr;
    value_read += LXStringToLong(locale_.get(), text.utf8.data(), length_of(text.utf8), &end, 10, 0);
    return static_cast<int32_t>(end - text.utf8.data());
  }
  int32_t read_number(const Given& text) override {
    const char* end = nullptr;
    value_read += LXStringToDouble(locale_.get(), text.utf8.data(), length_of(text.utf8), &end, 0);
    return static_cast<int32_t>(end - text.utf8.data());
  }

 protected:
  struct Release {
    void operator()(LXLocale* locale) const { LXReleaseLocale(locale, 0); }
  };
  std::unique_ptr<LXLocale, Release> locale_;
};

class LexaroUcs2 : public LexaroBytes {
 public:
  using LexaroBytes::LexaroBytes;
  int32_t integer(Text& out, int32_t value) override {
    return LXLongToStringU(locale_.get(), value, units(out), kRoom, 0);
  }
  int32_t number(Text& out, double value) override {
    return LXDoubleToStringU(locale_.get(), value, units(out), kRoom, 0);
  }
  int32_t money(Text& out, double value) override {
    return LXCurrencyToStringU(locale_.get(), value, units(out), kRoom, 0);
  }
  int32_t read_integer(const Given& text) override {
    const LXUChar* end = nullptr;
    value_read += LXStringToLongU(locale_.get(), units(text), length_of(text.ucs2), &end, 10, 0);
    return static_cast<int32_t>(end - units(text));
  }
  int32_t read_number(const Given& text) override {
    const LXUChar* end = nullptr;
    value_read += LXStringToDoubleU(locale_.get(), units(text), length_of(text.ucs2), &end, 0);
    return static_cast<int32_t>(end - units(text));
  }

 private:
  static LXUChar* units(Text& out) { return reinterpret_cast<LXUChar*>(out.ucs2); }
  static const LXUChar* units(const Given& text) { return reinterpret_cast<const LXUChar*>(text.ucs2.data()); }
};

// The formatters and the place of the result are made once.
class Icu : public Writer {
 public:
  Icu(const Country& country, bool ucs2)
      : ucs2_(ucs2),
        integer_(open(u"", country)),
        number_(open(u".00", country)),
        money_(open(country.currency, country)) {
    UErrorCode error = U_ZERO_ERROR;
    result_.reset(unumf_openResult(&error));
    reader_.reset(unum_open(UNUM_DECIMAL, nullptr, 0, country.tag, nullptr, &error));
    if (U_FAILURE(error)) throw Failure(u_errorName(error));
  }
  int32_t integer(Text& out, int32_t value) override {
    UErrorCode error = U_ZERO_ERROR;
    unumf_formatInt(integer_.get(), value, result_.get(), &error);
    return take(out, error);
  }
  int32_t number(Text& out, double value) override { return write(*number_, out, value); }
  int32_t money(Text& out, double value) override { return write(*money_, out, value); }
  int32_t read_integer(const Given& text) override {
    return read(text, [&](const char16_t* at, int32_t length, int32_t* end, UErrorCode* error) {
      value_read += unum_parse(reader_.get(), at, length, end, error);
    });
  }
  int32_t read_number(const Given& text) override {
    return read(text, [&](const char16_t* at, int32_t length, int32_t* end, UErrorCode* error) {
      value_read += unum_parseDouble(reader_.get(), at, length, end, error);
    });
  }

 private:
  struct Close {
    void operator()(UNumberFormatter* formatter) const { unumf_close(formatter); }
    void operator()(UFormattedNumber* result) const { unumf_closeResult(result); }
  };
  struct Reader {
    void operator()(UNumberFormat* format) const { unum_close(format); }
  };
  using Formatter = std::unique_ptr<UNumberFormatter, Close>;

  static Formatter open(const char16_t* skeleton, const Country& country) {
    UErrorCode error = U_ZERO_ERROR;
    Formatter formatter(unumf_openForSkeletonAndLocale(skeleton, -1, country.tag, &error));
    if (U_FAILURE(error)) throw Failure(u_errorName(error));
    return formatter;
  }
  int32_t write(const UNumberFormatter& formatter, Text& out, double value) {
    UErrorCode error = U_ZERO_ERROR;
    unumf_formatDouble(&formatter, value, result_.get(), &error);
    return take(out, error);
  }
  template <class Parse>
  int32_t read(const Given& text, Parse parse) {
    char16_t converted[kRoom];
    const char16_t* at = text.ucs2.data();
    int32_t length = length_of(text.ucs2);
    UErrorCode error = U_ZERO_ERROR;
    if (!ucs2_) {
      u_strFromUTF8(converted, kRoom, &length, text.utf8.data(), length_of(text.utf8), &error);
      at = converted;
    }
    int32_t end = 0;
    parse(at, length, &end, &error);
    return U_FAILURE(error) ? 0 : end;
  }
  int32_t take(Text& out, UErrorCode& error) {
    char16_t text[kRoom];
    int32_t length = unumf_resultToString(result_.get(), ucs2_ ? out.ucs2 : text, kRoom, &error);
    if (!ucs2_) u_strToUTF8(out.bytes, kRoom, &length, text, length, &error);
    return U_FAILURE(error) ? 0 : length;
  }

  bool ucs2_;
  Formatter integer_;
  Formatter number_;
  Formatter money_;
  std::unique_ptr<UFormattedNumber, Close> result_;
  std::unique_ptr<UNumberFormat, Reader> reader_;
};

// Its functions take the locale of the thread.
class CLibrary : public Writer {
 public:
  explicit CLibrary(const Country& country)
      : locale_(newlocale(LC_ALL_MASK, (std::string(country.tag) + ".UTF-8").c_str(), nullptr)) {
    if (locale_ == nullptr) throw Failure(std::string("the C library has no locale ") + country.tag);
    uselocale(locale_);
  }
  ~CLibrary() override {
    uselocale(LC_GLOBAL_LOCALE);
    freelocale(locale_);
  }
  CLibrary(const CLibrary&) = delete;
  CLibrary& operator=(const CLibrary&) = delete;
  int32_t integer(Text& out, int32_t value) override { return std::snprintf(out.bytes, kRoom, "%'d", value); }
  int32_t number(Text& out, double value) override { return std::snprintf(out.bytes, kRoom, "%'.2f", value); }
  int32_t money(Text& out, double value) override {
    return static_cast<int32_t>(strfmon(out.bytes, kRoom, "%n", value));
  }
  int32_t read_integer(const Given& text) override {
    int value = 0;
    int length = 0;
    std::sscanf(text.utf8.c_str(), "%'d%n", &value, &length);
    value_read += value;
    return length;
  }
  int32_t read_number(const Given& text) override {
    double value = 0;
    int length = 0;
    std::sscanf(text.utf8.c_str(), "%'lf%n", &value, &length);
    value_read += value;
    return length;
  }

 private:
  locale_t locale_;
};

#ifdef BENCH_FMT
class Fmt : public Writer {
 public:
  explicit Fmt(const Country& country) : locale_(std::locale::classic(), new Punctuation(country)) {}
  int32_t integer(Text& out, int32_t value) override {
    return static_cast<int32_t>(fmt::format_to(out.bytes, locale_, "{:L}", value) - out.bytes);
  }
  int32_t number(Text& out, double value) override {
    return static_cast<int32_t>(fmt::format_to(out.bytes, locale_, "{:.2Lf}", value) - out.bytes);
  }
  int32_t money(Text&, double) override { return 0; }
  int32_t read_integer(const Given&) override { return 0; }
  int32_t read_number(const Given&) override { return 0; }

 private:
  struct Punctuation : std::numpunct<char> {
    explicit Punctuation(const Country& country) : country_(country) {}
    char do_thousands_sep() const override { return country_.separator; }
    char do_decimal_point() const override { return country_.point; }
    std::string do_grouping() const override { return "\3"; }
    const Country& country_;
  };
  std::locale locale_;
};
#endif

// ---- Work ----

int64_t sink = 0;  // what no compiler may leave out

// ASCII, in the countries that are here.
Given given(const Text& text, int32_t length) {
  return {std::string(text.bytes, text.bytes + length), std::u16string(text.bytes, text.bytes + length)};
}

// Of all lengths, and of both signs.
struct Values {
  std::vector<int32_t> integers;
  std::vector<double> amounts;
  std::vector<Given> integer_texts;
  std::vector<Given> amount_texts;

  explicit Values(Writer& writer) {
    std::mt19937 random(4711);
    for (int i = 0; i < 20000; ++i) {
      integers.push_back(static_cast<int32_t>(random()) >> (random() % 28));
      amounts.push_back(static_cast<double>(static_cast<int32_t>(random()) >> (random() % 20)) / 100);
      Text text;
      integer_texts.push_back(given(text, writer.integer(text, integers.back())));
      amount_texts.push_back(given(text, writer.number(text, amounts.back())));
    }
  }
};

using Job = int64_t (*)(Writer&, const Values&);

template <auto kRead, auto kTexts>
int64_t read_all(Writer& writer, const Values& values) {
  int64_t length = 0;
  for (const Given& text : values.*kTexts) length += (writer.*kRead)(text);
  return length;
}

template <auto kWrite, auto kValues>
int64_t write_all(Writer& writer, const Values& values) {
  Text out;
  int64_t length = 0;
  for (auto value : values.*kValues) length += (writer.*kWrite)(out, value);
  return length;
}

struct Work {
  const char* name;
  Job job;
};
constexpr Work kWork[] = {{"integers", write_all<&Writer::integer, &Values::integers>},
                          {"numbers", write_all<&Writer::number, &Values::amounts>},
                          {"money", write_all<&Writer::money, &Values::amounts>},
                          {"read integers", read_all<&Writer::read_integer, &Values::integer_texts>},
                          {"read numbers", read_all<&Writer::read_number, &Values::amount_texts>}};

// Processor time of this thread: what other processes take away does not count.
double now() {
  timespec time = {};
  clock_gettime(CLOCK_THREAD_CPUTIME_ID, &time);
  return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_nsec) * 1e-9;
}

constexpr double kNone = std::numeric_limits<double>::infinity();

// The best of several runs that the contenders take in turn, in nanoseconds a value.
std::vector<double> measure(const std::vector<WriterPtr>& contenders, const Values& values, Job job, int repetitions) {
  std::vector<double> best(contenders.size(), kNone);
  for (int repetition = 0; repetition < repetitions; ++repetition) {
    for (size_t i = 0; i < contenders.size(); ++i) {
      if (contenders[i] == nullptr) continue;
      const double start = now();
      const int64_t length = job(*contenders[i], values);
      const double time = (now() - start) * 1e9 / static_cast<double>(values.integers.size());
      if (length != 0) best[i] = std::min(best[i], time);
      sink += length;
    }
  }
  return best;
}

// ---- The table ----

// Whether the library is no slower than the fastest peer.
bool print_row(const Country& country, const char* work, const char* text, const std::vector<double>& times) {
  const double ratio = *std::min_element(times.begin() + 1, times.end()) / times[0];
  const locale_t contender = uselocale(LC_GLOBAL_LOCALE);  // the table has its own
  std::printf("| %s | %s, %s |", country.tag, work, text);
  for (double time : times) time == kNone ? std::printf(" - |") : std::printf(" %.0f |", time);
  std::printf(" %.2f%s |\n", ratio, ratio < 1 ? " (slower)" : "");
  std::fflush(stdout);
  uselocale(contender);
  return ratio >= 1;
}

bool run_country(const Country& country, int repetitions) {
  std::vector<WriterPtr> bytes(4);
  bytes[0] = std::make_unique<LexaroBytes>(country);
  const Values values(*bytes[0]);
  bytes[1] = std::make_unique<Icu>(country, false);
  bytes[2] = std::make_unique<CLibrary>(country);
#ifdef BENCH_FMT
  bytes[3] = std::make_unique<Fmt>(country);
#endif
  std::vector<WriterPtr> ucs2(4);
  ucs2[0] = std::make_unique<LexaroUcs2>(country);
  ucs2[1] = std::make_unique<Icu>(country, true);

  bool never_slower = true;
  for (const Work& work : kWork) {
    never_slower &= print_row(country, work.name, "UTF-8", measure(bytes, values, work.job, repetitions));
    never_slower &= print_row(country, work.name, "UCS-2", measure(ucs2, values, work.job, repetitions));
  }
  return never_slower;
}

int run(const Options& options) {
  const Library library(options);
  const SystemLocales locales({"en_US", "de_DE"});
  std::string peers = "ICU " U_ICU_VERSION ", C library with locales of its own";
#ifdef BENCH_FMT
  peers += ", {fmt} " + std::to_string(FMT_VERSION);
#endif
  std::printf("%s\n", machine_description(peers).c_str());
  std::printf("| Country | Work | Lexaro ns a value | ICU | C library | {fmt} | Times the fastest peer |\n");
  std::printf("| --- | --- | ---: | ---: | ---: | ---: | ---: |\n");
  bool never_slower = true;
  for (const Country& country : kCountries) {
    if (options.wants(country.tag)) never_slower &= run_country(country, options.quick ? 3 : 15);
  }
  return never_slower ? 0 : 1;
}

}  // namespace
}  // namespace lx::bench

int main(int argc, char** argv) { return lx::bench::run_program("bench_format", argc, argv, lx::bench::run); }
