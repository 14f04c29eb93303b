// SPDX-License-Identifier: Apache-2.0
#include "objects/native_texts.hpp"

#include <pthread.h>

#include <cstddef>

#include "frame/memory.hpp"
#include "objects/text_format.hpp"

namespace lx {
namespace {

// In the order of their numbers.
template <class Visit>
void for_each_text(uint8_t type, const uint8_t* section, Visit visit) {
  auto visit_all = [&](const BeU16* offsets, unsigned count) {
    for (unsigned i = 0; i < count; ++i) {
      const auto* text = reinterpret_cast<const BeU16*>(section + offsets[i]);
      size_t length = 0;
      while (text[length] != 0) ++length;
      visit(text, length);
    }
  };
  if (type == LX_LANGUAGE) {
    visit_all(reinterpret_cast<const LanguageHeader*>(section)->text_offsets, kLanguageTexts);
    return;
  }
  const auto& territory = *reinterpret_cast<const TerritoryHeader*>(section);
  visit_all(territory.text_offsets, kTerritoryTexts);
  for (const BeU16& separator : territory.separators) visit(&separator, separator != 0 ? 1 : 0);
}

constexpr unsigned text_count(uint8_t type) {
  return type == LX_LANGUAGE ? kLanguageTexts : kTerritoryTexts + kLocaleSeparators;
}

size_t block_size(uint8_t type, const uint8_t* section) {
  size_t size = text_count(type) * sizeof(const LXUChar*);
  for_each_text(type, section, [&](const BeU16*, size_t length) { size += (length + 1) * sizeof(LXUChar); });
  return size;
}

const LXUChar* const* place_texts(void* block, uint8_t type, const uint8_t* section) {
  auto* pointer = static_cast<const LXUChar**>(block);
  auto* at = reinterpret_cast<LXUChar*>(pointer + text_count(type));
  for_each_text(type, section, [&](const BeU16* text, size_t length) {
    *pointer++ = at;
    for (size_t i = 0; i < length; ++i) *at++ = text[i];
    *at++ = 0;
  });
  return static_cast<const LXUChar* const*>(block);
}

constexpr size_t kBuiltInRoom = 1280;
const uint8_t* const kBuiltInSections[] = {LXDefaultLanguage, LXDefaultTerritory};
alignas(void*) uint8_t built_in_blocks[2][kBuiltInRoom];

void place_built_in() {
  for (uint8_t type = LX_LANGUAGE; type <= LX_TERRITORY; ++type) {
    if (block_size(type, kBuiltInSections[type]) > kBuiltInRoom) __builtin_trap();
    place_texts(built_in_blocks[type], type, kBuiltInSections[type]);
  }
}

}  // namespace

const LXUChar* const* build_texts(uint8_t type, const uint8_t* checked_section) {
  void* block = allocate(block_size(type, checked_section));
  return block != nullptr ? place_texts(block, type, checked_section) : nullptr;
}

const LXUChar* const* built_in_texts(uint8_t type) {
  static pthread_once_t once = PTHREAD_ONCE_INIT;
  pthread_once(&once, place_built_in);
  return reinterpret_cast<const LXUChar* const*>(built_in_blocks[type]);
}

}  // namespace lx
