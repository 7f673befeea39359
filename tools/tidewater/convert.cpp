// tidewater convert: positions from any coordinate system to any other.

#include <cmath>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include "chain.hpp"
#include "commands.hpp"
#include "convert_job.hpp"
#include "csv.hpp"
#include "geojson.hpp"
#include "options.hpp"
#include "stream.hpp"

namespace tidewater::command {

namespace {

constexpr std::size_t kBatch = 1024;

// Coordinates as they are written, by the target's kind.
class Writer {
 public:
  Writer(const Chain& chain, const ConvertOptions& options)
      : kind_(chain.target().kind()), style_(options.out) {
    metres_ = options.precision >= 0 ? options.precision : 3;
    if (options.precision >= 0) style_.precision = options.precision;
    mgrs_digits_ = options.precision >= 0 ? std::min(options.precision, 11) : 5;
  }

  void write(Buffer& out, const Batch& batch, std::size_t i) const {
    switch (kind_) {
      case Kind::angles:
        append_position(out, batch.x[i], batch.y[i], style_);
        break;
      case Kind::military:
        out.add(format_mgrs(batch.x[i], batch.y[i], mgrs_digits_));
        break;
      default: {
        char* at = out.room(2 * kNumberRoom);
        at = format_fixed(at, batch.x[i], metres_);
        *at++ = ' ';
        out.used(format_fixed(at, batch.y[i], metres_));
      }
    }
    if (kind_ == Kind::space || batch.has_z[i]) {
      out.add(' ');
      out.add_fixed(batch.z[i], metres_);
    }
    if (kind_ == Kind::grid) {
      out.add(' ');
      out.add(zone(batch.zone[i]));
    }
  }

  // One coordinate, for a column.
  void write_first(Buffer& out, const Batch& batch, std::size_t i) const {
    write_one(out, batch, i, true);
  }
  void write_second(Buffer& out, const Batch& batch, std::size_t i) const {
    write_one(out, batch, i, false);
  }
  void write_height(Buffer& out, const Batch& batch, std::size_t i) const {
    out.add_fixed(batch.z[i], metres_);
  }
  static std::string zone(int zone) {
    return std::to_string(std::abs(zone)) + (zone < 0 ? 'S' : 'N');
  }

  std::string_view marks() const {
    return kind_ == Kind::space ? "* * *" : kind_ == Kind::military ? "*" : "* *";
  }
  Kind kind() const { return kind_; }

 private:
  void write_one(Buffer& out, const Batch& batch, std::size_t i, bool first) const {
    if (kind_ == Kind::military) return out.add(format_mgrs(batch.x[i], batch.y[i], mgrs_digits_));
    if (kind_ != Kind::angles) return out.add_fixed(first ? batch.x[i] : batch.y[i], metres_);
    const bool is_latitude = first == style_.lat_first();
    append_angle(out, is_latitude ? batch.y[i] : batch.x[i],
                 is_latitude ? Axis::latitude : Axis::longitude, style_);
  }

  Kind kind_;
  AngleStyle style_;
  int metres_;
  int mgrs_digits_;
};

// What can be said of a position that was refused beyond the status itself.
std::string hint(const Chain& chain, const AngleStyle& style, TWstatus status, double x, double y) {
  if (chain.source().kind() != Kind::angles) return {};
  const auto shown = [](double value) {
    char text[kNumberRoom];
    return std::string(text, std::to_chars(text, text + 40, value).ptr);
  };
  if (status == TW_BAD_LATITUDE && !(std::fabs(y) <= 90)) {
    std::string words = "latitude " + shown(y) + " out of range";
    if (std::fabs(x) <= 90 && std::fabs(y) <= 360) {
      words += std::string("; if the longitude stands first, say --order ") +
               (style.lat_first() ? "lon-lat" : "lat-lon");
    }
    return words;
  }
  if (status == TW_BAD_LONGITUDE) return "longitude " + shown(x) + " beyond 360 degrees";
  return {};
}

class LineWorker : public Worker {
 public:
  LineWorker(const Chain& chain, const PositionReader& reader, const Writer& writer)
      : chain_(chain), reader_(reader), writer_(writer), batch_(kBatch) {
    lines_.reserve(2 * kBatch);
  }

  void process(const Chunk& chunk, Result& result) override {
    const char* at = chunk.text.data();
    const char* const end = at + chunk.text.size();
    std::int64_t number = 0;
    lines_.clear();
    batch_.count = 0;
    while (at != end) {
      const auto* newline =
          static_cast<const char*>(std::memchr(at, '\n', static_cast<std::size_t>(end - at)));
      const char* stop = newline ? newline : end;
      const bool cut = chunk.cut && !newline;
      take({at, static_cast<std::size_t>(stop - at)}, number++, cut);
      at = newline ? newline + 1 : end;
      if (batch_.count == kBatch || lines_.size() >= 2 * kBatch) flush(result);
    }
    flush(result);
    result.lines(number);
  }

 private:
  struct Line {
    std::string_view text;
    std::size_t rest;
    std::int64_t number;
    int point;  // among the batch; -1 for what is no data
  };

  void take(std::string_view text, std::int64_t number, bool cut) {
    if (!text.empty() && text.back() == '\r') text.remove_suffix(1);
    if (!is_data(text)) {
      lines_.push_back({text, 0, number, -1});
      return;
    }
    const std::size_t i = batch_.count++;
    reader_.take(text, position_);
    batch_.x[i] = position_.x;
    batch_.y[i] = position_.y;
    batch_.z[i] = position_.z;
    batch_.has_z[i] = position_.has_z;
    batch_.zone[i] = position_.zone;
    batch_.status[i] = position_.status;
    batch_.reason[i] = nullptr;
    if (cut) {
      batch_.status[i] = TW_BAD_TEXT;
      batch_.reason[i] = "the line is longer than any line may be";
    } else if (position_.status != TW_SUCCESS) {
      reasons_.push_back(position_.reason);
      refused_.push_back(i);
    }
    if (batch_.status[i] != TW_SUCCESS) batch_.x[i] = batch_.y[i] = batch_.z[i] = 0;
    lines_.push_back({text, position_.rest, number, static_cast<int>(i)});
  }

  void flush(Result& result) {
    chain_.run(batch_);
    std::size_t next_refused = 0;
    for (const Line& line : lines_) {
      if (line.point < 0) {
        result.out.add(line.text);
        result.out.add('\n');
        continue;
      }
      const auto i = static_cast<std::size_t>(line.point);
      if (batch_.status[i] == TW_SUCCESS) {
        writer_.write(result.out, batch_, i);
        result.done();
      } else {
        result.out.add(writer_.marks());
        std::string reason;
        if (next_refused < refused_.size() && refused_[next_refused] == i) {
          reason = reasons_[next_refused++];
        } else if (batch_.reason[i]) {
          reason = batch_.reason[i];
        } else {
          TakenPosition position;
          reader_.take(line.text, position);
          reason = hint(chain_, reader_.style(), batch_.status[i], position.x, position.y);
        }
        result.complain(line.number, line.text, reason, batch_.status[i]);
      }
      result.out.add(line.text.substr(line.rest));
      result.out.add('\n');
    }
    lines_.clear();
    batch_.count = 0;
    reasons_.clear();
    refused_.clear();
  }

  const Chain& chain_;
  const PositionReader& reader_;
  const Writer& writer_;
  Batch batch_;
  TakenPosition position_;
  std::vector<Line> lines_;
  std::vector<std::string> reasons_;
  std::vector<std::size_t> refused_;  // points of the batch, ascending, to which they belong
};

// Where a table keeps what.
struct Columns {
  std::unique_ptr<Table> table;
  int x = -1, y = -1, z = -1, zone = -1;
  bool swapped = false;  // the first column of a reference is all there is
};

class TableWorker : public Worker {
 public:
  TableWorker(const Chain& chain, const PositionReader& reader, const Writer& writer,
              const Columns& columns, bool in_place)
      : chain_(chain),
        reader_(reader),
        writer_(writer),
        columns_(columns),
        in_place_(in_place),
        batch_(kBatch),
        records_(kBatch) {}

  void process(const Chunk& chunk, Result& result) override {
    std::string_view text = chunk.text;
    std::int64_t number = 0;
    Record head;
    if (chunk.first && head.take(text, columns_.table->separator)) number += head.lines();
    batch_.count = 0;
    while (!text.empty()) {
      Row& row = records_[batch_.count];
      row.number = number;
      row.record.take(text, columns_.table->separator);
      number += row.record.lines();
      if (row.record.whole().empty()) {
        flush(result);
        result.out.add(row.record.line_end());
        continue;
      }
      take(row);
      if (batch_.count == kBatch) flush(result);
    }
    flush(result);
    result.lines(number);
  }

 private:
  struct Row {
    Record record;
    std::int64_t number = 0;
    std::string reason;
  };

  void take(Row& row) {
    const std::size_t i = batch_.count++;
    batch_.x[i] = batch_.y[i] = batch_.z[i] = 0;
    batch_.has_z[i] = 0;
    batch_.status[i] = TW_SUCCESS;
    batch_.reason[i] = nullptr;
    row.reason.clear();
    const Record& record = row.record;
    const auto size = static_cast<int>(record.size());
    bool ok = true;
    if (columns_.x >= size || columns_.y >= size || columns_.z >= size || columns_.zone >= size) {
      row.reason = "the row has " + std::to_string(size) + " fields of " +
                   std::to_string(columns_.table->names.size());
      ok = false;
    } else if (reader_.kind() == Kind::military) {
      TakenPosition position;
      reader_.take(record.value(static_cast<std::size_t>(columns_.x)), position);
      ok = position.status == TW_SUCCESS;
      row.reason = position.reason;
      batch_.x[i] = position.x;
      batch_.y[i] = position.y;
    } else {
      ok = field(record, columns_.x, false, batch_.x[i], row.reason) &&
           field(record, columns_.y, true, batch_.y[i], row.reason);
      if (ok && columns_.z >= 0) {
        const std::string text = record.value(static_cast<std::size_t>(columns_.z));
        if (!text.empty() || reader_.kind() == Kind::space) {
          std::string_view rest = text;
          ok = take_number(rest, batch_.z[i]) && rest.find_first_not_of(' ') == rest.npos;
          batch_.has_z[i] = ok;
          if (!ok) row.reason = "column " + name(columns_.z) + ": \"" + text + "\" is no number";
        }
      }
      if (ok && columns_.zone >= 0) {
        TakenPosition position;
        reader_.take("0 0 " + record.value(static_cast<std::size_t>(columns_.zone)), position);
        ok = position.status == TW_SUCCESS;
        row.reason = position.reason;
        batch_.zone[i] = position.zone;
      }
    }
    if (!ok) batch_.status[i] = TW_BAD_TEXT;
  }

  std::string name(int column) const {
    return columns_.table->names[static_cast<std::size_t>(column)];
  }

  bool field(const Record& record, int column, bool is_latitude, double& value,
             std::string& reason) const {
    const std::string_view text = record.field(static_cast<std::size_t>(column));
    const bool quoted = !text.empty() && text[0] == '"';
    const bool ok = quoted ? reader_.take_field(record.value(static_cast<std::size_t>(column)),
                                                is_latitude, value, reason)
                           : reader_.take_field(text, is_latitude, value, reason);
    if (!ok) reason = "column " + name(column) + ": " + reason;
    return ok;
  }

  void flush(Result& result) {
    chain_.run(batch_);
    for (std::size_t i = 0; i < batch_.count; ++i) {
      const Row& row = records_[i];
      const bool done = batch_.status[i] == TW_SUCCESS;
      write(result.out, row.record, i, done);
      result.out.add(row.record.line_end().empty() ? std::string_view("\n")
                                                   : row.record.line_end());
      if (done) {
        result.done();
      } else {
        std::string reason = row.reason;
        if (reason.empty() && batch_.reason[i]) reason = batch_.reason[i];
        if (reason.empty()) {
          double x = 0, y = 0;
          std::string none;
          field(row.record, columns_.x, false, x, none);
          field(row.record, columns_.y, true, y, none);
          reason = hint(chain_, reader_.style(), batch_.status[i], x, y);
        }
        result.complain(row.number, row.record.whole(), reason, batch_.status[i]);
      }
    }
    batch_.count = 0;
  }

  void write(Buffer& out, const Record& record, std::size_t i, bool done) {
    const char separator = columns_.table->separator;
    const bool heights = columns_.z >= 0 || writer_.kind() == Kind::space;
    const auto put = [&](auto writing) {
      if (!done) return out.add('*');
      field_.clear();
      writing();
      append_field(out, field_.text(), separator);
    };
    const auto first = [&] { writer_.write_first(field_, batch_, i); };
    const auto second = [&] { writer_.write_second(field_, batch_, i); };
    const auto height = [&] {
      if (batch_.has_z[i] || writer_.kind() == Kind::space) writer_.write_height(field_, batch_, i);
    };
    if (in_place_) {
      // The first of the two columns of the output takes the first coordinate's place: a latitude
      // goes where a latitude was.
      for (std::size_t c = 0; c < record.size(); ++c) {
        if (c > 0) out.add(separator);
        const int column = static_cast<int>(c);
        if (column == columns_.x) {
          put([&] { swaps() ? second() : first(); });
        } else if (column == columns_.y) {
          put([&] { swaps() ? first() : second(); });
        } else if (column == columns_.z && column >= 0) {
          put(height);
        } else {
          out.add(record.field(c));
        }
      }
      return;
    }
    out.add(record.whole());
    out.add(separator);
    put(first);
    if (writer_.kind() != Kind::military) {
      out.add(separator);
      put(second);
    }
    if (heights && writer_.kind() != Kind::military) {
      out.add(separator);
      put(height);
    }
    if (writer_.kind() == Kind::grid) {
      out.add(separator);
      out.add(done ? Writer::zone(batch_.zone[i]) : "*");
    }
  }

  // Columns are x and y, and latitudes are written first.
  bool swaps() const { return writer_.kind() == Kind::angles && columns_.swapped; }

  const Chain& chain_;
  const PositionReader& reader_;
  const Writer& writer_;
  const Columns& columns_;
  bool in_place_;
  Batch batch_;
  std::vector<Row> records_;
  Buffer field_;
};

class Conversion : public Job {
 public:
  explicit Conversion(const ConvertOptions& options)
      : options_(options),
        chain_(options.chain),
        reader_(chain_.source().kind(), options.in, Heights::never),
        writer_(chain_, options) {
    if (asked()) reader_.set_heights(Heights::where_there);
  }

  const Chain& chain() const { return chain_; }

  std::string prepare(const std::string& source, std::string_view first) override {
    if (!options_.csv) {
      if (!decided_ && !asked() && reader_.all_have_heights(first)) {
        reader_.set_heights(Heights::where_there);
      }
      decided_ = true;
      return {};
    }
    auto table = std::make_unique<Table>(first, separator_of(options_.separator));
    if (columns_.table) {
      if (table->names != columns_.table->names) {
        throw std::runtime_error(source + ": the columns are not those of the first table");
      }
      return {};
    }
    columns_.table = std::move(table);
    find_columns();
    return head(first);
  }

  std::unique_ptr<Worker> worker() const override {
    if (options_.csv) {
      return std::make_unique<TableWorker>(chain_, reader_, writer_, columns_, options_.in_place);
    }
    return std::make_unique<LineWorker>(chain_, reader_, writer_);
  }

  std::string summary(const Counts& counts) const override {
    return std::to_string(counts.done) + " converted, " + std::to_string(counts.outside) +
           " outside the grids, " + std::to_string(counts.refused) + " refused";
  }

 private:
  // Heights are asked for, by name or by what is done with them.
  bool asked() const { return options_.heights || chain_.uses_heights(); }

  void find_columns() {
    const Table& table = *columns_.table;
    const auto find = [&](const std::string& given, const char* option,
                          const std::vector<std::string_view>& usual, bool needed) {
      if (!given.empty()) return static_cast<int>(table.column(given));
      const int found = table.guess(usual);
      if (found < 0 && needed) {
        throw std::invalid_argument(std::string(option) + " must name a column; the table has " +
                                    table.all_names());
      }
      return found;
    };
    switch (chain_.source().kind()) {
      case Kind::military:
        columns_.x = columns_.y = find(options_.x, "--x", {"mgrs", "usng", "reference"}, true);
        break;
      case Kind::angles:
        columns_.x = find(options_.x, "--x",
                          {"longitude", "lon", "lng", "long", "x", "longitude_deg"}, true);
        columns_.y = find(options_.y, "--y", {"latitude", "lat", "y", "latitude_deg"}, true);
        break;
      default:
        columns_.x = find(options_.x, "--x", {"easting", "east", "e", "x"}, true);
        columns_.y = find(options_.y, "--y", {"northing", "north", "n", "y"}, true);
    }
    columns_.z = find(options_.z, "--z", {"height", "h", "z", "altitude", "elevation"},
                      chain_.source().kind() == Kind::space);
    if (chain_.source().by_zones()) columns_.zone = find("", "a column \"zone\"", {"zone"}, true);
    columns_.swapped = options_.out.lat_first();
  }

  // The names of what is written.
  std::string head(std::string_view first) const {
    const Table& table = *columns_.table;
    Record record;
    record.take(first, table.separator);
    std::string text(record.whole());
    if (!options_.in_place) {
      std::vector<std::string> names;
      switch (writer_.kind()) {
        case Kind::angles:
          names = options_.out.lat_first() ? std::vector<std::string>{"latitude", "longitude"}
                                           : std::vector<std::string>{"longitude", "latitude"};
          break;
        case Kind::military:
          names = {"mgrs"};
          break;
        case Kind::space:
          names = {"X", "Y"};
          break;
        default:
          names = {"easting", "northing"};
      }
      if (writer_.kind() == Kind::space) {
        names.emplace_back("Z");
      } else if (columns_.z >= 0 && writer_.kind() != Kind::military) {
        names.emplace_back("height");
      }
      if (writer_.kind() == Kind::grid) names.emplace_back("zone");
      for (const std::string& name : names) text += table.separator + table.new_name(name);
    }
    return text + std::string(record.line_end().empty() ? "\n" : record.line_end());
  }

  const ConvertOptions& options_;
  Chain chain_;
  PositionReader reader_;
  Writer writer_;
  Columns columns_;
  bool decided_ = false;
};

bool ends_with(const std::string& name, std::string_view ending) {
  return name.size() > ending.size() &&
         std::string_view(name).substr(name.size() - ending.size()) == ending;
}

int convert(ConvertOptions& options) {
  options.in.check();
  options.out.check();
  ChainRequest& chain = options.chain;
  if (!options.zone.empty() && options.zone != "auto") {
    if (chain.to != "utm") throw std::invalid_argument("--zone goes with --to utm");
    chain.to = "utm:" + options.zone;
    const char letter = options.zone.back();
    if (!std::strchr("NSns", letter)) {
      throw std::invalid_argument("no such zone: " + options.zone +
                                  " (auto, or 1N to 60N, 1S to 60S)");
    }
  }
  if (!options.ellipsoid.empty()) {
    if (!options.from.empty()) throw std::invalid_argument("--ellipsoid excludes --from");
    chain.to_ellipsoid = find_ellipsoid(options.ellipsoid);
    chain.from = "geodetic";
  }
  if (!options.from_ellipsoid.empty()) {
    chain.from_ellipsoid = find_ellipsoid(options.from_ellipsoid);
    if (options.from.empty()) chain.from = "geodetic";
    if (!chain.to_ellipsoid) chain.to_ellipsoid = Ellipsoid("GRS 1980");
  }
  if (!options.from.empty()) chain.from = options.from;
  if (options.no_shift) chain.operation = "no shift";
  // Short forms: grids by their kind and folder.
  const std::string& shift = options.shift;
  const bool by_grids = shift.starts_with("ntv2:") || shift.starts_with("nadcon:");
  if (by_grids) {
    const std::string folder = shift.substr(shift.find(':') + 1);
    if (folder.empty()) throw std::invalid_argument("--shift " + shift + " names no folder");
    if (chain.from_ellipsoid) {
      throw std::invalid_argument("a shift by grids takes no --from-ellipsoid");
    }
    chain.grids.push_back(folder);
  } else {
    chain.shift = shift;
  }
  if (chain.inverse && chain.grids.empty() && chain.shift.empty()) {
    throw std::invalid_argument("--inverse goes with --grid or --shift");
  }
  // Heights above the geoid are named on either side; X, Y, Z have none.
  if (!chain.geoid.empty() && !chain.geoid_to_ellipsoid && chain.to.starts_with("geocentric")) {
    throw std::invalid_argument("geocentric coordinates have no height above the geoid");
  }
  for (const std::string& file : options.files) {
    if (ends_with(file, ".geojson") || ends_with(file, ".geojsonl") ||
        ends_with(file, ".geojsons")) {
      options.geojson = true;
    }
  }
  if (options.geojson) return convert_geojson(options);
  Conversion job(options);
  if (options.describe) {
    write_out(job.chain().describe());
    flush_out();
    return 0;
  }
  StreamOptions stream;
  stream.records = options.csv;
  return run_stream(job, options.files, stream);
}

const char* const kExamples = R"(Systems:
  a code (EPSG:2154, 27700), a name ("RGF93 v1 / Lambert-93"), wgs84, utm:30N, ups:N, mgrs,
  spcs83:0401, geocentric:wgs84, a definition, a PROJ string or WKT; utm alone finds the zone of
  each position and writes it behind the coordinates; geodetic and geocentric alone are on the
  other side's datum.  tidewater systems search finds names.
Examples:
  # decimal degrees, latitude first, to UTM; the zone is found
  echo "48.3903 -4.4863 Brest" | tidewater convert
  # and back
  echo "389969.007 5360749.100 30N Brest" | tidewater convert --from utm --to wgs84
  # degrees, minutes and seconds with letters, to Lambert-93
  echo "48:23:25.1N 4:29:10.7W Brest" | tidewater convert --to EPSG:2154
  # to packed degrees, minutes and seconds with a letter in front
  echo "48.3903 -4.4863" | tidewater convert --to geodetic --out-format packed --out-hemisphere front
  # from Bessel's ellipsoid to WGS 84 by seven parameters
  echo "50.9413 6.9583 53.2 Cologne" | tidewater convert --to geodetic --shift helmert:598.1,73.7,418.2,0.202,0.045,-2.455,6.7 --from-ellipsoid "Bessel 1841" -e "WGS 84"
)";

}  // namespace

void add_convert(CLI::App& app, int& exit_status) {
  auto options = std::make_shared<ConvertOptions>();
  CLI::App* command = app.add_subcommand(
      "convert",
      "Converts positions between coordinate systems.\n"
      "A line begins with a position; the rest of it is passed through, as are blank lines and "
      "lines that begin with #.  A line that cannot be converted is written with * in place of its "
      "coordinates and told on standard error.  Geographic coordinates are latitude and longitude "
      "in degrees, others easting and northing, or X, Y, Z.  A third number is a height where it "
      "is asked for, or where every line has one that ends the line or has a decimal point.");
  command->add_option("files", options->files,
                      "files to read; - or none: standard input.  Names that end in .geojson are "
                      "read as such");
  ChainRequest& chain = options->chain;
  command->add_option("--from", options->from, "coordinate system of the input (wgs84)")
      ->group("Systems");
  command->add_option("--to", chain.to, "coordinate system of the output")
      ->capture_default_str()
      ->group("Systems");
  command
      ->add_option("--zone", options->zone,
                   "with --to utm: the zone with its hemisphere, such as 30N, instead of each "
                   "position's own")
      ->group("Systems");
  command->add_flag("--describe", options->describe, "say what would be done, and do nothing")
      ->group("Systems");
  command
      ->add_flag("--anywhere", chain.anywhere,
                 "convert also what lies far outside the systems' areas of use, by more than 10 "
                 "degrees")
      ->group("Systems");
  command
      ->add_option("--operation", chain.operation,
                   "the registry's operation between the datums, such as EPSG:1671; tidewater "
                   "systems show CODE --to CODE lists them.  The best one that can be used, if not "
                   "given")
      ->group("Datum");
  command->add_flag("--no-shift", options->no_shift, "no operation between the datums")
      ->excludes("--operation")
      ->group("Datum");
  command
      ->add_option("--grid", chain.grids,
                   "a shift grid of your own from the input's datum to the output's: FILE.gsb, "
                   ".las, .tif, or a folder with several, of which the first that holds a position "
                   "serves it")
      ->type_name("FILE")
      ->allow_extra_args(false)
      ->group("Datum");
  command
      ->add_option("--shift", options->shift,
                   "a shift of your own between ellipsoids.  With --from-ellipsoid: "
                   "molodensky:DX,DY,DZ in metres, or helmert:DX,DY,DZ,RX,RY,RZ,PPM in metres, "
                   "arc-seconds and parts per million, with the rotations of position vectors "
                   "(EPSG method 1033; those of a coordinate frame have the other sign).  "
                   "nadcon:DIR and ntv2:DIR are --grid DIR")
      ->group("Datum");
  command
      ->add_flag("--inverse", chain.inverse,
                 "the grid or shift turned round: the input is on its target datum, the output on "
                 "its source datum")
      ->group("Datum");
  command
      ->add_option("--from-ellipsoid", options->from_ellipsoid,
                   "ellipsoid of the input, for a shift by formulas: a name, or A,RF")
      ->needs("--shift")
      ->group("Datum");
  command
      ->add_option("-e,--ellipsoid", options->ellipsoid,
                   "ellipsoid of the output, without any datum: a name, or A,RF")
      ->group("Datum");
  command
      ->add_option("--geoid", chain.geoid,
                   "heights above the ellipsoid become heights above the geoid, behind the shift: "
                   "FILE.gtx, .geo, .tif, or a folder with several")
      ->type_name("FILE")
      ->group("Datum");
  command
      ->add_flag("--geoid-to-ellipsoid", chain.geoid_to_ellipsoid,
                 "the other way round, before the shift: the input's heights are above the geoid")
      ->needs("--geoid")
      ->group("Datum");
  command
      ->add_option("--epoch", chain.epoch,
                   "decimal year of the coordinates, for operations that depend on time")
      ->group("Datum");
  add_angle_options(*command, options->in, "", "Input");
  command->add_flag("--height", options->heights, "a third number is a height")->group("Input");
  command
      ->add_flag("--csv", options->csv,
                 "a table with a line of names; all its columns are kept, and the results added")
      ->group("Table");
  command->add_option("--x", options->x, "column of longitudes, eastings or X")->group("Table");
  command->add_option("--y", options->y, "column of latitudes, northings or Y")->group("Table");
  command->add_option("--z", options->z, "column of heights or Z")->group("Table");
  command
      ->add_option("--separator", options->separator, "of the table's fields: a character, or tab")
      ->group("Table");
  command->add_flag("--in-place", options->in_place, "results take the place of the coordinates")
      ->needs("--csv")
      ->group("Table");
  command
      ->add_flag("--geojson", options->geojson,
                 "GeoJSON in and out, also a feature a line; longitude or easting first")
      ->excludes("--csv")
      ->group("Table");
  add_precision(*command, options->precision,
                "decimals of metres (3), of degrees or grads (9), or of seconds (5); digits of a "
                "grid reference (5)");
  add_angle_options(*command, options->out, "out-", "Output");
  command->footer(kExamples);
  command->callback([options, &exit_status] { exit_status = convert(*options); });
}

}  // namespace tidewater::command
