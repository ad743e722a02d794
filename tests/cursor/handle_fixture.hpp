// Hand-built handles for the cursor tests: the fields and slots that the
// stepping and counting members read or call through, per encoding.
#pragma once

#include <nlssm/nlssm.h>

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace cursor_test {

enum class Enc {
  kSbcs,
  kUtf8,
  kUtfe,
  kWcs2Le,
  kWcs2Be,
  kWcs4Le,
  kWcs4Be,
  kModal,
  kDbcs,
  kEucJp,
  kEucTw,
  kGb18030,
};

std::string enc_name(Enc e);

struct TestHandle {
  NLSSMHandle h{};
  uint8_t ranges[64]{};  // the host record's range block
};

// A handle for `e`. Double-byte code pages take their lead (0x44) and trail
// (0x08) flags from `flags` (256 bytes); without them, Shift-JIS ranges.
std::unique_ptr<TestHandle> make_handle(Enc e, const uint8_t *flags = nullptr);

// Calls through the handle's slots, as callers of the module do.
int64_t set_pos(const NLSSMHandle *h, NLSString *s, int64_t pos, int64_t delta);
int64_t next_char(const NLSSMHandle *h, NLSString *s);
int64_t cur_char_size(const NLSSMHandle *h, const NLSString *s);
int64_t num_chars_s(const NLSSMHandle *h, const uint8_t *p, int64_t n, int64_t flags,
                    int64_t *count);
int64_t num_chars(const NLSSMHandle *h, const NLSString *s, int64_t flags, int64_t *count);
int64_t string_length(const NLSSMHandle *h, const uint8_t *text, int64_t *chars, int64_t *bytes,
                      int64_t flags = 0);
int64_t string_nlength(const NLSSMHandle *h, const uint8_t *text, int64_t limit, int64_t *chars,
                       int64_t *bytes);
int64_t string_blength(const NLSSMHandle *h, const uint8_t *text, int64_t count);
int64_t byte_length(const NLSSMHandle *h, const NLSString *s, int64_t limit);
int64_t byte_length_c(const NLSSMHandle *h, const uint8_t *p, int64_t n, int64_t flags);

// A descriptor over `bytes`, not yet positioned (as a caller builds one).
NLSString descriptor(std::vector<uint8_t> &bytes);

// Shift-JIS lead and trail flags.
std::vector<uint8_t> shift_jis_flags();

}  // namespace cursor_test
