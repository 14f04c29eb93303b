// SPDX-License-Identifier: Apache-2.0
// Translation of host fields beside iconv, whose descriptor is held and reset for each field. Exit status: 0; 1: a row
// is slower than iconv; 2: it could not be measured, or the two disagree.
#include <iconv.h>
#include <lexaro/nls1.h>
#include <time.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <limits>

#include "bench/convert/corpus.hpp"
#include "bench/convert/peers.hpp"
#include "bench/support/machine.hpp"
#include "bench/support/program.hpp"

namespace lx::bench {
namespace {

constexpr size_t kFields = 256;  // different ones, so that nobody learns one by heart
constexpr size_t kSizes[] = {80, 20};
constexpr size_t kRoom = 512;

struct HostRow {
  Page from;
  uint16_t from_id;
  Page to;
  uint16_t to_id;
  Script script;
  std::string name() const { return std::string(from.name) + " to " + to.name; }
};

constexpr Page kHost = kPages[0], kLatin1 = kPages[2], kMixedHost = kPages[6];
constexpr HostRow kRows[] = {
    {kHost, 37, kLatin1, 819, Script::latin},
    {kLatin1, 819, kHost, 37, Script::latin},
    {kMixedHost, 930, kUtf8, LX_CP_UTF8, Script::records},
    {kUtf8, LX_CP_UTF8, kMixedHost, 930, Script::records},
};

class ByNumber {
 public:
  explicit ByNumber(const HostRow& row) : to_(row.to_id), from_(row.from_id) {}

  size_t translate(const char* in, size_t length, char* out) {
    uint32_t error = LX_OK;
    int32_t consumed = 0;
    const int32_t count = NLS1_TranslateString(to_, out, static_cast<int32_t>(kRoom), from_, in,
                                               static_cast<int32_t>(length), &consumed, 0, &error);
    if (count < 0 || error != LX_OK) throw Failure("NLS1_TranslateString failed");
    return static_cast<size_t>(count);
  }

 private:
  uint16_t to_;
  uint16_t from_;
};

class ByIconv {
 public:
  explicit ByIconv(const HostRow& row)
      : shifted_(row.to.shifted), descriptor_(iconv_open(row.to.iconv, row.from.iconv)) {
    if (descriptor_ == reinterpret_cast<iconv_t>(-1)) throw Failure("iconv_open failed");
  }
  ~ByIconv() { iconv_close(descriptor_); }
  ByIconv(const ByIconv&) = delete;
  ByIconv& operator=(const ByIconv&) = delete;

  // The reset closes the last run of a mixed target.
  size_t translate(const char* in, size_t length, char* out) {
    char* text = const_cast<char*>(in);
    size_t left = kRoom;
    size_t status = iconv(descriptor_, &text, &length, &out, &left);
    status |= shifted_ ? iconv(descriptor_, nullptr, nullptr, &out, &left)
                       : iconv(descriptor_, nullptr, nullptr, nullptr, nullptr);
    if (status != 0) throw Failure("iconv failed");
    return kRoom - left;
  }

 private:
  bool shifted_;
  iconv_t descriptor_;
};

// Processor time of this thread: what other processes take away does not count.
double now() {
  timespec time = {};
  clock_gettime(CLOCK_THREAD_CPUTIME_ID, &time);
  return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_nsec) * 1e-9;
}

template <class Peer>
double nanoseconds_a_field(Peer& peer, const Texts& fields, int rounds) {
  char out[kRoom];
  const double start = now();
  for (int round = 0; round < rounds; ++round) {
    for (size_t i = 0; i < kFields; ++i) {
      peer.translate(fields.bytes.data() + fields.begins[i], fields.begins[i + 1] - fields.begins[i], out);
    }
  }
  return (now() - start) * 1e9 / rounds / kFields;
}

template <class Peer>
std::string results(Peer& peer, const Texts& fields) {
  std::string all;
  char out[kRoom];
  for (size_t i = 0; i < kFields; ++i) {
    const size_t begin = fields.begins[i];
    all.append(out, peer.translate(fields.bytes.data() + begin, fields.begins[i + 1] - begin, out));
  }
  return all;
}

// The library comes up with the first call and goes with these.
struct Library {
  explicit Library(const Options& options) { setenv("NLS1_LOCALEDIR", options.data, 1); }
  ~Library() {
    TermThread(HSV1_ResolveThread(&qlgnlthr_HSV1__T, "bench_host"));
    TermProcess(HSV1_ResolveProcess(&qlgnlprc_HSV1__P, "bench_host"));
  }
};

// Times iconv; prints the row.
double measure(const HostRow& row, size_t size, const Options& options) {
  const Texts fields = compose(row.from, row.script, size, kFields);
  ByNumber ours(row);
  ByIconv peer(row);
  if (results(ours, fields) != results(peer, fields)) throw Failure(row.name() + ": the results differ");
  double best[2] = {std::numeric_limits<double>::max(), std::numeric_limits<double>::max()};
  for (int repetition = 0; repetition < (options.quick ? 5 : 60); ++repetition) {
    best[0] = std::min(best[0], nanoseconds_a_field(ours, fields, 20));
    best[1] = std::min(best[1], nanoseconds_a_field(peer, fields, 20));
  }
  const double ratio = best[1] / best[0];
  std::printf("| %s | %zu | %.1f | %.1f | %.2f |\n", row.name().c_str(), size, best[0], best[1], ratio);
  std::fflush(stdout);
  return ratio;
}

int run(const Options& options) {
  const Library library(options);
  std::printf("%s\n", machine_description(peer_versions()).c_str());
  std::printf("| Fields | Bytes | Lexaro ns | iconv ns | Times iconv |\n| --- | ---: | ---: | ---: | ---: |\n");
  std::string slower;
  for (size_t size : kSizes) {
    for (const HostRow& row : kRows) {
      if (!options.wants(row.name().c_str())) continue;
      if (measure(row, size, options) < 1)
        slower += "SLOWER than iconv: " + row.name() + ", " + std::to_string(size) + " bytes\n";
    }
  }
  std::printf("\n%s", slower.c_str());
  return slower.empty() ? 0 : 1;
}

}  // namespace
}  // namespace lx::bench

int main(int argc, char** argv) { return lx::bench::run_program("bench_host", argc, argv, lx::bench::run); }
