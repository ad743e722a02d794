// nlsstr VERB [ARGUMENTS] [--text UTF8 | --hex HEX | --file PATH] [--out utf8|hex|raw]
#include <iostream>

#include "verbs.hpp"

namespace {

void usage(std::ostream &out) {
  out << "usage: nlsstr VERB [ARGUMENTS] [OPTIONS]\n\n"
         "Text comes from --text (UTF-8, converted into the encoding), --hex, --file,\n"
         "or standard input (bytes as they are); text results print as --out utf8\n"
         "(default), hex or raw. Encodings are given by number or name.\n\nverbs:\n";
  for (const nlsstr::Verb &verb : nlsstr::verbs())
    out << "  " << verb.name << ' ' << verb.usage << "\n      " << verb.summary << '\n';
}

nlsstr::Arguments parse(int argc, char **argv) {
  nlsstr::Arguments args;
  for (int i = 2; i < argc; ++i) {
    const std::string word = argv[i];
    if (word.rfind("--", 0) == 0) {
      if (i + 1 >= argc) throw nlsstr::Failure(word + " needs a value");
      args.options[word.substr(2)] = argv[++i];
    } else {
      args.words.push_back(word);
    }
  }
  return args;
}

}  // namespace

int main(int argc, char **argv) {
  if (argc < 2 || std::string(argv[1]) == "--help" || std::string(argv[1]) == "help") {
    usage(argc < 2 ? std::cerr : std::cout);
    return argc < 2 ? 2 : 0;
  }
  const std::string name = argv[1];
  for (const nlsstr::Verb &verb : nlsstr::verbs()) {
    if (verb.name != name) continue;
    try {
      nlsstr::Session session;
      return verb.run(session, parse(argc, argv));
    } catch (const nlsstr::Failure &failure) {
      std::cerr << "nlsstr " << name << ": " << failure.what();
      if (failure.status != 0) {
        const std::string status = nlsstr::status_name(failure.status);
        std::cerr << ": " << (status.empty() ? "status" : status) << " (0x" << std::hex
                  << failure.status << std::dec << ')';
      }
      std::cerr << '\n';
      return 1;
    }
  }
  std::cerr << "nlsstr: unknown verb '" << name << "'\n";
  usage(std::cerr);
  return 2;
}
