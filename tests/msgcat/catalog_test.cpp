// SPDX-License-Identifier: Apache-2.0
// Catalogs that are searched, read in every way, damaged, and left without memory or the system's help.
#include <nl_types.h>

#include <cerrno>
#include <filesystem>

#include "faults/failing_calls.hpp"
#include "support/descriptors.hpp"
#include "support/edge_buffer.hpp"
#include "support/environment.hpp"
#include "support/object_builder.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

struct SetModel {
  uint32_t number;
  std::vector<std::pair<uint32_t, std::string>> messages;
};

// A set record is followed by its index and its texts.
std::string catalog_image(const std::string& locale, const std::vector<SetModel>& sets) {
  std::string image;
  auto append = [](std::string& to, std::initializer_list<size_t> values) {
    for (size_t value : values)
      to.append(reinterpret_cast<const char*>(std::array{static_cast<uint32_t>(value)}.data()), 4);
  };
  append(image, {0x4C78F463, 0x10000000, static_cast<size_t>(LXMcGetByteOrder()), sets.size(), 152});
  image += locale + std::string(132 - locale.size(), '\0');
  for (const SetModel& set : sets) {
    std::string index, texts;
    for (const auto& [number, text] : set.messages) append(index, {number, text.size(), texts.size()}), texts += text;
    size_t at = image.size() + 28, texts_at = at + index.size();
    append(image, {set.number, texts_at + texts.size(), set.messages.size(), at, texts_at, texts.size(), 0});
    image += index + texts;
  }
  return image;
}

using CatalogPtr = std::unique_ptr<LXCatalog, decltype([](LXCatalog* catalog) { LXCloseCatalog(catalog, 0); })>;
constexpr uint32_t kModes[] = {0, 0x80000001, LX_CAT_LOAD};
constexpr const char* kEnglish = "English_UnitedStates.UTF-8@BINARY";

class CatalogTest : public testing::Test {
 protected:
  CatalogTest() { std::filesystem::current_path(directory_.path()); }
  ~CatalogTest() override { std::filesystem::current_path("/"); }

  static std::string convert(const Locale& to, const Locale& from, const std::string& text) {
    std::string out(text.size() * 3 + 3, '\0');
    LXConvertStringEx(to.get(), out.data(), 0, static_cast<int32_t>(out.size()), from.get(), text.data(), 0,
                      static_cast<int32_t>(text.size()), 0);
    return out.c_str();
  }
  static std::basic_string<LXUChar> ucs2(const Locale& locale, const std::string& text) {
    std::basic_string<LXUChar> out(text.size() + 1, 0);
    LXStringToUnicodeEx(locale.get(), out.data(), static_cast<int32_t>(out.size()), text.c_str(), 0, -1, 0);
    return out.c_str();
  }
  static std::string message(const CatalogPtr& catalog, uint32_t set, int32_t number) {
    char text[400] = "";
    uint32_t rc = LXGetMessage(catalog.get(), set, number, text, sizeof text, nullptr, 0);
    return rc == LX_OK ? text : "status " + std::to_string(rc);
  }

  Session session_;
  Variable variable_{"LX_NLSPATH", nullptr};
  DataDirectory directory_;
  Locale utf8_ = locale_of("UTF-8");
};

TEST_F(CatalogTest, FilesAreFoundByTemplates) {
  Locale german(LXGetLocale("German_Germany.UTF-8@BINARY", 0, nullptr));
  Locale host(LXGetLocale("German_Germany.IBM930@BINARY", 0, nullptr));
  for (const char* name : {"app", "DE_DEU/app.cat", "DE/DEU/app", "EN_USA/second", "100%/app", "n%Nn", "%q"}) {
    std::filesystem::create_directories(std::filesystem::absolute(name).parent_path());
    directory_.write(name, std::string_view(catalog_image(kEnglish, {{1, {{1, name}}}})));
  }
  struct {
    const char *directory, *variable, *name, *found;  // no file: its status
    uint32_t flags = LX_CAT_LOAD;
  } const cases[] = {
      {"", nullptr, "app", "app"},
      {"none;DE_DEU", nullptr, "app.cat", "DE_DEU/app.cat"},
      {"%L/%N.cat", nullptr, "app", "DE_DEU/app.cat"},
      {"%l/%t", nullptr, "app", "DE/DEU/app"},
      {";;none/%N;100%%;%L", nullptr, "app", "100%/app"},
      {"n%%Nn", nullptr, "x", "n%Nn"},
      {"none", "%L/%N.cat", "app", "DE_DEU/app.cat"},
      {"", "./././././././././././././%q", "x", "status 1000"},  // 28 characters: not read
      {"", "././././././././././././/%q", "x", "%q"},
      {"%L", nullptr, "second", "EN_USA/second", 0},
      {"%L", nullptr, "second", "status 1000", LX_CAT_LOAD},
      {"%L", nullptr, "second", "status 1000", LX_CAT_ONEPASS},
      {"", nullptr, "app/x", "status 1"},
      {"", nullptr, "", "status 2"},
      {"", nullptr, "app", "status 2", 2},
  };
  for (const auto& each : cases) {
    variable_.set(each.variable);
    auto check = [&](const Locale& locale, const CatalogPtr& catalog) {
      std::string found = catalog ? message(catalog, 1, 1) : "status " + std::to_string(LXGetError(locale.get()));
      EXPECT_EQ(catalog && locale == host ? convert(german, host, found) : found, each.found) << each.name;
    };
    auto name = ucs2(german, each.name), directory = ucs2(german, each.directory);
    check(german, CatalogPtr(LXOpenCatalog(german.get(), each.directory, each.name, each.flags)));
    check(german, CatalogPtr(LXOpenCatalogU(german.get(), directory.c_str(), name.c_str(), each.flags)));
    check(host, CatalogPtr(LXOpenCatalogU(host.get(), directory.c_str(), name.c_str(), each.flags)));
  }
  // Half a character at the end is part of the name.
  EXPECT_FALSE(CatalogPtr(LXOpenCatalog(german.get(), nullptr, "app\xE3", LX_CAT_LOAD)));
}

TEST_F(CatalogTest, MessagesInAllModesKindsPagesAndLengths) {
  const std::string texts[] = {"", "A", "Hello, world", "日本", "1日2本3ｶﾅ", "日a", "a\t日"};
  EdgeBuffer edge(400);
  for (const char* own_name : {"UTF-8", "IBM930", "MS932"}) {
    Locale own = locale_of(own_name);
    std::vector<SetModel> sets = {{2, {}}, {3, {}}, {7, {}}};
    for (uint32_t i = 0; i < std::size(texts); ++i) {
      sets[0].messages.push_back({i + 1, convert(own, utf8_, texts[i])});
      sets[2].messages.push_back({i * i + 5, convert(own, utf8_, texts[i])});
    }
    std::string locale_name = "English_UnitedStates." + std::string(own_name) + "@BINARY";
    directory_.write("m", std::string_view(catalog_image(locale_name, sets)));
    for (const char* caller_name : {"UTF-8", "IBM930", "IBM037", "MS932"}) {
      Locale caller = locale_of(caller_name);
      for (uint32_t i = 0; i < std::size(kModes) * 2 * std::size(texts); ++i) {
        const LXWChar name[] = {LXCpUnicodeToCharW(LXGetLocaleObject(caller.get(), LX_CODEPAGE), 'm'), 0};
        CatalogPtr catalog(LXOpenCatalogW(caller.get(), nullptr, name, kModes[i % 3]));
        ASSERT_TRUE(catalog);
        const SetModel& set = sets[i / 3 % 2 * 2];
        const auto& [number, bytes] = set.messages[i / 6];
        SCOPED_TRACE(std::string(own_name) + " for " + caller_name + ": " + texts[i / 6]);
        auto id = static_cast<int32_t>(number);
        std::string full = convert(caller, own, bytes);
        auto direct = ucs2(own, bytes), back = ucs2(caller, full);
        std::basic_string<LXWChar> wide(full.size() + 1, 0);
        LXMbToWideEx(caller.get(), wide.data(), static_cast<int32_t>(wide.size()), full.c_str(), 0, -1, 0);
        wide = wide.c_str();
        for (size_t room = 1; room <= full.size() + 2; ++room) {
          auto size = static_cast<int32_t>(room);
          std::string fitting = full + std::string(8, '\0');
          LXTruncateStringEx(caller.get(), fitting.data(), 0, size, 0);
          char* out = edge.room(room);
          EXPECT_EQ(LXGetMessage(catalog.get(), set.number, id, out, size, "?", LX_OPT_TERMINATE), LX_OK);
          EXPECT_STREQ(out, fitting.c_str()) << size;
          auto* out_u = edge.room<LXUChar>(room);
          EXPECT_EQ(LXGetMessageU(catalog.get(), set.number, id, out_u, size, nullptr, 0), LX_OK);
          EXPECT_TRUE(out_u == direct.substr(0, room - 1)) << size;
          auto* out_w = edge.room<LXWChar>(room);
          EXPECT_EQ(LXGetMessageW(catalog.get(), set.number, id, out_w, size, nullptr, LX_OPT_CHARS), LX_OK);
          EXPECT_TRUE(out_w == wide.substr(0, room - 1)) << size;
          char characters[200];
          EXPECT_EQ(LXGetMessage(catalog.get(), set.number, id, characters, size, "?", LX_OPT_CHARS), LX_OK);
          EXPECT_TRUE(ucs2(caller, characters) == back.substr(0, room - 1)) << size;
        }
      }
    }
  }
}

TEST_F(CatalogTest, DefaultTexts) {
  directory_.write("gaps",
                   std::string_view(catalog_image(
                       kEnglish, {{5, {{5, "five"}}}, {2, {{3, "three"}, {10, "ten"}}}, {2, {{10, "again"}}}})));
  for (uint32_t mode : kModes) {
    CatalogPtr catalog(LXOpenCatalog(utf8_.get(), nullptr, "gaps", mode));
    for (int32_t number = -1; number < 40; ++number) {
      auto set = static_cast<uint32_t>(number % 4);
      EXPECT_EQ(message(catalog, set, number), number == 10 ? "ten" : "status 72");
      EXPECT_EQ(LXGetError(utf8_.get()), number == 10 ? LX_OK : LX_E_MESSAGE);
      char out[8] = "before";
      EXPECT_EQ(LXGetMessage(catalog.get(), set, number, out, 5, "日本", 0), LX_OK);
      EXPECT_STREQ(out, number == 10 ? "ten" : "日");
    }
    EXPECT_EQ(LXGetMessage(catalog.get(), 2, 3, nullptr, 0, nullptr, 0), LX_OK);
    EXPECT_EQ(LXGetMessage(catalog.get(), 2, 3, nullptr, 0, nullptr, 1), LX_E_ARGUMENT);
  }
}

// A thousand messages, made from one source by the C library's compiler and by ours.
TEST_F(CatalogTest, SameTextsAsTheCLibrary) {
  std::string source = "$quote \"\n";
  for (int i = 0; i < 1000; ++i) {
    if (i % 200 == 0) source += "$set " + std::to_string(i / 100 + 1) + " Names\n";
    int number = i < 600 ? i % 200 + 1 : i % 200 * 7 + 3;
    source += std::to_string(number) + " \"\\tx\\\"" + std::to_string(i) + "\\101\\\n  on\"\n";
  }
  directory_.write("peer.msg", std::string_view(source));
  std::string command = LEXAROC_PATH " catalog peer.msg -o ours.cat --locale-dir " LEXARO_DATA " --locale ";
  ASSERT_EQ(std::system("gencat -o theirs.cat peer.msg"), 0);
  ASSERT_EQ(std::system((command + kEnglish).c_str()), 0);
  nl_catd peer = catopen("./theirs.cat", 0);
  for (uint32_t mode : kModes) {
    CatalogPtr catalog(LXOpenCatalog(utf8_.get(), nullptr, "ours.cat", mode));
    for (int i = 0; i < 11 * 1500; i += mode == 0 ? 7 : 1) {
      const char* expected = catgets(peer, i / 1500, i % 1500, "status 72");
      ASSERT_EQ(message(catalog, static_cast<uint32_t>(i / 1500), i % 1500), expected) << i;
      // The same piece by piece.
      LXCatSet place, *set = MCGetSet(catalog.get(), static_cast<uint32_t>(i / 1500), &place, nullptr);
      if (mode == LX_CAT_LOAD && set != nullptr) {
        const uint32_t record[] = {set->number,    set->next, set->messages, set->index_offset, set->text_offset,
                                   set->text_size, 0};
        ASSERT_EQ(LXMcLoadSet(catalog.get(), record, set = &place), LX_OK);
      }
      uint32_t length = 0;
      char* text = MCGetMsg(catalog.get(), set, i % 1500, &length, nullptr);
      ASSERT_EQ(text != nullptr ? std::string(text, length) : "status 72", expected) << i;
      if (mode != LX_CAT_LOAD) LXMcFree(text);
    }
  }
  catclose(peer);
}

const std::string kSound = catalog_image("English_UnitedStates.Small@BINARY",
                                         {{1, {{1, "one"}, {2, "two"}, {9, "nine"}}}, {4, {{1, "four"}}}});

class CatalogFaults : public testing::Test {
 protected:
  CatalogFaults() : session_((write_small_directory(directory_), directory_.path())) {}

  // The worst status of opening a catalog and reading every message of it.
  uint32_t status_of(const std::string& image, uint32_t mode) const {
    directory_.write("catalog", std::string_view(image));
    Locale locale(LXGetLocale("English_UnitedStates.US-ASCII@BINARY", 0, nullptr));
    CatalogPtr catalog(LXOpenCatalog(locale.get(), directory_.path(), "catalog", mode));
    uint32_t worst = LXGetError(locale.get());
    for (auto [set, number] : {std::pair(1u, 1), {1u, 2}, {1u, 9}, {4u, 1}}) {
      char out[16];
      uint32_t rc = catalog ? LXGetMessage(catalog.get(), set, number, out, 16, nullptr, 0) : worst;
      if (rc != LX_OK && worst != LX_E_CATALOG) worst = rc;
    }
    return worst;
  }

  DataDirectory directory_;
  Session session_;
};

TEST_F(CatalogFaults, DamagedFiles) {
  struct {
    const char* name;
    size_t at;
    uint32_t value, status;
  } const cases[] = {
      {"nothing", 0, 0x4C78F463, LX_OK},
      {"an object file", 0, 0x4C78F462, LX_E_CATALOG},
      {"the other byte order", 8, 3 - static_cast<uint32_t>(LXMcGetByteOrder()), LX_E_CATALOG},
      {"far more sets than the file can hold", 12, 0x7FFFFFFF, LX_E_CATALOG},
      {"another locale", 20, 0x41414141, LX_E_CATALOG},
      {"sets out of order", 152, 7, LX_E_MESSAGE},
      {"a chain in a circle", 156, 152, LX_E_MESSAGE},
      {"next set outside", 156, 0xFFFFFFFF, LX_E_CATALOG},
      {"a message too long", 184, 0xFFFFFFFF, LX_E_CATALOG},
      {"two sets of a number", 226, 1, LX_E_MESSAGE},
  };
  for (const auto& each : cases) {
    std::string image = kSound;
    std::memcpy(image.data() + each.at, &each.value, 4);
    for (uint32_t mode : kModes) EXPECT_EQ(status_of(image, mode), each.status) << each.name << ", mode " << mode;
  }
  // Sets may have the same messages, but not so many that checking them takes far longer than reading the file.
  std::vector<std::pair<uint32_t, std::string>> messages;
  for (uint32_t i = 1; i <= 100; ++i) messages.emplace_back(i, "x");
  for (uint32_t sets : {2u, 14u, 15u}) {
    std::string image = catalog_image("English_UnitedStates.Small@BINARY", {{1, messages}});
    image[12 + 3 * (LXMcGetByteOrder() == 1)] = static_cast<char>(sets);
    std::memcpy(image.data() + 156, std::array{152u}.data(), 4);
    for (uint32_t mode : kModes) {
      EXPECT_EQ(status_of(image, mode), sets == 15 && mode == LX_CAT_LOAD ? LX_E_CATALOG : LX_E_MESSAGE);
    }
  }
  for (size_t bit = 0; bit < kSound.size() * 9; ++bit) {  // then each length
    std::string image = kSound.substr(0, bit < kSound.size() * 8 ? kSound.size() : bit - kSound.size() * 8);
    if (bit / 8 < image.size()) image[bit / 8] = static_cast<char>(image[bit / 8] ^ (1 << bit % 8));
    for (uint32_t rc : {status_of(image, 0), status_of(image, LX_CAT_LOAD)}) {
      EXPECT_TRUE(rc == LX_OK || rc == LX_E_CATALOG || rc == LX_E_MESSAGE) << rc << " at " << bit;
    }
  }
}

TEST_F(CatalogFaults, EachSystemCallFails) {
  ASSERT_EQ(status_of(kSound, 0), LX_OK);  // now all objects are loaded
  long descriptors = open_descriptors();
  for (Call call : {Call::open, Call::read, Call::seek, Call::close, Call::status}) {
    for (uint32_t mode : kModes) {
      for (int n = 0, happened = 1; happened; ++n) {
        FailingCall failing(call, n, EIO);
        uint32_t rc = status_of(kSound, mode);
        happened = failing.happened();
        bool harmless = call == Call::close || (call == Call::open && mode != LX_CAT_LOAD);  // tried again
        EXPECT_EQ(rc, !happened || harmless ? LX_OK : call == Call::open ? LX_E_NOFILE : LX_E_CATALOG);
      }
    }
    EXPECT_EQ(open_descriptors(), descriptors);
  }
}

}  // namespace
}  // namespace lx::test
