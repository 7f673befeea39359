// The tidewater command: the library's main jobs on lines of text.

#include <cstdio>
#include <cstdlib>
#include <exception>

#include "commands.hpp"

namespace {

int run(int argc, char** argv) {
  CLI::App app{"Cartographic and geodetic computation on lines of text."};
  app.name("tidewater");
  app.set_version_flag("--version", TIDEWATER_VERSION);
  app.require_subcommand(1);
  int exit_status = 0;
  tidewater::command::add_convert(app, exit_status);
  //LATER

  try {
    app.parse(argc, argv);
  } catch (const CLI::ParseError& error) {
    return app.exit(error) == 0 ? 0 : tidewater::command::kUsageError;
  }
  return exit_status;
}

}  // namespace

int main(int argc, char** argv) {
  // The library's text functions follow the user's locale; a command that is used in scripts reads
  // and writes the full stop everywhere.
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
