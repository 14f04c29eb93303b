// SPDX-License-Identifier: Apache-2.0
// Conversion speed beside iconv and ICU. Exit status: 0; 1: a row is slower than the faster peer; 2: it could not be
// measured, or the contenders disagree.
#include <lexaro/lexaro.h>

#include <cstdio>
#include <cstring>

#include "bench/convert/peers.hpp"
#include "bench/convert/table.hpp"
#include "bench/support/library.hpp"
#include "bench/support/machine.hpp"

namespace lx::bench {
namespace {

constexpr double kSingleByteAim = 3;
constexpr double kMultibyteAim = 2;

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
  const Library library(options);
  std::printf("%s", machine_description(peer_versions()).c_str());
  int slower = 0;
  for (const Size& size : kSizes) {
    std::vector<Result> results;
    for (const Row& row : rows()) {
      std::string name = row.name() + ", " + size.name;
      if (!options.wants(name.c_str())) continue;
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

}  // namespace
}  // namespace lx::bench

int main(int argc, char** argv) { return lx::bench::run_program("bench_convert", argc, argv, lx::bench::run); }
