// SPDX-License-Identifier: Apache-2.0
// Message catalogs beside the C library's catgets and gettext: a thousand messages looked up, and a catalog opened and
// closed. The peers hand out a pointer; the library writes the text into the caller's buffer, in the caller's code
// page, as catgets_copied does.
#include <benchmark/benchmark.h>
#include <lexaro/lexaro.h>
#include <libintl.h>
#include <nl_types.h>

#include <clocale>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <stdexcept>
#include <string>
#include <vector>

namespace lx::bench {
namespace {

constexpr int kSets = 5;
constexpr int kMessages = 200;
constexpr char kLocale[] = "English_UnitedStates.UTF-8@BINARY";

void run(const std::string& command) {
  if (std::system((command + " > /dev/null 2>&1").c_str()) != 0) std::fprintf(stderr, "failed: %s\n", command.c_str());
}

std::string text_of(int set, int number) {
  return "Message " + std::to_string(number) + " of set " + std::to_string(set) + ": the file cannot be read";
}

// The same messages for all: catalogs of both kinds, and a gettext catalog of an own locale.
class Files {
 public:
  Files() {
    char name[] = "/tmp/bench-catalog-XXXXXX";
    if (mkdtemp(name) == nullptr) throw std::runtime_error("no temporary directory");
    directory_ = name;
    std::ofstream source(path("app.msg"));
    std::ofstream po(path("app.po"));
    po << "msgid \"\"\nmsgstr \"Content-Type: text/plain; charset=UTF-8\\n\"\n";
    for (int set = 1; set <= kSets; ++set) {
      source << "$set " << set << "\n";
      for (int i = 1; i <= kMessages; ++i) {
        source << i << " " << text_of(set, i) << "\n";
        po << "msgid \"" << text_of(set, i) << "\"\nmsgstr \"[" << text_of(set, i) << "]\"\n";
      }
    }
    source.close();
    po.close();
    run("gencat -o " + path("app.peer") + " " + path("app.msg"));
    std::string compile = std::string(LEXAROC_PATH) + " catalog " + path("app.msg") + " -o " + path("app.cat");
    run(compile + " --locale " + kLocale + " --locale-dir " LEXARO_DATA);
    run("localedef -i en_US -f UTF-8 " + path("en_US.UTF-8"));
    std::filesystem::create_directories(path("en_US/LC_MESSAGES"));
    run("msgfmt -o " + path("en_US/LC_MESSAGES/app.mo") + " " + path("app.po"));
    setenv("LOCPATH", name, 1);
  }
  ~Files() {
    std::error_code error;
    std::filesystem::remove_all(directory_, error);
  }
  Files(const Files&) = delete;
  Files& operator=(const Files&) = delete;
  std::string path(const std::string& name) const { return directory_ + "/" + name; }

 private:
  std::string directory_;
};

// Calls with each message in an order that jumps about.
template <class LookUp>
void each_message(benchmark::State& state, LookUp look_up) {
  unsigned i = 0;
  for (auto _ : state) {
    i = (i + 377) % (kSets * kMessages);
    benchmark::DoNotOptimize(look_up(static_cast<int>(i) / kMessages + 1, static_cast<int>(i) % kMessages + 1));
  }
}

void lexaro_lookup(benchmark::State& state, LXLocale* locale, const std::string& path, uint32_t flags) {
  LXCatalog* catalog = LXOpenCatalog(locale, nullptr, path.c_str(), flags);
  char out[200];
  if (LXGetMessage(catalog, 1, 1, out, sizeof out, nullptr, 0) != LX_OK) return state.SkipWithError("no message");
  each_message(state, [&](int set, int number) {
    return LXGetMessage(catalog, static_cast<uint32_t>(set), number, out, sizeof out, nullptr, 0);
  });
  LXCloseCatalog(catalog, 0);
}

void catgets_lookup(benchmark::State& state, const std::string& path, bool copied) {
  nl_catd catalog = catopen(path.c_str(), 0);
  if (*catgets(catalog, 1, 1, "") == '\0') return state.SkipWithError("no message");
  if (copied) {
    char out[200];
    each_message(state, [&](int set, int number) {
      const char* text = catgets(catalog, set, number, "");
      return *static_cast<char*>(std::memcpy(out, text, std::strlen(text) + 1));
    });
  } else {
    each_message(state, [&](int set, int number) { return catgets(catalog, set, number, ""); });
  }
  catclose(catalog);
}

void gettext_lookup(benchmark::State& state, const Files& files) {
  if (std::setlocale(LC_ALL, "en_US.UTF-8") == nullptr) return state.SkipWithError("no locale");
  bindtextdomain("app", files.path("").c_str());
  std::vector<std::string> keys;
  for (int i = 0; i < kSets * kMessages; ++i) keys.push_back(text_of(i / kMessages + 1, i % kMessages + 1));
  if (*dgettext("app", keys[0].c_str()) != '[') return state.SkipWithError("no message");
  each_message(state, [&](int set, int number) {
    return dgettext("app", keys[static_cast<size_t>((set - 1) * kMessages + number - 1)].c_str());
  });
  std::setlocale(LC_ALL, "C");
}

void lexaro_open(benchmark::State& state, LXLocale* locale, const std::string& path, uint32_t flags) {
  for (auto _ : state) LXCloseCatalog(LXOpenCatalog(locale, nullptr, path.c_str(), flags), 0);
}

void catgets_open(benchmark::State& state, const std::string& path) {
  for (auto _ : state) catclose(catopen(path.c_str(), 0));
}

int run_all(int argc, char** argv) {
  LXInit(LEXARO_DATA, nullptr, nullptr, nullptr, 0);
  LXLocale* locale = LXGetLocale(kLocale, 0, nullptr);
  LXLocale* host = LXGetLocale("English_UnitedStates.IBM037@BINARY", 0, nullptr);
  Files files;
  std::string ours = files.path("app.cat");
  std::filesystem::current_path(files.path(""));
  using benchmark::RegisterBenchmark;
  RegisterBenchmark("lookup/catgets", [&](auto& state) { catgets_lookup(state, files.path("app.peer"), false); });
  RegisterBenchmark("lookup/catgets_copied", [&](auto& state) { catgets_lookup(state, files.path("app.peer"), true); });
  RegisterBenchmark("lookup/gettext", [&](auto& state) { gettext_lookup(state, files); });
  RegisterBenchmark("lookup/lexaro", [&](auto& state) { lexaro_lookup(state, locale, ours, LX_CAT_LOAD); });
  RegisterBenchmark("lookup/lexaro_on_disk", [&](auto& state) { lexaro_lookup(state, locale, ours, 0); });
  RegisterBenchmark("lookup/lexaro_for_host",
                    [&](auto& state) { lexaro_lookup(state, host, "\x81\x97\x97\x4B\x83\x81\xA3", LX_CAT_LOAD); });
  RegisterBenchmark("open/catopen", [&](auto& state) { catgets_open(state, files.path("app.peer")); });
  RegisterBenchmark("open/lexaro", [&](auto& state) { lexaro_open(state, locale, ours, LX_CAT_LOAD); });
  RegisterBenchmark("open/lexaro_on_disk", [&](auto& state) { lexaro_open(state, locale, ours, 0); });
  benchmark::Initialize(&argc, argv);
  benchmark::RunSpecifiedBenchmarks();
  LXReleaseLocale(host, 0);
  LXReleaseLocale(locale, 0);
  LXTerm();
  return 0;
}

}  // namespace
}  // namespace lx::bench

int main(int argc, char** argv) {
  try {
    return lx::bench::run_all(argc, argv);
  } catch (const std::exception& error) {
    std::fprintf(stderr, "bench_catalog: %s\n", error.what());
    return 1;
  }
}
