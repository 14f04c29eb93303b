// SPDX-License-Identifier: Apache-2.0
// Every function of the interface, on every kind of code page, with every argument that it may be given, with memory,
// files and streams that fail at every place where they can. It comes back, tells of it with a status of its own, has
// taken nothing, and works as before.
#include <gtest/gtest.h>
#include <unistd.h>

#include <cerrno>
#include <csignal>
#include <cstring>
#include <optional>
#include <set>

#include "faults/campaign/call.hpp"
#include "support/descriptors.hpp"
#include "support/environment.hpp"

extern "C" __attribute__((weak)) void __sanitizer_set_death_callback(void (*)());

namespace lx::test {
namespace {

constexpr const char* kPages[] = {"Latin1", "IBM037", "MS932", "MS936", "UTF-8", "JapanEUC", "IBM930"};
constexpr int kMostFailures = 3;  // of one function; more say the same
constexpr unsigned kSeconds = 20;
const std::set<uint32_t> kStatuses = {0,  1,  2,  10, 11, 20, 21, 30, 31, 32, 33, 34,   35,   37,   40,   50,  51,
                                      52, 53, 60, 61, 62, 63, 64, 65, 70, 71, 72, 1000, 1001, 1002, 1003, 2000};
const std::vector<Fault> kSystemFaults = {
    {Fault::system_call, 0, Call::open, ENOENT}, {Fault::system_call, 0, Call::open, EACCES},
    {Fault::system_call, 0, Call::open, EMFILE}, {Fault::system_call, 0, Call::read, EIO},
    {Fault::system_call, 0, Call::seek, EINVAL}, {Fault::system_call, 0, Call::close, EIO},
    {Fault::system_call, 0, Call::status, EBADF}};
const std::vector<Fault> kTransferFaults = {{Fault::transfer, 0, {}, -1},
                                            {Fault::transfer, 0, {}, 0},
                                            {Fault::transfer, 0, {}, -3},
                                            {Fault::transfer, 0, {}, INT32_MAX}};

std::vector<int64_t> up_to(int64_t end) {
  std::vector<int64_t> values;
  for (int64_t value = 0; value < end; ++value) values.push_back(value);
  return values;
}
std::vector<int64_t> each_bit(int64_t good) {
  std::vector<int64_t> values;
  for (int bit = 0; bit < 64; ++bit) values.push_back((bit < 32 ? 0 : good) ^ int64_t{1} << bit % 32);
  return values;
}

// What parameters are changed to, by their letters.
const struct {
  const char* letters;
  Change::Kind kind;
  std::vector<int64_t> values;
} kChanges[] = {
    {"LYtbBeq", Change::null, {0}},
    {"taT", Change::cut, up_to(24)},
    {"taT", Change::hostile, up_to(16)},
    {"ta", Change::measured, {0}},
    {"ta", Change::hostile_measured, {0}},
    {"zy", Change::number, {0, 1, 13, 26, 132, 255, 256, 300}},  // a text of that length
    {"zy", Change::hostile, {1, 5, 16}},
    {"c", Change::number, up_to(256)},
    {"bB", Change::room, {0, 1, 2, 3, 4, 5, 7, 13, -1, INT32_MIN, INT32_MAX}},
    {"I", Change::number, up_to(92)},
    {"h", Change::number, {1, -1}},
    {"iIdw",
     Change::number,
     {0, 1, -1, 2, 37, INT32_MAX, INT32_MIN, 0x4241, 0x8140, 0x8FA1A1, 0xE38182, 0xFFFFFFFF, 0xFFFF, 0xD800}},
};

struct Counts {
  std::set<std::string> functions;
  long calls = 0, faults = 0;
};

class Campaign {
 public:
  Campaign(World& world, const Entry& entry, Counts& counts) : world_(world), entry_(entry), counts_(counts) {}

  void run() {
    counts_.functions.insert(entry_.name);
    const Outcome good = run_once({}, {});
    check(good.status == LX_OK || good.status == LX_E_NATIVE, "the good call fails");
    vary(0);
    if (entry_.has('o')) vary(LX_OPT_CHARS);
    const Outcome again = run_once({}, {});
    check(again.result == good.result && again.status == good.status && again.written == good.written,
          "the good call gives something else now");
  }

 private:
  void vary(uint32_t options) {
    attack({Change::none, 0, 0, options});
    for (size_t i = 0; i < entry_.roles.size(); ++i) {
      const Role& role = entry_.roles[i];
      auto attack_with = [&](Change::Kind kind, const std::vector<int64_t>& values) {
        for (int64_t value : values) attack({kind, i, value, options});
      };
      if (role.optional) attack_with(Change::null, {0});
      if (role.optional && role.letter == 'b') attack_with(Change::null_room, {0});
      if (role.letter == 'o') attack_with(Change::number, each_bit(std::strtoll(role.value.c_str(), nullptr, 0)));
      for (const auto& [letters, kind, values] : kChanges) {
        const bool fixed = role.letter == 'b' && !role.value.empty();
        const bool in_characters = role.letter == 'h' && options != 0;  // whose count depends on the state
        if (std::strchr(letters, role.letter) != nullptr && !fixed && !in_characters) attack_with(kind, values);
      }
      if ((role.letter != 'L' && role.letter != 'Y') || lxglocale != nullptr) continue;
      EXPECT_EQ(LXSetLocale(("French_France." + world_.page_name).c_str(), 0), LX_OK);
      attack_with(Change::null, {0});
      LXReleaseLocale(lxglocale, 0);
    }
  }

  // The call so changed, then with every fault that it can meet.
  void attack(const Change& change) {
    const Role none, &role = entry_.roles.empty() ? none : entry_.roles[change.parameter];
    if (role.bound && (role.letter == 'h' || (change.kind == Change::room && change.value == INT32_MAX))) return;
    const Outcome plain = run_once(change, {});
    if (plain.allocations != 0) meet({{Fault::allocation, 0, {}, 0}, {Fault::allocations, 0, {}, 0}}, plain, change);
    if (change.kind != Change::none && change.kind != Change::null) return;
    meet(kSystemFaults, plain, change);
    if (entry_.has('S') || entry_.result == 'S') meet(kTransferFaults, plain, change);
  }

  void meet(const std::vector<Fault>& faults, const Outcome& plain, const Change& change) {
    for (Fault fault : faults) {
      for (bool more = true; more && failures_ < kMostFailures; ++fault.at) {
        const Outcome outcome = run_once(change, fault);
        more = outcome.faulted;
        counts_.faults += more;
        if (more && fault.of_memory()) check_failure(plain, outcome);
      }
    }
  }

  void check_failure(const Outcome& plain, const Outcome& outcome) {
    const bool told = outcome.status != plain.status || outcome.result != plain.result;
    check(told || outcome.written == plain.written, "without memory it succeeds with something else");
    if (!told || (entry_.gives_handle() && outcome.result != 0)) return;
    check(!outcome.has_status || outcome.status == LX_E_MEMORY, "not the status of no memory");
    check(outcome.left == 0, "a failed call keeps memory");
    check(outcome.locale_kept, "a failed call changes the locale");
  }

  Outcome run_once(const Change& change, const Fault& fault) {
    alarm(kSeconds);
    last_ = call(world_, entry_, change, fault);
    if (last_.leaked != 0) last_ = call(world_, entry_, change, fault);  // it may have loaded an object
    alarm(0);
    ++counts_.calls;
    check(kStatuses.count(last_.status) == 1, "an unknown status");
    check(last_.leaked == 0, "memory is lost");
    check(!last_.overrun, "bytes before a room are changed");
    return last_;
  }

  void check(bool holds, const char* what) {
    if (holds || ++failures_ > kMostFailures) return;
    ADD_FAILURE() << what << ": " << current_call() << "result " << last_.result << ", status " << last_.status
                  << ", blocks kept " << last_.left << ", lost " << last_.leaked;
  }

  World& world_;
  const Entry& entry_;
  Counts& counts_;
  Outcome last_;
  int failures_ = 0;
};

void tell_current_call() { [[maybe_unused]] auto done = write(2, current_call(), std::strlen(current_call())); }

class CampaignTest : public testing::Test {
 protected:
  CampaignTest() {
    if (__sanitizer_set_death_callback != nullptr) __sanitizer_set_death_callback(tell_current_call);
    for (int signal : {SIGSEGV, SIGBUS, SIGFPE, SIGALRM}) {
      std::signal(signal, [](int number) {
        tell_current_call();
        std::signal(number, SIG_DFL);
        raise(number);
      });
    }
  }

  void run(const Table& table) {
    for (const char* page : kPages) {
      World world(page);
      ASSERT_NE(world.sort, nullptr) << page;
      for (const Entry& entry : table) Campaign(world, entry, counts_).run();
    }
  }

  // In a library that has loaded nothing yet, so that files are read during the call.
  void run_cold(const Table& table) {
    std::vector<Fault> faults = kSystemFaults;
    for (Fault::Kind kind : {Fault::allocation, Fault::allocations}) faults.push_back({kind, 0, {}, 0});
    for (const Entry& entry : table) {
      counts_.functions.insert(entry.name);
      for (Fault fault : faults) {
        for (bool more = true; more && !HasFailure(); ++fault.at) more = survives(entry, fault);
      }
    }
  }

  bool survives(const Entry& entry, const Fault& fault) {
    const long descriptors = open_descriptors();
    std::optional<World> world("Latin1");
    alarm(kSeconds);
    const Outcome outcome = call(*world, entry, {}, fault);
    const Outcome again = call(*world, entry, {}, {});
    alarm(0);
    world.reset();
    ++counts_.calls, counts_.faults += outcome.faulted;
    EXPECT_EQ(kStatuses.count(outcome.status), 1u) << current_call() << outcome.status;
    EXPECT_TRUE(again.status == LX_OK || !fault.of_memory()) << current_call() << again.status;
    EXPECT_EQ(std::pair(memory().live, open_descriptors()), std::pair(0, descriptors)) << current_call();
    return outcome.faulted;
  }

  void TearDown() override {
    std::printf("%zu functions, %ld calls, %ld faults\n", counts_.functions.size(), counts_.calls, counts_.faults);
  }

  Counts counts_;
  Variable location_{"LX_LOCALEDIR", nullptr};
  Variable numbered_{"NLS1_LOCALEDIR", LEXARO_DATA};
  Variable language_{"LX_LANG", "French_France.IBM297@French"};
};

TEST_F(CampaignTest, Host) { run(host_calls()); }
TEST_F(CampaignTest, Objects) { run(object_calls()); }
TEST_F(CampaignTest, Codes) { run(code_calls()); }
TEST_F(CampaignTest, Text) { run(text_calls()); }
TEST_F(CampaignTest, Formats) { run(format_calls()); }
TEST_F(CampaignTest, Streams) { run(stream_calls()); }
TEST_F(CampaignTest, ColdObjects) { run_cold(object_calls()); }
TEST_F(CampaignTest, ColdStreams) { run_cold(stream_calls()); }
TEST_F(CampaignTest, Numbered) { run(numbered_calls()); }  // the last: the process keeps its library

TEST_F(CampaignTest, CoversTheInterface) {
  for (auto* table : {host_calls, object_calls, code_calls, text_calls, format_calls, stream_calls, numbered_calls}) {
    for (const Entry& entry : table()) counts_.functions.insert(entry.name);
  }
  std::set<std::string> exported;
  FILE* names = popen(LEXARO_NM " -D --defined-only " LEXARO_LIBRARY " | sed -n 's/.* [TW] \\([^@]*\\).*/\\1/p'", "r");
  for (char name[200]; std::fgets(name, sizeof name, names) != nullptr;) {
    exported.insert(std::string(name, std::strcspn(name, "\n")));
  }
  pclose(names);
  EXPECT_EQ(counts_.functions, exported);
}

}  // namespace
}  // namespace lx::test
