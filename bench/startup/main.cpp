// SPDX-License-Identifier: Apache-2.0
// What a short program pays before its first converted string, beside iconv and ICU: the time and the memory of a
// process that converts one string, less those of the same program when it ends at once; and the memory of ten locales.
// Exit status: 0; 1: above the aims or slower than the faster peer; 2: it could not be measured.
#include <spawn.h>
#include <sys/wait.h>
#include <time.h>

#include <algorithm>
#include <cstdio>
#include <cstring>
#include <string>
#include <utility>
#include <vector>

#include "bench/startup/child.hpp"
#include "bench/support/machine.hpp"

extern char** environ;

namespace lx::bench {
namespace {

constexpr int kRepetitions = 400;
constexpr int kQuickRepetitions = 60;
constexpr double kAim = 100;      // microseconds
constexpr long kMemoryAim = 500;  // kilobytes of its own

double now() {
  timespec time = {};
  clock_gettime(CLOCK_MONOTONIC, &time);
  return static_cast<double>(time.tv_sec) * 1e6 + static_cast<double>(time.tv_nsec) * 1e-3;
}

// Microseconds from the start of the process to its end; negative on failure.
double run(const char* program, const char* mode) {
  char* arguments[] = {const_cast<char*>(program), const_cast<char*>(mode), nullptr};
  double start = now();
  pid_t process = 0;
  if (posix_spawn(&process, program, nullptr, nullptr, arguments, environ) != 0) return -1;
  int status = 0;
  if (waitpid(process, &status, 0) != process || status != 0) return -1;
  return now() - start;
}

// Kilobytes at the end of the process.
struct Memory {
  long resident = 0;
  long own = 0;  // not shared with other processes
};
Memory memory(const char* program, const char* mode) {
  std::FILE* pipe = popen((std::string("'") + program + "' " + mode + " memory").c_str(), "r");
  Memory result;
  const bool told = pipe != nullptr && std::fscanf(pipe, "%ld kB %ld", &result.resident, &result.own) == 2;
  if (pipe != nullptr) pclose(pipe);
  if (!told) std::fprintf(stderr, "bench_startup: %s does not tell its memory\n", program);
  return result;
}

double median(std::vector<double> values) {
  std::nth_element(values.begin(), values.begin() + static_cast<std::ptrdiff_t>(values.size() / 2), values.end());
  return values[values.size() / 2];
}

struct Contender {
  const char* name;
  const char* program;
  std::vector<double> empty = {};
  std::vector<double> working = {};

  bool measure() {
    empty.push_back(run(program, kEmpty));
    working.push_back(run(program, kWork));
    return empty.back() >= 0 && working.back() >= 0;
  }
  // Of neighbours in time, which share what else the machine is doing.
  double cost() const {
    std::vector<double> differences;
    for (size_t i = 0; i < empty.size(); ++i) differences.push_back(working[i] - empty[i]);
    return median(std::move(differences));
  }
};

// Whether the aim is met.
bool print_memory(const Contender& ours, const Contender& peer) {
  std::printf("\nKilobytes more than the empty process: resident, and of these the process's own\n\n");
  std::printf("| Program | One string converted | Ten locales used |\n| --- | ---: | ---: |\n");
  bool met = true;
  for (const Contender* contender : {&ours, &peer}) {
    const Memory empty = memory(contender->program, kEmpty);
    const Memory one = memory(contender->program, kWork);
    const Memory ten = memory(contender->program, kTen);
    std::printf("| %s | %ld, %ld | %ld, %ld |\n", contender->name, one.resident - empty.resident, one.own - empty.own,
                ten.resident - empty.resident, ten.own - empty.own);
    if (contender == &ours) met = one.own - empty.own <= kMemoryAim;
  }
  if (!met) std::printf("\nABOVE the aim of %ld KB\n", kMemoryAim);
  return met;
}

int compare(int repetitions) {
  Contender contenders[] = {{"Lexaro", LEXARO_CHILD}, {"iconv", ICONV_CHILD}, {"ICU", ICU_CHILD}};
  for (int i = 0; i < repetitions; ++i) {
    for (Contender& contender : contenders) {
      if (contender.measure()) continue;
      std::fprintf(stderr, "bench_startup: %s failed\n", contender.program);
      return 2;
    }
  }
  std::printf("%s", machine_description("the C library and ICU of this system").c_str());
  std::printf("\n| Program | Empty process, us | With one string converted, us | Difference, us |\n");
  std::printf("| --- | ---: | ---: | ---: |\n");
  for (const Contender& contender : contenders) {
    std::printf("| %s | %.0f | %.0f | %.0f |\n", contender.name, median(contender.empty), median(contender.working),
                contender.cost());
  }
  double cost = contenders[0].cost();
  bool slower = cost > std::min(contenders[1].cost(), contenders[2].cost());
  if (slower) std::printf("\nSLOWER than the faster peer: %.0f us\n", cost);
  if (cost > kAim) std::printf("\nABOVE the aim of %.0f us: %.0f us\n", kAim, cost);
  const bool light = print_memory(contenders[0], contenders[2]);
  return slower || cost > kAim || !light ? 1 : 0;
}

}  // namespace
}  // namespace lx::bench

int main(int argc, char** argv) {
  bool quick = argc == 2 && std::strcmp(argv[1], "--quick") == 0;
  if (argc > 1 && !quick) {
    std::fprintf(stderr, "usage: bench_startup [--quick]\n");
    return 2;
  }
  return lx::bench::compare(quick ? lx::bench::kQuickRepetitions : lx::bench::kRepetitions);
}
