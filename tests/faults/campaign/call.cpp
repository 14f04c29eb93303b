// SPDX-License-Identifier: Apache-2.0
#include "faults/campaign/call.hpp"

#include <sys/mman.h>

#include <algorithm>
#include <cstring>
#include <optional>

#include "support/edge_buffer.hpp"

namespace lx::test {
namespace {

constexpr size_t kMost = 16;   // parameters
constexpr size_t kRoom = 120;  // units of a room
constexpr size_t kCanary = 8;  // bytes before an area, which nobody may change
char g_label[400];

void* largest_room() {
  constexpr size_t kSize = size_t{9} << 30;
  static void* const mapped =
      mmap(nullptr, kSize, PROT_READ | PROT_WRITE, MAP_PRIVATE | MAP_ANONYMOUS | MAP_NORESERVE, -1, 0);
  return mapped;
}

uint64_t hash(uint64_t value, const void* data, size_t size) {
  for (size_t i = 0; i < size; ++i) value = (value ^ static_cast<const uint8_t*>(data)[i]) * 1099511628211u;
  return value;
}

// What a locale says of itself.
uint64_t hash_of(LXLocale* locale) {
  uint64_t value = 0;
  for (uint32_t item = 1; item < 88; ++item) {
    LXUChar text[64] = {};
    int32_t results[] = {LXGetLocaleTextInfoU(locale, item, text, 64, 0), LXGetLocaleNumInfo(locale, item, 0)};
    value = hash(hash(value, text, sizeof text), results, sizeof results);
  }
  return value;
}

class Arguments {
 public:
  Arguments(World& world, const Entry& entry, const Change& change) : world_(world), entry_(entry), change_(change) {
    const std::string& name = entry.name;
    has_state_ = entry.has('h') || name.substr(name.size() - 2) == "Ex" || name.substr(0, 5) == "NLS1_";
    for (size_t i = 0; i < entry.roles.size(); ++i) {
      if (entry.roles[i].letter == 'o') characters_ = characters_ || (number(i) & LX_OPT_CHARS) != 0;
    }
    for (size_t i = 0; i < entry.roles.size(); ++i) values[i] = place(i);
    if (own_ != nullptr) before_ = hash_of(own_);
    for (LXLocale* locale : locales_) LXGetLocaleNumInfo(locale, LX_ITEM_FRACTION_DIGITS, 0);  // clears its status
  }
  ~Arguments() {
    for (size_t i = 0; i < entry_.roles.size(); ++i) {
      if (!entry_.roles[i].bound) close(entry_.roles[i].letter, values[i].pointer);
    }
  }
  Arguments(const Arguments&) = delete;
  Arguments& operator=(const Arguments&) = delete;

  // Gives back what has that letter, as a result or an argument.
  void close(char letter, void* pointer) const {
    if (pointer == nullptr) return;
    if (letter == 'l') LXReleaseLocale(static_cast<LXLocale*>(pointer), 0);
    if (letter == 'A') LXMcFree(pointer);
    if (letter == 'V') LXCloseConversion(static_cast<LXConversion*>(pointer));
    if (letter == 'S') LXCloseStream(static_cast<LXStream*>(pointer), world_.locale, 0);
    if (letter == 'K') LXCloseCatalog(static_cast<LXCatalog*>(pointer), 0);
    if (letter == 'F' && LXCloseFile(static_cast<LXFile*>(pointer), 1) != 0) LXMcFree(pointer);  // it keeps the handle
    if (letter == 'M' && pointer != world_.manager) LXTermObjManager(static_cast<LXObjMgr*>(pointer));
  }

  void read(Value result, Outcome& outcome) const {
    const bool in_locales = !entry_.has('q') && entry_.result != 's';
    outcome.result = entry_.gives_handle() || entry_.result == 'p' ? result.pointer != nullptr : result.number;
    outcome.has_status = status_ != nullptr || entry_.result == 's' || (in_locales && !locales_.empty());
    outcome.status = status_ != nullptr ? *status_ : entry_.result == 's' ? static_cast<uint32_t>(result.number) : 0;
    for (const LXLocale* locale : locales_) {
      if (in_locales) outcome.status = std::max(outcome.status, LXGetError(locale));
    }
    for (const auto& [at, size] : areas_) {
      outcome.written = hash(outcome.written, at, size);
      outcome.overrun = outcome.overrun || std::string_view(at - kCanary, kCanary) != "ZZZZZZZZ";
    }
    outcome.locale_kept = own_ == nullptr || hash_of(own_) == before_;
  }

  Value values[kMost] = {};

 private:
  bool changed(size_t i, Change::Kind kind) const { return change_.kind == kind && change_.parameter == i; }
  int64_t number(size_t i) const {
    const Role& role = entry_.roles[i];
    if (changed(i, Change::number)) return change_.value;
    if (role.value == "$page") return LXGetObjId(world_.page);
    if (role.value == "$ascii") return LXGetLocaleNumInfo(world_.locale, LX_ITEM_ASCII_FAMILY, 0);
    if (role.value.empty() && role.letter == 'i') return 'A';
    return std::strtoll(role.value.c_str(), nullptr, 0) | (role.letter == 'o' ? change_.options : 0);
  }
  // Memory of that size for the parameter, `second` if it is pointed at through another.
  char* area(size_t i, size_t size, bool second = false) {
    static EdgeBuffer* blocks[2 * kMost];
    EdgeBuffer*& block = blocks[second ? kMost + i : i];
    if (block == nullptr) block = new EdgeBuffer(8192);
    char* at = block->room(size + kCanary) + kCanary;
    if (!second) areas_.emplace_back(at, size);
    return at;
  }
  template <class T>
  Value cell(size_t i, const T& value) {
    return value_of(std::memcpy(area(i, sizeof value, std::is_pointer_v<T>), &value, sizeof value));
  }

  int64_t characters_in(const std::string& text, size_t unit) const {
    auto length = static_cast<int32_t>(text.size() / unit);
    if (unit != 1) return length;
    return has_state_ ? LXNumCharsEx(world_.locale, text.data(), 0, length)
                      : LXNumChars(world_.locale, text.data(), length);
  }
  char* place_text(size_t i, bool terminated) {
    const Role& role = entry_.roles[i];
    const size_t unit = entry_.targets[i].unit;
    const bool measured = changed(i, Change::measured) || changed(i, Change::hostile_measured);
    const bool hostile = changed(i, Change::hostile) || changed(i, Change::hostile_measured);
    const auto count = static_cast<size_t>(change_.value) * unit;
    std::string units =
        hostile ? world_.hostile(unit) : world_.text(unit, (role.letter == 'z' ? "=" : "") + role.value);
    if (changed(i, Change::cut) || changed(i, Change::hostile)) units.resize(std::min(units.size(), count));
    if (changed(i, Change::number)) units.assign(count, 'x');
    text_characters_ = characters_in(units, unit);
    text_length_ = measured ? -1 : characters_ ? text_characters_ : static_cast<int64_t>(units.size() / unit);
    if (unit == 1 && characters_ && has_state_ && !measured) units += '\x0F';  // a run that is counted is closed
    const size_t size = units.size();
    if (terminated || measured) units.append(unit, '\0');
    char* at = area(i, units.size() + (role.letter == 'D' ? 2 * kRoom * unit : 0));
    text_end_ = std::copy(units.begin(), units.end(), at) - (units.size() - size);
    return at;
  }
  // With as many bytes as its first one announces, or as any state needs.
  char* place_character(size_t i) {
    std::string units = world_.text(1, "A");
    if (changed(i, Change::number)) units[0] = static_cast<char>(change_.value);
    int32_t length = units[0] != '\0' ? LXByteLength(world_.locale, units.data()) : 1;
    if (has_state_ && change_.kind == Change::number) length = 5;
    units.resize(static_cast<size_t>(std::max(length, entry_.roles[i].value.empty() ? 1 : 3)), '\x41');
    char* at = area(i, units.size());
    return std::copy(units.begin(), units.end(), at), at;
  }
  char* place_room(size_t i) {
    const size_t unit = entry_.targets[i].unit;
    if (const int64_t fixed = number(i); fixed != 0) return area(i, static_cast<size_t>(fixed) * unit);
    room_ = changed(i, Change::room) ? change_.value : int64_t{kRoom};
    if (room_ == INT32_MAX) return static_cast<char*>(largest_room());
    auto units = static_cast<size_t>(std::max(room_, int64_t{0}));
    return area(i, (characters_ && units != 0 ? units * 6 + 8 : units) * unit);
  }
  Value place_time(size_t i) {
    LXTime time = {};
    std::fill_n(&time.tm_sec, 9, changed(i, Change::number) ? static_cast<int>(change_.value) : 5);
    return cell(i, time);
  }
  Value place_variable(size_t i) {
    const size_t size = entry_.targets[i].indirect ? sizeof(void*) : entry_.targets[i].unit;
    const int64_t before = number(i);
    char* at = area(i, size, entry_.targets[i].indirect);
    std::memset(at, 0, size);
    std::memcpy(at, raw_number(before, std::min(size, sizeof before)).data(), std::min(size, sizeof before));
    if (entry_.roles[i].letter == 'q') status_ = reinterpret_cast<uint32_t*>(at);
    return value_of(at);
  }
  LXStream* open_stream(char mode) {
    Wire& wire = Wire::get() = Wire{};
    LXStream* stream = LXOpenStream(world_.locale, Wire::move, &wire, mode == 'w' ? LX_STREAM_WRITE : LX_STREAM_READ);
    if (mode == 'w') {  // a character is refused, and kept
      wire.fail_at = wire.failure = 0;
      LXWriteCharU(stream, world_.locale, 'A');
    }
    wire = Wire{};
    wire.bytes = mode == 'w' ? "" : world_.text(mode == 'u' ? 2 : 1, "");
    return stream;
  }
  Value with_status(LXLocale* locale) {
    if (locale != nullptr || lxglocale != nullptr) locales_.push_back(locale != nullptr ? locale : lxglocale);
    return value_of(locale);
  }

  Value place(size_t i) {
    const Role& role = entry_.roles[i];
    const char letter = role.letter;
    const bool null = changed(i, Change::null) || changed(i, Change::null_room);
    if (letter == 'L' || letter == 'Y')
      return with_status(null ? nullptr : letter == 'L' ? world_.locale : world_.other);
    if (null && std::strchr("taTyz", letter) != nullptr) text_length_ = text_characters_ = 0;
    if (null && letter == 'b') room_ = change_.kind == Change::null ? 0 : int64_t{kRoom};
    if (null) return value_of(nullptr);
    if (letter == 'l' && role.bound) return value_of(world_.own_locale());
    if (letter == 'l') return with_status(own_ = world_.own_locale());
    if (letter == 'P') return value_of(world_.page);
    if (letter == 'Q') return value_of(world_.other_page);
    if (letter == 'G') return value_of(world_.language);
    if (letter == 'W') return value_of(world_.sort);
    if (letter == 'M') return value_of(world_.manager);
    if (letter == 'F') return value_of(LXOpenFile(0, "file", 0, 0, nullptr));
    if (letter == 'V') return value_of(LXOpenConversion(world_.other, world_.locale, 0));
    if (letter == 'S') return value_of(open_stream(role.value[0]));
    if (letter == 'K') return value_of(LXOpenCatalog(world_.other, "", "catalog", role.value == "l" ? LX_CAT_LOAD : 0));
    if (letter == 't') return value_of(place_text(i, false));
    if (std::strchr("azyD", letter) != nullptr) return value_of(place_text(i, true));
    if (letter == 'T') return cell(i, place_text(i, false));
    if (letter == 'n') return value_of(text_length_);
    if (letter == 'x') return value_of(text_characters_);
    if (letter == 'N') return cell(i, static_cast<int32_t>(text_length_));
    if (letter == 'u') return value_of(text_end_);
    if (letter == 'c') return value_of(place_character(i));
    if (letter == 'b') return value_of(place_room(i));
    if (letter == 'B') return cell(i, place_room(i));
    if (letter == 'r') return value_of(room_);
    if (letter == 'R') return cell(i, static_cast<int32_t>(room_));
    if (std::strchr("veq", letter) != nullptr) return place_variable(i);
    if (letter == 'w') return place_time(i);
    if (letter != 'd') return value_of(number(i));
    return value_of(changed(i, Change::number) ? static_cast<double>(change_.value) * 1e290 : -1234567.891);
  }

  World& world_;
  const Entry& entry_;
  const Change& change_;
  bool has_state_ = false;                         // characters are counted with shift states
  bool characters_ = false;                        // lengths are in characters
  int64_t text_length_ = 0, text_characters_ = 0;  // of the text before
  char* text_end_ = nullptr;
  int64_t room_ = 0;
  uint32_t* status_ = nullptr;
  LXLocale* own_ = nullptr;
  uint64_t before_ = 0;  // what the own locale said
  std::vector<LXLocale*> locales_;
  std::vector<std::pair<char*, size_t>> areas_;
};

}  // namespace

const char* current_call() { return g_label; }

Outcome call(World& world, const Entry& entry, const Change& change, const Fault& fault) {
  std::snprintf(g_label, sizeof g_label, "%s on %s, parameter %zu changed (%d) to %lld, options %X, fault %d at %d\n",
                entry.name.c_str(), world.page_name.c_str(), change.parameter + 1, change.kind,
                static_cast<long long>(change.value), change.options, fault.kind, fault.at);
  Outcome outcome;
  CountingAllocator& counter = memory();
  const LXLocale* default_locale = lxglocale;
  const int before = counter.live;
  {
    Arguments arguments(world, entry, change);
    const int before_call = counter.live;
    if (fault.kind == Fault::transfer) Wire::get().fail_at = fault.at, Wire::get().failure = fault.error;
    counter.arm(fault.of_memory() ? fault.at : -1, fault.kind == Fault::allocations);
    std::optional<FailingCall> failing;
    if (fault.kind == Fault::system_call) failing.emplace(fault.call, fault.at, fault.error);
    Value result = entry.call(arguments.values);
    outcome.faulted = failing ? failing->happened() : fault.of_memory() ? counter.has_failed() : Wire::get().failed;
    failing.reset();
    outcome.allocations = counter.calls;
    counter.disarm();
    Wire::get().fail_at = -1;
    outcome.left = counter.live - before_call;
    arguments.read(result, outcome);
    if (entry.gives_handle()) arguments.close(entry.result == 'L' ? 'l' : entry.result, result.pointer);
    if (default_locale == nullptr) LXReleaseLocale(lxglocale, 0);
  }
  outcome.leaked = counter.live - before;
  return outcome;
}

}  // namespace lx::test
