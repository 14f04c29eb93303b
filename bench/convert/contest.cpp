// SPDX-License-Identifier: Apache-2.0
#include "bench/convert/contest.hpp"

#include <time.h>

#include <algorithm>
#include <limits>

#include "bench/convert/corpus.hpp"
#include "bench/convert/peers.hpp"

namespace lx::bench {
namespace {

// No pair of the table grows a text more than this.
constexpr size_t kMostGrowth = 4;

// Processor time of this thread: what other processes take away does not count.
double now() {
  timespec time = {};
  clock_gettime(CLOCK_THREAD_CPUTIME_ID, &time);
  return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_nsec) * 1e-9;
}

class Contender {
 public:
  explicit Contender(PeerPtr peer) : peer_(std::move(peer)) {}

  std::string results(const Texts& texts, std::vector<char>& out) {
    std::string all;
    for (size_t i = 0; i + 1 < texts.begins.size(); ++i) all.append(out.data(), convert(texts, i, out));
    return all;
  }

  double seconds(const Texts& texts, std::vector<char>& out, int rounds) {
    double start = now();
    for (int round = 0; round < rounds; ++round) {
      for (size_t i = 0; i + 1 < texts.begins.size(); ++i) convert(texts, i, out);
    }
    return (now() - start) / rounds;
  }

  void run(const Texts& texts, std::vector<char>& out, double batch_seconds) {
    if (rounds_ == 0) rounds_ = 1 + static_cast<int>(batch_seconds / seconds(texts, out, 1));
    best_ = std::min(best_, seconds(texts, out, rounds_));
  }
  double best() const { return best_; }

 private:
  size_t convert(const Texts& texts, size_t i, std::vector<char>& out) {
    size_t begin = texts.begins[i];
    return peer_->convert(texts.bytes.data() + begin, texts.begins[i + 1] - begin, out.data(), out.size());
  }

  PeerPtr peer_;
  int rounds_ = 0;
  double best_ = std::numeric_limits<double>::max();
};

std::vector<Contender> contenders_for(const Row& row) {
  std::vector<Contender> contenders;
  contenders.emplace_back(lexaro_peer(row.from, row.to));
  contenders.emplace_back(iconv_peer(row.from, row.to));
  contenders.emplace_back(icu_pivot_peer(row.from, row.to));
  if (PeerPtr direct = icu_direct_peer(row.from, row.to)) contenders.emplace_back(std::move(direct));
  return contenders;
}

void check_equal(const Row& row, std::vector<Contender>& contenders, const Texts& texts, std::vector<char>& out) {
  std::string expected = contenders[0].results(texts, out);
  for (size_t i = 1; i < contenders.size(); ++i) {
    std::string found = contenders[i].results(texts, out);
    if (found == expected) continue;
    auto at = std::mismatch(expected.begin(), expected.end(), found.begin(), found.end()).first - expected.begin();
    throw Failure(row.name() + ": contender " + std::to_string(i) + " differs at output byte " + std::to_string(at));
  }
}

}  // namespace

Speeds measure(const Row& row, const Size& size, const Effort& effort) {
  Texts texts = compose(row.from, row.script, size.bytes, size.texts);
  std::vector<char> out(size.bytes * kMostGrowth);
  std::vector<Contender> contenders = contenders_for(row);
  check_equal(row, contenders, texts, out);
  for (int repetition = 0; repetition < effort.repetitions; ++repetition) {
    for (Contender& contender : contenders) contender.run(texts, out, effort.batch_seconds);
  }
  auto speed = [&](size_t i) { return static_cast<double>(texts.bytes.size()) / contenders[i].best() / 1e6; };
  double icu = contenders.size() > 3 ? std::max(speed(2), speed(3)) : speed(2);
  return {speed(0), speed(1), icu};
}

}  // namespace lx::bench
