// nlsstr parse ENCODING / nlsstr format ENCODING VALUE: numbers read from and
// written into text of an encoding, through the handle's number slots.
#include <nlssm/host.h>

#include <algorithm>
#include <charconv>
#include <iostream>
#include <sstream>

#include "verbs.hpp"

namespace nlsstr {
namespace {

using ToIntmaxFn = int64_t (*)(const NLSSMHandle *, void *, const void *, int64_t, uint32_t,
                               int64_t *, int32_t *);
using ToDoubleFn = int64_t (*)(const NLSSMHandle *, void *, const void *, int64_t, int64_t,
                               uint32_t, double *, int32_t *);
using FromIntmaxFn = int64_t (*)(const NLSSMHandle *, void *, int64_t, int64_t, uint32_t, void *,
                                 int64_t, int32_t *);
using FromDoubleFn = int64_t (*)(const NLSSMHandle *, void *, double, int64_t, int64_t, uint32_t,
                                 void *, int64_t, int32_t *);

bool as_double(const Arguments &args) {
  const std::string as = args.option("as", "integer");
  if (as != "integer" && as != "double") throw Failure("--as takes integer or double");
  return as == "double";
}

int64_t number_option(const Arguments &args, const std::string &name, int64_t fallback) {
  if (!args.has(name)) return fallback;
  const std::string text = args.option(name);
  int64_t value = 0;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value);
  if (error != std::errc() || end != text.data() + text.size())
    throw Failure("--" + name + " takes a number");
  return value;
}

uint32_t format_flags(const Arguments &args) {
  uint32_t flags = 0;
  std::istringstream names(args.option("flags"));
  for (std::string name; std::getline(names, name, ',');) {
    if (name == "grouping")
      flags |= NLSHOST_NUMBER_GROUPING;
    else if (name == "scientific")
      flags |= NLSHOST_NUMBER_SCIENTIFIC;
    else if (name == "sign")
      flags |= NLSHOST_NUMBER_SIGN;
    else if (name == "left")
      flags |= NLSHOST_NUMBER_LEFT;
    else if (!name.empty())
      throw Failure("unknown flag " + name + " (grouping, scientific, sign, left)");
  }
  return flags;
}

// A host locale by name for --locale, destroyed with the object.
struct NamedLocale {
  void *object = nullptr;
  NamedLocale(Session &session, const Arguments &args) {
    if (!args.has("locale")) return;
    const std::string name = args.option("locale");
    const std::u32string wide(name.begin(), name.end());
    void *nls = session.host().nls();
    object = reinterpret_cast<NLSHostLocaleFn>(NLSSM_HOST_SLOT(nls, NLSHOST_SLOT_NLS_LOCALE))(
        nls, reinterpret_cast<const uint32_t *>(wide.data()), std::ssize(wide));
    if (object == nullptr) throw Failure("the host has no locale " + name);
  }
  ~NamedLocale() {
    if (object != nullptr)
      reinterpret_cast<NLSHostLocaleDestroyFn>(
          NLSSM_HOST_SLOT(object, NLSHOST_SLOT_LOCALE_DESTROY))(object);
  }
};

int parse(Session &session, const Arguments &args) {
  if (args.words.size() != 1) throw Failure("parse takes one encoding");
  const NLSSMHandle *handle = session.handle(args.words[0]);
  const std::vector<uint8_t> text = session.input(handle, args);
  const uint32_t options = args.has("strict") ? NLSSM_NUMBER_STRICT_TAIL : 0;
  NamedLocale locale(session, args);
  int32_t consumed = 0;
  int64_t status = 0;
  if (as_double(args)) {
    double value = 0;
    status = call<ToDoubleFn>(handle, handle->NLSStringToDouble, locale.object,
                              static_cast<const void *>(text.data()), std::ssize(text), int64_t{0},
                              options, &value, &consumed);
    char shortest[32];
    *std::to_chars(shortest, shortest + 31, value).ptr = '\0';
    std::cout << "value    " << shortest << '\n';
  } else {
    int64_t value = 0;
    status = call<ToIntmaxFn>(handle, handle->NLSStringToIntmax, locale.object,
                              static_cast<const void *>(text.data()), std::ssize(text), options,
                              &value, &consumed);
    std::cout << "value    " << value << '\n';
  }
  std::cout << "consumed " << consumed << " of " << text.size() << " bytes\n";
  check(status, "parsing");
  return 0;
}

int format(Session &session, const Arguments &args) {
  if (args.words.size() != 2) throw Failure("format takes an encoding and a value");
  const NLSSMHandle *handle = session.handle(args.words[0]);
  const std::string &number = args.words[1];
  const int64_t width = number_option(args, "width", 0);
  const int64_t capacity = number_option(args, "capacity", 152);
  const uint32_t flags = format_flags(args);
  NamedLocale locale(session, args);
  uint8_t out[160];
  int32_t written = 0;
  int64_t status = 0;
  if (as_double(args)) {
    double value = 0;
    const auto [end, error] = std::from_chars(number.data(), number.data() + number.size(), value);
    if (error != std::errc() || end != number.data() + number.size())
      throw Failure(number + " is not a double");
    const int64_t decimals = args.option("decimals", "shortest") == "shortest"
                                 ? NLSHOST_DECIMALS_SHORTEST
                                 : number_option(args, "decimals", 0);
    status = call<FromDoubleFn>(handle, handle->NLSStringFromDouble, locale.object, value, width,
                                decimals, flags, static_cast<void *>(out), capacity, &written);
  } else {
    int64_t value = 0;
    const auto [end, error] = std::from_chars(number.data(), number.data() + number.size(), value);
    if (error != std::errc() || end != number.data() + number.size())
      throw Failure(number + " is not a 64-bit integer");
    status = call<FromIntmaxFn>(handle, handle->NLSStringFromIntmax, locale.object, value, width,
                                flags, static_cast<void *>(out), capacity, &written);
  }
  const auto n = static_cast<size_t>(std::clamp<int32_t>(written, 0, sizeof out));
  session.print_text(handle, std::vector<uint8_t>(out, out + n), Session::output_form(args));
  check(status, "formatting");
  return 0;
}

const RegisterVerb kParse{{"parse", "ENCODING [--as integer|double] [--strict 1] [--locale NAME]",
                           "the number at the start of the text (NLSStringToIntmax/ToDouble), "
                           "with the bytes consumed",
                           parse}};
const RegisterVerb kFormat{
    {"format",
     "ENCODING VALUE [--as integer|double] [--width N] [--decimals N|shortest] "
     "[--flags grouping,scientific,sign,left] [--capacity BYTES] [--locale NAME]",
     "VALUE written in the encoding (NLSStringFromIntmax/FromDouble)", format}};

}  // namespace
}  // namespace nlsstr
