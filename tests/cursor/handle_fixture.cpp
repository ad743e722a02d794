#include "handle_fixture.hpp"

#include <cstring>

namespace cursor_test {
namespace {

template <typename Fn>
NLSSlot slot(Fn *fn) {
  return reinterpret_cast<NLSSlot>(fn);
}

void set_blank(NLSSMHandle &h, uint8_t b, uint64_t width, bool big) {
  std::memset(h.blankChar, 0, sizeof h.blankChar);
  h.blankChar[big ? width - 1 : 0] = b;
  h.blankWidth = width;
}

void mark(NLSSMHandle &h, int low, int high, uint8_t bits) {
  for (int b = low; b <= high; ++b) h.charClass[b] |= bits;
}

// Shift-JIS lead and trail flags.
std::vector<uint8_t> shift_jis_flags() {
  std::vector<uint8_t> flags(256, 0);
  for (int b = 0x81; b <= 0x9F; ++b) flags[b] |= 0x44;
  for (int b = 0xE0; b <= 0xFC; ++b) flags[b] |= 0x44;
  for (int b = 0x40; b <= 0x7E; ++b) flags[b] |= 0x08;
  for (int b = 0x80; b <= 0xFC; ++b) flags[b] |= 0x08;
  return flags;
}

}  // namespace

std::string enc_name(Enc e) {
  static const char *const kNames[] = {"SBCS",   "UTF8",  "UTFE", "WCS2LE", "WCS2BE", "WCS4LE",
                                       "WCS4BE", "Modal", "DBCS", "EUCJP",  "EUCTW",  "GB18030"};
  return kNames[static_cast<int>(e)];
}

std::unique_ptr<TestHandle> make_handle(Enc e, const uint8_t *flags) {
  auto t = std::make_unique<TestHandle>();
  NLSSMHandle &h = t->h;
  std::memcpy(h.magic, "nevo", 4);
  h.unitWidth = 1;
  h.charRanges = t->ranges;
  set_blank(h, 0x20, 1, false);
  h.stringNextCharB = slot(&stringNextCharB);
  h.stringGetPos = slot(&stringGetPos);
  auto common_blanks = [&h] {
    h.NLSBlankPad = slot(&NLSBlankPad);
    h.NLSBlankPadS = slot(&NLSBlankPadS);
    h.NLSAllBlanks = slot(&NLSAllBlanks);
    h.NLSAllBlanksS = slot(&NLSAllBlanksS);
  };
  auto wcs_blanks = [&h] {
    h.NLSBlankPad = slot(&NLSBlankPad_WCS);
    h.NLSBlankPadS = slot(&NLSBlankPadS_WCS);
    h.NLSAllBlanks = slot(&NLSAllBlanks_WCS);
    h.NLSAllBlanksS = slot(&NLSAllBlanksS_WCS);
  };
#define NLSSM_FILL(next, setpos, size, suffix, blen, nlen, bytec) \
  h.stringNextChar = slot(&next);                                 \
  h.stringSetPos = slot(&setpos);                                 \
  h.stringCurCharSize = slot(&size);                              \
  h.NLSNumChars = slot(&NLSNumChars_##suffix);                    \
  h.NLSNumCharsS = slot(&NLSNumCharsS_##suffix);                  \
  h.NLSStringLength = slot(&NLSStringLength_##suffix);            \
  h.NLSStringByteLength = slot(&NLSStringByteLength_##suffix);    \
  h.NLSStringNLength = slot(&NLSStringNLength_##nlen);            \
  h.NLSStringBLength = slot(&NLSStringBLength_##blen);            \
  h.NLSStringByteLengthC = slot(&NLSStringByteLengthC_##bytec)

  switch (e) {
    case Enc::kSbcs:
      h.encodingNumber = 78;  // EBCDIC 037
      h.encodingClass = NLSSM_CLASS_SBCS;
      set_blank(h, 0x40, 1, false);
      NLSSM_FILL(stringNextChar_SBCS, stringSetPos_SBCS, stringCurCharSize_FixedSize, SBCS, SBCS,
                 SBCS, SBCS);
      h.NLSBlankPad = slot(&NLSBlankPad_SBCS);
      h.NLSBlankPadS = slot(&NLSBlankPadS_SBCS);
      h.NLSAllBlanks = slot(&NLSAllBlanks_SBCS);
      h.NLSAllBlanksS = slot(&NLSAllBlanksS_SBCS);
      break;
    case Enc::kUtf8:
    case Enc::kUtfe:
      h.encodingNumber = e == Enc::kUtf8 ? NLSSM_ENC_UTF8 : 161;
      h.encodingClass = NLSSM_CLASS_UTF8;
      if (e == Enc::kUtf8) {
        NLSSM_FILL(stringNextChar_UTF8, stringSetPos_UTF8, stringCurCharSize_UTF8, UTF8, UTF8, UTF8,
                   UTF8);
      } else {
        set_blank(h, 0x40, 1, false);
        NLSSM_FILL(stringNextChar_UTF8, stringSetPos_UTF8, stringCurCharSize_UTF8, UTFE, UTF8, UTF8,
                   UTF8);
      }
      common_blanks();
      break;
    case Enc::kWcs2Le:
    case Enc::kWcs2Be:
      h.encodingNumber = e == Enc::kWcs2Be ? NLSSM_ENC_WCS2_BE : NLSSM_ENC_WCS2_LE;
      h.encodingClass = NLSSM_CLASS_WCS2;
      h.unitWidth = 2;
      set_blank(h, 0x20, 2, e == Enc::kWcs2Be);
      NLSSM_FILL(stringNextChar_WCS2, stringSetPos_WCS2, stringCurCharSize_WCS2, WCS2, WCS2, WCS2,
                 WCS2);
      wcs_blanks();
      break;
    case Enc::kWcs4Le:
    case Enc::kWcs4Be:
      h.encodingNumber = e == Enc::kWcs4Be ? NLSSM_ENC_WCS4_BE : NLSSM_ENC_HOST_CHARS;
      h.encodingClass = NLSSM_CLASS_WCS4;
      h.unitWidth = 4;
      set_blank(h, 0x20, 4, e == Enc::kWcs4Be);
      NLSSM_FILL(stringNextChar_WCS4, stringSetPos_WCS4, stringCurCharSize_FixedSize, WCS4, WCS4,
                 WCS4, WCS4);
      wcs_blanks();
      break;
    case Enc::kModal:
      h.encodingNumber = 117;
      h.encodingClass = NLSSM_CLASS_MBCS_MODAL;
      h.shiftLength = 1;
      t->ranges[24] = 1;
      t->ranges[26] = 0x0E;
      t->ranges[30] = 0x0F;
      set_blank(h, 0x40, 1, false);
      NLSSM_FILL(stringNextChar_MBCS_modal, stringSetPos_MBCS_modal, stringCurCharSize_MBCS_modal,
                 MBCS_modal, MBCS_modal, MBCS_modal, MBCS_modal);
      h.NLSBlankPad = slot(&NLSBlankPad_MBCS_modal);
      h.NLSBlankPadS = slot(&NLSBlankPadS);
      h.NLSAllBlanks = slot(&NLSAllBlanks_MBCS_modal);
      h.NLSAllBlanksS = slot(&NLSAllBlanksS_MBCS_modal);
      break;
    case Enc::kDbcs: {
      h.encodingNumber = 135;
      h.encodingClass = NLSSM_CLASS_MBCS_NONMODAL;
      const std::vector<uint8_t> sjis = shift_jis_flags();
      std::memcpy(h.charClass, flags != nullptr ? flags : sjis.data(), 256);
      NLSSM_FILL(stringNextChar_MBCS_nonmodal, stringSetPos_MBCS_nonmodal,
                 stringCurCharSize_MBCS_nonmodal, MBCS_nonmodal, MBCS_nonmodal, MBCS_nonmodal,
                 MBCS_nonmodal);
      common_blanks();
      break;
    }
    case Enc::kEucJp:
      h.encodingNumber = NLSSM_ENC_EUC_JP;
      h.encodingClass = NLSSM_CLASS_MBCS_NONMODAL;
      mark(h, 0x8E, 0x8E, 0x44);
      mark(h, 0xA1, 0xFE, 0x44 | 0x08);
      NLSSM_FILL(stringNextChar_MBCS_nonmodal_EUC_JP, stringSetPos_MBCS_nonmodal_EUC_JP,
                 stringCurCharSize_MBCS_nonmodal, MBCS_EUC_JP, MBCS_EUC_JP, MBCS_EUC_JP,
                 MBCS_EUC_JP);
      common_blanks();
      break;
    case Enc::kEucTw:
      h.encodingNumber = 119;
      h.encodingClass = NLSSM_CLASS_MBCS_NONMODAL;
      mark(h, 0xA1, 0xFE, 0x44 | 0x08);
      NLSSM_FILL(stringNextChar_MBCS_nonmodal_EUC_TW, stringSetPos_MBCS_nonmodal_EUC_TW,
                 stringCurCharSize_MBCS_nonmodal, MBCS_EUC_TW, MBCS_EUC_TW, MBCS_EUC_TW,
                 MBCS_EUC_TW);
      common_blanks();
      break;
    case Enc::kGb18030:
      h.encodingNumber = NLSSM_ENC_GB18030;
      h.encodingClass = NLSSM_CLASS_MBCS_NONMODAL;
      NLSSM_FILL(stringNextChar_MBCS_nonmodal_GB18030, stringSetPos_MBCS_nonmodal_GB18030,
                 stringCurCharSize_MBCS_nonmodal, MBCS_GB18030, MBCS_GB18030, MBCS_GB18030,
                 MBCS_GB18030);
      common_blanks();
      break;
  }
#undef NLSSM_FILL
  return t;
}

NLSString descriptor(std::vector<uint8_t> &bytes) {
  if (bytes.capacity() == 0) bytes.reserve(1);  // a real buffer even for empty text
  NLSString s{};
  s.buffer = bytes.data();
  s.length = bytes.size();
  s.capacity = bytes.size();
  s.curOffset = 0;
  s.nextOffset = NLSSM_POS_NONE;
  s.prevOffset = NLSSM_POS_NO_PREVIOUS;
  return s;
}

}  // namespace cursor_test
