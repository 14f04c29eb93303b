// SPDX-License-Identifier: Apache-2.0
// The files that a catalog's name may mean: templates between semicolons, expanded and tried one after the other.
#include <sys/stat.h>

#include <algorithm>
#include <cerrno>

#include "codepage/text/kinds.hpp"
#include "frame/library.hpp"
#include "msgcat/catalog.hpp"
#include "objects/entry.hpp"

namespace lx {
namespace {

constexpr char kVariable[] = "LX_NLSPATH";
constexpr int32_t kVariableRoom = 28;  // a longer value counts as none
constexpr int32_t kItemRoom = 64;      // of a language or territory code
constexpr char kNotAscii = 0x1A;

// Text that is put together in bytes; short ones need no memory.
class ByteText {
 public:
  void append(const void* bytes, size_t count) {
    if (count > room_ - length_ && !grow(count)) return;
    if (count != 0) std::memcpy(data_ + length_, bytes, count);
    length_ += count;
  }
  void append(uint8_t byte) { append(&byte, 1); }
  void clear() { length_ = 0; }

  bool failed() const { return failed_; }
  size_t length() const { return length_; }
  // Terminated; what is appended next overwrites the terminator.
  char* text() {
    append(uint8_t{0});
    if (!failed_) --length_;
    return data_;
  }

 private:
  bool grow(size_t count) {
    auto larger = Owned<char>::array((length_ + count) * 2);
    if (!larger) {
      failed_ = true;
      return false;
    }
    std::memcpy(larger.get(), data_, length_);
    room_ = (length_ + count) * 2;
    data_ = larger.get();
    block_ = std::move(larger);
    return true;
  }

  char small_[256];
  Owned<char> block_;
  char* data_ = small_;
  size_t length_ = 0;
  size_t room_ = sizeof small_;
  bool failed_ = false;
};

class Search {
 public:
  Search(LXLocale& locale, const char* name)
      : locale_(locale), page_(page_of(locale)), name_(name), name_length_(std::strlen(name)) {}

  uint32_t status() const { return status_; }
  // Once through all the lists, with the language and territory of that locale.
  LXFile* walk(LXLocale& names, const char* directory) {
    names_ = &names;
    LXFile* file = try_list(directory, std::strlen(directory));
    ByteText variable;
    if (file == nullptr && status_ != LX_E_MEMORY && read_variable(variable)) {
      file = try_list(variable.text(), variable.length());
    }
    return file == nullptr && status_ != LX_E_MEMORY ? try_list(name_, name_length_) : file;
  }

 private:
  // The byte of an ASCII character in the locale's page.
  uint8_t byte_of(char ascii) const {
    auto character = static_cast<uint8_t>(ascii);
    return page_.ascii_family ? character : static_cast<uint8_t>(page_.packed(character));
  }
  bool is(const Character& character, char ascii) const {
    return character.units == 1 && character.code == byte_of(ascii);
  }

  bool read_variable(ByteText& text) const {
    char value[kVariableRoom];
    int32_t length = LXGetEnv(kVariable, value, kVariableRoom);
    if (length <= 0 || length > kVariableRoom) return false;
    for (int32_t i = 0; i < length - 1; ++i) text.append(byte_of(value[i]));
    return true;
  }

  LXFile* try_list(const char* list, size_t length) {
    return ShiftedKind::with_walker(page_, {list, length}, [&](auto walker) { return try_entries(walker); });
  }

  template <class Walker>
  LXFile* try_entries(Walker list) {
    ByteText path;
    for (bool more = list.at != list.end; more;) {
      const uint8_t* from = list.at;
      Character character;
      more = list.next(character);
      const uint8_t* to = more ? list.at - character.units : list.end;
      path.append(from, static_cast<size_t>(to - from));  // shift bytes, and what is no whole character
      if (more && is(character, '%')) {
        expand(list, path);
      } else if (more && !is(character, ';')) {
        path.append(to, character.units);
      } else {
        LXFile* file = try_template(path, is_double_byte(list));
        if (file != nullptr || status_ == LX_E_MEMORY) return file;
        path.clear();
      }
    }
    return nullptr;
  }
  template <class Walker>
  static bool is_double_byte(const Walker& walker) {
    if constexpr (requires { walker.double_byte; }) return walker.double_byte;
    return false;
  }

  // What stands for the character behind a percent sign.
  template <class Walker>
  void expand(Walker& list, ByteText& path) {
    const uint8_t* from = list.at;
    Character character;
    if (!list.next(character)) {
      path.append(byte_of('%'));
    } else if (is(character, 'N')) {
      path.append(name_, name_length_);
    } else if (is(character, 'L')) {
      append_item(LX_ITEM_LANGUAGE_ABBREVIATION, path);
      path.append(byte_of('_'));
      append_item(LX_ITEM_TERRITORY_ABBREVIATION, path);
    } else if (is(character, 'l')) {
      append_item(LX_ITEM_LANGUAGE_ABBREVIATION, path);
    } else if (is(character, 't')) {
      append_item(LX_ITEM_TERRITORY_ABBREVIATION, path);
    } else {
      if (!is(character, '%')) path.append(byte_of('%'));
      path.append(from, static_cast<size_t>(list.at - from));
    }
  }
  void append_item(uint32_t item, ByteText& path) {
    char text[kItemRoom];
    int32_t length = LXGetLocaleTextInfoEx(names_, item, text, kItemRoom, locale_.code_page, 0);
    if (length > 1) path.append(text, static_cast<size_t>(length) - 1);
  }

  LXFile* try_template(ByteText& path, bool double_byte) {
    if (double_byte) path.append(page_.leave_byte);
    if (path.length() == 0) return nullptr;
    bool directory = false;
    LXFile* file = try_path(path, directory);
    if (!directory) return file;
    path.append(byte_of('/'));
    path.append(name_, name_length_);
    return try_path(path, directory);
  }

  // Names of files are ASCII, or in the page itself where that begins with ASCII.
  LXFile* try_path(ByteText& path, bool& directory) {
    status_ = LX_E_MEMORY;
    const char* text = path.text();
    if (path.failed()) return nullptr;
    if (page_.ascii_family) return try_file(text, directory);
    auto characters = Owned<LXUChar>::array(path.length() + 1);
    if (!characters) return nullptr;
    auto room = static_cast<int32_t>(path.length() + 1);
    int32_t count = LXStringToUnicodeEx(&locale_, characters.get(), room, text, 0, -1, LX_OPT_TERMINATE);
    ByteText ascii;
    for (int32_t i = 0; i < count - 1; ++i) {
      LXUChar character = characters[static_cast<size_t>(i)];
      ascii.append(static_cast<uint8_t>(character < 0x80 ? character : kNotAscii));
    }
    const char* name = ascii.text();
    return ascii.failed() ? nullptr : try_file(name, directory);
  }

  // A directory can be opened too, but is no catalog.
  LXFile* try_file(const char* path, bool& directory) {
    status_ = LX_E_NOFILE;
    struct stat file;
    if (stat(path, &file) == 0) {
      directory = S_ISDIR(file.st_mode);
      if (directory) return nullptr;
    } else if (errno == ENOENT) {
      return nullptr;
    }
    const LXGlobals* area = live_globals();
    return LXOpenFile(area != nullptr ? area->file_access_mode : 0, path, 0, 0, &status_);
  }

  LXLocale& locale_;
  const CodePage& page_;
  const char* name_;
  size_t name_length_;
  LXLocale* names_ = nullptr;
  uint32_t status_ = LX_E_NOFILE;
};

}  // namespace

LXFile* find_catalog_file(LXLocale& locale, const char* directory, const char* name, bool one_pass, uint32_t& rc) {
  Search search(locale, name);
  LXFile* file = search.walk(locale, directory);
  if (file == nullptr && search.status() != LX_E_MEMORY && !one_pass) {
    uint32_t status = LX_OK;
    LXLocale* other = LXGetLocale("", 0, &status);
    if (other != nullptr) {
      file = search.walk(*other, directory);
      LXReleaseLocale(other, 0);
    } else if (status == LX_E_MEMORY) {
      rc = LX_E_MEMORY;
      return nullptr;
    }
  }
  rc = search.status();
  return file;
}

}  // namespace lx
