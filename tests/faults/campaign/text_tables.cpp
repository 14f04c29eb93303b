// SPDX-License-Identifier: Apache-2.0
#include "faults/campaign/entry.hpp"
#include "support/object_builder.hpp"

namespace lx::test {
namespace {

uint8_t* convert_older_page() {
  static const Bytes file = multibyte_page_file(true);
  const uint8_t* section1 = file.data() + 76;
  auto size1 = static_cast<uint16_t>(file[10] << 8 | file[11]);
  auto size2 = static_cast<uint16_t>(file[16] << 8 | file[17]);
  uint8_t* section2 = nullptr;
  uint8_t* made = LXCpV1toV2(section1, size1, section1 + size1, size2, &section2);
  LXUnloadFile(section2);
  return made;
}

void insert_weights(uint16_t primary, uint8_t secondary, uint8_t tertiary, uint16_t special, uint8_t mask) {
  uint16_t primaries[1] = {}, *p[2] = {primaries, primaries};
  uint8_t bytes[2] = {}, *s[2] = {bytes, bytes}, *t[2] = {bytes + 1, bytes + 1};
  LXSpecialWeight specials[1] = {}, *x[2] = {specials, specials};
  LXStrInsertWeights(primary, &p[0], &p[1], secondary, &s[0], &s[1], tertiary, &t[0], &t[1], special, &x[0], &x[1], 1,
                     mask);
}

uint32_t set_options(LXConversion* handle, uint32_t options) {
  return LXSetConversionOptions(
      handle, options, [](void*, const LXConversionProblem*) {}, nullptr);
}

}  // namespace

Table text_calls() {
  return joined(
      {calls<LXByteLength, LXGetChar, LXValidChar, LXNextChar>("L c"),
       calls<LXByteLengthW, LXStrByteLength, LXUnicodeToLower, LXUnicodeToH2F, LXUnicodeToUpper, LXUnicodeToF2H>("L i"),
       calls<LXByteLengthEx, LXGetCharEx, LXValidCharEx>("L c h"),
       calls<LXNextCharEx>("L a h e"),
       calls<LXPrevChar>("L t u"),
       calls<LXPrevCharEx>("L t u h e"),
       calls<LXNumChars>("L t n"),
       calls<LXNumCharsEx, AdjustLength>("L t h n"),
       calls<LXMoveStringPointer>("L t n o"),
       calls<LXMoveStringPointerEx>("L a h n o"),
       calls<LXPutChar>("L b:4 i"),
       calls<LXPutCharEx>("L b:4 i h"),
       calls<LXInitState>("L v"),
       calls<LXGetCharType>("L c i:0x80000010"),
       calls<LXGetCharTypeW>("L i i:0x80000011"),
       calls<LXGetCharTypeU>("L i i:0x80000012"),
       calls<LXGetCharTypeEx>("L c h i:0x80000010"),
       calls<LXGetEol, LXGetEolU, LXGetEolW>("L t n e e o"),
       calls<LXGetEolEx>("L t h n e e o"),
       calls<LXPutEol, LXPutEolU, LXPutEolW>("L b:5 o"),
       calls<LXPutEolEx>("L b:6 h o"),
       calls<LXTerminateStringEx>("L b:2 h o"),
       calls<LXTruncateString>("L y:Plan_A__ i:5 o"),
       calls<LXTruncateStringEx>("L y:Plan_A__ h i:5 o"),
       calls<LXStrcmp, LXWcscmp, LXStrcmpU, LXStrcoll, LXWcscoll, LXStrcollU, LXStrstr, LXWcsstr, LXStrstrU, LXStrspn,
             LXWcsspn, LXStrspnU, LXStrcspn, LXWcscspn, LXStrcspnU>("L t n t:Ab n o"),
       calls<LXStrcmpEx, LXStrspnEx, LXStrcspnEx>("L t h n t:Ab h n o"),
       calls<LXStrcpy, LXWcscpy, LXStrcpyU>("L b r t n o"),
       calls<LXStrcpyEx>("L b r t h n o"),
       calls<LXStrcat, LXWcscat, LXStrcatU>("L D:Ab t n o"),
       calls<LXStrcatEx>("L D:Ab t h n o"),
       calls<LXStrchr>("L t n c o"),
       calls<LXStrchrEx>("L t h n c h e o"),
       calls<LXWcschr, LXStrchrU>("L t n i o"),
       calls<LXStrstrEx>("L t h n t:Ab h n e o"),
       calls<LXStrtok, LXWcstok, LXStrtokU>("L t N t:Ab n v o"),
       calls<LXStrtokEx>("L t v N t:Ab h n v o"),
       calls<LXWcslen, LXStrlenU>("L y"),
       calls<LXMapString>("L b r t n o:0x80000024"),
       calls<LXMapStringEx>("L b r t h n o:0x80000025"),
       calls<LXMapStringW>("L b r t n o:0x80000021"),
       calls<LXMapStringU>("L b r t n o:0x80000022"),
       calls<LXSortGetWeights>("W? i v v v v v v v v v"),
       calls<LXSortGetCombination>("W? i i:66 v v v v v"),
       calls<LXStrGetNextWeight, LXStrGetNextWeightW, LXStrGetNextWeightU>("L T N v v v v v v v v v v v:65535"),
       calls<LXStrGetNextWeightEx>("L T N v v v v v v v v v v v v:65535"),
       calls<LXStrcollEx>("L t n h t:Ab n h o"),
       calls<LXStrxfrm, LXWcsxfrm, LXStrxfrmU>("L b- r t n o"),
       calls<LXStrxfrmEx>("L b- r t n h o"),
       calls<LXStrGenSortKey>("L b- r t n"),
       use<insert_weights>({"LXStrInsertWeights"}, "i:7 i:6 i:5 i:4 i:0")});
}

Table code_calls() {
  return joined(
      {calls<LXCpMbToUnicode, LXGetMbCtype>("P c:3"),
       calls<LXCpMbToUnicodeW, LXCpUnicodeToCharW, LXCpMbHalfToFullW, LXCpFullToHalfW, LXGetMbCtypeW>("P i"),
       calls<LXCpUnicodeToChar>("P i b:4"),
       calls<LXMbToW>("P c"),
       calls<LXMbToWS>("P c h"),
       calls<LXWToMb>("b:4 i"),
       calls<LXCpMbCaseConv, LXCpMbCaseConvS>("P c:3 b:4 i:2"),
       calls<LXCpMbCaseConvW>("P i i:2"),
       calls<LXGetCodePageInfo>("P? v >s"),
       calls<LXOpenConversion>("Y L k >V"),
       calls<LXCloseConversion>("V- >s"),
       calls<LXConvertBuffer>("V B R T N k"),
       calls<LXFinishConversion>("V B R"),
       calls<LXGetConversionCounts>("V? v >s"),
       calls<LXConversionRatio>("Y L k"),
       calls<LXConvertString, LXConvertStringW>("Y b r L t n o"),
       calls<LXConvertStringEx>("Y b h r L t h n o"),
       calls<LXCpStrCharToByteLen>("P a h- x"),
       calls<LXCpStrByteToCharLen>("P t h n"),
       calls<LXStringToUnicode, LXStringToUnicodeW, LXUnicodeToString, LXUnicodeToStringW, LXMbToWide, LXWideToMb>(
           "L b r t n o"),
       calls<LXStringToUnicodeEx, LXMbToWideEx>("L b r t h n o"),
       calls<LXUnicodeToStringEx, LXWideToMbEx>("L b h r t n o"),
       calls<LXCpStrToUnicode, LXCpUnicodeToStr>("P? b r t n o"),
       calls<LXComStrToUnicode, LXComUnicodeToStr>("b r t:=abc n o"),
       use<convert_older_page>({"LXCpV1toV2"}, ">A"),
       use<set_options>({"LXSetConversionOptions"}, "V? o >s")});
}

Table format_calls() {
  return joined(
      {calls<LXLongToString, LXLongToStringW, LXLongToStringU>("L i:-1234567 b r o"),
       calls<LXLongToStringEx>("L i:-1234567 b h r o"),
       calls<LXStringToLong, LXStringToLongW, LXStringToLongU>("L t:-1,234 n e i:10 o"),
       calls<LXStringToLongEx>("L t:-1,234 h n e e i:10 o"),
       calls<LXDoubleToString, LXDoubleToStringW, LXDoubleToStringU, LXCurrencyToString, LXCurrencyToStringW,
             LXCurrencyToStringU>("L d b r o"),
       calls<LXDoubleToStringEx, LXCurrencyToStringEx>("L d b h r o"),
       calls<LXStringToDouble, LXStringToDoubleW, LXStringToDoubleU>("L t:1.234,5e3 n e o"),
       calls<LXStringToDoubleEx>("L t:1.234,5e3 h n e e o"),
       calls<LXStrGroupingSize, LXStrGroupingSizeW, LXStrGroupingSizeU>("L y:3;0 v:9 v"),
       calls<LXStrGetDigit>("L t:7 n v y?:, y?:. y:+ y:- i:$ascii o"),
       calls<LXStrGetDigitW>("L t:7 n v i:44 i:46 y:+ y:- i:$ascii o"),
       calls<LXStrGetDigitU>("L t:7 n v i:44 i:46 y:+ y:- o"),
       calls<LXStrGetDigitEx>("L t:7 h n v e y?:, y?:. y:+ y:- i:$ascii o"),
       calls<LXStrDoubleNextState>("i:0 i:0 v v v v v"),
       calls<LXTimeToString, LXTimeToStringW, LXTimeToStringU>("L w b r t:%x_%#c_%B_%A_%p_%j_%U n o"),
       calls<LXTimeToStringEx>("L w b h r t:%x_%#c_%B_%A_%p_%j_%U h n o"),
       calls<LXStrExpandTime, LXStrExpandTimeW, LXStrExpandTimeU>("L w b v r y:%B v o i:$ascii i:0 o >s"),
       calls<LXStrExpandTimeEx>("L w b v v r y:%B v v o i:$ascii i:0 o >s"),
       calls<LXStrWriteWord, LXStrWriteWordW, LXStrWriteWordU>("L b v r I:16 o >s"),
       calls<LXStrWriteWordEx>("L b v v r I:16 o >s"),
       calls<LXStrWriteNumber, LXStrWriteNumberW, LXStrWriteNumberU>("b v r i:5 i:2 i:$ascii i >s"),
       calls<LXStrWriteNumberEx>("L b v v r i:5 i:2 i:$ascii i >s"),
       calls<LXStringToTime, LXStringToTimeW, LXStringToTimeU>("L w t:11/22/2026 n t:%m/%d/%Y n o"),
       calls<LXStringToTimeEx>("L w t:11/22/2026 h n t:%m/%d/%Y h n o"),
       calls<LXStrExtractTime, LXStrExtractTimeW, LXStrExtractTimeU>("L w t:2026 v n t:%Y v n v i:$ascii o >s"),
       calls<LXStrExtractTimeEx>("L w t:2026 v v n t:%Y v v n v i:$ascii o >s"),
       calls<LXStrReadNumber, LXStrReadNumberW, LXStrReadNumberU>("q t:12 v n i:2 i:99 i:$ascii"),
       calls<LXStrReadNumberEx>("L q t:12 v v n i:2 i:99 i:$ascii"),
       calls<LXStrReadWord, LXStrReadWordW, LXStrReadWordU>("L q t:Montag v n I:16 i:7 o"),
       calls<LXStrReadWordEx>("L q t:Montag v v n I:16 i:7 o")});
}

}  // namespace lx::test
