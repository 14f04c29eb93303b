// SPDX-License-Identifier: Apache-2.0
// Comparison, keys and sorting of real words beside ICU and the C library. Exit status: 0; 1: a row is slower than the
// faster peer; 2: it could not be measured.
#include <lexaro/lexaro.h>
#include <time.h>
#include <unicode/ucol.h>
#include <unicode/ustring.h>
#include <unicode/uvernum.h>

#include <algorithm>
#include <clocale>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <functional>
#include <limits>
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

struct Language {
  const char* tag;
  const char* lexaro;
  const char* system;  // source of the C library's locale
  const char* words;
  bool latin1;
};

constexpr Language kLanguages[] = {
    {"en", "English.UTF-8", "en_US", "/usr/share/dict/american-english", false},
    {"de", "German.UTF-8", "de_DE", "/usr/share/dict/ngerman", false},
    {"es", "Spanish.UTF-8", "es_ES", "/usr/share/dict/spanish", false},
    {"sv", "Swedish.UTF-8", "sv_SE", "/usr/share/dict/swedish", true},
};

constexpr size_t kWords = 20000;
constexpr size_t kKeyRoom = 1024;

// ---- Words ----

// Both forms end with a zero, which the C library needs.
struct Word {
  std::string utf8;
  std::u16string ucs2;
};
using Words = std::vector<Word>;

std::string utf8_of_latin1(const std::string& text) {
  std::string utf8;
  for (char c : text) {
    auto byte = static_cast<unsigned char>(c);
    if (byte >= 0x80) utf8 += static_cast<char>(0xC0 | byte >> 6);
    utf8 += byte < 0x80 ? c : static_cast<char>(0x80 | (byte & 0x3F));
  }
  return utf8;
}

std::u16string ucs2_of(const std::string& utf8) {
  std::u16string text(utf8.size(), u'\0');
  int32_t length = 0;
  UErrorCode error = U_ZERO_ERROR;
  u_strFromUTF8(text.data(), static_cast<int32_t>(text.size()), &length, utf8.data(), static_cast<int32_t>(utf8.size()),
                &error);
  text.resize(static_cast<size_t>(length));
  return text;
}

// Shuffled, evenly chosen from the whole list.
Words read_words(const Language& language) {
  std::vector<std::string> all;
  std::ifstream in(language.words, std::ios::binary);
  for (std::string line; std::getline(in, line);) all.push_back(language.latin1 ? utf8_of_latin1(line) : line);
  if (all.size() < kWords) throw Failure(std::string(language.words) + " is not installed (script/setup)");
  Words words;
  for (size_t i = 0; i < kWords; ++i) {
    const std::string& word = all[i * all.size() / kWords];
    words.push_back({word, ucs2_of(word)});
  }
  std::shuffle(words.begin(), words.end(), std::mt19937(4711));
  return words;
}

// ---- Contenders ----

class Collator {
 public:
  virtual ~Collator() = default;
  virtual int compare(const Word& a, const Word& b) = 0;
  // The length of the key, which is cut when there is no room for it.
  virtual size_t key(char* out, size_t room, const Word& word) = 0;
};
using CollatorPtr = std::unique_ptr<Collator>;

int32_t length_of(const auto& text) { return static_cast<int32_t>(text.size()); }

class LexaroBytes : public Collator {
 public:
  explicit LexaroBytes(const Language& language) {
    uint32_t rc = LX_OK;
    locale_.reset(LXGetLocale(language.lexaro, 0, &rc));
    if (!locale_) throw Failure(std::string(language.lexaro) + ": status " + std::to_string(rc));
  }
  int compare(const Word& a, const Word& b) override {
    return LXStrcoll(locale_.get(), a.utf8.data(), length_of(a.utf8), b.utf8.data(), length_of(b.utf8), 0);
  }
  size_t key(char* out, size_t room, const Word& word) override {
    return static_cast<size_t>(
        LXStrxfrm(locale_.get(), out, static_cast<int32_t>(room), word.utf8.data(), length_of(word.utf8), 0));
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
  int compare(const Word& a, const Word& b) override {
    return LXStrcollU(locale_.get(), units(a), length_of(a.ucs2), units(b), length_of(b.ucs2), 0);
  }
  size_t key(char* out, size_t room, const Word& word) override {
    return static_cast<size_t>(
        LXStrxfrmU(locale_.get(), out, static_cast<int32_t>(room), units(word), length_of(word.ucs2), 0));
  }

 private:
  static const LXUChar* units(const Word& word) { return reinterpret_cast<const LXUChar*>(word.ucs2.data()); }
};

// Four levels with punctuation on the last one, as the library has them.
class Icu : public Collator {
 public:
  Icu(const Language& language, bool ucs2) : ucs2_(ucs2) {
    UErrorCode error = U_ZERO_ERROR;
    collator_.reset(ucol_open(language.tag, &error));
    ucol_setAttribute(collator_.get(), UCOL_ALTERNATE_HANDLING, UCOL_SHIFTED, &error);
    ucol_setAttribute(collator_.get(), UCOL_STRENGTH, UCOL_QUATERNARY, &error);
    if (U_FAILURE(error)) throw Failure(u_errorName(error));
  }
  int compare(const Word& a, const Word& b) override {
    if (ucs2_) {
      return ucol_strcoll(collator_.get(), a.ucs2.data(), length_of(a.ucs2), b.ucs2.data(), length_of(b.ucs2));
    }
    UErrorCode error = U_ZERO_ERROR;
    return ucol_strcollUTF8(collator_.get(), a.utf8.data(), length_of(a.utf8), b.utf8.data(), length_of(b.utf8),
                            &error);
  }
  // ICU makes keys of UTF-16 only: from UTF-8 the conversion comes first.
  size_t key(char* out, size_t room, const Word& word) override {
    UChar converted[kKeyRoom];
    const UChar* text = word.ucs2.data();
    int32_t length = length_of(word.ucs2);
    if (!ucs2_) {
      UErrorCode error = U_ZERO_ERROR;
      u_strFromUTF8(converted, kKeyRoom, &length, word.utf8.data(), length_of(word.utf8), &error);
      text = converted;
    }
    return static_cast<size_t>(
        ucol_getSortKey(collator_.get(), text, length, reinterpret_cast<uint8_t*>(out), static_cast<int32_t>(room)));
  }

 private:
  struct Close {
    void operator()(UCollator* collator) const { ucol_close(collator); }
  };
  bool ucs2_;
  std::unique_ptr<UCollator, Close> collator_;
};

class CLibrary : public Collator {
 public:
  explicit CLibrary(const Language& language)
      : locale_(newlocale(LC_ALL_MASK, (std::string(language.system) + ".UTF-8").c_str(), nullptr)) {
    if (locale_ == nullptr) throw Failure(std::string("the C library has no locale ") + language.system);
  }
  ~CLibrary() override { freelocale(locale_); }
  CLibrary(const CLibrary&) = delete;
  CLibrary& operator=(const CLibrary&) = delete;
  int compare(const Word& a, const Word& b) override { return strcoll_l(a.utf8.c_str(), b.utf8.c_str(), locale_); }
  size_t key(char* out, size_t room, const Word& word) override {
    return strxfrm_l(out, word.utf8.c_str(), room, locale_);
  }

 private:
  locale_t locale_;
};

// ---- Work ----

int sink = 0;  // what no compiler may leave out

using Job = std::function<void(Collator&, const Words&)>;

void compare_pairs(Collator& collator, const Words& words) {
  for (size_t i = 1; i < words.size(); ++i) sink += collator.compare(words[i - 1], words[i]) < 0;
}

void make_keys(Collator& collator, const Words& words) {
  char key[kKeyRoom];
  for (const Word& word : words) sink += static_cast<int>(collator.key(key, sizeof key, word));
}

void sort_by_compare(Collator& collator, const Words& words) {
  std::vector<const Word*> order;
  for (const Word& word : words) order.push_back(&word);
  std::sort(order.begin(), order.end(), [&](const Word* a, const Word* b) { return collator.compare(*a, *b) < 0; });
  sink += order.front() == words.data();
}

void sort_by_key(Collator& collator, const Words& words) {
  char key[kKeyRoom];
  std::vector<std::string> keys;
  for (const Word& word : words) keys.emplace_back(key, collator.key(key, sizeof key, word));
  std::vector<uint32_t> order(words.size());
  for (size_t i = 0; i < order.size(); ++i) order[i] = static_cast<uint32_t>(i);
  std::sort(order.begin(), order.end(), [&](uint32_t a, uint32_t b) { return keys[a] < keys[b]; });
  sink += order.front() == 0;
}

// Processor time of this thread: what other processes take away does not count.
double now() {
  timespec time = {};
  clock_gettime(CLOCK_THREAD_CPUTIME_ID, &time);
  return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_nsec) * 1e-9;
}

// The best of several runs that the contenders take in turn, in nanoseconds a word.
std::vector<double> measure(const std::vector<Collator*>& contenders, const Words& words, const Job& job,
                            int repetitions) {
  std::vector<double> best(contenders.size(), std::numeric_limits<double>::max());
  for (int repetition = 0; repetition < repetitions; ++repetition) {
    for (size_t i = 0; i < contenders.size(); ++i) {
      double start = now();
      job(*contenders[i], words);
      best[i] = std::min(best[i], (now() - start) * 1e9 / static_cast<double>(words.size()));
    }
  }
  return best;
}

double mean_key_length(Collator& collator, const Words& words) {
  char key[kKeyRoom];
  size_t all = 0;
  for (const Word& word : words) all += collator.key(key, sizeof key, word);
  return static_cast<double>(all) / static_cast<double>(words.size());
}

// ---- The table ----

struct Contest {
  const char* text;
  std::vector<CollatorPtr> contenders;  // the library, ICU and, where it takes part, the C library
};

Words in_order(Collator& collator, Words words) {
  std::sort(words.begin(), words.end(), [&](const Word& a, const Word& b) { return collator.compare(a, b) < 0; });
  return words;
}

// Whether the library is no slower than the faster peer.
bool print_row(const Language& language, const char* job, const char* text, const std::vector<double>& times) {
  double peer = *std::min_element(times.begin() + 1, times.end());
  double ratio = peer / times[0];
  std::printf("| %s | %s, %s | %.0f | %.0f | ", language.tag, job, text, times[0], times[1]);
  times.size() > 2 ? std::printf("%.0f", times[2]) : std::printf("-");
  std::printf(" | %.2f%s |\n", ratio, ratio < 1 ? " (slower)" : "");
  std::fflush(stdout);
  return ratio >= 1;
}

bool run_language(const Language& language, int repetitions) {
  const Words shuffled = read_words(language);
  Contest contests[2] = {{"UTF-8", {}}, {"UCS-2", {}}};
  contests[0].contenders.push_back(std::make_unique<LexaroBytes>(language));
  contests[0].contenders.push_back(std::make_unique<Icu>(language, false));
  contests[0].contenders.push_back(std::make_unique<CLibrary>(language));
  contests[1].contenders.push_back(std::make_unique<LexaroUcs2>(language));
  contests[1].contenders.push_back(std::make_unique<Icu>(language, true));
  const Words sorted = in_order(*contests[0].contenders[1], shuffled);

  const struct {
    const char* name;
    const Words& words;
    Job job;
  } jobs[] = {{"compare, shuffled pairs", shuffled, compare_pairs},
              {"compare, neighbours", sorted, compare_pairs},
              {"make keys", shuffled, make_keys},
              {"sort by comparing", shuffled, sort_by_compare},
              {"sort by keys", shuffled, sort_by_key}};
  bool never_slower = true;
  for (const auto& job : jobs) {
    for (const Contest& contest : contests) {
      std::vector<Collator*> contenders;
      for (const CollatorPtr& contender : contest.contenders) contenders.push_back(contender.get());
      const auto times = measure(contenders, job.words, job.job, repetitions);
      never_slower &= print_row(language, job.name, contest.text, times);
    }
  }
  std::printf("| %s | bytes of a key | %.1f | %.1f | %.1f | |\n", language.tag,
              mean_key_length(*contests[0].contenders[0], shuffled),
              mean_key_length(*contests[0].contenders[1], shuffled),
              mean_key_length(*contests[0].contenders[2], shuffled));
  return never_slower;
}

int run(const Options& options) {
  const Library library(options);
  const SystemLocales locales({"en_US", "de_DE", "es_ES", "sv_SE"});
  const std::string peers = "ICU " U_ICU_VERSION ", C library with locales of its own";
  std::printf("%s\n", machine_description(peers).c_str());
  std::printf("| Language | Work | Lexaro ns a word | ICU | C library | Times the faster peer |\n");
  std::printf("| --- | --- | ---: | ---: | ---: | ---: |\n");
  bool never_slower = true;
  for (const Language& language : kLanguages) {
    if (options.wants(language.tag)) never_slower &= run_language(language, options.quick ? 3 : 15);
  }
  return never_slower ? 0 : 1;
}

}  // namespace
}  // namespace lx::bench

int main(int argc, char** argv) { return lx::bench::run_program("bench_collate", argc, argv, lx::bench::run); }
