// The tidewater command: the library's main jobs on lines of text and on files.

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <iostream>
#include <sstream>

#include "commands.hpp"
#include "stream.hpp"
#include "tidewater/version.h"

namespace {

using namespace tidewater::command;

// How many letters must be put in, left out, changed or swapped to make one word of another.
std::size_t letters_apart(const std::string& a, const std::string& b) {
  std::vector<std::vector<std::size_t>> cost(a.size() + 1, std::vector<std::size_t>(b.size() + 1));
  for (std::size_t i = 0; i <= a.size(); ++i) {
    for (std::size_t j = 0; j <= b.size(); ++j) {
      if (i == 0 || j == 0) {
        cost[i][j] = i + j;
        continue;
      }
      cost[i][j] = std::min({cost[i - 1][j] + 1, cost[i][j - 1] + 1,
                             cost[i - 1][j - 1] + (a[i - 1] == b[j - 1] ? 0 : 1)});
      const bool swapped = i > 1 && j > 1 && a[i - 1] == b[j - 2] && a[i - 2] == b[j - 1];
      if (swapped) cost[i][j] = std::min(cost[i][j], cost[i - 2][j - 2] + 1);
    }
  }
  return cost[a.size()][b.size()];
}

// The word among those known that is nearest to a mistyped one; empty where none is near.
std::string nearest(const std::string& word, const std::vector<std::string>& known) {
  std::string best;
  std::size_t least = std::max<std::size_t>(2, word.size() / 3) + 1;
  for (const std::string& name : known) {
    const std::size_t apart =
        name.starts_with(word) && word.size() > 2 ? 1 : letters_apart(word, name);
    if (apart < least) {
      least = apart;
      best = name;
    }
  }
  return best;
}

// What could have been meant by the arguments that no option or subcommand took.
std::string suggestion(CLI::App& app, int argc, char** argv) {
  CLI::App* at = &app;
  const auto all = [](const CLI::App*) { return true; };
  for (int i = 1; i < argc; ++i) {
    const std::string word = std::string(argv[i]).substr(0, std::string(argv[i]).find('='));
    const auto subs = at->get_subcommands(all);
    std::vector<std::string> known;
    if (word.starts_with("--")) {
      for (const CLI::Option* option : at->get_options()) {
        for (const std::string& name : option->get_lnames()) known.push_back("--" + name);
      }
    } else if (!word.starts_with("-") && !subs.empty()) {
      for (const CLI::App* sub : subs) {
        if (!sub->get_group().empty()) known.push_back(sub->get_name());
      }
    } else {
      continue;
    }
    if (std::find(known.begin(), known.end(), word) != known.end()) {
      if (!word.starts_with("--")) at = at->get_subcommand(word);
      continue;
    }
    const std::string near = nearest(word, known);
    if (!near.empty()) return "\"" + word + "\" is not known; did you mean \"" + near + "\"?";
    if (!word.starts_with("--")) return "\"" + word + "\" is no command.";
    return "\"" + word + "\" is not known.";
  }
  return {};
}

int run(int argc, char** argv) {
  CLI::App app{"Cartographic and geodetic computation on lines of text and on files."};
  app.name("tidewater");
  app.set_version_flag("--version", TIDEWATER_VERSION);
  app.require_subcommand(1);
  int exit_status = 0;
  add_convert(app, exit_status);
  add_line(app, exit_status);
  add_magnetic(app, exit_status);
  add_factors(app, exit_status);
  add_geoid(app, exit_status);
  add_systems(app, exit_status);
  add_doctor(app, exit_status);
  add_documents(app, exit_status);
  try {
    app.parse(argc, argv);
  } catch (const CLI::ParseError& error) {
    std::ostringstream out, err;
    const bool fine = app.exit(error, out, err) == 0;
    write_out(out.str());
    flush_out();
    if (!fine) {
      const std::string near = suggestion(app, argc, argv);
      if (!near.empty()) std::fprintf(stderr, "tidewater: %s\n", near.c_str());
    }
    std::fputs(err.str().c_str(), stderr);
    return fine ? 0 : kUsageError;
  }
  return exit_status;
}

}  // namespace

int main(int argc, char** argv) {
  // Numbers have the full stop everywhere: the command is used in scripts.
  setenv("LC_ALL", "C", 1);
  try {
    return run(argc, argv);
  } catch (const std::exception& error) {
    std::fprintf(stderr, "tidewater: %s\n", error.what());
  } catch (...) {
    std::fprintf(stderr, "tidewater: unknown failure\n");
  }
  return tidewater::command::kUsageError;
}
