// SPDX-License-Identifier: Apache-2.0
// Conversion speed beside iconv and ICU. Exit status: 0; 1: a row is slower than the faster peer; 2: it could not be
// measured, or the contenders disagree.
#include <lexaro/lexaro.h>

#include <cstdio>
#include <cstring>

#include "bench/convert/peers.hpp"
#include "bench/convert/table.hpp"
#include "bench/support/machine.hpp"

namespace lx::bench {
namespace {

constexpr double kSingleByteAim = 3;
constexpr double kMultibyteAim = 2;

struct Options {
  bool quick = false;
  const char* only = "";  // of "ROW, SIZE"
  const char* data = LEXARO_DATA;
};

constexpr Size kSizes[] = {{"16 MiB", 16 << 20, 1}, {"4 KiB", 4 << 10, 16}, {"64-byte", 64, 256}};

std::vector<Row> rows() {
  std::vector<Row> all;
  for (const Page& page : kPages) {
    bool multibyte = page.script == Script::japanese || page.script == Script::chinese;
    double aim = multibyte ? kMultibyteAim : kSingleByteAim;
    for (const Page& unicode : {kUtf8, kUcs2}) {
      all.push_back({page, unicode, page.script, aim});
      all.push_back({unicode, page, page.script, aim});
    }
  }
  all.push_back({kPages[0], kPages[1], Script::latin, kSingleByteAim});
  return all;
}

Effort effort_for(const Options& options, const Size& size) {
  if (options.quick) return size.texts == 1 ? Effort{2, 0} : Effort{5, 0.0005};
  return size.texts == 1 ? Effort{7, 0} : Effort{40, 0.001};
}

int run(const Options& options) {
  std::printf("%s", machine_description(peer_versions()).c_str());
  int slower = 0;
  for (const Size& size : kSizes) {
    std::vector<Result> results;
    for (const Row& row : rows()) {
      std::string name = row.name() + ", " + size.name;
      if (name.find(options.only) == std::string::npos) continue;
      results.push_back({row, measure(row, size, effort_for(options, size))});
    }
    if (results.empty()) continue;
    print_table(size, results);
    std::printf("\n");
    slower += print_slower(size, results);
    std::fflush(stdout);
  }
  return slower == 0 ? 0 : 1;
}

int usage() {
  std::fprintf(stderr, "usage: bench_convert [--quick] [--only TEXT] [--data DIRECTORY]\n");
  return 2;
}

bool parse(int count, char** arguments, Options& options) {
  for (int i = 1; i < count; ++i) {
    const char* value = i + 1 < count ? arguments[i + 1] : nullptr;
    if (std::strcmp(arguments[i], "--quick") == 0) {
      options.quick = true;
    } else if (std::strcmp(arguments[i], "--only") == 0 && value != nullptr) {
      options.only = arguments[++i];
    } else if (std::strcmp(arguments[i], "--data") == 0 && value != nullptr) {
      options.data = arguments[++i];
    } else {
      return false;
    }
  }
  return true;
}

}  // namespace
}  // namespace lx::bench

int main(int argc, char** argv) {
  using namespace lx::bench;
  Options options;
  if (!parse(argc, argv, options)) return usage();
  if (LXInit(options.data, nullptr, nullptr, nullptr, LX_INIT_NO_DEFAULTS) != LX_OK) {
    std::fprintf(stderr, "bench_convert: no locale data in %s\n", options.data);
    return 2;
  }
  int status = 2;
  try {
    status = run(options);
  } catch (const Failure& failure) {
    std::fprintf(stderr, "bench_convert: %s\n", failure.what());
  }
  LXTerm();
  return status;
}
