// Bytes as a file for the command, by many sets of its options: it comes back with exit status 0, 1
// or 2, and nothing is thrown past it.  The first byte chooses the set; where a set has a "%", the
// first line of the rest stands there.

#include <fcntl.h>
#include <unistd.h>

#include <CLI/CLI.hpp>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <sstream>
#include <string>
#include <string_view>
#include <vector>

#include "commands.hpp"

namespace {

namespace command = tidewater::command;

// FILE is the file of the bytes, GRID a small geoid grid.  Left out: "documents", which writes
// where it is told, and counts and spacings from the bytes, which ask for a long time and get it.
constexpr const char* kSets[] = {
    "convert FILE",
    "convert --from utm --to wgs84 FILE",
    "convert --from mgrs --to EPSG:2154 FILE",
    "convert --to mgrs --format dms FILE",
    "convert --to EPSG:2154 --format packed --hemisphere front FILE",
    "convert --to EPSG:4258 --format dm --hemisphere behind --out-format dms FILE",
    "convert --to EPSG:4258 --format grads --reverse both --decimal comma --order lon-lat FILE",
    "convert --from geocentric:wgs84 --to wgs84 FILE",
    "convert --height --to geocentric:wgs84 FILE",
    "convert --from EPSG:27700 --to EPSG:4277 --anywhere FILE",
    "convert --csv --to EPSG:3857 FILE",
    "convert --csv --in-place --to EPSG:2154 --separator ; FILE",
    "convert --csv --to utm --x lon --y lat --z h FILE",
    "convert --geojson --to EPSG:3857 FILE",
    "convert --geojson --from EPSG:2154 --to wgs84 FILE",
    "convert --to EPSG:4326 --geoid GRID --height FILE",
    "line FILE",
    "line --direct FILE",
    "line --rhumb --format dms FILE",
    "line --area FILE",
    "line --points 3 --as geojson FILE",
    "line --direct --points 4 --as csv FILE",
    "line --csv FILE",
    "line --csv --direct --separator tab FILE",
    "magnetic --date 2026.5 -f FILE",
    "magnetic --csv --date-column date -f FILE",
    "factors --system EPSG:2154 FILE",
    "factors --system EPSG:3035 --json FILE",
    "geoid GRID -f FILE",
    "convert --from % --to wgs84 FILE",
    "convert --to % FILE",
    "convert --from utm --to utm --zone % FILE",
    "convert --to geodetic --shift % --from-ellipsoid intl FILE",
    "convert --to EPSG:2154 -e % FILE",
    "convert --from EPSG:4277 --to EPSG:4326 --operation % FILE",
    "convert --csv --to EPSG:2154 --x % --y lat FILE",
    "convert --csv --to EPSG:2154 --separator % FILE",
    "line -e % FILE",
    "magnetic --date % -f FILE",
    "magnetic --model % --date 2020 -f FILE",
    "magnetic --date 2026 -- %",
    "systems search %",
    "systems show -- %",
    "systems show --as wkt2 -- %",
};

const std::string& folder() {
  static const std::string path = [] {
    std::string name = (std::filesystem::temp_directory_path() / "tidewater-fuzz-XXXXXX").string();
    if (!mkdtemp(name.data())) std::abort();
    // Seven rows of twelve nodes, all zero: the grid is not what is tried here.
    const unsigned char head[] = {0xC0, 0x56, 0x80, 0,    0, 0, 0, 0, 0xC0, 0x66, 0x80, 0,    0, 0,
                                  0,    0,    0x40, 0x3E, 0, 0, 0, 0, 0,    0,    0x40, 0x3E, 0, 0,
                                  0,    0,    0,    0,    0, 0, 0, 7, 0,    0,    0,    12};
    std::ofstream grid(name + "/grid.gtx", std::ios::binary);
    grid.write(reinterpret_cast<const char*>(head), sizeof head);
    grid << std::string(7 * 12 * 4, '\0');
    return name + "/";
  }();
  return path;
}

int run(const std::vector<std::string>& arguments) {
  CLI::App app;
  app.require_subcommand(1);
  int exit_status = 0;
  command::add_convert(app, exit_status);
  command::add_line(app, exit_status);
  command::add_magnetic(app, exit_status);
  command::add_factors(app, exit_status);
  command::add_geoid(app, exit_status);
  command::add_systems(app, exit_status);
  try {
    app.parse(std::vector<std::string>(arguments.rbegin(), arguments.rend()));
  } catch (const CLI::ParseError& error) {
    std::ostringstream out, err;
    return app.exit(error, out, err) == 0 ? 0 : command::kUsageError;
  } catch (const std::exception& error) {  // as in the command's main
    if (error.what()[0] == '\0') std::abort();
    return command::kUsageError;
  }
  return exit_status;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  static std::FILE* const nowhere = std::freopen("/dev/null", "w", stdout);
  if (!nowhere) std::abort();
  if (size == 0) return 0;
  std::string_view rest(reinterpret_cast<const char*>(data + 1), size - 1);
  std::string given;
  std::vector<std::string> arguments;
  std::istringstream words(kSets[data[0] % std::size(kSets)]);
  for (std::string word; words >> word;) {
    if (word == "FILE") word = folder() + "input";
    if (word == "GRID") word = folder() + "grid.gtx";
    if (word == "%") {
      const std::size_t end = rest.find('\n');
      word = rest.substr(0, end);
      word = word.substr(0, word.find('\0'));  // no argument holds one
      rest = end == std::string_view::npos ? std::string_view() : rest.substr(end + 1);
    }
    arguments.push_back(word);
  }
  std::ofstream(folder() + "input", std::ios::binary) << rest;
  const int status = run(arguments);
  if (status < 0 || status > 2) std::abort();
  return 0;
}
