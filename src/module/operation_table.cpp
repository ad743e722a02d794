// The operation table, written once, row by row, in slot order. Each row
// names the member for each encoding class (SBCS, UTF-8/UTF-EBCDIC, WCS2,
// WCS4, MBCS modal, MBCS non-modal); a cell with several members picks one
// by the rule its constructor names.
#include "module/operation_table.hpp"

#include <array>
#include <cstddef>

namespace nlssm::module {
namespace {

enum class Pick : unsigned char {
  kSame,           // one member
  kUtf8OrUtfe,     // encoding 20, else UTF-EBCDIC
  kLittleOrBig,    // big-endian is encoding 24 (WCS2) or 26 (WCS4)
  kAsciiOrEbcdic,  // bit 0 of encodingFlags
  kDbcsVariant,    // other double-byte sets, EUC-JP, EUC-TW, GB18030
  kNumberForm,     // encoding 27, number form 4, all others
};

struct Cell {
  Pick pick = Pick::kSame;
  NLSSlot member[4] = {};
};

struct Row {
  int slot;
  Cell cells[6];
};

template <typename Fn>
NLSSlot op(Fn *function) {
  return reinterpret_cast<NLSSlot>(function);
}

Cell same(NLSSlot f) {
  return {Pick::kSame, {f}};
}
[[maybe_unused]] Cell utf(NLSSlot utf8, NLSSlot utfe) {
  return {Pick::kUtf8OrUtfe, {utf8, utfe}};
}
[[maybe_unused]] Cell endian(NLSSlot little, NLSSlot big) {
  return {Pick::kLittleOrBig, {little, big}};
}
[[maybe_unused]] Cell ascii_ebcdic(NLSSlot ascii, NLSSlot ebcdic) {
  return {Pick::kAsciiOrEbcdic, {ascii, ebcdic}};
}
[[maybe_unused]] Cell dbcs(NLSSlot other, NLSSlot eucJp, NLSSlot eucTw, NLSSlot gb18030) {
  return {Pick::kDbcsVariant, {other, eucJp, eucTw, gb18030}};
}
[[maybe_unused]] Cell number_form(NLSSlot hostChars, NLSSlot swapped, NLSSlot other) {
  return {Pick::kNumberForm, {hostChars, swapped, other}};
}
Row every_class(int slot, NLSSlot f) {
  return {slot, {same(f), same(f), same(f), same(f), same(f), same(f)}};
}

const std::array kRows = {
    // slot, SBCS, UTF-8 / UTF-EBCDIC, WCS2, WCS4, MBCS modal, MBCS non-modal
    Row{6,  // NLSNumChars
        {same(op(&NLSNumChars_SBCS)), utf(op(&NLSNumChars_UTF8), op(&NLSNumChars_UTFE)),
         same(op(&NLSNumChars_WCS2)), same(op(&NLSNumChars_WCS4)),
         same(op(&NLSNumChars_MBCS_modal)),
         dbcs(op(&NLSNumChars_MBCS_nonmodal), op(&NLSNumChars_MBCS_EUC_JP),
              op(&NLSNumChars_MBCS_EUC_TW), op(&NLSNumChars_MBCS_GB18030))}},
    Row{7,  // NLSBlankPad
        {same(op(&NLSBlankPad_SBCS)), same(op(&NLSBlankPad)), same(op(&NLSBlankPad_WCS)),
         same(op(&NLSBlankPad_WCS)), same(op(&NLSBlankPad_MBCS_modal)), same(op(&NLSBlankPad))}},
    Row{8,  // NLSAllBlanks
        {same(op(&NLSAllBlanks_SBCS)), same(op(&NLSAllBlanks)), same(op(&NLSAllBlanks_WCS)),
         same(op(&NLSAllBlanks_WCS)), same(op(&NLSAllBlanks_MBCS_modal)), same(op(&NLSAllBlanks))}},
    Row{9,  // NLSStringIndex
        {same(op(&NLSStringIndex_SBCS)), utf(op(&NLSStringIndex_UTF8), op(&NLSStringIndex_UTFE)),
         same(op(&NLSStringIndex_WCS2)), same(op(&NLSStringIndex_WCS4)),
         same(op(&NLSStringIndex_MBCS_modal)),
         dbcs(op(&NLSStringIndex_MBCS_nonmodal), op(&NLSStringIndex_MBCS_nonmodal_EUC_JP),
              op(&NLSStringIndex_MBCS_nonmodal_EUC_TW),
              op(&NLSStringIndex_MBCS_nonmodal_GB18030))}},
    Row{10,  // NLSStringEquals
        {same(op(&NLSStringEquals_SBCS)), utf(op(&NLSStringEquals_UTF8), nullptr),
         same(op(&NLSStringEquals)), same(op(&NLSStringEquals)),
         same(op(&NLSStringEquals_MBCS_modal)), same(op(&NLSStringEquals_MBCS_nonmodal))}},
    Row{11,  // NLSStringLower
        {same(op(&NLSStringLower_SBCS)), utf(op(&NLSStringLower_UTF8), op(&NLSStringLower_UTFE)),
         endian(op(&NLSStringLower_WCS2L), op(&NLSStringLower_WCS2B)),
         endian(op(&NLSStringLower_WCS4L), op(&NLSStringLower_WCS4B)),
         same(op(&NLSStringLower_MBCS_modal)),
         dbcs(op(&NLSStringLower_MBCS_nonmodal), op(&NLSStringLower_MBCS_nonmodal_EUC_JP),
              op(&NLSStringLower_MBCS_nonmodal_EUC_TW),
              op(&NLSStringLower_MBCS_nonmodal_GB18030))}},
    Row{12,  // NLSStringUpper
        {same(op(&NLSStringUpper_SBCS)), utf(op(&NLSStringUpper_UTF8), op(&NLSStringUpper_UTFE)),
         endian(op(&NLSStringUpper_WCS2L), op(&NLSStringUpper_WCS2B)),
         endian(op(&NLSStringUpper_WCS4L), op(&NLSStringUpper_WCS4B)),
         same(op(&NLSStringUpper_MBCS_modal)),
         dbcs(op(&NLSStringUpper_MBCS_nonmodal), op(&NLSStringUpper_MBCS_nonmodal_EUC_JP),
              op(&NLSStringUpper_MBCS_nonmodal_EUC_TW),
              op(&NLSStringUpper_MBCS_nonmodal_GB18030))}},
    Row{13,  // NLSStringNormalize
        {same(op(&NLSStringNormalize_SBCS)),
         utf(op(&NLSStringNormalize_UTF8), op(&NLSStringNormalize_UTFE)),
         endian(op(&NLSStringNormalize_WCS2L), op(&NLSStringNormalize_WCS2B)),
         endian(op(&NLSStringNormalize_WCS4L), op(&NLSStringNormalize_WCS4B)),
         same(op(&NLSStringNormalize_MBCS_modal)), same(op(&NLSStringNormalize_MBCS_nonmodal))}},
    every_class(14, op(&NLSStringInit)),
    Row{15,
        {same(op(&NLSCharInit_SBCS)), same(op(&NLSCharInit)), same(op(&NLSCharInit)),
         same(op(&NLSCharInit)), same(op(&NLSCharInit)), same(op(&NLSCharInit))}},
    every_class(16, op(&NLSStringClean)),
    every_class(17, op(&stringDupPos)),
    every_class(18, op(&stringGetPos)),
    Row{19,  // stringSetPos
        {same(op(&stringSetPos_SBCS)), same(op(&stringSetPos_UTF8)), same(op(&stringSetPos_WCS2)),
         same(op(&stringSetPos_WCS4)), same(op(&stringSetPos_MBCS_modal)),
         dbcs(op(&stringSetPos_MBCS_nonmodal), op(&stringSetPos_MBCS_nonmodal_EUC_JP),
              op(&stringSetPos_MBCS_nonmodal_EUC_TW), op(&stringSetPos_MBCS_nonmodal_GB18030))}},
    Row{20,  // stringNextChar
        {same(op(&stringNextChar_SBCS)), same(op(&stringNextChar_UTF8)),
         same(op(&stringNextChar_WCS2)), same(op(&stringNextChar_WCS4)),
         same(op(&stringNextChar_MBCS_modal)),
         dbcs(op(&stringNextChar_MBCS_nonmodal), op(&stringNextChar_MBCS_nonmodal_EUC_JP),
              op(&stringNextChar_MBCS_nonmodal_EUC_TW),
              op(&stringNextChar_MBCS_nonmodal_GB18030))}},
    every_class(21, op(&stringNextCharB)),
    Row{23,  // NLSStringCompLit
        {same(op(&NLSStringCompLit_SBCS)), same(op(&NLSStringCompLit)), same(op(&NLSStringCompLit)),
         same(op(&NLSStringCompLit)), same(op(&NLSStringCompLit_MBCS_modal)),
         same(op(&NLSStringCompLit))}},
    Row{24,  // NLSStringCompStr
        {same(op(&NLSStringCompStr_SBCS)),
         utf(op(&NLSStringCompStr_UTF8), op(&NLSStringCompStr_UTFE)),
         endian(op(&NLSStringCompStr_WCS2L), op(&NLSStringCompStr_WCS2B)),
         endian(op(&NLSStringCompStr_WCS4L), op(&NLSStringCompStr_WCS4B)),
         same(op(&NLSStringCompStr_MBCS_modal)),
         dbcs(op(&NLSStringCompStr_MBCS_nonmodal), op(&NLSStringCompStr_MBCS_nonmodal_EUC_JP),
              op(&NLSStringCompStr_MBCS_nonmodal_EUC_TW),
              op(&NLSStringCompStr_MBCS_nonmodal_GB18030))}},
    Row{25,  // NLSStringCompare
        {same(op(&NLSStringCompare_SBCS)),
         utf(op(&NLSStringCompare_UTF8), op(&NLSStringCompare_UTFE)),
         endian(op(&NLSStringCompare_WCS2L), op(&NLSStringCompare_WCS2B)),
         endian(op(&NLSStringCompare_WCS4L), op(&NLSStringCompare_WCS4B)),
         same(op(&NLSStringCompare_MBCS_modal)),
         dbcs(op(&NLSStringCompare_MBCS_nonmodal), op(&NLSStringCompare_MBCS_nonmodal_EUC_JP),
              op(&NLSStringCompare_MBCS_nonmodal_EUC_TW),
              op(&NLSStringCompare_MBCS_nonmodal_GB18030))}},
    Row{26,  // stringCurCharSize
        {same(op(&stringCurCharSize_FixedSize)), same(op(&stringCurCharSize_UTF8)),
         same(op(&stringCurCharSize_WCS2)), same(op(&stringCurCharSize_FixedSize)),
         same(op(&stringCurCharSize_MBCS_modal)), same(op(&stringCurCharSize_MBCS_nonmodal))}},
    Row{27,  // NLSStringLike
        {ascii_ebcdic(op(&NLSStringLike_SBCS_ASCII), op(&NLSStringLike_SBCS_EBCDIC)),
         same(op(&NLSStringLike_MBCS_nonmodal)), same(op(&NLSStringLike_MBCS_nonmodal)),
         same(op(&NLSStringLike_MBCS_nonmodal)), same(op(&NLSStringLike_MBCS_modal)),
         ascii_ebcdic(op(&NLSStringLike_MBCS_nonmodal2_ASCII),
                      op(&NLSStringLike_MBCS_nonmodal2_EBCDIC))}},
    every_class(28, op(&NLSStringContains)),
    Row{29,  // NLSStringFromDouble
        {ascii_ebcdic(op(&NLSStringFromDouble_ASCII_SBCS), op(&NLSStringFromDouble_EBCDIC_SBCS)),
         utf(op(&NLSStringFromDouble_UTF8), op(&NLSStringFromDouble_EBCDIC_MBCS)),
         number_form(op(&NLSStringFromDouble_QVChar), op(&NLSStringFromDouble_swap2),
                     op(&NLSStringFromDouble_fromQVChar)),
         number_form(op(&NLSStringFromDouble_QVChar), op(&NLSStringFromDouble_swap4),
                     op(&NLSStringFromDouble_fromQVChar)),
         ascii_ebcdic(op(&NLSStringFromDouble_ASCII_MBCS), op(&NLSStringFromDouble_EBCDIC_MBCS)),
         ascii_ebcdic(op(&NLSStringFromDouble_ASCII_MBCS), op(&NLSStringFromDouble_EBCDIC_MBCS))}},
    Row{30,  // NLSStringFromIntmax
        {ascii_ebcdic(op(&NLSStringFromIntmax_ASCII_SBCS), op(&NLSStringFromIntmax_EBCDIC_SBCS)),
         utf(op(&NLSStringFromIntmax_ASCII_MBCS), op(&NLSStringFromIntmax_EBCDIC_MBCS)),
         number_form(op(&NLSStringFromIntmax_QVChar), op(&NLSStringFromIntmax_swap2),
                     op(&NLSStringFromIntmax_fromQVChar)),
         number_form(op(&NLSStringFromIntmax_QVChar), op(&NLSStringFromIntmax_swap4),
                     op(&NLSStringFromIntmax_fromQVChar)),
         ascii_ebcdic(op(&NLSStringFromIntmax_ASCII_MBCS), op(&NLSStringFromIntmax_EBCDIC_MBCS)),
         ascii_ebcdic(op(&NLSStringFromIntmax_ASCII_MBCS), op(&NLSStringFromIntmax_EBCDIC_MBCS))}},
    Row{31,  // NLSStringToDouble
        {ascii_ebcdic(op(&NLSStringToDouble_ASCII), op(&NLSStringToDouble_EBCDIC)),
         utf(op(&NLSStringToDouble_ASCII), op(&NLSStringToDouble_EBCDIC)),
         number_form(op(&NLSStringToDouble_QVChar), op(&NLSStringToDouble_swap2),
                     op(&NLSStringToDouble_toQVChar)),
         number_form(op(&NLSStringToDouble_QVChar), op(&NLSStringToDouble_swap4),
                     op(&NLSStringToDouble_toQVChar)),
         ascii_ebcdic(op(&NLSStringToDouble_ASCII), op(&NLSStringToDouble_EBCDIC)),
         ascii_ebcdic(op(&NLSStringToDouble_ASCII), op(&NLSStringToDouble_EBCDIC))}},
    Row{32,  // NLSStringToIntmax
        {ascii_ebcdic(op(&NLSStringToIntmax_ASCII), op(&NLSStringToIntmax_EBCDIC)),
         utf(op(&NLSStringToIntmax_ASCII), op(&NLSStringToIntmax_EBCDIC)),
         number_form(op(&NLSStringToIntmax_QVChar), op(&NLSStringToIntmax_swap2),
                     op(&NLSStringToIntmax_toQVChar)),
         number_form(op(&NLSStringToIntmax_QVChar), op(&NLSStringToIntmax_swap4),
                     op(&NLSStringToIntmax_toQVChar)),
         ascii_ebcdic(op(&NLSStringToIntmax_ASCII), op(&NLSStringToIntmax_EBCDIC)),
         ascii_ebcdic(op(&NLSStringToIntmax_ASCII), op(&NLSStringToIntmax_EBCDIC))}},
    Row{33,  // NLSStringReverse
        {same(op(&NLSStringReverse_SBCS)), same(op(&NLSStringReverse_MBCS)),
         same(op(&NLSStringReverse_WCS2)), same(op(&NLSStringReverse_WCS4)),
         same(op(&NLSStringReverse_MBCS_modal)), same(op(&NLSStringReverse_MBCS))}},
    Row{34,  // NLSStringDelete
        {same(op(&NLSStringDelete_SBCS)), same(op(&NLSStringDelete_MBCS)),
         endian(op(&NLSStringDelete_WCS2L), op(&NLSStringDelete_WCS2B)),
         same(op(&NLSStringDelete_WCS4)), same(op(&NLSStringDelete_MBCS_modal)),
         same(op(&NLSStringDelete_MBCS))}},
    every_class(35, op(&NLSStringDeleteLit)),
    Row{36,  // NLSStringNotEqual
        {same(op(&NLSStringNotEqual_SBCS)), same(op(&NLSStringNotEqual_UTF8)),
         same(op(&NLSStringNotEqual_MBCS)), same(op(&NLSStringNotEqual_WCS4)),
         same(op(&NLSStringNotEqual_MBCS_modal)), same(op(&NLSStringNotEqual_MBCS))}},
    every_class(37, op(&NLSStringNotEqualLit)),
    Row{38,  // NLSStringSubStr
        {same(op(&NLSStringSubStr_SBCS)), same(op(&NLSStringSubStr_MBCS_UTF8)),
         same(op(&NLSStringSubStr_WCS2)), same(op(&NLSStringSubStr_WCS4)),
         same(op(&NLSStringSubStr_MBCS_modal)), same(op(&NLSStringSubStr_MBCS))}},
    Row{39,  // NLSStringStrip
        {same(op(&NLSStringStrip_SBCS)), utf(op(&NLSStringStrip_UTF8), op(&NLSStringStrip_UTFE)),
         same(op(&NLSStringStrip_WCS2)), same(op(&NLSStringStrip_WCS4)),
         same(op(&NLSStringStrip_MBCS_modal)), same(op(&NLSStringStrip_MBCS_nonmodal))}},
    Row{40,  // NLSStringByteLength
        {same(op(&NLSStringByteLength_SBCS)),
         utf(op(&NLSStringByteLength_UTF8), op(&NLSStringByteLength_UTFE)),
         same(op(&NLSStringByteLength_WCS2)), same(op(&NLSStringByteLength_WCS4)),
         same(op(&NLSStringByteLength_MBCS_modal)),
         dbcs(op(&NLSStringByteLength_MBCS_nonmodal), op(&NLSStringByteLength_MBCS_EUC_JP),
              op(&NLSStringByteLength_MBCS_EUC_TW), op(&NLSStringByteLength_MBCS_GB18030))}},
    Row{42,  // NLSStringAddQuotes
        {same(op(&NLSStringAddQuotes)),
         utf(op(&NLSStringAddQuotes_UTF8), op(&NLSStringAddQuotes_UTFE)),
         same(op(&NLSStringAddQuotes_WCS2)), same(op(&NLSStringAddQuotes_WCS4)),
         same(op(&NLSStringAddQuotes_MBCS_modal)),
         dbcs(op(&NLSStringAddQuotes_MBCS_nonmodal), op(&NLSStringAddQuotes_MBCS_nonmodal_EUC_JP),
              op(&NLSStringAddQuotes_MBCS_nonmodal_EUC_TW),
              op(&NLSStringAddQuotes_MBCS_nonmodal_GB18030))}},
    Row{43,  // NLSStringConcat
        {same(op(&NLSStringConcat)), same(op(&NLSStringConcat)), same(op(&NLSStringConcat_WCS2)),
         same(op(&NLSStringConcat_WCS4)), same(op(&NLSStringConcat_MBCS_modal)),
         same(op(&NLSStringConcat_MBCS))}},
    Row{44,  // NLSStringFill
        {same(op(&NLSStringFill_SBCS)), same(op(&NLSStringFill_MBCS)),
         same(op(&NLSStringFill_WCS2)), same(op(&NLSStringFill_WCS4)),
         same(op(&NLSStringFill_MBCS_modal)), same(op(&NLSStringFill_MBCS))}},
    every_class(45, op(&NLSStringFillLit)),
    Row{46,  // NLSStringFindCharLit
        {same(op(&NLSStringFindCharLit_SBCS)), same(op(&NLSStringFindCharLit_UTF8)),
         same(op(&NLSStringFindCharLit_WCS2)), same(op(&NLSStringFindCharLit_WCS4)),
         same(op(&NLSStringFindCharLit_MBCS_modal)),
         dbcs(op(&NLSStringFindCharLit_MBCS_nonmodal), op(&NLSStringFindCharLit_MBCS_EUC_JP),
              op(&NLSStringFindCharLit_MBCS_EUC_TW), op(&NLSStringFindCharLit_MBCS_GB18030))}},
    Row{47,  // NLSStringJustify
        {same(op(&NLSStringJustify)), utf(op(&NLSStringJustify_UTF8), op(&NLSStringJustify_UTFE)),
         same(op(&NLSStringJustify_WCS2)), same(op(&NLSStringJustify_WCS4)),
         same(op(&NLSStringJustify_MBCS_modal)),
         dbcs(op(&NLSStringJustify_MBCS_nonmodal), op(&NLSStringJustify_MBCS_nonmodal_EUC_JP),
              op(&NLSStringJustify_MBCS_nonmodal_EUC_TW),
              op(&NLSStringJustify_MBCS_nonmodal_GB18030))}},
    Row{48,  // NLSNumCharsS
        {same(op(&NLSNumCharsS_SBCS)), utf(op(&NLSNumCharsS_UTF8), op(&NLSNumCharsS_UTFE)),
         same(op(&NLSNumCharsS_WCS2)), same(op(&NLSNumCharsS_WCS4)),
         same(op(&NLSNumCharsS_MBCS_modal)),
         dbcs(op(&NLSNumCharsS_MBCS_nonmodal), op(&NLSNumCharsS_MBCS_EUC_JP),
              op(&NLSNumCharsS_MBCS_EUC_TW), op(&NLSNumCharsS_MBCS_GB18030))}},
    Row{49,  // NLSBlankPadS
        {same(op(&NLSBlankPadS_SBCS)), same(op(&NLSBlankPadS)), same(op(&NLSBlankPadS_WCS)),
         same(op(&NLSBlankPadS_WCS)), same(op(&NLSBlankPadS)), same(op(&NLSBlankPadS))}},
    Row{50,  // NLSAllBlanksS
        {same(op(&NLSAllBlanksS_SBCS)), same(op(&NLSAllBlanksS)), same(op(&NLSAllBlanksS_WCS)),
         same(op(&NLSAllBlanksS_WCS)), same(op(&NLSAllBlanksS_MBCS_modal)),
         same(op(&NLSAllBlanksS))}},
    Row{51,  // NLSStringIndexS
        {same(op(&NLSStringIndexS_SBCS)), utf(op(&NLSStringIndexS_UTF8), op(&NLSStringIndexS_UTFE)),
         same(op(&NLSStringIndexS_WCS2)), same(op(&NLSStringIndexS_WCS4)),
         same(op(&NLSStringIndexS_MBCS_modal)),
         dbcs(op(&NLSStringIndexS_MBCS_nonmodal), op(&NLSStringIndexS_MBCS_nonmodal_EUC_JP),
              op(&NLSStringIndexS_MBCS_nonmodal_EUC_TW),
              op(&NLSStringIndexS_MBCS_nonmodal_GB18030))}},
    Row{52,  // NLSStringEqualsS
        {same(op(&NLSStringEqualsS_SBCS)), utf(op(&NLSStringEqualsS_UTF8), nullptr),
         same(op(&NLSStringEqualsS)), same(op(&NLSStringEqualsS)),
         same(op(&NLSStringEqualsS_MBCS_modal)), same(op(&NLSStringEqualsS_MBCS_nonmodal))}},
    Row{53,  // NLSStringLowerS
        {same(op(&NLSStringLowerS_SBCS)), utf(op(&NLSStringLowerS_UTF8), op(&NLSStringLowerS_UTFE)),
         endian(op(&NLSStringLowerS_WCS2L), op(&NLSStringLowerS_WCS2B)),
         endian(op(&NLSStringLowerS_WCS4L), op(&NLSStringLowerS_WCS4B)),
         same(op(&NLSStringLowerS_MBCS_modal)),
         dbcs(op(&NLSStringLowerS_MBCS_nonmodal), op(&NLSStringLowerS_MBCS_nonmodal_EUC_JP),
              op(&NLSStringLowerS_MBCS_nonmodal_EUC_TW),
              op(&NLSStringLowerS_MBCS_nonmodal_GB18030))}},
    Row{54,  // NLSStringUpperS
        {same(op(&NLSStringUpperS_SBCS)), utf(op(&NLSStringUpperS_UTF8), op(&NLSStringUpperS_UTFE)),
         endian(op(&NLSStringUpperS_WCS2L), op(&NLSStringUpperS_WCS2B)),
         endian(op(&NLSStringUpperS_WCS4L), op(&NLSStringUpperS_WCS4B)),
         same(op(&NLSStringUpperS_MBCS_modal)),
         dbcs(op(&NLSStringUpperS_MBCS_nonmodal), op(&NLSStringUpperS_MBCS_nonmodal_EUC_JP),
              op(&NLSStringUpperS_MBCS_nonmodal_EUC_TW),
              op(&NLSStringUpperS_MBCS_nonmodal_GB18030))}},
    Row{55,  // NLSStringNormalizeS
        {same(op(&NLSStringNormalizeS_SBCS)),
         utf(op(&NLSStringNormalizeS_UTF8), op(&NLSStringNormalizeS_UTFE)),
         endian(op(&NLSStringNormalizeS_WCS2L), op(&NLSStringNormalizeS_WCS2B)),
         endian(op(&NLSStringNormalizeS_WCS4L), op(&NLSStringNormalizeS_WCS4B)),
         same(op(&NLSStringNormalizeS_MBCS_modal)), same(op(&NLSStringNormalizeS_MBCS_nonmodal))}},
    Row{56,  // NLSStringCompareS
        {same(op(&NLSStringCompareS_SBCS)),
         utf(op(&NLSStringCompareS_UTF8), op(&NLSStringCompareS_UTFE)),
         endian(op(&NLSStringCompareS_WCS2L), op(&NLSStringCompareS_WCS2B)),
         endian(op(&NLSStringCompareS_WCS4L), op(&NLSStringCompareS_WCS4B)),
         same(op(&NLSStringCompareS_MBCS_modal)),
         dbcs(op(&NLSStringCompareS_MBCS_nonmodal), op(&NLSStringCompareS_MBCS_nonmodal_EUC_JP),
              op(&NLSStringCompareS_MBCS_nonmodal_EUC_TW),
              op(&NLSStringCompareS_MBCS_nonmodal_GB18030))}},
    Row{57,  // NLSStringCompLitS
        {same(op(&NLSStringCompLitS_SBCS)), same(op(&NLSStringCompLitS)),
         same(op(&NLSStringCompLitS)), same(op(&NLSStringCompLitS)),
         same(op(&NLSStringCompLitS_MBCS_modal)), same(op(&NLSStringCompLitS))}},
    Row{58,  // NLSStringReverseS
        {same(op(&NLSStringReverseS_SBCS)), same(op(&NLSStringReverseS_MBCS)),
         same(op(&NLSStringReverseS_WCS2)), same(op(&NLSStringReverseS_WCS4)),
         same(op(&NLSStringReverseS_MBCS_modal)), same(op(&NLSStringReverseS_MBCS))}},
    Row{59,  // NLSStringDeleteS
        {same(op(&NLSStringDeleteS_SBCS)), same(op(&NLSStringDeleteS_MBCS)),
         endian(op(&NLSStringDeleteS_WCS2L), op(&NLSStringDeleteS_WCS2B)),
         same(op(&NLSStringDeleteS_WCS4)), same(op(&NLSStringDeleteS_MBCS_modal)),
         same(op(&NLSStringDeleteS_MBCS))}},
    every_class(60, op(&NLSStringDeleteLitS)),
    Row{61,  // NLSStringNotEqualS
        {same(op(&NLSStringNotEqualS_SBCS)), same(op(&NLSStringNotEqualS_UTF8)),
         same(op(&NLSStringNotEqualS_MBCS)), same(op(&NLSStringNotEqualS_WCS4)),
         same(op(&NLSStringNotEqualS_MBCS_modal)), same(op(&NLSStringNotEqualS_MBCS))}},
    every_class(62, op(&NLSStringNotEqualLitS)),
    Row{63,  // NLSStringMoveS
        {same(op(&NLSStringMoveS_SBCS)), same(op(&NLSStringMoveS_MBCS_UTF8)),
         same(op(&NLSStringMoveS_WCS2)), same(op(&NLSStringMoveS_WCS4)),
         same(op(&NLSStringMoveS_MBCS_modal)),
         dbcs(op(&NLSStringMoveS_MBCS_nonmodal), op(&NLSStringMoveS_MBCS_nonmodal_EUC_JP),
              op(&NLSStringMoveS_MBCS_nonmodal_EUC_TW),
              op(&NLSStringMoveS_MBCS_nonmodal_GB18030))}},
    Row{64,  // NLSStringStripS
        {same(op(&NLSStringStripS_SBCS)), utf(op(&NLSStringStripS_UTF8), op(&NLSStringStripS_UTFE)),
         same(op(&NLSStringStripS_WCS2)), same(op(&NLSStringStripS_WCS4)),
         same(op(&NLSStringStripS_MBCS_modal)), same(op(&NLSStringStripS_MBCS_nonmodal))}},
    Row{65,  // NLSStringAddQuotesS
        {same(op(&NLSStringAddQuotesS)),
         utf(op(&NLSStringAddQuotesS_UTF8), op(&NLSStringAddQuotesS_UTFE)),
         same(op(&NLSStringAddQuotesS_WCS2)), same(op(&NLSStringAddQuotesS_WCS4)),
         same(op(&NLSStringAddQuotesS_MBCS_modal)),
         dbcs(op(&NLSStringAddQuotesS_MBCS_nonmodal), op(&NLSStringAddQuotesS_MBCS_nonmodal_EUC_JP),
              op(&NLSStringAddQuotesS_MBCS_nonmodal_EUC_TW),
              op(&NLSStringAddQuotesS_MBCS_nonmodal_GB18030))}},
    Row{66,  // NLSStringConcatS
        {same(op(&NLSStringConcatS)), same(op(&NLSStringConcatS)), same(op(&NLSStringConcatS_WCS2)),
         same(op(&NLSStringConcatS_WCS4)), same(op(&NLSStringConcatS_MBCS_modal)),
         same(op(&NLSStringConcatS_MBCS))}},
    Row{67,  // NLSStringFillS
        {same(op(&NLSStringFillS_SBCS)), same(op(&NLSStringFillS_MBCS)),
         same(op(&NLSStringFillS_WCS2)), same(op(&NLSStringFillS_WCS4)),
         same(op(&NLSStringFillS_MBCS_modal)), same(op(&NLSStringFillS_MBCS))}},
    every_class(68, op(&NLSStringFillLitS)),
    Row{69,  // NLSStringFindCharLitS
        {same(op(&NLSStringFindCharLitS_SBCS)), same(op(&NLSStringFindCharLitS_UTF8)),
         same(op(&NLSStringFindCharLitS_WCS2)), same(op(&NLSStringFindCharLitS_WCS4)),
         same(op(&NLSStringFindCharLitS_MBCS_modal)),
         dbcs(op(&NLSStringFindCharLitS_MBCS_nonmodal), op(&NLSStringFindCharLitS_MBCS_EUC_JP),
              op(&NLSStringFindCharLitS_MBCS_EUC_TW), op(&NLSStringFindCharLitS_MBCS_GB18030))}},
    Row{70,  // NLSStringFindCharS
        {same(op(&NLSStringFindCharLitS_SBCS)), same(op(&NLSStringFindCharLitS_UTF8)),
         same(op(&NLSStringFindCharLitS_WCS2)), same(op(&NLSStringFindCharLitS_WCS4)),
         same(op(&NLSStringFindCharS_MBCS_modal)),
         dbcs(op(&NLSStringFindCharLitS_MBCS_nonmodal), op(&NLSStringFindCharLitS_MBCS_EUC_JP),
              op(&NLSStringFindCharLitS_MBCS_EUC_TW), op(&NLSStringFindCharLitS_MBCS_GB18030))}},
    Row{71,  // NLSStringJustifyS
        {same(op(&NLSStringJustifyS)),
         utf(op(&NLSStringJustifyS_UTF8), op(&NLSStringJustifyS_UTFE)),
         same(op(&NLSStringJustifyS_WCS2)), same(op(&NLSStringJustifyS_WCS4)),
         same(op(&NLSStringJustifyS_MBCS_modal)),
         dbcs(op(&NLSStringJustifyS_MBCS_nonmodal), op(&NLSStringJustifyS_MBCS_nonmodal_EUC_JP),
              op(&NLSStringJustifyS_MBCS_nonmodal_EUC_TW),
              op(&NLSStringJustifyS_MBCS_nonmodal_GB18030))}},
    Row{72,  // NLSStringLength
        {same(op(&NLSStringLength_SBCS)), utf(op(&NLSStringLength_UTF8), op(&NLSStringLength_UTFE)),
         same(op(&NLSStringLength_WCS2)), same(op(&NLSStringLength_WCS4)),
         same(op(&NLSStringLength_MBCS_modal)),
         dbcs(op(&NLSStringLength_MBCS_nonmodal), op(&NLSStringLength_MBCS_EUC_JP),
              op(&NLSStringLength_MBCS_EUC_TW), op(&NLSStringLength_MBCS_GB18030))}},
    Row{73,  // NLSStringIs
        {same(op(&NLSStringIs_SBCS)), same(op(&NLSStringIs_UTF8)), same(op(&NLSStringIs_WCS2)),
         same(op(&NLSStringIs_WCS4)), same(op(&NLSStringIs_MBCS)), same(op(&NLSStringIs_MBCS))}},
    Row{74,  // NLSStringIsLower
        {same(op(&NLSStringIs_SBCS)), same(op(&NLSStringIs_UTF8)), same(op(&NLSStringIs_WCS2)),
         same(op(&NLSStringIs_WCS4)), same(op(&NLSStringIsLower_MBCS)),
         same(op(&NLSStringIsLower_MBCS))}},
    Row{75,  // NLSStringIsDigit
        {same(op(&NLSStringIs_SBCS)), same(op(&NLSStringIs_UTF8)), same(op(&NLSStringIs_WCS2)),
         same(op(&NLSStringIs_WCS4)), same(op(&NLSStringIsDigit_MBCS)),
         same(op(&NLSStringIsDigit_MBCS))}},
    Row{76,  // NLSStringIsSpace
        {ascii_ebcdic(op(&NLSStringIsSpace_ASCII), op(&NLSStringIsSpace_EBCDIC)),
         same(op(&NLSStringIsSpace_UTF8)), same(op(&NLSStringIsSpace_WCS2)),
         same(op(&NLSStringIsSpace_WCS4)),
         ascii_ebcdic(op(&NLSStringIsSpace_MBCS_ASCII), op(&NLSStringIsSpace_MBCS_EBCDIC)),
         same(op(&NLSStringIsSpace_MBCS_ASCII))}},
    Row{77,  // NLSStringIsXDigit
        {same(op(&NLSStringIs_SBCS)), same(op(&NLSStringIsXDigit_UTF8)),
         same(op(&NLSStringIsXDigit_WCS2)), same(op(&NLSStringIsXDigit_WCS4)),
         same(op(&NLSStringIsXDigit_MBCS)), same(op(&NLSStringIsXDigit_MBCS))}},
    Row{78,  // NLSStringIsGraph
        {same(op(&NLSStringIs_SBCS)), same(op(&NLSStringIsGraph_UTF8)),
         same(op(&NLSStringIsGraph_WCS2)), same(op(&NLSStringIsGraph_WCS4)),
         same(op(&NLSStringIsGraph_MBCS)), same(op(&NLSStringIsGraph_MBCS))}},
    Row{79,  // NLSGetBaseDirection
        {same(op(&NLSGetBaseDirection_SBCS)),
         utf(op(&NLSGetBaseDirection_UTF8), op(&NLSGetBaseDirection_UTFE)),
         same(op(&NLSGetBaseDirection_WCS2)), same(op(&NLSGetBaseDirection_WCS4)),
         same(op(&NLSGetBaseDirection_MBCS)), same(op(&NLSGetBaseDirection_MBCS))}},
    Row{80,  // NLSVisualOrderFormat
        {same(op(&NLSVisualOrderFormat_SBCS)),
         same(op(&NLSVisualOrderFormat_UTF8)),
         same(op(&NLSVisualOrderFormat_WCS2)),
         same(op(&NLSVisualOrderFormat_WCS4)),
         {},
         {}}},
    Row{81,  // NLSLogicalOrderFormat
        {same(op(&NLSLogicalOrderFormat_SBCS)),
         same(op(&NLSLogicalOrderFormat_UTF8)),
         same(op(&NLSLogicalOrderFormat_WCS2)),
         same(op(&NLSLogicalOrderFormat_WCS4)),
         {},
         {}}},
    Row{86,  // NLSStringVerify
        {same(op(&NLSStringVerify_SBCS)), same(op(&NLSStringVerify_UTF8)),
         endian(op(&NLSStringVerify_WCS2L), op(&NLSStringVerify_WCS2B)),
         same(op(&NLSStringVerify_WCS4)), same(op(&NLSStringVerify_MBCS_modal)),
         same(op(&NLSStringVerify_MBCS_nonmodal))}},
    Row{87,  // NLSStringVerifyS
        {same(op(&NLSStringVerifyS_SBCS)), same(op(&NLSStringVerifyS_UTF8)),
         endian(op(&NLSStringVerifyS_WCS2L), op(&NLSStringVerifyS_WCS2B)),
         same(op(&NLSStringVerifyS_WCS4)), same(op(&NLSStringVerifyS_MBCS_modal)),
         same(op(&NLSStringVerifyS_MBCS_nonmodal))}},
    every_class(89, op(&NLSStringTransliterateLit)),
    every_class(90, op(&NLSStringTransliterateLitS)),
    Row{91,  // NLSStringTransliterate
        {same(op(&NLSStringTransliterate_SBCS)), same(op(&NLSStringTransliterate_UTF8)),
         same(op(&NLSStringTransliterate_WCS2)), same(op(&NLSStringTransliterate_WCS4)),
         same(op(&NLSStringTransliterate_DBCSM)), same(op(&NLSStringTransliterate_DBCS))}},
    Row{92,  // NLSStringTransliterateS
        {same(op(&NLSStringTransliterateS_SBCS)), same(op(&NLSStringTransliterateS_UTF8)),
         same(op(&NLSStringTransliterateS_WCS2)), same(op(&NLSStringTransliterateS_WCS4)),
         same(op(&NLSStringTransliterateS_DBCSM)), same(op(&NLSStringTransliterateS_DBCS))}},
    Row{93,  // NLSStringRemoveDelimiters
        {same(op(&NLSStringRemoveDelimiters_SBCS)), same(op(&NLSStringRemoveDelimiters_UTF8)),
         same(op(&NLSStringRemoveDelimiters_WCS2)), same(op(&NLSStringRemoveDelimiters_WCS4)),
         same(op(&NLSStringRemoveDelimiters_DBCSM)), same(op(&NLSStringRemoveDelimiters_DBCS))}},
    Row{94,  // NLSStringRemoveDelimitersS
        {same(op(&NLSStringRemoveDelimitersS_SBCS)), same(op(&NLSStringRemoveDelimitersS_UTF8)),
         same(op(&NLSStringRemoveDelimitersS_WCS2)), same(op(&NLSStringRemoveDelimitersS_WCS4)),
         same(op(&NLSStringRemoveDelimitersS_DBCSM)), same(op(&NLSStringRemoveDelimitersS_DBCS))}},
    Row{95,  // NLSStringTranword
        {same(op(&NLSStringTranword_SBCS)), same(op(&NLSStringTranword_UTF8)),
         same(op(&NLSStringTranword_WCS2)), same(op(&NLSStringTranword_WCS4)),
         same(op(&NLSStringTranword_DBCSM)), same(op(&NLSStringTranword_DBCS))}},
    Row{96,  // NLSStringTranwordS
        {same(op(&NLSStringTranwordS_SBCS)), same(op(&NLSStringTranwordS_UTF8)),
         same(op(&NLSStringTranwordS_WCS2)), same(op(&NLSStringTranwordS_WCS4)),
         same(op(&NLSStringTranwordS_DBCSM)), same(op(&NLSStringTranwordS_DBCS))}},
    every_class(97, op(&NLSStringSqueezeLit)),
    every_class(98, op(&NLSStringSqueezeLitS)),
    Row{99,  // NLSStringSqueeze
        {same(op(&NLSStringSqueeze_SBCS)), same(op(&NLSStringSqueeze_UTF8)),
         same(op(&NLSStringSqueeze_WCS2)), same(op(&NLSStringSqueeze_WCS4)),
         same(op(&NLSStringSqueeze_DBCSM)), same(op(&NLSStringSqueeze_DBCS))}},
    Row{100,  // NLSStringSqueezeS
        {same(op(&NLSStringSqueezeS_SBCS)), same(op(&NLSStringSqueezeS_UTF8)),
         same(op(&NLSStringSqueezeS_WCS2)), same(op(&NLSStringSqueezeS_WCS4)),
         same(op(&NLSStringSqueezeS_DBCSM)), same(op(&NLSStringSqueezeS_DBCS))}},
    Row{101,  // NLSStringNLength
        {same(op(&NLSStringNLength_SBCS)), same(op(&NLSStringNLength_UTF8)),
         same(op(&NLSStringNLength_WCS2)), same(op(&NLSStringNLength_WCS4)),
         same(op(&NLSStringNLength_MBCS_modal)),
         dbcs(op(&NLSStringNLength_MBCS_nonmodal), op(&NLSStringNLength_MBCS_EUC_JP),
              op(&NLSStringNLength_MBCS_EUC_TW), op(&NLSStringNLength_MBCS_GB18030))}},
    Row{102,  // NLSStringBLength
        {same(op(&NLSStringBLength_SBCS)), same(op(&NLSStringBLength_UTF8)),
         same(op(&NLSStringBLength_WCS2)), same(op(&NLSStringBLength_WCS4)),
         same(op(&NLSStringBLength_MBCS_modal)),
         dbcs(op(&NLSStringBLength_MBCS_nonmodal), op(&NLSStringBLength_MBCS_EUC_JP),
              op(&NLSStringBLength_MBCS_EUC_TW), op(&NLSStringBLength_MBCS_GB18030))}},
    Row{104,  // NLSStringIndexC
        {same(op(&NLSStringIndexC_SBCS)), same(op(&NLSStringIndexC_UTF8)),
         same(op(&NLSStringIndexC_WCS2)), same(op(&NLSStringIndexC_WCS4)),
         same(op(&NLSStringIndexC_MBCS_modal)),
         dbcs(op(&NLSStringIndexC_MBCS_nonmodal), op(&NLSStringIndexC_MBCS_nonmodal_EUC_JP),
              op(&NLSStringIndexC_MBCS_nonmodal_EUC_TW),
              op(&NLSStringIndexC_MBCS_nonmodal_GB18030))}},
    Row{105,  // NLSStringEqualsC
        {same(op(&NLSStringEqualsC_SBCS)), same(op(&NLSStringEqualsC_UTF8)),
         same(op(&NLSStringEqualsC)), same(op(&NLSStringEqualsC)),
         same(op(&NLSStringEqualsC_MBCS_modal)), same(op(&NLSStringEqualsC_MBCS_nonmodal))}},
    Row{106,  // NLSStringLowerC
        {same(op(&NLSStringLowerC_SBCS)), same(op(&NLSStringLowerC_UTF8)),
         endian(op(&NLSStringLowerC_WCS2L), op(&NLSStringLowerC_WCS2B)),
         endian(op(&NLSStringLowerC_WCS4L), op(&NLSStringLowerC_WCS4B)),
         same(op(&NLSStringLowerC_MBCS_modal)),
         dbcs(op(&NLSStringLowerC_MBCS_nonmodal), op(&NLSStringLowerC_MBCS_nonmodal_EUC_JP),
              op(&NLSStringLowerC_MBCS_nonmodal_EUC_TW),
              op(&NLSStringLowerC_MBCS_nonmodal_GB18030))}},
    Row{107,  // NLSStringUpperC
        {same(op(&NLSStringUpperC_SBCS)), same(op(&NLSStringUpperC_UTF8)),
         endian(op(&NLSStringUpperC_WCS2L), op(&NLSStringUpperC_WCS2B)),
         endian(op(&NLSStringUpperC_WCS4L), op(&NLSStringUpperC_WCS4B)),
         same(op(&NLSStringUpperC_MBCS_modal)),
         dbcs(op(&NLSStringUpperC_MBCS_nonmodal), op(&NLSStringUpperC_MBCS_nonmodal_EUC_JP),
              op(&NLSStringUpperC_MBCS_nonmodal_EUC_TW),
              op(&NLSStringUpperC_MBCS_nonmodal_GB18030))}},
    Row{108,  // NLSStringCompStrC
        {same(op(&NLSStringCompStrC_SBCS)), same(op(&NLSStringCompStrC_UTF8)),
         endian(op(&NLSStringCompStrC_WCS2L), op(&NLSStringCompStrC_WCS2B)),
         endian(op(&NLSStringCompStrC_WCS4L), op(&NLSStringCompStrC_WCS4B)),
         same(op(&NLSStringCompStrC_MBCS_modal)),
         dbcs(op(&NLSStringCompStrC_MBCS_nonmodal), op(&NLSStringCompStrC_MBCS_nonmodal_EUC_JP),
              op(&NLSStringCompStrC_MBCS_nonmodal_EUC_TW),
              op(&NLSStringCompStrC_MBCS_nonmodal_GB18030))}},
    Row{109,  // NLSStringCompLitC
        {same(op(&NLSStringCompLitC_SBCS)), same(op(&NLSStringCompLitC)),
         same(op(&NLSStringCompLitC)), same(op(&NLSStringCompLitC)),
         same(op(&NLSStringCompLitC_MBCS_modal)), same(op(&NLSStringCompLitC))}},
    Row{110,  // NLSStringStripC
        {same(op(&NLSStringStripC_SBCS)), same(op(&NLSStringStripC_UTF8)),
         same(op(&NLSStringStripC_WCS2)), same(op(&NLSStringStripC_WCS4)),
         same(op(&NLSStringStripC_MBCS_modal)), same(op(&NLSStringStripC_MBCS_nonmodal))}},
    Row{111,  // NLSStringFindCharLitC
        {same(op(&NLSStringFindCharLitC_SBCS)), same(op(&NLSStringFindCharLitC_UTF8)),
         same(op(&NLSStringFindCharLitC_WCS2)), same(op(&NLSStringFindCharLitC_WCS4)),
         same(op(&NLSStringFindCharLitC_MBCS_modal)),
         dbcs(op(&NLSStringFindCharLitC_MBCS_nonmodal), op(&NLSStringFindCharLitC_MBCS_EUC_JP),
              op(&NLSStringFindCharLitC_MBCS_EUC_TW), op(&NLSStringFindCharLitC_MBCS_GB18030))}},
    Row{112,  // NLSStringFindCharC
        {same(op(&NLSStringFindCharLitC_SBCS)), same(op(&NLSStringFindCharLitC_UTF8)),
         same(op(&NLSStringFindCharLitC_WCS2)), same(op(&NLSStringFindCharLitC_WCS4)),
         same(op(&NLSStringFindCharLitC_MBCS_modal)),
         dbcs(op(&NLSStringFindCharLitC_MBCS_nonmodal), op(&NLSStringFindCharLitC_MBCS_EUC_JP),
              op(&NLSStringFindCharLitC_MBCS_EUC_TW), op(&NLSStringFindCharLitC_MBCS_GB18030))}},
    Row{113,  // NLSStringJustifyC
        {same(op(&NLSStringJustifyC)), same(op(&NLSStringJustifyC_UTF8)),
         same(op(&NLSStringJustifyC_WCS2)), same(op(&NLSStringJustifyC_WCS4)),
         same(op(&NLSStringJustifyC_MBCS_modal)),
         dbcs(op(&NLSStringJustifyC_MBCS_nonmodal), op(&NLSStringJustifyC_MBCS_nonmodal_EUC_JP),
              op(&NLSStringJustifyC_MBCS_nonmodal_EUC_TW),
              op(&NLSStringJustifyC_MBCS_nonmodal_GB18030))}},
    Row{114,  // NLSStringByteLengthC
        {same(op(&NLSStringByteLengthC_SBCS)), same(op(&NLSStringByteLengthC_UTF8)),
         same(op(&NLSStringByteLengthC_WCS2)), same(op(&NLSStringByteLengthC_WCS4)),
         same(op(&NLSStringByteLengthC_MBCS_modal)),
         dbcs(op(&NLSStringByteLengthC_MBCS_nonmodal), op(&NLSStringByteLengthC_MBCS_EUC_JP),
              op(&NLSStringByteLengthC_MBCS_EUC_TW), op(&NLSStringByteLengthC_MBCS_GB18030))}},
    Row{115,  // NLSStringMoveC
        {same(op(&NLSStringMoveC_SBCS)), same(op(&NLSStringMoveC_MBCS_UTF8)),
         same(op(&NLSStringMoveC_WCS2)), same(op(&NLSStringMoveC_WCS4)),
         same(op(&NLSStringMoveC_MBCS_modal)),
         dbcs(op(&NLSStringMoveC_MBCS_nonmodal), op(&NLSStringMoveC_MBCS_nonmodal_EUC_JP),
              op(&NLSStringMoveC_MBCS_nonmodal_EUC_TW),
              op(&NLSStringMoveC_MBCS_nonmodal_GB18030))}},
    every_class(118, op(&stringAnyNot)),
};

bool is_class_independent(const Row &row) {
  for (const Cell &cell : row.cells)
    if (cell.pick != Pick::kSame || cell.member[0] != row.cells[0].member[0]) return false;
  return true;
}

NLSSlot choose(const Cell &cell, const NLSSMHandle &handle) {
  const uint32_t number = handle.encodingNumber;
  switch (cell.pick) {
    case Pick::kSame:
      return cell.member[0];
    case Pick::kUtf8OrUtfe:
      return cell.member[number == NLSSM_ENC_UTF8 ? 0 : 1];
    case Pick::kLittleOrBig: {
      const bool big = number == (handle.encodingClass == NLSSM_CLASS_WCS2 ? NLSSM_ENC_WCS2_BE
                                                                           : NLSSM_ENC_WCS4_BE);
      return cell.member[big ? 1 : 0];
    }
    case Pick::kAsciiOrEbcdic:
      return cell.member[(handle.encodingFlags & 1u) ? 0 : 1];
    case Pick::kDbcsVariant:
      if (number == NLSSM_ENC_EUC_JP) return cell.member[1];
      if (number == 119 || number == 120 || number == 159) return cell.member[2];
      if (number == NLSSM_ENC_GB18030) return cell.member[3];
      return cell.member[0];
    case Pick::kNumberForm:
      if (number == NLSSM_ENC_HOST_CHARS) return cell.member[0];
      return cell.member[handle.numberForm == 4 ? 1 : 2];
  }
  return nullptr;
}

}  // namespace

void fill_operation_slots(NLSSMHandle &handle) {
  auto *words = reinterpret_cast<NLSSlot *>(&handle);
  for (const Row &row : kRows) {
    NLSSlot member = nullptr;
    if (handle.encodingClass <= NLSSM_CLASS_MBCS_NONMODAL)
      member = choose(row.cells[handle.encodingClass], handle);
    else if (is_class_independent(row))
      member = row.cells[0].member[0];
    if (member != nullptr) words[row.slot] = member;
  }
}

}  // namespace nlssm::module
