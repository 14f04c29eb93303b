// SPDX-License-Identifier: Apache-2.0
// Lexaro for C++17: owners for what the C interface hands out, and strings instead of buffers for the common work.
// Everything else is a call of <lexaro/lexaro.h> with get().
//
//  - Objects are moved, not copied; a moved-from object may only be destroyed. Release never throws.
//  - What fails throws lexaro::Error with the status, or std::bad_alloc. Programs built without exceptions use the C
//    interface.
//  - Text is a std::string_view in the code page of a locale, shift bytes included, which begins in the single-byte
//    state; or a std::u16string_view of UCS-2. No terminator is needed, and none is written. A view is at most
//    INT32_MAX units long (Error with LX_E_ARGUMENT), except for conversions.
//  - One thread at a time uses a Locale and what depends on it, even to ask: each call leaves its status in it. That is
//    why nothing here is const. Each thread makes its own; the Library is for all of them.
#ifndef LEXARO_LEXARO_HPP
#define LEXARO_LEXARO_HPP

#include <lexaro/lexaro.h>
#include <lexaro/nls1.h>

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>

namespace lexaro {

// A call that failed: its name, and the LX_E_ code that it left.
class Error : public std::runtime_error {
 public:
  Error(const std::string& call, uint32_t status)
      : std::runtime_error(call + ": status " + std::to_string(status)), status_(status) {}
  uint32_t status() const noexcept { return status_; }

 private:
  uint32_t status_;
};

namespace detail {

struct Close {
  void operator()(LXLocale* locale) const noexcept { LXReleaseLocale(locale, 0); }
  void operator()(LXConversion* conversion) const noexcept { LXCloseConversion(conversion); }
  void operator()(LXCatalog* catalog) const noexcept { LXCloseCatalog(catalog, 0); }
};
template <typename T>
using Owner = std::unique_ptr<T, Close>;

inline void check(const char* call, uint32_t status) {
  if (status != LX_OK) throw Error(call, status);
}
inline void check(const char* call, LXLocale* locale) { check(call, LXGetError(locale)); }

inline int32_t length_of(std::size_t length) {
  if (length > static_cast<std::size_t>(INT32_MAX)) throw Error("lexaro.hpp: text too long", LX_E_ARGUMENT);
  return static_cast<int32_t>(length);
}

// Where a text is, never null. char16_t and LXUChar have the same representation.
inline const char* units(std::string_view text) { return text.data() != nullptr ? text.data() : ""; }
inline const LXUChar* units(std::u16string_view text) {
  return reinterpret_cast<const LXUChar*>(text.data() != nullptr ? text.data() : u"");
}
inline char* units(std::string& text) { return text.data(); }
inline LXUChar* units(std::u16string& text) { return reinterpret_cast<LXUChar*>(text.data()); }
template <typename Text>
int32_t length(const Text& text) {
  return length_of(text.size());
}

// Room beyond what any character needs: as long as so much is left, none was left out.
inline constexpr std::size_t kSpareRoom = 16;

// Calls `write(buffer, room)`, which gives the units written, with more room until the library says that it fits. What
// the locale's own formats of dates and times leave out shows in the room only.
template <typename Text, typename Write>
Text write_until_it_fits(const char* call, LXLocale* locale, Write write) {
  Text text(64, typename Text::value_type());
  for (;;) {
    const int32_t written = write(units(text), length(text));
    const uint32_t status = LXGetError(locale);
    const std::size_t used = static_cast<std::size_t>(std::max(written, 0));
    const bool fits = status != LX_E_BUFFER && used + kSpareRoom <= text.size();
    if (fits || text.size() >= (std::size_t{1} << 24)) {
      check(call, status);
      text.resize(used);
      return text;
    }
    text.resize(text.size() * 2);
  }
}

// The same for calls that leave out silently what does not fit.
template <typename Text, typename Write>
Text write_with_room_to_spare(std::size_t expected, Write write) {
  Text text(expected + 2 * kSpareRoom, typename Text::value_type());
  for (;;) {
    const std::size_t written = write(units(text), length(text));
    if (written + kSpareRoom <= text.size()) {
      text.resize(written);
      return text;
    }
    text.resize(text.size() * 2);
  }
}

}  // namespace detail

// ---- The library ----

// The library, in use as long as this object lives; it outlives everything else here. `directory` holds the locale data
// (null: as LXInit finds them). Throws unless the data are there, or `options` is 0 and the built-in objects stand in;
// a library that is in use already has decided that.
class Library {
 public:
  explicit Library(const char* directory = nullptr, uint32_t options = LX_INIT_NO_DEFAULTS) {
    const uint32_t status = LXInit(directory, nullptr, nullptr, nullptr, options);
    on_defaults_ = status == LX_E_DEFAULTS;
    if (on_defaults_ && options != 0) LXTerm();
    if (!on_defaults_ || options != 0) detail::check("LXInit", status);
  }
  Library(Library&& other) noexcept : used_(std::exchange(other.used_, false)), on_defaults_(other.on_defaults_) {}
  ~Library() {
    if (used_) LXTerm();
  }
  // Only English, the United States and US-ASCII are there, as this object found when it was the first.
  bool on_defaults() const noexcept { return on_defaults_; }

 private:
  bool used_ = true;
  bool on_defaults_ = false;
};

// ---- Locales ----

// What was read from the beginning of a text, and how many units that took: 0, there was nothing.
template <typename T>
struct Parsed {
  T value;
  std::size_t length;
};

// Owns a locale.
class Locale {
 public:
  // "Language_Territory.CodePage@Sort", any part of which may be left out; options of LXGetLocale.
  explicit Locale(const std::string& name, uint32_t options = 0) {
    uint32_t status = LX_OK;
    locale_.reset(LXGetLocale(name.c_str(), options, &status));
    if (locale_ == nullptr) throw Error("LXGetLocale " + name, status);
  }
  // Takes over a locale that a C function made.
  explicit Locale(LXLocale* owned) : locale_(owned) {
    if (owned == nullptr) throw Error("lexaro::Locale", LX_E_ARGUMENT);
  }
  // The user's locale. Only while the program sets itself up.
  static Locale user() { return Locale("", LX_GET_USER); }
  LXLocale* get() noexcept { return locale_.get(); }

  // Items (LX_ITEM_). They throw for unknown items, the setters also for values that are refused.
  int32_t number(uint32_t item) {
    const int32_t value = LXGetLocaleNumInfo(get(), item, 0);
    detail::check("LXGetLocaleNumInfo", get());
    return value;
  }
  void set_number(uint32_t item, int32_t value) {
    if (LXSetLocaleNumInfo(get(), item, value) != 1) throw Error("LXSetLocaleNumInfo", LXGetError(get()));
  }
  std::string text(uint32_t item) {
    return detail::write_with_room_to_spare<std::string>(128, [&](char* out, int32_t room) {
      return item_length("LXGetLocaleTextInfoEx", LXGetLocaleTextInfoEx(get(), item, out, room, nullptr, 0));
    });
  }
  std::u16string text_u(uint32_t item) {
    return detail::write_with_room_to_spare<std::u16string>(128, [&](LXUChar* out, int32_t room) {
      return item_length("LXGetLocaleTextInfoU", LXGetLocaleTextInfoU(get(), item, out, room, 0));
    });
  }
  void set_text(uint32_t item, std::string_view text) {
    if (LXSetLocaleTextInfoEx(get(), item, detail::units(text), detail::length(text), nullptr, 0) != 1) {
      throw Error("LXSetLocaleTextInfoEx", LXGetError(get()));
    }
  }
  // Language_Territory.CodePage@Sort, in ASCII.
  std::string name() {
    char buffer[136];
    const int32_t length = LXLocaleGetLocaleString(get(), buffer);
    return std::string(buffer, static_cast<std::size_t>(std::max(length, 0)));
  }
  // What the code page is like. Throws only for a moved-from locale without a default.
  LXCodePageInfo code_page() {
    LXCodePageInfo info{};
    detail::check("LXGetCodePageInfo", LXGetCodePageInfo(LXGetLocaleObject(get(), LX_CODEPAGE), &info));
    return info;
  }

  // Order by the sort: below, equal to or above 0. options: LX_CMP_NOCASE, LX_CMP_NOWIDTH. Throws for other bits.
  int32_t compare(std::string_view a, std::string_view b, uint32_t options = 0) {
    return ordered("LXStrcollEx", LXStrcollEx(get(), detail::units(a), detail::length(a), 0, detail::units(b),
                                              detail::length(b), 0, options));
  }
  int32_t compare(std::u16string_view a, std::u16string_view b, uint32_t options = 0) {
    return ordered("LXStrcollU", LXStrcollU(get(), detail::units(a), detail::length(a), detail::units(b),
                                            detail::length(b), options));
  }
  // Keys order as strings (operator<) as compare() orders the texts, but for what is said of LXStrxfrm and punctuation.
  // They are bytes, zero bytes among them.
  std::string sort_key(std::string_view text, uint32_t options = 0) {
    return key_of([&](char* out, int32_t room) {
      return LXStrxfrmEx(get(), out, room, detail::units(text), detail::length(text), 0, options);
    });
  }
  std::string sort_key(std::u16string_view text, uint32_t options = 0) {
    return key_of([&](char* out, int32_t room) {
      return LXStrxfrmU(get(), out, room, detail::units(text), detail::length(text), options);
    });
  }

  // A text with each character mapped: LX_MAP_ bits, not LX_OPT_CHARS. Throws for other bits.
  std::string map(std::string_view text, uint32_t flags) {
    return detail::write_with_room_to_spare<std::string>(text.size(), [&](char* out, int32_t room) {
      return mapped(LXMapStringEx(get(), out, room, detail::units(text), 0, detail::length(text), flags));
    });
  }
  std::u16string map(std::u16string_view text, uint32_t flags) {
    return detail::write_with_room_to_spare<std::u16string>(text.size(), [&](LXUChar* out, int32_t room) {
      return mapped(LXMapStringU(get(), out, room, detail::units(text), detail::length(text), flags));
    });
  }
  std::string upper(std::string_view text) { return map(text, LX_MAP_UPPER); }
  std::u16string upper(std::u16string_view text) { return map(text, LX_MAP_UPPER); }
  std::string lower(std::string_view text) { return map(text, LX_MAP_LOWER); }
  std::u16string lower(std::u16string_view text) { return map(text, LX_MAP_LOWER); }

  // Characters of a text; shift bytes are none. Never throws but for the length.
  std::size_t count(std::string_view text) {
    const int32_t characters = LXNumCharsEx(get(), detail::units(text), 0, detail::length(text));
    return static_cast<std::size_t>(std::max(characters, 0));
  }

  // Numbers, money and times as the locale writes them. They throw for fields out of range and unknown directives; the
  // template argument chooses the text: std::string or std::u16string.
  template <typename Text = std::string>
  Text format(int32_t value, uint32_t flags = 0) {
    return formatted<Text>("LXLongToString", LXLongToStringEx, LXLongToStringU, value, flags);
  }
  template <typename Text = std::string>
  Text format(double value, uint32_t flags = 0) {
    return formatted<Text>("LXDoubleToString", LXDoubleToStringEx, LXDoubleToStringU, value, flags);
  }
  template <typename Text = std::string>
  Text format_currency(double amount, uint32_t flags = 0) {
    return formatted<Text>("LXCurrencyToString", LXCurrencyToStringEx, LXCurrencyToStringU, amount, flags);
  }
  std::string format_time(const LXTime& time, std::string_view format, uint32_t flags = 0) {
    return detail::write_until_it_fits<std::string>("LXTimeToStringEx", get(), [&](char* out, int32_t room) {
      return LXTimeToStringEx(get(), &time, out, 0, room, detail::units(format), 0, detail::length(format), flags);
    });
  }
  std::u16string format_time(const LXTime& time, std::u16string_view format, uint32_t flags = 0) {
    return detail::write_until_it_fits<std::u16string>("LXTimeToStringU", get(), [&](LXUChar* out, int32_t room) {
      return LXTimeToStringU(get(), &time, out, room, detail::units(format), detail::length(format), flags);
    });
  }

  // Reads them from the beginning of a text; text left over is no error. Numbers out of range become the nearest one.
  Parsed<int32_t> parse_integer(std::string_view text, int32_t base = 10, uint32_t flags = 0) {
    const char* end = detail::units(text);
    const int32_t value = LXStringToLongEx(get(), end, 0, detail::length(text), &end, nullptr, base, flags);
    return parsed("LXStringToLongEx", value, detail::units(text), end);
  }
  Parsed<int32_t> parse_integer(std::u16string_view text, int32_t base = 10, uint32_t flags = 0) {
    const LXUChar* end = detail::units(text);
    const int32_t value = LXStringToLongU(get(), end, detail::length(text), &end, base, flags);
    return parsed("LXStringToLongU", value, detail::units(text), end);
  }
  Parsed<double> parse_number(std::string_view text, uint32_t flags = 0) {
    const char* end = detail::units(text);
    const double value = LXStringToDoubleEx(get(), end, 0, detail::length(text), &end, nullptr, flags);
    return parsed("LXStringToDoubleEx", value, detail::units(text), end);
  }
  Parsed<double> parse_number(std::u16string_view text, uint32_t flags = 0) {
    const LXUChar* end = detail::units(text);
    const double value = LXStringToDoubleU(get(), end, detail::length(text), &end, flags);
    return parsed("LXStringToDoubleU", value, detail::units(text), end);
  }
  // Fields that the format does not name are 0. Throws when the text does not match the format.
  Parsed<LXTime> parse_time(std::string_view text, std::string_view format, uint32_t flags = 0) {
    LXTime time{};
    return parsed_time("LXStringToTimeEx", time,
                       LXStringToTimeEx(get(), &time, detail::units(text), 0, detail::length(text),
                                        detail::units(format), 0, detail::length(format), flags));
  }
  Parsed<LXTime> parse_time(std::u16string_view text, std::u16string_view format, uint32_t flags = 0) {
    LXTime time{};
    return parsed_time("LXStringToTimeU", time,
                       LXStringToTimeU(get(), &time, detail::units(text), detail::length(text), detail::units(format),
                                       detail::length(format), flags));
  }

  // Between the code page and UCS-2. A character cut off at the end is dropped; use Conversion to learn what was lost.
  std::u16string to_ucs2(std::string_view text) {
    std::u16string out(text.size(), u'\0');  // no character has fewer than one byte
    const int32_t length = LXStringToUnicodeEx(get(), detail::units(out), detail::length(out), detail::units(text), 0,
                                               detail::length(text), 0);
    detail::check("LXStringToUnicodeEx", get());
    out.resize(static_cast<std::size_t>(std::max(length, 0)));
    return out;
  }
  std::string from_ucs2(std::u16string_view text) {
    std::string out(text.size() * (code_page().max_length + std::size_t{1}) + 1, '\0');
    const int32_t length =
        LXUnicodeToStringEx(get(), out.data(), 0, detail::length(out), detail::units(text), detail::length(text), 0);
    detail::check("LXUnicodeToStringEx", get());
    out.resize(static_cast<std::size_t>(std::max(length, 0)));
    return out;
  }

 private:
  // The library's result counts the terminator.
  std::size_t item_length(const char* call, int32_t result) {
    if (result < 0) throw Error(call, LXGetError(get()));
    return static_cast<std::size_t>(std::max(result, 1) - 1);
  }
  int32_t ordered(const char* call, int32_t order) {
    detail::check(call, get());
    return order;
  }
  std::size_t mapped(int32_t length) {
    detail::check("LXMapString", get());
    return static_cast<std::size_t>(std::max(length, 0));
  }
  template <typename Write>
  std::string key_of(Write write) {
    std::string key(256, '\0');
    for (;;) {
      const int32_t length = write(key.data(), detail::length(key));
      if (length < 0) throw Error("LXStrxfrm", LXGetError(get()));
      const bool whole = static_cast<std::size_t>(length) <= key.size();
      key.resize(static_cast<std::size_t>(length));
      if (whole) return key;
    }
  }
  template <typename Text, typename Bytes, typename Units, typename Value>
  Text formatted(const char* call, Bytes bytes, Units units, Value value, uint32_t flags) {
    return detail::write_until_it_fits<Text>(call, get(), [&](auto* out, int32_t room) {
      if constexpr (sizeof *out == 1) return bytes(get(), value, out, 0, room, flags);
      if constexpr (sizeof *out != 1) return units(get(), value, out, room, flags);
    });
  }
  template <typename T, typename Unit>
  Parsed<T> parsed(const char* call, T value, const Unit* begin, const Unit* end) {
    detail::check(call, get());
    return {value, static_cast<std::size_t>(end - begin)};
  }
  Parsed<LXTime> parsed_time(const char* call, const LXTime& time, int32_t length) {
    if (length < 0) throw Error(call, LXGetError(get()));
    return {time, static_cast<std::size_t>(length)};
  }

  detail::Owner<LXLocale> locale_;
};

// ---- Conversion ----

// Owns a conversion of text of any length, in blocks; both locales must outlive it. Throws when out of memory.
class Conversion {
 public:
  Conversion(Locale& from, Locale& to) : handle_(LXOpenConversion(to.get(), from.get(), 0)) {
    if (handle_ == nullptr) throw Error("LXOpenConversion", LXGetError(to.get()));
  }
  LXConversion* get() noexcept { return handle_.get(); }

  // LX_CONV_ bits and what is called for each problem, which must not throw. Throws for other bits, and after append().
  void set_options(uint32_t options, std::function<void(const LXConversionProblem&)> problem = nullptr) {
    const bool calls = problem != nullptr;
    auto callback = std::make_unique<ProblemFunction>(std::move(problem));
    detail::check("LXSetConversionOptions",
                  LXSetConversionOptions(get(), options, calls ? on_problem : nullptr, callback.get()));
    problem_ = std::move(callback);
  }
  // Appends what a block becomes; a character that the block cuts waits for the next one.
  void append(std::string_view block, std::string& out) {
    const char* in = detail::units(block);
    for (std::size_t behind = block.size(); behind != 0;) {
      auto left = static_cast<int32_t>(std::min<std::size_t>(behind, INT32_MAX));
      behind -= static_cast<std::size_t>(left);
      drain(out, [&](char** at, int32_t* room) { return LXConvertBuffer(get(), at, room, &in, &left, 0); });
    }
  }
  // Ends the text and appends what was pending. The next append() begins another text.
  void finish(std::string& out) {
    drain(out, [&](char** at, int32_t* room) { return LXFinishConversion(get(), at, room); });
  }
  // A whole text.
  std::string operator()(std::string_view text) {
    std::string out;
    out.reserve(text.size());
    append(text, out);
    finish(out);
    return out;
  }
  // Bytes and problems of all texts so far.
  LXConversionCounts counts() {
    LXConversionCounts counts{};
    detail::check("LXGetConversionCounts", LXGetConversionCounts(get(), &counts));
    return counts;
  }

 private:
  using ProblemFunction = std::function<void(const LXConversionProblem&)>;
  static void on_problem(void* context, const LXConversionProblem* problem) noexcept {
    (*static_cast<ProblemFunction*>(context))(*problem);
  }
  // `step` leaves LX_E_PARTIAL when it keeps the beginning of a character, which is as good as LX_OK here.
  template <typename Step>
  static void drain(std::string& out, Step step) {
    char buffer[4096];
    for (uint32_t status = LX_E_FULL; status == LX_E_FULL;) {
      char* end = buffer;
      auto room = static_cast<int32_t>(sizeof buffer);
      status = step(&end, &room);
      out.append(buffer, static_cast<std::size_t>(end - buffer));
      if (status != LX_OK && status != LX_E_FULL && status != LX_E_PARTIAL) throw Error("LXConvertBuffer", status);
    }
  }

  std::unique_ptr<ProblemFunction> problem_;  // where it stands does not change when the object is moved
  detail::Owner<LXConversion> handle_;
};

// A whole text from one locale's code page into another's. Characters that the target lacks are substituted.
inline std::string convert(Locale& from, Locale& to, std::string_view text) { return Conversion(from, to)(text); }

// A field of a host record, translated by code page number; LX_OPT_TERMINATE and LX_OPT_CHARS are not for this call.
struct Field {
  std::string text;
  std::size_t consumed;  // bytes of the input
  bool complete;         // false: the rest did not fit
};
// `flags`: NLS1_XLT_ bits. Throws for an unknown code page and when not even one character fits.
inline Field translate_field(uint16_t from, uint16_t to, std::string_view field, std::size_t room, uint32_t flags = 0) {
  std::string out(room, '\0');
  int32_t consumed = 0;
  uint32_t status = LX_OK;
  const int32_t length = NLS1_TranslateString(to, out.data(), detail::length(out), from, detail::units(field),
                                              detail::length(field), &consumed, flags, &status);
  if (length < 0) throw Error("NLS1_TranslateString", status);
  out.resize(static_cast<std::size_t>(length));
  return {std::move(out), static_cast<std::size_t>(consumed), status != LX_E_BUFFER};
}

// ---- Streams ----

// Owns a stream of characters over a routine that moves up to `count` bytes and gives their number, or -1 (failure, end
// of the input); it must not throw. The locale must outlive the stream. The destructor flushes output, silently.
class Stream {
 public:
  using Transfer = std::function<int32_t(void* buffer, int32_t count)>;

  Stream(Stream&&) = default;
  Stream& operator=(Stream&&) = delete;
  static Stream reader(Locale& locale, Transfer transfer) {
    return Stream(locale, std::move(transfer), LX_STREAM_READ);
  }
  static Stream writer(Locale& locale, Transfer transfer) {
    return Stream(locale, std::move(transfer), LX_STREAM_WRITE);
  }
  LXStream* get() noexcept { return stream_.get(); }

  // The next character, packed; nothing at the end. Throws for what the routine could not deliver.
  std::optional<LXWChar> read_char() {
    const LXWChar packed = LXReadCharEx(get(), locale_, nullptr, 0);
    if (packed != 0xFFFFFFFFu) return packed;
    detail::check("LXReadCharEx", locale_);
    return std::nullopt;
  }
  // A line without its end (`flags`: LX_EOL_ bits), or up to `room` bytes of it, and then the next; false at the end.
  bool read_line(std::string& line, uint32_t flags = LX_EOL_1 | LX_EOL_21, std::size_t room = 4096) {
    line.resize(room);
    const int32_t length = LXReadStringEx(get(), locale_, line.data(), detail::length(line), flags);
    line.resize(static_cast<std::size_t>(std::max(length, 0)));
    if (length < -1) throw Error("LXReadStringEx", LXGetError(locale_));
    return length >= 0;
  }
  // Puts a packed character back, to be read next.
  void unget(LXWChar packed) {
    if (LXUngetCharW(get(), locale_, packed, 0) != 1) throw Error("LXUngetCharW", LXGetError(locale_));
  }
  // Write a packed or UCS-2 character. Error with LX_E_REFUSED: the character is kept and goes out with the next flush.
  void write(LXWChar packed) {
    if (LXWriteCharW(get(), locale_, packed) != 1) throw Error("LXWriteCharW", LXGetError(locale_));
  }
  void write_u(char16_t character) {
    if (LXWriteCharU(get(), locale_, character) != 1) throw Error("LXWriteCharU", LXGetError(locale_));
  }
  // Hands over what is kept.
  void flush() {
    if (LXFlushStream(get(), locale_, 0) != 1) throw Error("LXFlushStream", LXGetError(locale_));
  }
  // Ends the stream, and throws the first status met. The object is empty then.
  void close() {
    if (LXCloseStream(stream_.release(), locale_, 0) != 1) throw Error("LXCloseStream", LXGetError(locale_));
  }

 private:
  Stream(Locale& locale, Transfer transfer, uint32_t mode)
      : transfer_(std::make_unique<Transfer>(std::move(transfer))),
        locale_(locale.get()),
        stream_(LXOpenStream(locale_, call_transfer, transfer_.get(), mode), CloseStream{locale_}) {
    if (stream_ == nullptr) throw Error("LXOpenStream", LXGetError(locale_));
  }
  struct CloseStream {
    LXLocale* locale;
    void operator()(LXStream* stream) const noexcept { LXCloseStream(stream, locale, 0); }
  };
  static int32_t call_transfer(void* context, void* buffer, int32_t count) noexcept {
    return (*static_cast<Transfer*>(context))(buffer, count);
  }

  std::unique_ptr<Transfer> transfer_;  // outlives the stream, which flushes through it
  LXLocale* locale_;
  std::unique_ptr<LXStream, CloseStream> stream_;
};

// ---- Message catalogs ----

// Owns an open catalog; the locale must outlive it. `directory` and `name` as for LXOpenCatalog. Throws when there is
// no such catalog, or a damaged one.
class Catalog {
 public:
  Catalog(Locale& locale, const std::string& directory, const std::string& name, uint32_t flags = 0)
      : catalog_(LXOpenCatalog(locale.get(), directory.c_str(), name.c_str(), flags)) {
    if (catalog_ == nullptr) throw Error("LXOpenCatalog " + name, LXGetError(locale.get()));
  }
  LXCatalog* get() noexcept { return catalog_.get(); }

  // A message in the locale's code page, or `otherwise` where the catalog has none; without it that throws.
  std::string text(uint32_t set, int32_t message, const char* otherwise = nullptr) {
    return detail::write_with_room_to_spare<std::string>(256, [&](char* out, int32_t room) {
      detail::check("LXGetMessage", LXGetMessage(get(), set, message, out, room, otherwise, LX_OPT_TERMINATE));
      return std::char_traits<char>::length(out);
    });
  }
  std::u16string text_u(uint32_t set, int32_t message, const char16_t* otherwise = nullptr) {
    return detail::write_with_room_to_spare<std::u16string>(256, [&](LXUChar* out, int32_t room) {
      const auto* text = reinterpret_cast<const LXUChar*>(otherwise);
      detail::check("LXGetMessageU", LXGetMessageU(get(), set, message, out, room, text, LX_OPT_TERMINATE));
      return static_cast<std::size_t>(std::find(out, out + room, LXUChar{0}) - out);
    });
  }

 private:
  detail::Owner<LXCatalog> catalog_;
};

// ---- What there is ----

// Calls body(type, name), which must not throw, for every object of the locale data. `type` is LX_LANGUAGE and so on.
template <typename Body>
void for_each_object(Body body) {
  const auto step = [](void* context, uint8_t type, const char* name) noexcept -> int32_t {
    (*static_cast<Body*>(context))(type, name);
    return 1;
  };
  LXEnumLocales(step, &body, 0);
}
// Calls body(alias, code_page), which must not throw, for every alias of a code page.
template <typename Body>
void for_each_alias(Body body) {
  const auto step = [](void* context, const char* alias, const char* code_page) noexcept -> int32_t {
    (*static_cast<Body*>(context))(alias, code_page);
    return 1;
  };
  LXEnumAliases(LXGetObjManager(), step, &body);
}

}  // namespace lexaro

#endif
