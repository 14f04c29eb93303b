// SPDX-License-Identifier: Apache-2.0
// Many threads at once, each with locales of its own, over objects that all of them share.
#include <gtest/gtest.h>

#include <atomic>
#include <barrier>
#include <functional>
#include <thread>

#include "support/object_builder.hpp"
#include "support/session.hpp"

namespace lx::test {
namespace {

constexpr unsigned kThreads = 8;

// Runs the body in all threads, which begin together.
void in_threads(const std::function<void(unsigned number)>& body) {
  std::barrier start(kThreads);
  std::vector<std::thread> threads;
  for (unsigned number = 0; number < kThreads; ++number) {
    threads.emplace_back([&, number] {
      start.arrive_and_wait();
      body(number);
    });
  }
  for (std::thread& thread : threads) thread.join();
}

// Text of a page that goes to UTF-8 and back.
std::string text_for(const char* page) {
  std::string text;
  for (int i = 0; i < 50; ++i) text += "Some plain text 0123456789 ";
  if (std::string_view(page) == "UTF-8") text += "\xC3\xA9\xE3\x81\x82";
  return text;
}

const char* const kPages[] = {"US-ASCII", "Latin1", "UTF-8",    "ISO-8859-2", "MS932",
                              "MS950",    "EUC-TW", "JapanEUC", "MS949"};
const char* const kNames[] = {"English", "German_Austria", "Japanese", "French_French-Switzerland", "Greek", "Turkish"};

bool carries(LXLocale* target, LXLocale* source, const std::string& text) {
  std::vector<char> there(text.size() * 4), back(text.size() * 4);
  auto room = static_cast<int32_t>(there.size());
  auto length = static_cast<int32_t>(text.size());
  int32_t count = LXConvertString(target, there.data(), room, source, text.data(), length, 0);
  int32_t again = LXConvertString(source, back.data(), room, target, there.data(), count, 0);
  return std::string_view(back.data(), static_cast<size_t>(again)) == text;
}

bool carries_in_pieces(LXLocale* target, LXLocale* source, const std::string& text) {
  Conversion handle(LXOpenConversion(target, source, 0));
  std::string result;
  for (size_t done = 0; done < text.size(); done += 7) {
    char buffer[64];
    char* out = buffer;
    const char* in = text.data() + done;
    int32_t left = static_cast<int32_t>(std::min<size_t>(7, text.size() - done));
    int32_t room = sizeof buffer;
    if (LXConvertBuffer(handle.get(), &out, &room, &in, &left, 0) == LX_E_FULL) return false;
    result.append(buffer, out);
  }
  return !result.empty();
}

// One thread's work; the name of what went wrong, or null.
const char* work(unsigned number) {
  uint32_t rc = 0;
  Locale utf8(LXGetLocale("English.UTF-8@BINARY", 0, &rc));
  if (utf8 == nullptr) return "UTF-8";
  for (unsigned i = 0; i < std::size(kPages); ++i) {
    const char* page = kPages[(i + number) % std::size(kPages)];
    Locale locale(LXGetLocale((std::string("German_Germany.") + page + "@BINARY").c_str(), 0, &rc));
    if (locale == nullptr) return page;
    if (!carries(utf8.get(), locale.get(), text_for(page))) return page;
    if (!carries_in_pieces(utf8.get(), locale.get(), text_for(page))) return page;
  }
  for (unsigned i = 0; i < std::size(kNames); ++i) {
    const char* name = kNames[(i + number) % std::size(kNames)];
    Locale locale(LXGetLocale(name, 0, &rc));
    if (locale == nullptr || LXLocaleSetModifiable(locale.get()) != LX_OK) return name;
  }
  if (LXGetCodepageFromAlias(LXGetObjManager(), "ibm-819") == nullptr) return "alias";
  int objects = 0;
  LXEnumLocales([](void* count, uint8_t, const char*) -> int32_t { return ++*static_cast<int*>(count); }, &objects, 0);
  return objects > 100 ? nullptr : "objects";
}

TEST(Threads, LoadAndConvertAtOnce) {
  for (int round = 0; round < 3; ++round) {
    Session session;
    ASSERT_EQ(session.status, LX_OK);
    in_threads([](unsigned number) { EXPECT_STREQ(work(number), nullptr); });
  }
}

TEST(Threads, CountUpAndDownAtOnce) {
  Session session;
  in_threads([](unsigned number) {
    for (int i = 0; i < 200; ++i) {
      EXPECT_EQ(LXInit(nullptr, nullptr, nullptr, nullptr, 0), LX_OK);
      if (i % 50 == 0) {
        EXPECT_STREQ(work(number), nullptr);
      }
      EXPECT_EQ(LXTerm(), LX_OK);
    }
  });
  EXPECT_NE(LXGetObjManager(), nullptr);
}

// All threads see the same substitute, whoever has met the error, and share what becomes of pages of the older layout.
TEST(Threads, MeetMissingAndOlderObjectsAtOnce) {
  DataDirectory directory;
  write_small_directory(directory);
  directory.remove("cp_00900.nls");
  Session session(directory.path());
  std::atomic<int> errors = 0;
  in_threads([&](unsigned) {
    uint32_t rc = 99;
    LXObjEntry* page = LXGetObjFromID(LXGetObjManager(), LX_CODEPAGE, 900, 0, &rc);
    if (rc != LX_OK) ++errors;
    LXCodePageInfo info;
    EXPECT_EQ(LXGetCodePageInfo(page, &info), LX_OK);
    EXPECT_EQ(info.max_length, 1);
    for (const char* name : {"English.Small", "English.OldSmall", "English.OldSingle"}) {
      Locale locale(LXGetLocale(name, 0, nullptr));
      ASSERT_NE(locale, nullptr);
      LXUChar units[8];
      EXPECT_EQ(LXStringToUnicode(locale.get(), units, 8, "abc", 3, 0), 3);
      EXPECT_EQ(units[0], 'a');
    }
  });
  EXPECT_EQ(errors, 1) << "only the thread that tried to load it is told";
}

}  // namespace
}  // namespace lx::test
