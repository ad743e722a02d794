// The C++ layer on the reference host: a field of EBCDIC code page 037,
// counted and shown as UTF-8; the smallest complete use of nlssm.hpp.
#include <nlssm/nlssm.hpp>

#include <cstdio>

int main() {
  nlssm::Host host = nlssm::Host::start();
  auto ebcdic = host.encoding("IBM-037");
  if (!ebcdic) {
    std::fprintf(stderr, "no handle: %s\n", ebcdic.status().name());
    return 1;
  }
  auto field = nlssm::Text::from_utf8(*ebcdic, "Grüße aus Zürich");
  if (!field) return 1;
  const auto chars = field->count();
  std::printf("%s: %lld characters in %lld bytes\n", field->to_utf8().value_or("?").c_str(),
              static_cast<long long>(chars.value_or(-1)),
              static_cast<long long>(field->byte_length()));
  return chars ? 0 : 1;
}
