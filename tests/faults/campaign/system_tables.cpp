// SPDX-License-Identifier: Apache-2.0
#include <algorithm>
#include <utility>

#include "faults/campaign/entry.hpp"
#include "faults/campaign/world.hpp"

namespace lx::test {
namespace {

// A life of everything that a host gives.
int32_t use_host(const char* text) {
  static TRC1_Unit unit = {"campaign", "campaign", 0};
  static HSV1_Descriptor process = {16, nullptr, nullptr, nullptr}, thread = process;
  HSV1_Lock lock;
  TRC1_Sync(&unit);
  TRC1_Event(&unit, 1, TRC1_ENTRY, text, 0);
  TRC1_Printf(&unit, 1, "%s", text);
  TRC1_Dump(&unit, 1, text, text, 1);
  if (HSV1_ResolveProcess(&process, text) == nullptr || HSV1_ResolveThread(&thread, text) == nullptr) return -1;
  return HSV1_InitializeLock(&lock) | HSV1_GetLock(&lock) | HSV1_ReleaseLock(&lock) | HSV1_DestroyLock(&lock);
}

// Memory that is taken, filled, enlarged and given back.
void* use_memory(const char* text) {
  LXUnloadFile(nullptr);
  LXDefFree(nullptr, LXDefAlloc(nullptr, 16));
  void* block = LXMcMalloc(8);
  if (block == nullptr) return nullptr;
  LXMcMemcpy(LXMcSetZero(block, 8), text, 1);
  void* larger = LXMcRealloc(block, 16, 8);
  if (larger != nullptr) LXMcFree(block);
  LXUnloadFile(LXMcMalloc(16));
  return larger;
}

uint32_t count_of(int32_t room) { return static_cast<uint32_t>(std::max(room, 0)); }

int compare(const char* a, int32_t a_length, const char* b, int32_t b_length) {
  return LXmemicmp(a, b, std::min(count_of(a_length), count_of(b_length)));
}

// A failed close keeps the handle.
uint32_t close_file(LXFile* file, int32_t discard) {
  uint32_t result = LXCloseFile(file, discard);
  if (result != 0) LXMcFree(file);
  return result;
}

uint32_t read_file(LXFile* file, char* buffer, int32_t room, uint32_t* rc) {
  return LXReadFile(file, buffer, count_of(room), rc);
}

// With a manager of its own, so that the library's keeps what it has.
template <auto kUse>
uint32_t with_manager(const char* directory) {
  LXObjMgr* manager = LXInitObjManager(directory, LX_INIT_NO_DEFAULTS, nullptr);
  uint32_t result = manager != nullptr ? kUse(manager) : uint32_t{LX_E_MEMORY};
  LXTermObjManager(manager);
  return result;
}

LXObjEntry* find(LXObjMgr* manager, const char* name, int32_t no_load) {
  return LXGetObjFromName(manager, LX_CODEPAGE, name, -1, no_load, nullptr);
}
uint32_t unload(LXObjMgr* manager) { return LXUnloadObj(manager, find(manager, "MS949", 0)); }
uint32_t load_default(LXObjMgr* manager) { return LXLoadDefaultObj(manager, find(manager, "IBM037", 1)); }

uint32_t init_and_end(const char* directory, uint32_t options) {
  uint32_t status = LXInit(directory, nullptr, nullptr, nullptr, options);
  uint32_t end_status = LXTerm();
  return status != LX_OK ? status : end_status;
}

uint32_t change_territory(LXLocale* locale) {
  return LXLocaleChangeTerritory(locale, LXGetObjFromID(LXGetObjManager(), LX_TERRITORY, 392, 0, nullptr));
}

int32_t next_pair(void*, const char*, const char*) { return 1; }
template <class Unit>
int32_t next_name(void*, uint8_t, const Unit*) {
  return 1;
}

LXCatalog* load_catalog(LXLocale* locale, const char* path, int32_t loaded, uint32_t* rc) {
  LXFile* file = LXOpenFile(0, path, 0, 0, rc);
  LXCatalog* catalog = file != nullptr ? LXMcLoadCat(locale, file, loaded, rc) : nullptr;
  if (catalog == nullptr && file != nullptr) close_file(file, 0);
  return catalog;
}

uint32_t load_set(LXCatalog* catalog, uint32_t at) {
  const uint32_t record[7] = {2, 0, 1, at + 28, at + 40, 5, 0};
  LXCatSet set;
  return LXMcLoadSet(catalog, record, &set);
}

char* get_message(LXCatalog* catalog, uint32_t number, int32_t message, uint32_t* length, uint32_t* rc) {
  LXCatSet scratch;
  LXCatSet* set = MCGetSet(catalog, number, &scratch, rc);
  return set != nullptr ? MCGetMsg(catalog, set, message, length, rc) : nullptr;
}

// A block beside that of the process, which then has its own locale and state again.
uint32_t use_process_block() {
  LXLocale* const locale = std::exchange(lxglocale, nullptr);
  const int32_t flag = qlginflg;
  uint32_t status = 0;
  InitProcess(&status);
  LXReleaseLocale(lxglocale, 0);
  if (qlginflg > 0) TermProcess(&status);
  lxglocale = locale;
  qlginflg = flag;
  return status;
}

void* use_thread_block() {
  static LXLocale* locale;
  InitThread(&locale);
  const bool made = locale != nullptr;
  TermThread(&locale);
  return made ? &locale : nullptr;
}

int32_t bytes_of_units(int32_t length, uint32_t flags) {
  return length > 0 && length != INT32_MAX && (flags & LX_OPT_CHARS) == 0 ? length * 2 : length;
}
int32_t to_ucs2(LXUChar* out, int32_t room, uint16_t page, const char* in, int32_t length, int32_t* consumed,
                uint32_t flags, uint32_t* error) {
  return NLS1_TranslateString(LX_CP_UCS2, out, bytes_of_units(room, flags), page, in, length, consumed, flags, error);
}
int32_t from_ucs2(uint16_t page, char* out, int32_t room, const LXUChar* in, int32_t length, int32_t* consumed,
                  uint32_t flags, uint32_t* error) {
  return NLS1_TranslateString(page, out, room, LX_CP_UCS2, in, bytes_of_units(length, flags), consumed, flags, error);
}

}  // namespace

Table host_calls() {
  return joined({calls<HSV1_GetEnv>("z?:PATH k"),
                 calls<LXGetEnv>("z:LX_LANG b r"),
                 calls<LXGetDataLocation>("b r i:1"),
                 calls<LXGetControlFileName, LXGetAliasFileName>("z:/data b r"),
                 calls<LXGetDataFileName>("z:/data i:2 i:37 b r"),
                 calls<SplitDrive>("z:/a/b.c b:4"),
                 calls<SplitDir>("z:/a/b.c b:256"),
                 calls<SplitFile>("z:/a/b.c b:15"),
                 calls<SplitExtent>("z:/a/b.c b:5"),
                 calls<SplitPath>("z:/a/b.c b:4 b:256 b:15 b:5"),
                 calls<MakePath>("b:2048 z z:/a/ z:b z:.c"),
                 calls<LXOpenFile>("k z:$file k:0 k q >F"),
                 calls<LXOpenFile>("k z:$new k:1 i q >F"),
                 calls<LXOpenFile>("k z:$file k:2 k q >F"),
                 calls<LXSeekFile>("F? i:0 i:10"),
                 calls<LXLoadFile>("F? i:0 k:16 q >A"),
                 calls<LXFileSize>("F?"),
                 calls<LXMcMalloc>("k:16 >A"),
                 calls<LXMcGetByteOrder, LXVersion>(""),
                 use<use_host>({"HSV1_InitializeLock", "HSV1_GetLock", "HSV1_ReleaseLock", "HSV1_DestroyLock",
                                "HSV1_ResolveProcess", "HSV1_ResolveThread", "TRC1_Sync", "TRC1_Event", "TRC1_Printf",
                                "TRC1_Dump"},
                               "z:a"),
                 use<use_memory>({"LXDefAlloc", "LXDefFree", "LXUnloadFile", "LXMcFree", "LXMcRealloc", "LXMcSetZero",
                                  "LXMcMemcpy"},
                                 "z:a >A"),
                 use<compare>({"LXmemicmp"}, "t n t n"),
                 use<close_file>({"LXCloseFile"}, "F-? i"),
                 use<read_file>({"LXReadFile"}, "F? b r q")});
}

Table object_calls() {
  return joined(
      {calls<LXGetError>("L"),
       calls<LXGetObjManager>(""),
       calls<LXInitObjManager>("z?:$data k:0 q >M"),
       calls<LXGetObjFromName, LXGetObjFromNameW>("M? i:2 t:=IBM1026 n k q"),
       calls<LXGetObjFromID>("M? i:2 i:1026 k q"),
       calls<LXLoadObj>("M? P q"),
       calls<LXGetCodepageFromAlias>("M? z:cp930"),
       calls<LXLangGetSpecial>("G i:223 i:0 v v i:44"),
       calls<LXGetLocaleObject>("L i:2"),
       calls<LXGetObjId, LXGetObjType, LXGetObjName>("P"),
       calls<LXGetLocale, LXGetLocaleW, LXGetLocaleU>("z?:Spanish_Spain.IBM1026@Spanish o q >L"),
       calls<LXGetLocale>("z?:Spanish_Spain.ibm-1026@None o:4 q >L"),
       calls<LXGetLocale>("z?: o:6 q >L"),
       calls<LXReleaseLocale>("l-? k"),
       calls<LXSetLocale, LXSetLocaleW, LXSetLocaleU>("z?:Spanish_Spain.IBM1026@Spanish o >s"),
       calls<LXGetUserLocale>("b r"),
       calls<LXGetLocaleNumInfo>("L I:63 i:0"),
       calls<LXSetLocaleNumInfo>("l I:63 i:5"),
       calls<LXSetLocaleNumInfo>("l k:1 i:1"),
       calls<LXSetLocaleNumInfo>("l k:5 i:840"),
       calls<LXSetLocaleNumInfo>("l k:9 i:1026"),
       calls<LXSetLocaleNumInfo>("l k:11 i:5"),
       calls<LXLocaleGetTextItem, LXLocaleGetTextItemU>("L I:64 i:1 e"),
       calls<LXGetLocaleTextInfo, LXGetLocaleTextInfoW, LXGetLocaleTextInfoU>("L I:79 b? r o"),
       calls<LXGetLocaleTextInfoEx>("L I:79 b? r Q? o"),
       calls<LXSetLocaleTextInfo, LXSetLocaleTextInfoW, LXSetLocaleTextInfoU>("l I:80 t n o"),
       calls<LXSetLocaleTextInfo>("l k:6 t:UnitedStates n k"),
       calls<LXSetLocaleTextInfo>("l k:10 t:IBM1026 n k"),
       calls<LXSetLocaleTextInfo>("l k:59 t:' n o"),
       calls<LXSetLocaleTextInfoU>("l k:66 t:# n o"),
       calls<LXSetLocaleTextInfoEx>("l I:80 t n P? o"),
       calls<LXLocaleGetLocaleString>("L b:136"),
       calls<LXLocaleSetModifiable>("l >s"),
       calls<LXLocaleChangeCodePage>("l Q? >s"),
       calls<LXLocaleFreeOldText>("L? l"),
       calls<LXLocaleCnvText>("P? Q? y?:abc >A"),
       calls<LXMapNativeLocale>("z:de_DE b r"),
       calls<LXConvertNativeLocale>("z:C o:4 q >L"),
       calls<LXConvertLocale>("L b:12 o:4"),
       calls<LXMapNativeInfo>("z:C l k"),
       use<init_and_end>({"LXInit"}, "z:$data o:0x80000001 >s"),
       use<init_and_end>({"LXTerm"}, "z:$data k >s"),
       use<with_manager<[](LXObjMgr*) { return uint32_t{0}; }>>({"LXTermObjManager"}, "z:$data"),
       use<with_manager<unload>>({"LXUnloadObj"}, "z:$data"),
       use<with_manager<load_default>>({"LXLoadDefaultObj"}, "z:$data"),
       use<with_manager<LXLoadDefaults>>({"LXLoadDefaults"}, "z:$none"),
       use<with_manager<LXBuildAliasList>>({"LXBuildAliasList"}, "z:$data"),
       use<with_manager<LXDestroyAliasList>>({"LXDestroyAliasList"}, "z:$data"),
       use<[](LXObjMgr* manager) { return LXEnumAliases(manager, next_pair, nullptr); }>({"LXEnumAliases"}, "M"),
       use<[] { return LXEnumNativeNames(next_pair, nullptr); }>({"LXEnumNativeNames"}, ""),
       use<[] { return LXEnumLocales(next_name<char>, nullptr, 0); }>({"LXEnumLocales"}, ""),
       use<[] { return LXEnumLocalesW(next_name<LXWChar>, nullptr, 0); }>({"LXEnumLocalesW"}, ""),
       use<[] { return LXEnumLocalesU(next_name<LXUChar>, nullptr, 0); }>({"LXEnumLocalesU"}, ""),
       use<change_territory>({"LXLocaleChangeTerritory"}, "l >s")});
}

Table stream_calls() {
  return joined(
      {calls<LXCloseStream>("S-? l k"),
       calls<LXCloseStream>("S-:w l k"),
       calls<LXFlushStream>("S?:w L k"),
       calls<LXReadCharU>("S?:u L k"),
       calls<LXReadCharW, LXReadChar>("S?:r L k"),
       calls<LXReadCharEx>("S?:r L e k"),
       calls<LXReadString, LXReadStringW, LXReadStringEx>("S?:r L b r o"),
       calls<LXReadStringU>("S?:u L b r o"),
       calls<LXUngetChar>("S?:r L c k"),
       calls<LXUngetCharU>("S?:u L i k"),
       calls<LXUngetCharW>("S?:r L i k"),
       calls<LXUngetCharEx>("S?:r L c h k"),
       calls<LXWriteChar>("S?:w L c"),
       calls<LXWriteCharU, LXWriteCharW>("S?:w L i"),
       calls<LXWriteCharEx>("S?:w L c h"),
       calls<LXOpenCatalog>("L y?: y?:$catalog o >K"),
       calls<LXOpenCatalog>("L y?: y?:$catalog o:0x80000061 >K"),
       calls<LXOpenCatalogW, LXOpenCatalogU>("L y?:%L y?:$catalog o >K"),
       calls<LXCloseCatalog>("K-? k >s"),
       calls<LXGetMessage, LXGetMessageW, LXGetMessageU>("K? i:1 i:1 b r y?:default o >s"),
       calls<LXGetMessage>("K?:l i:1 i:1 b r y?:default o >s"),
       calls<MCGetSet>("K? i:1 v q"),
       calls<MCGetSet>("K?:l i:1 v q"),
       use<[](LXLocale* locale, uint32_t mode) { return LXOpenStream(locale, Wire::move, &Wire::get(), mode); }>(
           {"LXOpenStream"}, "L o:0x80000050 >S"),
       use<load_catalog>({"LXMcLoadCat"}, "L z:$catalog i q >K"),
       use<load_set>({"LXMcLoadSet"}, "K:l i:152 >s"),
       use<get_message>({"MCGetMsg"}, "K i:1 i:1 e q >A")});
}

Table numbered_calls() {
  return joined({calls<NLS1_PrivateFunction_GetProcessLocale>(">s"),
                 calls<NLS1_PrivateFunction_GetThreadLocale>(""),
                 calls<NLS1_GetLocale>("i:18087938 i:1026 o q >L"),
                 calls<NLS1_SetLocale>("i:18087938 i:1026 o:0x80000000 >s"),
                 calls<NLS1_SetLocale>("i:18087938 i:1026 o:0xC0000000 >s"),
                 calls<NLS1_GetLocaleNumInfo>("L I:63 i:0"),
                 calls<NLS1_SetLocaleNumInfo>("l I:63 i:5"),
                 calls<NLS1_GetLocaleTextInfo>("L I:79 b? r i:1026 o"),
                 calls<NLS1_SetLocaleTextInfo>("l I:80 t n k o"),
                 calls<NLS1_SetLocaleTextInfo>("l I:80 t:=abc n i:37 k"),
                 calls<NLS1_SetLocaleFromNative>("z:C o:4 >s"),
                 calls<NLS1_SetNativeLocale>("i:18087938 i:819 k i:4 >s"),
                 calls<NLS1_SetNativeFromLocale>("L k o:4 >s"),
                 calls<NLS1_ConvertNativeLocale>("z:C o:4 q >L"),
                 calls<NLS1_GetCodepageId>("z:cp1026 q"),
                 calls<NLS1_GetLanguageId>("z:German q"),
                 calls<NLS1_GetTerritoryId>("z:Germany q"),
                 calls<NLS1_GetSortId>("z:Spanish q"),
                 calls<NLS1_GetObjectName>("i:37 b r i:2 >s"),
                 calls<NLS1_GetLanguageName, NLS1_GetTerritoryName>("i:18087938 b r >s"),
                 calls<NLS1_GetCodepageName>("i:37 b r >s"),
                 calls<NLS1_GetSortName>("i:5 b r >s"),
                 calls<NLS1_TranslateString>("k:1026 b r k:$page t n e o q"),
                 calls<NLS1_TranslateString>("k:$page b r k:37 t:=\xC1\x4B\x40 n e o q"),
                 use<use_process_block>({"InitProcess", "TermProcess"}, ">s"),
                 use<use_thread_block>({"InitThread", "TermThread"}, ""),
                 use<to_ucs2>({"NLS1_TranslateString"}, "b r k:$page t n e o q"),
                 use<from_ucs2>({"NLS1_TranslateString"}, "k:$page b r t n e o q")});
}

}  // namespace lx::test
