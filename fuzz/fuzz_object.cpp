// SPDX-License-Identifier: Apache-2.0
// The first byte of the input chooses what kind of object the rest is; what loads is used. Sections of the object are
// whatever the file says.
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

class Objects : public Target {
 public:
  Objects() {
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
    start(directory_.path(), "", {"English_UnitedStates.Small@BINARY"});
  }

  void run(InputBytes input) override {
    const Kind& kind = kKinds[input.byte() % std::size(kKinds)];
    InputFile(directory_, directory_.object_name(kind.type, kind.id)).write(input.rest());
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
      demand(test::exercise_conversions(locale, locales_[0]));
    }
    LXReleaseLocale(locale, 0);
  }

  test::DataDirectory directory_;
};

}  // namespace

std::unique_ptr<Target> make_target() { return std::make_unique<Objects>(); }

}  // namespace lx::fuzz
