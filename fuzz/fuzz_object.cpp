// SPDX-License-Identifier: Apache-2.0
// The first byte of the input chooses what kind of object the rest is; what loads is used. Sections of the object are
// whatever the file says.
#include <lexaro/lexaro.h>

#include <iterator>

#include "fuzz_support.hpp"
#include "support/exercise.hpp"

namespace lx::fuzz {
namespace {

constexpr uint16_t kId = 60000;

struct Kind {
  uint8_t type;
  uint16_t id;
  const char* locale;  // that has the object as a part
};
const Kind kKinds[] = {
    {LX_LANGUAGE, kId, "Subject_UnitedStates.US-ASCII@BINARY"},
    {LX_TERRITORY, kId, "English_Subject.Small@BINARY"},
    {LX_CODEPAGE, kId, "English_Germany.Subject@BINARY"},
    {LX_CODEPAGE, LX_CP_UTF8, "English_Germany.Utf8@BINARY"},
    {LX_SORT, kId, "English_UnitedStates.US-ASCII@Subject"},
};

class Library {
 public:
  Library() {
    test::write_small_directory(directory_);
    directory_.write_control({{LX_LANGUAGE, 1, "English"},
                              {LX_LANGUAGE, kId, "Subject"},
                              {LX_TERRITORY, 1, "UnitedStates"},
                              {LX_TERRITORY, 2, "Germany"},
                              {LX_TERRITORY, kId, "Subject"},
                              {LX_CODEPAGE, 367, "US-ASCII"},
                              {LX_CODEPAGE, 900, "Small"},
                              {LX_CODEPAGE, LX_CP_UTF8, "Utf8"},
                              {LX_CODEPAGE, kId, "Subject"},
                              {LX_SORT, kId, "Subject"}});
    LXInit(directory_.path(), nullptr, nullptr, nullptr, LX_INIT_NO_DEFAULTS);
    other_ = LXGetLocale("English_UnitedStates.Small@BINARY", 0, nullptr);
    demand(other_ != nullptr, "the test's own data");
  }
  ~Library() {
    LXReleaseLocale(other_, 0);
    LXTerm();
  }
  Library(const Library&) = delete;
  Library& operator=(const Library&) = delete;

  void run(const Kind& kind, const uint8_t* data, size_t size) {
    InputFile(directory_, directory_.object_name(kind.type, kind.id)).write(data, size);
    uint32_t rc = 99;
    LXObjEntry* entry = LXGetObjFromID(LXGetObjManager(), kind.type, kind.id, 1, &rc);
    if (LXLoadObj(LXGetObjManager(), entry, &rc) == nullptr) {
      demand(rc == LX_E_HEADER || rc == LX_E_FILE, "status of an object that was refused");
      return;
    }
    use(kind, entry);
    demand(LXUnloadObj(LXGetObjManager(), entry) == LX_OK, "LXUnloadObj");
  }

 private:
  void use(const Kind& kind, const LXObjEntry* entry) {
    uint32_t rc = 99;
    LXLocale* locale = LXGetLocale(kind.locale, 0, &rc);
    demand(locale != nullptr, "LXGetLocale");
    if (kind.type == LX_LANGUAGE) demand(test::exercise_language(entry));
    if (kind.type == LX_CODEPAGE) {
      demand(test::exercise_page(entry));
      demand(test::exercise_conversions(locale, other_));
    }
    LXReleaseLocale(locale, 0);
  }

  test::DataDirectory directory_;
  LXLocale* other_;
};

}  // namespace
}  // namespace lx::fuzz

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  static lx::fuzz::Library library;
  if (size == 0) return 0;
  library.run(lx::fuzz::kKinds[*data % std::size(lx::fuzz::kKinds)], data + 1, size - 1);
  return 0;
}
