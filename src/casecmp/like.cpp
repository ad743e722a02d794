// The LIKE matcher: SQL LIKE on whole characters of the text's encoding.
// '%' matches any run of characters, '_' exactly one, and, when asked, the
// escape character makes the pattern character after it literal. The
// three pattern characters are those of the encoding's family (ASCII or
// EBCDIC); in wide text they are the units of the same values, in modal
// text single-byte characters only.
//
// The match keeps only the last '%' it passed: when a later piece fails,
// that '%' takes one more character and the rest is tried again. Any
// earlier '%' never needs to take more, so the cost stays within text
// length times pattern length whatever the pattern.
#include <nlssm/nlssm.h>

#include <type_traits>

#include "casecmp/text_walk.hpp"
#include "catalogue/catalogue.hpp"

namespace nlssm::casecmp {
namespace {

namespace cat = nlssm::catalogue;

// The pattern characters in the text's encoding: one unit each.
struct Specials {
  uint8_t bytes[3][4] = {};
  int64_t size = 1;
};

Specials specials(bool ebcdic, int64_t unit, bool big) {
  const uint8_t *table = ebcdic ? cat::LIKE_EBCDIC_chars : cat::LIKE_ASCII_chars;
  Specials s;
  s.size = unit;
  for (int i = 0; i < 3; ++i) s.bytes[i][big ? unit - 1 : 0] = table[i];
  return s;
}

bool is_special(const Specials &sp, int which, const uint8_t *base, Char c) {
  return !c.shifted && c.size == sp.size &&
         std::memcmp(base + c.offset, sp.bytes[which], static_cast<size_t>(sp.size)) == 0;
}

template <class M>
int64_t like(const M &m, TextSpan t, TextSpan p, const Specials &sp, bool escape) {
  using W = Walk<M>;
  W tw(m, t.p, t.n, 0, t.state);
  W pw(m, p.p, p.n, 0, p.state);
  bool starred = false;
  W starP = pw;  // the pattern after the last '%'
  W starT = tw;  // where the text stood when it was passed
  for (;;) {
    if (!pw.done()) {
      Char pc = pw.current();
      if (is_special(sp, cat::kLikeAny, p.p, pc)) {
        pw.next();
        if (pw.done()) return 1;
        starred = true;
        starP = pw;
        starT = tw;
        continue;
      }
      W after = pw;
      after.next();
      bool any_one = is_special(sp, cat::kLikeOne, p.p, pc);
      // An escape at the very end of the pattern stands for itself.
      if (escape && is_special(sp, cat::kLikeEscape, p.p, pc) && !after.done()) {
        pc = after.current();
        any_one = false;
        after.next();
      }
      if (!tw.done() && (any_one || same_char(p.p, pc, t.p, tw.current()))) {
        pw = after;
        tw.next();
        continue;
      }
    } else if (tw.done()) {
      return 1;
    }
    if (!starred || starT.done()) return 0;
    starT.next();
    tw = starT;
    pw = starP;
  }
}

// Unit and byte order of the pattern characters for a model.
template <class M>
Specials specials_for(const NLSSMHandle *h, bool ebcdic) {
  if constexpr (std::is_same_v<M, cursor::Wcs2Model<true>>) return specials(false, 2, true);
  if constexpr (std::is_same_v<M, cursor::Wcs2Model<false>>) return specials(false, 2, false);
  if constexpr (std::is_same_v<M, cursor::FixedModel>)
    return specials(false, cursor::FixedModel(h).width, h->encodingNumber == NLSSM_ENC_WCS4_BE);
  return specials(ebcdic, 1, false);
}

template <class M>
int64_t like_plain(const NLSSMHandle *h, const NLSString *text, const NLSString *pattern,
                   int64_t escape, bool ebcdic) {
  if (h == nullptr || text == nullptr || pattern == nullptr) return NLSSM_E_NULL_ARGUMENT;
  for (const NLSString *s : {text, pattern})
    if (s->buffer == nullptr && s->curOffset >= 0 && s->length > 0) return NLSSM_E_NULL_ARGUMENT;
  static const uint8_t kNothing = 0;
  TextSpan t = from_current(text);
  TextSpan p = from_current(pattern);
  if (!t.valid) t = {&kNothing, 0, kModalSingle, true};
  if (!p.valid) p = {&kNothing, 0, kModalSingle, true};
  return like(M(h), t, p, specials_for<M>(h, ebcdic), escape != 0);
}

}  // namespace
}  // namespace nlssm::casecmp

using namespace nlssm::casecmp;

extern "C" int64_t NLSStringLike_SBCS_ASCII(const NLSSMHandle *h, const NLSString *text,
                                            const NLSString *pattern, int64_t escape) {
  return like_plain<nlssm::cursor::SbcsModel>(h, text, pattern, escape, false);
}

extern "C" int64_t NLSStringLike_SBCS_EBCDIC(const NLSSMHandle *h, const NLSString *text,
                                             const NLSString *pattern, int64_t escape) {
  return like_plain<nlssm::cursor::SbcsModel>(h, text, pattern, escape, true);
}

// UTF-8, UTF-EBCDIC (EBCDIC pattern characters), WCS2 and WCS4.
extern "C" int64_t NLSStringLike_MBCS_nonmodal(const NLSSMHandle *h, const NLSString *text,
                                               const NLSString *pattern, int64_t escape) {
  if (h == nullptr) return NLSSM_E_NULL_ARGUMENT;
  auto run = [&](auto m) {
    return like_plain<NLSSM_MODEL_OF(m)>(h, text, pattern, escape,
                                         h->encodingNumber != NLSSM_ENC_UTF8);
  };
  switch (h->encodingClass) {
    case NLSSM_CLASS_WCS2:
      return with_wcs2_model(h, run);
    case NLSSM_CLASS_WCS4:
      return run(nlssm::cursor::FixedModel(h));
    default:
      return with_utf_model(h, run);
  }
}

extern "C" int64_t NLSStringLike_MBCS_modal(const NLSSMHandle *h, const NLSString *text,
                                            const NLSString *pattern, int64_t escape) {
  if (h == nullptr) return NLSSM_E_NULL_ARGUMENT;
  return like_plain<nlssm::cursor::ModalModel>(h, text, pattern, escape,
                                               (h->encodingFlags & 1u) == 0);
}

extern "C" int64_t NLSStringLike_MBCS_nonmodal2_ASCII(const NLSSMHandle *h, const NLSString *text,
                                                      const NLSString *pattern, int64_t escape) {
  if (h == nullptr) return NLSSM_E_NULL_ARGUMENT;
  return nlssm::cursor::with_nonmodal_model(
      h, [&](auto m) { return like_plain<NLSSM_MODEL_OF(m)>(h, text, pattern, escape, false); });
}

extern "C" int64_t NLSStringLike_MBCS_nonmodal2_EBCDIC(const NLSSMHandle *h, const NLSString *text,
                                                       const NLSString *pattern, int64_t escape) {
  if (h == nullptr) return NLSSM_E_NULL_ARGUMENT;
  return nlssm::cursor::with_nonmodal_model(
      h, [&](auto m) { return like_plain<NLSSM_MODEL_OF(m)>(h, text, pattern, escape, true); });
}
