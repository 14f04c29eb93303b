// SPDX-License-Identifier: Apache-2.0
// Sort objects made by the tests themselves from a readable description, and collation done slowly by it: weights
// looked up in the description, levels as lists, keys as strings. It shares no code with the library.
#pragma once

#include <array>
#include <map>

#include "support/object_builder.hpp"
#include "support/text_calls.hpp"
#include "text/text_functions.hpp"

namespace lx::test {

// ---- Sort objects ----

inline constexpr unsigned kEmptyPage = 1, kPrimaryPage = 2, kSpecialPage = 4;
inline constexpr unsigned kIsSpecial = 0x8000, kExpands = 0x4000;
constexpr unsigned mask_flags(unsigned mask) { return mask << 10; }

struct SortSpec {
  struct Page {
    unsigned flags = kEmptyPage;
    unsigned mask = 0;
    unsigned base = 0;
  };
  struct Entry {
    unsigned weight = 0;
    unsigned secondary = 0;
    unsigned tertiary = 0;
    unsigned flags = 0;
  };
  struct Expansion {
    char16_t character;
    Entry first, second;  // without flags
  };
  struct Combination {
    char16_t first, second;
    Entry entry;
  };

  unsigned default_secondary = 0x20;
  unsigned default_tertiary = 2;
  std::array<Page, 256> pages = {};
  std::map<char16_t, Entry> entries = {};  // of tabulated pages; those left out weigh nothing
  std::vector<Expansion> expansions = {};
  std::vector<Combination> combinations = {};

  Bytes section() const;
  Bytes file() const { return object_file({section()}); }
};

// Every kind of character on a few letters, see the .cpp.
SortSpec test_sort(const std::string& name);
// The sorts "Plain", "Combining" (with pairs) and "Forward" (with pairs, nothing stored backwards), beside some
// compiled languages and pages.
void write_collation_directory(const DataDirectory& directory);

// ---- Weights ----

struct ModelSet {
  unsigned primary = 0, secondary = 0, tertiary = 0, special = 0;
  bool operator==(const ModelSet&) const = default;
};
struct ModelWeights {
  std::vector<ModelSet> sets = {};  // 0 to 2
  int mask = -1;                    // -1: not told
  bool operator==(const ModelWeights&) const = default;
};
ModelWeights model_weights(const SortSpec& sort, char16_t character);
bool model_combination(const SortSpec& sort, char16_t first, char16_t second, ModelWeights& weights);

// What a reader of weights is given and gives back.
struct Reading {
  int32_t offset = 0;
  int32_t remaining = 0;
  uint32_t state = 0;
  uint16_t position = 0;
  uint16_t pending = 0xFFFF;
  bool operator==(const Reading&) const = default;
};
// One character after the other, with a look at the one behind it where pairs may combine.
class ModelReader {
 public:
  ModelReader(const SortSpec& sort, const Form& form, const Units& text);
  bool more() const { return now.remaining > 0 || now.pending != 0xFFFF; }
  ModelWeights next();

  Reading now;

 private:
  bool read(char16_t& character);

  const SortSpec* sort_;
  Form form_;
  Characters text_;
  size_t at_ = 0;
};

// Elements in level order.
template <class Element>
struct ModelLevel {
  std::vector<Element> list;
  size_t insertion = 0;

  void file(const Element& element, bool in_order) {
    if (in_order) insertion = list.size();
    list.insert(list.begin() + static_cast<ptrdiff_t>(insertion), element);
    insertion += in_order;
  }
};
struct ModelLevels {
  ModelLevel<unsigned> primary, secondary, tertiary;
  ModelLevel<std::pair<unsigned, unsigned>> special;

  void file(const ModelSet& set, uint16_t position, int mask);
};

std::string model_key(const SortSpec& sort, std::u16string_view text);
// A difference of primary weights, or a sign.
int model_compare(ModelReader a, ModelReader b);

// ---- The library ----

inline int sign(int value) { return (value > 0) - (value < 0); }

class Collation {
 public:
  Collation(Form::Kind kind, uint16_t page, const std::string& sort, LanguageIndex language = kEnglish);

  const Form form;
  const SortSpec sort;
  const TestLanguage& language;
  const std::string name;
  LXLocale* locale() const { return locale_.get(); }

  Units store(std::u16string_view text) const { return spelled(form, text); }
  ModelReader reader(const Units& text) const { return {sort, form, text}; }
  // What becomes of a text that is mapped in a form.
  std::u16string mapped(const Form& in, std::u16string_view text, uint32_t flags) const;

  // Texts are at the edge of their memory. The key has room for itself and for the work.
  int32_t compare(const Units& a, const Units& b, uint32_t options = 0) const;
  int32_t transform(void* key, int32_t size, const Units& text, int32_t length, uint32_t options) const;
  std::string key(const Units& text, uint32_t options = 0) const;
  ModelWeights next_weight(const Units& text, Reading& reading) const;

 private:
  Locale locale_;
};

// Every form of text, with that sort.
std::vector<Collation> own_forms(const std::string& sort, LanguageIndex language = kEnglish);
// All texts of up to `length` letters.
std::vector<std::u16string> all_texts(std::u16string_view letters, size_t length);

// The library on the collation directory, for all cases of a program.
class CollationTest : public testing::Test {
 private:
  static const char* directory() {
    static const DataDirectory directory;
    static const bool written = [] { return write_collation_directory(directory), true; }();
    return written ? directory.path() : "";
  }
  Session session_{directory()};
};

}  // namespace lx::test
