// nlsstr encodings, nlsstr info ENCODING: what the host offers and what a
// handle holds.
#include <cstdio>
#include <iostream>

#include "verbs.hpp"

namespace nlsstr {
namespace {

const char *const kClassNames[] = {"SBCS", "UTF-8/UTF-EBCDIC", "WCS2",
                                   "WCS4", "MBCS modal",       "MBCS non-modal"};

const char *class_name(int encodingClass) {
  return encodingClass >= 0 && encodingClass <= 5 ? kClassNames[encodingClass] : "-";
}

int list_encodings(Session &, const Arguments &) {
  std::printf("%-4s %-24s %-17s %-6s %s\n", "no", "name", "class", "family", "described");
  for (const auto &info : nlssm::refhost::ReferenceHost::registry().rows())
    std::printf("%-4d %-24s %-17s %-6s %s\n", info.number, info.name.c_str(),
                class_name(info.encodingClass), info.ascii ? "ASCII" : "EBCDIC",
                info.described ? "yes" : ("no: " + info.reason).c_str());
  return 0;
}

std::string ranges(const uint8_t *charClass, uint8_t flag) {
  std::string out;
  for (int b = 0; b < 256; ++b) {
    if (!(charClass[b] & flag) || (b > 0 && (charClass[b - 1] & flag))) continue;
    int e = b;
    while (e < 255 && (charClass[e + 1] & flag)) ++e;
    char text[16];
    std::snprintf(text, sizeof text, "%s%02X-%02X", out.empty() ? "" : ",", b, e);
    out += text;
  }
  return out.empty() ? "none" : out;
}

int show_info(Session &session, const Arguments &args) {
  if (args.words.size() != 1) throw Failure("info takes one encoding");
  const NLSSMHandle *h = session.handle(args.words[0]);
  std::cout << "encoding      " << h->encodingNumber << '\n'
            << "class         " << h->encodingClass << " (" << class_name(h->encodingClass) << ")\n"
            << "family        " << ((h->encodingFlags & 1u) ? "ASCII" : "EBCDIC") << '\n'
            << "unit width    " << h->unitWidth << '\n'
            << "number form   " << h->numberForm << '\n'
            << "blank         " << hex(h->blankChar, h->blankWidth) << '\n'
            << "quote         " << hex(h->quoteChar, h->quoteWidth) << '\n'
            << "shift length  " << h->shiftLength << '\n'
            << "lead bytes    " << ranges(h->charClass, 0x04) << '\n'
            << "trail bytes   " << ranges(h->charClass, 0x08) << '\n'
            << "case tables   " << (h->lowerTable ? "yes" : "no") << '\n'
            << "class table   " << (h->classTable ? "yes" : "no") << '\n'
            << "dbcs records  " << h->dbcsTableCount << '\n'
            << "bidi table    " << (h->bidiTable ? "yes" : "no") << '\n'
            << "char converter " << (h->charConverter ? "yes" : "no") << '\n';
  return 0;
}

const RegisterVerb kEncodings{
    {"encodings", "", "every encoding number with its name, class and family", list_encodings}};
const RegisterVerb kInfo{{"info", "ENCODING", "the fields of the encoding's handle", show_info}};

}  // namespace
}  // namespace nlsstr
