// tidewater systems, factors, geoid and doctor: what there is, and how maps distort.

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <memory>
#include <nlohmann/json.hpp>
#include <stdexcept>
#include <string>
#include <vector>

#include "chain.hpp"
#include "commands.hpp"
#include "options.hpp"
#include "stream.hpp"
#include "tidewater/magnetic_model.hpp"
#include "tidewater/systems.h"
#include "tidewater/version.h"

namespace tidewater::command {

namespace {

using Json = nlohmann::ordered_json;

const char* kind_name(SystemKind kind) {
  switch (kind) {
    case SystemKind::geographic2d:
      return "geographic";
    case SystemKind::geographic3d:
      return "geographic 3D";
    case SystemKind::geocentric:
      return "geocentric";
    case SystemKind::projected:
      return "projected";
    case SystemKind::vertical:
      return "vertical";
    case SystemKind::compound:
      return "compound";
  }
  return "";
}

std::string joined(const std::vector<std::string>& words) {
  std::string text;
  for (const std::string& word : words) text += (text.empty() ? "" : " ") + word;
  return text;
}

void write_json(const Json& json) { write_out(json.dump(2) + "\n"); }

// --- systems -----------------------------------------------------------------------------------

struct Listing {
  std::vector<std::string> words;
  std::string kind;
  std::string to;
  std::string form;
  std::size_t limit = 0;
  bool json = false;
};

int write_found(const Listing& listing, const std::vector<FoundSystem>& found) {
  Json list = Json::array();
  std::string text;
  for (const FoundSystem& system : found) {
    const std::string kind = kind_name(system.kind);
    if (!listing.kind.empty() && kind.rfind(listing.kind, 0) != 0) continue;
    if (listing.json) {
      list.push_back(
          {{"code", "EPSG:" + std::to_string(system.code)}, {"kind", kind}, {"name", system.name}});
    } else {
      text += "EPSG:" + std::to_string(system.code) + "\t" + kind + "\t" + system.name + "\n";
    }
  }
  if (listing.json) {
    write_json(list);
  } else {
    write_out(text);
  }
  flush_out();
  return text.empty() && list.empty() ? kSomeRefused : 0;
}

int search_systems(const Listing& listing) {
  const std::string words = joined(listing.words);
  const auto found = System::search(words, listing.limit == 0 ? 50 : listing.limit);
  if (found.empty()) std::fprintf(stderr, "no system has \"%s\" in its name\n", words.c_str());
  return write_found(listing, found);
}

void write_list(const Listing& listing, const std::vector<std::string>& names) {
  if (listing.json) return write_json(names);
  std::string text;
  for (const std::string& name : names) text += name + "\n";
  write_out(text);
}

int list_systems(const Listing& listing) {
  const std::string what = listing.words.empty() ? "systems" : listing.words.front();
  if (what == "methods") {
    write_list(listing, Projection::methods());
  } else if (what == "models") {
    write_list(listing, MagneticModel::models());
  } else if (what == "zones") {
    return write_found(listing, System::search("UTM zone", 100000));
  } else if (what == "ellipsoids") {
    // Those of the systems in use.
    write_list(listing, Ellipsoid::names());
  } else if (what == "systems") {
    return write_found(listing, System::all());
  } else {
    throw std::invalid_argument("there is no list of \"" + what +
                                "\"; there are systems, zones, ellipsoids, methods and models");
  }
  flush_out();
  return 0;
}

Json area_json(const Area& area) {
  return {{"name", area.name},
          {"west", area.west},
          {"south", area.south},
          {"east", area.east},
          {"north", area.north}};
}

std::string metres(double accuracy) {
  if (!std::isfinite(accuracy)) return "unknown";
  char text[kNumberRoom];
  return std::string(text, std::to_chars(text, text + 40, accuracy).ptr) + " m";
}

int show_system(const Listing& listing) {
  const System system(joined(listing.words));
  if (!listing.form.empty()) {
    write_out((listing.form == "proj" ? system.to_proj() : system.to_wkt(listing.form)) + "\n");
    flush_out();
    return 0;
  }
  std::vector<Candidate> ways;
  if (!listing.to.empty()) ways = Transformation::candidates(system, System(listing.to));
  if (listing.json) {
    Json json = {{"name", system.name()}, {"kind", kind_name(system.kind())}};
    if (system.code() != 0) json["code"] = "EPSG:" + std::to_string(system.code());
    json["datum"] = system.datum();
    if (!system.method().empty()) {
      json["method"] = system.method();
      for (const auto& [name, value] : system.parameters()) json["parameters"][name] = value;
    }
    json["unit"] = system.unit();
    json["axes"] = system.axes();
    if (!system.area().name.empty()) json["area"] = area_json(system.area());
    if (!listing.to.empty()) {
      json["operations"] = Json::array();
      for (const Candidate& way : ways) {
        Json one = {{"operation", way.steps}, {"name", way.name}};
        one["accuracy"] = std::isfinite(way.accuracy) ? Json(way.accuracy) : Json(nullptr);
        one["area"] = area_json(way.area);
        if (!way.missing.empty()) one["missing"] = way.missing;
        json["operations"].push_back(one);
      }
    }
    write_json(json);
  } else {
    std::string text = system.describe();
    if (!listing.to.empty()) {
      const System target(listing.to);
      text += "operations to " + target.name() + ", best first:\n";
      if (ways.empty()) text += "  none: the datum is the same, or no way is known\n";
      for (const Candidate& way : ways) {
        text += "  " + (way.steps.empty() ? std::string("-") : way.steps) + "  " +
                metres(way.accuracy) + "  " + way.name;
        if (!way.area.name.empty()) text += "; " + way.area.name;
        if (!way.missing.empty()) text += " (missing: " + way.missing + ")";
        text += "\n";
      }
    }
    write_out(text);
  }
  flush_out();
  return 0;
}

// --- factors -----------------------------------------------------------------------------------

struct FactorOptions {
  std::vector<std::string> files;
  std::string system;
  AngleStyle in;
  bool json = false;
};

class FactorJob : public Job {
 public:
  explicit FactorJob(const FactorOptions& options)
      : system_(options.system),
        map_(system_.projection() ? *system_.projection() : refused()),
        reader_(Kind::angles, options.in, Heights::never),
        json_(options.json) {}

  std::string prepare(const std::string&, std::string_view) override {
    const bool first = !std::exchange(started_, true);
    return first && !json_ ? "#  meridian   parallel       area convergence angular\n" : "";
  }
  std::unique_ptr<Worker> worker() const override;
  std::string summary(const Counts& counts) const override {
    return std::to_string(counts.done) + " computed, " + std::to_string(counts.refused) +
           " refused";
  }

 private:
  friend class FactorWorker;
  Projection refused() const {
    throw std::invalid_argument(system_.name() + " is no map: it has no projection");
  }
  System system_;
  Projection map_;
  PositionReader reader_;
  bool json_;
  bool started_ = false;
};

class FactorWorker : public Worker {
 public:
  explicit FactorWorker(const FactorJob& job) : job_(job) {}

  void process(const Chunk& chunk, Result& result) override {
    std::string_view text = chunk.text;
    std::int64_t number = 0;
    while (!text.empty()) {
      const std::size_t newline = std::min(text.find('\n'), text.size());
      std::string_view line = text.substr(0, newline);
      text.remove_prefix(std::min(newline + 1, text.size()));
      if (!line.empty() && line.back() == '\r') line.remove_suffix(1);
      take(line, number++, result);
    }
    result.lines(number);
  }

 private:
  void take(std::string_view line, std::int64_t number, Result& result) {
    Buffer& out = result.out;
    if (!is_data(line)) {
      if (!job_.json_) {
        out.add(line);
        out.add('\n');
      }
      return;
    }
    TakenPosition position;
    job_.reader_.take(line, position);
    TWstatus status = position.status;
    if (status == TW_SUCCESS && !(std::fabs(position.y) <= 90)) status = TW_BAD_LATITUDE;
    if (status == TW_SUCCESS && !(std::fabs(position.x) <= 360)) status = TW_BAD_LONGITUDE;
    // Longitudes of a projection are from its own prime meridian.
    const double lon = position.x - job_.system_.meridian().longitude();
    Factors f = {};
    if (status == TW_SUCCESS) {
      f = job_.map_.factors(Point{lon, position.y, 0});
      const bool finite =
          std::isfinite(f.meridional) && std::isfinite(f.parallel) && std::isfinite(f.convergence);
      if (!finite) status = TW_RANGE_ERROR;
    }
    if (status != TW_SUCCESS) {
      result.complain(number, line, status == position.status ? position.reason : "", status);
      if (!job_.json_) {
        out.add("* * * * *");
        out.add(line.substr(position.rest));
        out.add('\n');
      }
      return;
    }
    if (job_.json_) {
      const Json json = {{"longitude", position.x},    {"latitude", position.y},
                         {"meridional", f.meridional}, {"parallel", f.parallel},
                         {"areal", f.areal},           {"convergence", f.convergence},
                         {"angular", f.angular}};
      out.add(json.dump());
    } else {
      out.add_fixed(f.meridional, 8);
      out.add(' ');
      out.add_fixed(f.parallel, 8);
      out.add(' ');
      out.add_fixed(f.areal, 8);
      out.add(' ');
      out.add_fixed(f.convergence, 6);
      out.add(' ');
      out.add_fixed(f.angular, 6);
      out.add(line.substr(position.rest));
    }
    out.add('\n');
    result.done();
  }

  const FactorJob& job_;
};

std::unique_ptr<Worker> FactorJob::worker() const { return std::make_unique<FactorWorker>(*this); }

// --- geoid -------------------------------------------------------------------------------------

struct GeoidOptions {
  std::string grid;
  std::vector<std::string> position;
  std::vector<std::string> files;
  AngleStyle in;
  int precision = 3;
};

class GeoidJob : public Job {
 public:
  explicit GeoidJob(const GeoidOptions& options)
      : grid_(options.grid),
        reader_(Kind::angles, options.in, Heights::never),
        decimals_(options.precision) {}
  std::unique_ptr<Worker> worker() const override;
  std::string summary(const Counts& counts) const override {
    return std::to_string(counts.done) + " computed, " + std::to_string(counts.outside) +
           " outside the grid, " + std::to_string(counts.refused) + " refused";
  }

 private:
  friend class GeoidWorker;
  tidewater::GeoidGrid grid_;
  PositionReader reader_;
  int decimals_;
};

class GeoidWorker : public Worker {
 public:
  explicit GeoidWorker(const GeoidJob& job) : job_(job) {}

  void process(const Chunk& chunk, Result& result) override {
    std::string_view text = chunk.text;
    std::int64_t number = 0;
    while (!text.empty()) {
      const std::size_t newline = std::min(text.find('\n'), text.size());
      std::string_view line = text.substr(0, newline);
      text.remove_prefix(std::min(newline + 1, text.size()));
      if (!line.empty() && line.back() == '\r') line.remove_suffix(1);
      if (is_data(line)) {
        TakenPosition position;
        job_.reader_.take(line, position);
        TWstatus status = position.status;
        if (status == TW_SUCCESS && !(std::fabs(position.y) <= 90)) status = TW_BAD_LATITUDE;
        double n = 0;
        if (status == TW_SUCCESS) {
          n = job_.grid_.undulation(position.x, position.y);
          if (!std::isfinite(n)) status = TW_I_OUTSIDE_GEOID;
        }
        if (status == TW_SUCCESS) {
          result.out.add_fixed(n, job_.decimals_);
          result.done();
        } else {
          result.complain(number, line, status == position.status ? position.reason : "", status);
          result.out.add('*');
        }
        result.out.add(line.substr(position.rest));
      } else {
        result.out.add(line);
      }
      result.out.add('\n');
      ++number;
    }
    result.lines(number);
  }

 private:
  const GeoidJob& job_;
};

std::unique_ptr<Worker> GeoidJob::worker() const { return std::make_unique<GeoidWorker>(*this); }

// --- doctor ------------------------------------------------------------------------------------

std::string processor_level() {
#if defined(__x86_64__) && defined(__GNUC__)
  __builtin_cpu_init();
  if (__builtin_cpu_supports("avx512f") && __builtin_cpu_supports("avx512dq")) return "AVX-512";
  if (__builtin_cpu_supports("avx2") && __builtin_cpu_supports("fma")) return "AVX2";
  return "SSE2";
#elif defined(__aarch64__)
  return "NEON";
#else
  return "portable";
#endif
}

int doctor(bool as_json) {
  namespace fs = std::filesystem;
  Json json = {{"version", TIDEWATER_VERSION}, {"library", tw_version()}};
  json["processor"] = processor_level();
  const char* store = std::getenv("TIDEWATER_STORE");
  json["store"] = store ? store : "beside the library";
  bool well = true;
  try {
    json["systems"] = System::all().size();
    json["magnetic models"] = MagneticModel::models();
  } catch (const Error& error) {
    well = false;
    json["problem"] = error.what();
  }
  Json grids = Json::array();
  // Where the systems layer looks for the registry's grids.
  for (const char* folder : {"/usr/local/share/proj", "/usr/share/proj"}) {
    std::error_code error;
    for (const auto& entry : fs::directory_iterator(folder, error)) {
      const std::string ending = entry.path().extension().string();
      if (ending == ".gsb" || ending == ".las" || ending == ".gtx" || ending == ".tif") {
        grids.push_back(entry.path().string());
      }
    }
  }
  std::sort(grids.begin(), grids.end());
  json["grids"] = grids;
  if (as_json) {
    write_json(json);
  } else {
    std::string text;
    for (const auto& [key, value] : json.items()) {
      if (value.is_array()) {
        text += key + ": " + (value.empty() ? "none" : std::to_string(value.size())) + "\n";
        for (const auto& one : value) text += "  " + one.get<std::string>() + "\n";
      } else {
        text += key + ": " + (value.is_string() ? value.get<std::string>() : value.dump()) + "\n";
      }
    }
    write_out(text);
  }
  flush_out();
  return well ? 0 : kSomeRefused;
}

}  // namespace

void add_systems(CLI::App& app, int& exit_status) {
  auto listing = std::make_shared<Listing>();
  CLI::App* command = app.add_subcommand("systems", "Finds and shows coordinate systems.");
  command->require_subcommand(1);
  const auto add = [&](const char* name, const char* help) {
    CLI::App* sub = command->add_subcommand(name, help);
    sub->add_flag("--json", listing->json, "for programs");
    return sub;
  };
  CLI::App* list = add("list", "Lists systems, or zones, ellipsoids, methods, models.");
  list->add_option("what", listing->words, "systems, zones, ellipsoids, methods or models");
  list->add_option("--kind", listing->kind,
                   "only these: geographic, geocentric, projected, vertical, compound");
  list->callback([listing, &exit_status] { exit_status = list_systems(*listing); });
  CLI::App* search = add("search", "Finds systems by words of their names, best first.");
  search->add_option("words", listing->words, "words, without regard to case and accents")
      ->required();
  search->add_option("--kind", listing->kind,
                     "only these: geographic, geocentric, projected, vertical, compound");
  search->add_option("--limit", listing->limit, "how many at most (50)");
  search->callback([listing, &exit_status] { exit_status = search_systems(*listing); });
  CLI::App* show = add("show", "Shows a system: datum, parameters, area, operations.");
  show->add_option("system", listing->words, "a code, a name or a definition")->required();
  show->add_option("--to", listing->to, "also the operations to this system's datum");
  show->add_option("--as", listing->form, "as another text")
      ->check(CLI::IsMember({"proj", "wkt1", "wkt2", "esri"}));
  show->callback([listing, &exit_status] { exit_status = show_system(*listing); });
}

void add_factors(CLI::App& app, int& exit_status) {
  auto options = std::make_shared<FactorOptions>();
  CLI::App* command = app.add_subcommand(
      "factors",
      "Computes how a map distorts at positions.\n"
      "A line begins with latitude and longitude; written are the scale along the meridian and the "
      "parallel, the scale of areas, the convergence (grid north from true north, clockwise) and "
      "the largest angular distortion, in degrees.");
  command->add_option("files", options->files, "files to read; - or none: standard input");
  command->add_option("--system", options->system, "the map's coordinate system")->required();
  command->add_flag("--json", options->json, "an object a line, for programs");
  add_angle_options(*command, options->in, "", "Input");
  command->callback([options, &exit_status] {
    options->in.check();
    FactorJob job(*options);
    exit_status = run_stream(job, options->files);
  });
}

void add_geoid(CLI::App& app, int& exit_status) {
  auto options = std::make_shared<GeoidOptions>();
  CLI::App* command = app.add_subcommand(
      "geoid",
      "Gives the height of the geoid above the ellipsoid.\n"
      "A line begins with latitude and longitude; written is the undulation in metres, and the "
      "rest of the line.");
  command->add_option("grid", options->grid, "grid: FILE.gtx, .geo or .tif")->required();
  CLI::Option* position = command->add_option("position", options->position,
                                              "a single position; without one, files are read");
  command->add_option("-f,--file", options->files, "file to read, may be given again")
      ->allow_extra_args(false)
      ->excludes(position);
  add_angle_options(*command, options->in, "", "Input");
  add_precision(*command, options->precision, "decimals of metres (3)");
  command->callback([options, &exit_status] {
    options->in.check();
    GeoidJob job(*options);
    exit_status = options->position.empty() ? run_stream(job, options->files)
                                            : run_line(job, joined(options->position));
  });
}

void add_doctor(CLI::App& app, int& exit_status) {
  auto as_json = std::make_shared<bool>(false);
  CLI::App* command =
      app.add_subcommand("doctor", "Says which version, store, grids and processor are at work.");
  command->add_flag("--json", *as_json, "for programs");
  command->callback([as_json, &exit_status] { exit_status = doctor(*as_json); });
}

}  // namespace tidewater::command
