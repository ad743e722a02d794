// UTF-EBCDIC: code points written as UTF-8-Mod (I8) sequences whose bytes are
// then permuted into EBCDIC positions, so that the EBCDIC invariant
// characters keep their single-byte values.
#pragma once

#include <cstddef>
#include <cstdint>

namespace nlssm::refhost::utfe {

// Bytes `character` takes (1 to 5); 0 for a value above 0x10FFFF.
int encoded_length(std::uint32_t character);
// Writes the character's bytes (encoded_length of them) to `out`.
void encode(std::uint32_t character, std::uint8_t *out);

enum class Decode { Ok, IllFormed, Truncated };
// Reads one character from (text, length); `used` gets its byte count.
// Surrogate code points and over-long forms are ill-formed.
Decode decode(const std::uint8_t *text, std::size_t length, std::uint32_t &character,
              std::size_t &used);
// The same, answering with the host status of a failed decode (0 when it reads).
std::int64_t decode_status(const std::uint8_t *text, std::size_t length, std::uint32_t &character,
                           std::size_t &used);

}  // namespace nlssm::refhost::utfe
