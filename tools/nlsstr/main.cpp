// nlsstr VERB [ARGUMENTS] [--text UTF8 | --hex HEX | --file PATH] [--records N | --lines]
//        [--out utf8|hex|raw|both]
// The command line is parsed by CLI11: one subcommand per registered verb,
// its options taken from the --names its usage line shows.
#include <CLI/CLI.hpp>

#include <iostream>
#include <regex>

#include "verbs.hpp"

namespace {

using nlsstr::Arguments;
using nlsstr::Failure;
using nlsstr::Verb;

const char kExitCodes[] =
    "Exit codes: 0 done; 1 an operation returned a failing status (printed by name)\n"
    "or the answer is no (like, is); 2 the command line is wrong; 3 the input\n"
    "cannot be read, or is longer than 64 MiB for a verb that needs it whole.";

const char kInput[] =
    "Text comes from --text (UTF-8, converted into the encoding), --hex, --file or\n"
    "standard input (bytes as they are). --file and standard input are read in\n"
    "constant memory: --records N takes fixed-length records of N bytes, --lines\n"
    "texts ended by the encoding's newline, and the verb runs once per record;\n"
    "neither cuts a character. Encodings are given by number or name.";

// The --name options a usage line shows, with the name of each one's value.
std::vector<std::pair<std::string, std::string>> usage_options(const std::string &usage) {
  static const std::regex option(R"(--([a-z][a-z0-9-]*)(?: ([^\s\]]+))?)");
  std::vector<std::pair<std::string, std::string>> found;
  for (std::sregex_iterator it(usage.begin(), usage.end(), option), end; it != end; ++it)
    found.emplace_back((*it)[1].str(), (*it)[2].matched ? (*it)[2].str() : "VALUE");
  return found;
}

// The positional part of a usage line: what comes before its first option.
std::string usage_words(const std::string &usage) {
  std::string words = usage.substr(0, std::min(usage.find('['), usage.find("--")));
  while (!words.empty() && words.back() == ' ') words.pop_back();
  return words;
}

void add_verb(CLI::App &app, const Verb &verb, Arguments &args) {
  CLI::App *sub = app.add_subcommand(verb.name, verb.summary);
  sub->footer(std::string("usage: nlsstr ") + verb.name + (verb.usage.empty() ? "" : " ") +
              verb.usage + "\n\n" + (verb.usage.empty() ? "" : std::string(kInput) + "\n\n") +
              kExitCodes);
  auto store = [&args](const std::string &name) {
    return [&args, name](const std::string &value) { args.options[name] = value; };
  };
  if (const std::string words = usage_words(verb.usage); !words.empty())
    sub->add_option("ARGUMENTS", args.words, words)->type_name("");
  for (const auto &[name, value] : usage_options(verb.usage))
    sub->add_option_function<std::string>("--" + name, store(name))->type_name(value);
  if (verb.usage.empty()) return;  // a verb without a text
  const char *group = "Input and output";
  sub->add_option_function<std::string>("--text", store("text"), "the text, in UTF-8")
      ->type_name("UTF8")
      ->group(group);
  sub->add_option_function<std::string>("--hex", store("hex"), "the text as hex bytes")
      ->type_name("HEX")
      ->group(group);
  sub->add_option_function<std::string>("--file", store("file"), "read the text from PATH")
      ->type_name("PATH")
      ->group(group);
  sub->add_option_function<std::string>("--records", store("records"),
                                        "take the input as fixed-length records of N bytes")
      ->type_name("N")
      ->group(group);
  sub->add_flag_callback(
         "--lines", [&args] { args.options["lines"] = "1"; },
         "take the input line by line (the encoding's newline)")
      ->group(group);
  sub->add_option_function<std::string>("--out", store("out"),
                                        "text results as utf8 (default), hex, raw, or both "
                                        "(hex, then UTF-8)")
      ->type_name("FORM")
      ->group(group);
}

void report(const std::string &verb, const Failure &failure, int64_t record = 0,
            int64_t records = 1) {
  std::cout.flush();
  std::cerr << "nlsstr " << verb << ": ";
  if (records > 1)
    std::cerr << "records " << record << '-' << record + records - 1 << ": ";
  else if (record > 0)
    std::cerr << "record " << record << ": ";
  std::cerr << failure.what();
  if (failure.status != 0) {
    const std::string status = nlsstr::status_name(failure.status);
    std::cerr << ": " << (status.empty() ? "status" : status) << " (0x" << std::hex
              << failure.status << std::dec << ')';
  }
  std::cerr << '\n';
}

// Runs a verb on every text of its input. A failing status on one record is
// reported with the record's number and the run goes on; any other failure
// ends it.
int run(const Verb &verb, const Arguments &args) {
  nlsstr::Session session;
  session.begin(args, verb.pieces);
  int worst = nlsstr::kExitOk;
  do {
    try {
      worst = std::max(worst, verb.run(session, args));
    } catch (const Failure &failure) {
      if (failure.status == 0 || session.record() == 0) throw;
      report(verb.name, failure, session.record(), session.records());
      worst = std::max(worst, failure.exit_code);
    }
  } while (session.more());
  session.finish();
  std::cout.flush();
  return worst;
}

}  // namespace

int main(int argc, char **argv) {
  std::ios::sync_with_stdio(false);
  CLI::App app(
      "nlsstr: the nlssm module's operations on text in any of its encodings, "
      "on the reference host.",
      "nlsstr");
  app.footer(std::string(kInput) + "\n\n" + kExitCodes);
  app.require_subcommand(1);
  Arguments args;
  for (const Verb &verb : nlsstr::verbs()) add_verb(app, verb, args);
  try {
    app.parse(argc, argv);
  } catch (const CLI::ParseError &error) {
    const int code = app.exit(error);
    return code == 0 ? nlsstr::kExitOk : nlsstr::kExitUsage;
  }
  const Verb *chosen = nullptr;
  for (const Verb &verb : nlsstr::verbs())
    if (app.got_subcommand(verb.name)) chosen = &verb;
  try {
    return run(*chosen, args);
  } catch (const Failure &failure) {
    report(chosen->name, failure);
    return failure.exit_code;
  } catch (const std::exception &error) {  // a number option that is not one
    report(chosen->name, Failure(error.what()), 0);
    return nlsstr::kExitUsage;
  }
}
