#include "geojson.hpp"

#include <cerrno>
#include <charconv>
#include <cmath>
#include <cstring>
#include <fstream>
#include <iostream>
#include <nlohmann/json.hpp>
#include <optional>
#include <stdexcept>

#include "commands.hpp"
#include "json_text.hpp"
#include "status_name.hpp"
#include "stream.hpp"

namespace tidewater::command {

namespace {

constexpr std::size_t kBatch = 1024;
constexpr std::size_t kHeldText = 1 << 18;

// Hands a document's events on as text, but for coordinates, which are converted when a geometry
// has ended.  The parser calls it; what it answers is whether to go on.
class Converter {
 public:
  Converter(const ConvertOptions& options, const std::string& source)
      : options_(options), source_(source) {
    if (!options.from.empty()) make_chain(options.chain);
  }

  Counts counts() const { return counts_; }

  bool null() { return plain("null"); }
  bool boolean(bool value) { return plain(value ? "true" : "false"); }
  bool number_integer(std::int64_t value) { return number(std::to_string(value), double(value)); }
  bool number_unsigned(std::uint64_t value) {
    return number(std::to_string(value), static_cast<double>(value));
  }
  bool number_float(double value, const std::string& text) { return number(text, value); }
  bool string(std::string& value) {
    if (in_coordinates_) return fail("coordinates hold a text");
    if (skipped_ > 0) {
      if (key_ == "name") crs_name_ = value;
      return true;
    }
    separate();
    scratch_.clear();
    append_json_string(scratch_, value);
    out_.add(scratch_);
    return true;
  }
  bool binary(std::vector<std::uint8_t>&) { return false; }

  bool start_object(std::size_t) {
    if (in_coordinates_) return fail("coordinates hold an object");
    if (skipped_ > 0) {
      ++skipped_;
      return true;
    }
    if (skips_next()) {
      skipped_ = 1;
      return true;
    }
    separate();
    // A document may be a geometry itself, until it turns out to be a feature.
    const bool outermost = properties_depth_ == 0 && (levels_.empty() || key_ == "geometry");
    levels_.push_back({false, false});
    if (key_ == "properties" && properties_depth_ == 0) properties_depth_ = levels_.size();
    if (outermost) {
      geometry_depth_ = levels_.size();
      geometry_begin_ = out_.size();
      geometry_hole_ = holes_.size();
    }
    out_.add('{');
    key_.clear();
    return true;
  }
  bool key(std::string& value) {
    key_ = value;
    if (skipped_ > 0) return true;
    const bool document = levels_.size() == 1 && properties_depth_ == 0;
    if (document && value == "crs") return true;  // said anew where it is needed
    if (value == "bbox" && properties_depth_ == 0) return true;
    if (value == "features" && document) {
      geometry_depth_ = 0;
      say_system();
    }
    Level& level = levels_.back();
    if (level.any) out_.add(',');
    level.any = true;
    scratch_.clear();
    append_json_string(scratch_, value);
    out_.add(scratch_);
    out_.add(':');
    after_key_ = true;
    return true;
  }
  bool end_object() {
    if (skipped_ > 0) {
      if (--skipped_ == 0) take_crs();
      return true;
    }
    if (levels_.size() == 1 && !said_system_) say_system();
    out_.add('}');
    const std::size_t depth = levels_.size();
    levels_.pop_back();
    if (properties_depth_ == depth) properties_depth_ = 0;
    if (geometry_depth_ == depth) {
      geometry_depth_ = 0;
      geometries_.push_back({geometry_begin_, out_.size(), geometry_hole_, holes_.size()});
    }
    if (geometry_depth_ == 0 && (x_.size() >= kBatch || out_.size() >= kHeldText)) flush();
    key_.clear();
    return true;
  }
  bool start_array(std::size_t) {
    if (skipped_ > 0) {
      ++skipped_;
      return true;
    }
    if (in_coordinates_) {
      if (numbers_ > 0) return fail("a position holds an array");
      if (++coordinate_depth_ > 5) return fail("coordinates lie deeper than any geometry's");
      separate();
      out_.add('[');
      levels_.push_back({true, false});
      return true;
    }
    if (skips_next()) {
      skipped_ = 1;
      return true;
    }
    separate();
    if (key_ == "coordinates" && properties_depth_ == 0 && geometry_depth_ > 0) {
      in_coordinates_ = true;
      coordinate_depth_ = 1;
    }
    levels_.push_back({true, false});
    out_.add('[');
    return true;
  }
  bool end_array() {
    if (skipped_ > 0) {
      if (--skipped_ == 0) take_crs();
      return true;
    }
    if (in_coordinates_) {
      if (numbers_ > 0 && !end_position()) return false;
      if (--coordinate_depth_ == 0) in_coordinates_ = false;
    }
    out_.add(']');
    levels_.pop_back();
    key_.clear();
    return true;
  }
  bool parse_error(std::size_t place, const std::string&,
                   const nlohmann::detail::exception& error) {
    // The library's sentence begins with its own name and number.
    std::string words = error.what();
    const std::size_t colon = words.find(": ");
    failure_ = "not JSON at byte " + std::to_string(place) +
               (colon == words.npos ? "" : words.substr(colon));
    return false;
  }

  // A document has ended.
  void end_document() {
    flush();
    write_out("\n");
    said_system_ = false;
    levels_.clear();
    geometry_depth_ = 0;
  }
  [[noreturn]] void stop() {
    flush();
    throw std::runtime_error(source_ + ": " + failure_);
  }

 private:
  struct Level {
    bool array;
    bool any;
  };
  // Where a position's numbers belong in the text.
  struct Hole {
    std::size_t place;
    bool has_z;
    std::string more;  // what stands behind the third number
  };
  struct Geometry {
    std::size_t begin, end, first_hole, last_hole;
  };

  bool fail(std::string why) {
    failure_ = std::move(why);
    return false;
  }

  // Members of old documents that are written anew or would be wrong.
  bool skips_next() const {
    return properties_depth_ == 0 &&
           ((key_ == "crs" && levels_.size() == 1) || (key_ == "bbox" && !levels_.empty()));
  }

  void separate() {
    if (after_key_) {
      after_key_ = false;
      return;
    }
    if (levels_.empty() || !levels_.back().array) return;
    if (levels_.back().any) out_.add(',');
    levels_.back().any = true;
  }

  bool plain(std::string_view text) {
    if (skipped_ > 0) return true;
    if (in_coordinates_) return fail("coordinates hold what is no number");
    if (skips_next()) return true;
    separate();
    out_.add(text);
    key_.clear();
    return true;
  }

  bool number(const std::string& text, double value) {
    if (skipped_ > 0) return true;
    if (!in_coordinates_) return plain(text);
    if (levels_.back().any) return fail("an array of positions holds a number");
    if (numbers_ < 3) {
      position_[numbers_] = value;
    } else {
      more_ += "," + text;
    }
    ++numbers_;
    return true;
  }

  bool end_position() {
    if (numbers_ < 2) return fail("a position has one number only");
    if (!chain_) {
      ChainRequest request = options_.chain;
      make_chain(request);
    }
    said_system();
    holes_.push_back({out_.size(), numbers_ > 2, more_});
    x_.push_back(position_[0]);
    y_.push_back(position_[1]);
    z_.push_back(numbers_ > 2 ? position_[2] : 0);
    numbers_ = 0;
    more_.clear();
    return true;
  }

  void make_chain(const ChainRequest& request) {
    chain_.emplace(request);
    const Kind source = chain_->source().kind();
    const Kind target = chain_->target().kind();
    if (source == Kind::military || source == Kind::grid || target == Kind::military ||
        target == Kind::grid || target == Kind::space || source == Kind::space) {
      throw std::invalid_argument(
          "GeoJSON holds longitudes and latitudes or a map's coordinates: "
          "say --to with such a system");
    }
    decimals_ = options_.precision >= 0 ? options_.precision : target == Kind::angles ? 9 : 3;
    metres_ = options_.precision >= 0 ? options_.precision : 3;
  }

  // The document's own system, by the rules of 2008: names only.
  void take_crs() {
    if (key_ == "bbox" || crs_name_.empty()) return;
    std::string name;
    std::swap(name, crs_name_);
    if (!options_.from.empty()) return;  // what is asked for overrules it
    if (chain_ && !x_.empty()) late_crs();
    // urn:ogc:def:crs:EPSG::2154, EPSG:2154, urn:ogc:def:crs:OGC:1.3:CRS84
    const std::size_t colon = name.rfind(':');
    std::string code = colon == name.npos ? name : name.substr(colon + 1);
    ChainRequest request = options_.chain;
    request.from = code == "CRS84"                  ? "wgs84"
                   : name.find("EPSG") != name.npos ? "EPSG:" + code
                                                    : name;
    if (converted_any_) late_crs();
    make_chain(request);
  }
  [[noreturn]] void late_crs() {
    throw std::runtime_error(source_ + ": the crs stands behind coordinates; name it with --from");
  }

  void said_system() { converted_any_ = true; }

  // A member that names the system of the output, where it is not the one that GeoJSON has.
  void say_system() {
    said_system_ = true;
    if (!chain_) make_chain(options_.chain);
    const System& target = chain_->target().system();
    if (target.code() == 0 || target.code() == 4326 || levels_.empty()) return;
    Level& level = levels_.back();
    if (level.any) out_.add(',');
    level.any = true;
    out_.add(R"("crs":{"type":"name","properties":{"name":"urn:ogc:def:crs:EPSG::)" +
             std::to_string(target.code()) + "\"}}");
  }

  void flush() {
    Batch batch(std::max<std::size_t>(1, x_.size()));
    batch.count = x_.size();
    for (std::size_t i = 0; i < x_.size(); ++i) {
      batch.x[i] = x_[i];
      batch.y[i] = y_[i];
      batch.z[i] = z_[i];
      batch.has_z[i] = holes_[i].has_z;
      batch.status[i] = TW_SUCCESS;
      batch.reason[i] = nullptr;
    }
    if (batch.count > 0) chain_->run(batch);
    const std::string_view text = out_.text();
    std::size_t at = 0;
    Buffer done;
    for (const Geometry& geometry : geometries_) {
      done.add(text.substr(at, geometry.begin - at));
      at = geometry.end;
      std::size_t bad = geometry.first_hole;
      while (bad < geometry.last_hole && batch.status[bad] == TW_SUCCESS) ++bad;
      ++number_;
      if (bad < geometry.last_hole) {
        done.add("null");
        complain(batch, bad);
        continue;
      }
      ++counts_.done;
      std::size_t place = geometry.begin;
      for (std::size_t i = geometry.first_hole; i < geometry.last_hole; ++i) {
        done.add(text.substr(place, holes_[i].place - place));
        place = holes_[i].place;
        done.add_fixed(batch.x[i], decimals_);
        done.add(',');
        done.add_fixed(batch.y[i], decimals_);
        if (holes_[i].has_z) {
          done.add(',');
          done.add_fixed(batch.z[i], metres_);
        }
        done.add(holes_[i].more);
      }
      done.add(text.substr(place, geometry.end - place));
    }
    done.add(text.substr(at));
    write_out(done.text());
    out_.clear();
    holes_.clear();
    geometries_.clear();
    x_.clear();
    y_.clear();
    z_.clear();
  }

  void complain(const Batch& batch, std::size_t bad) {
    const TWstatus status = batch.status[bad];
    ++(is_outside(status) ? counts_.outside : counts_.refused);
    const std::string shown = nlohmann::json(x_[bad]).dump() + "," + nlohmann::json(y_[bad]).dump();
    std::fprintf(stderr, "%s: geometry %lld: [%s]: %s (%s)\n", source_.c_str(),
                 static_cast<long long>(number_), shown.c_str(),
                 batch.reason[bad] ? batch.reason[bad] : status_meaning(status),
                 status_name(status));
  }

  const ConvertOptions& options_;
  const std::string& source_;
  std::optional<Chain> chain_;
  int decimals_ = 9, metres_ = 3;

  Buffer out_;
  std::string scratch_;
  std::vector<Level> levels_;
  std::string key_;
  bool after_key_ = false;
  std::size_t properties_depth_ = 0, geometry_depth_ = 0;
  std::size_t geometry_begin_ = 0, geometry_hole_ = 0;
  int skipped_ = 0;  // depth within a member that is not handed on
  std::string crs_name_;
  bool said_system_ = false;
  bool converted_any_ = false;

  bool in_coordinates_ = false;
  int coordinate_depth_ = 0;
  std::size_t numbers_ = 0;
  double position_[3] = {};
  std::string more_;
  std::vector<Hole> holes_;
  std::vector<Geometry> geometries_;
  std::vector<double> x_, y_, z_;
  std::int64_t number_ = 0;
  Counts counts_;
  std::string failure_;
};

void convert_stream(std::istream& stream, Converter& converter) {
  while (stream >> std::ws && stream.peek() != std::istream::traits_type::eof()) {
    if (stream.peek() == 0x1E) {  // RFC 8142: a sequence of texts
      stream.get();
      continue;
    }
    if (!nlohmann::json::sax_parse(stream, &converter, nlohmann::json::input_format_t::json,
                                   false)) {
      converter.stop();
    }
    converter.end_document();
  }
}

}  // namespace

int convert_geojson(const ConvertOptions& given) {
  ConvertOptions options = given;
  if (!options.from.empty()) options.chain.from = options.from;
  std::vector<std::string> files = options.files;
  if (files.empty()) files.emplace_back("-");
  Counts counts;
  // Reading would flush standard output unseen, and a full disk with it.
  std::cin.tie(nullptr);
  for (const std::string& file : files) {
    const std::string name = file == "-" ? "standard input" : file;
    std::ifstream opened;
    if (file != "-") {
      opened.open(file, std::ios::binary);
      if (!opened) throw std::runtime_error(file + ": " + std::strerror(errno));
    }
    std::istream& stream = file == "-" ? std::cin : opened;
    if (stream.peek() == 0xEF) stream.ignore(3);  // a byte order mark
    Converter converter(options, name);
    convert_stream(stream, converter);
    if (stream.bad()) throw std::runtime_error(name + ": " + std::strerror(errno));
    counts.done += converter.counts().done;
    counts.outside += converter.counts().outside;
    counts.refused += converter.counts().refused;
  }
  flush_out();
  std::fprintf(stderr, "%lld %s converted, %lld outside the grids, %lld refused\n",
               static_cast<long long>(counts.done), counts.done == 1 ? "geometry" : "geometries",
               static_cast<long long>(counts.outside), static_cast<long long>(counts.refused));
  return counts.outside + counts.refused > 0 ? kSomeRefused : 0;
}

}  // namespace tidewater::command
