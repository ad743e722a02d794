// The module on the reference host: count the characters of an EBCDIC field.
#include <nlssm/nlssm.h>
#include <nlssm/reference_host.hpp>

#include <cstdio>

int main() {
  auto host = nlssm::refhost::ReferenceHost::start(nlssm::refhost::linked_module());
  NLSSMHandle *h = nullptr;
  if (host->module() == nullptr || host->create_handle(78, &h) != 0) return 1;
  const uint8_t field[] = {0xC8, 0x85, 0x93, 0x93, 0x96};  // "Hello" in code page 037
  int64_t count = 0;
  auto numChars = reinterpret_cast<int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t,
                                               int64_t, int64_t *)>(h->NLSNumCharsS);
  if (numChars(h, field, sizeof field, 0, &count) != 0 || count != 5) return 2;
  std::printf("ok %lld\n", static_cast<long long>(count));
  return 0;
}
