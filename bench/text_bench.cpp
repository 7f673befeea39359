// Angles, positions and grid references as text.  The peers of a plain number are the C library's
// and the language's own readers.

#include <array>
#include <charconv>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>

#include "harness.hpp"
#include "tidewater/position_text.hpp"
#include "tidewater/text.h"

#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
#include <GeographicLib/DMS.hpp>
#include <GeographicLib/MGRS.hpp>
#include <GeographicLib/UTMUPS.hpp>
#endif

using namespace tidewater;
using namespace tidewater::bench;

namespace {

constexpr double kDegree = 3.141592653589793 / 180;
constexpr double kArcSecond = kDegree / 3600;
constexpr AngleFormat kSymbols = {AngleForm::seconds, AngleMarks::plain, 3, Axis::longitude};

const AngleUnit kColonForm = {{"dd:mm:ss"}, 3, 5, kArcSecond};

// Reads each text to radians, or to figures of which only the first counts.
template <class Read>
std::shared_ptr<Side> reading(const std::vector<std::string>& texts, Read read) {
  struct Values : Side {
    Values(const std::vector<std::string>& given, Read reader)
        : texts(given), values(given.size()), read(reader) {}
    void run() override {
      for (std::size_t i = 0; i < texts.size(); ++i) values[i] = read(texts[i]);
    }
    CoordinateTriple result(std::size_t i) override { return {values[i], 0, 0}; }
    std::vector<std::string> texts;
    std::vector<double> values;
    Read read;
  };
  return std::make_shared<Values>(texts, read);
}

// Writes each angle; what is written is not compared.
template <class Write>
std::shared_ptr<Side> writing(const std::vector<CoordinateTriple>& in, Write write) {
  return side([in, write] {
    std::size_t sum = 0;
    for (const CoordinateTriple& p : in) sum += write(p);
    // Never so; but the compiler does not know.
    if (sum == 1) std::puts("");
  });
}

template <class Write>
std::vector<std::string> texts_of(const std::vector<CoordinateTriple>& in, Write write) {
  std::vector<std::string> texts;
  for (const CoordinateTriple& p : in) texts.push_back(write(p));
  return texts;
}

const Suite suite([] {
  const auto in = box(-180, -80, 180, 84);

  const auto colons = texts_of(in, [](const CoordinateTriple& p) {
    char text[52];
    TWstatus word = 0;
    TWrad_to_ascii(p.x, kColonForm, 0, text, &word);
    return std::string(text);
  });
  const auto contract_reader = reading(colons, [](const std::string& text) {
    double value = 0;
    TWstatus word = 0;
    TWascii_to_rad(text.c_str(), kColonForm, 0, &value, &word);
    return value;
  });
  const auto contract_writer = writing(in, [](const CoordinateTriple& p) {
    char text[52];
    TWstatus word = 0;
    TWrad_to_ascii(p.x, kColonForm, 0, text, &word);
    return static_cast<std::size_t>(text[0]);
  });
  const auto symbols =
      texts_of(in, [](const CoordinateTriple& p) { return format_angle(p.x / kDegree, kSymbols); });
  const auto free_reader = reading(symbols, [](const std::string& text) {
    return parse_angle(text, Axis::longitude).degrees * kDegree;
  });
  const auto free_writer = writing(in, [](const CoordinateTriple& p) {
    char text[kAngleTextSize];
    return format_angle(p.x / kDegree, kSymbols, text);
  });

  std::vector<std::string> names;
  Sides colon_readers, symbol_readers, writers;
#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
  using GeographicLib::DMS;
  const auto decode = [](const std::string& text) {
    DMS::flag axis;
    return DMS::Decode(text, axis) * kDegree;
  };
  names = {"GeographicLib"};
  colon_readers = {reading(colons, decode)};
  symbol_readers = {reading(symbols, decode)};
  writers = {writing(in, [](const CoordinateTriple& p) {
    return DMS::Encode(p.x / kDegree, DMS::SECOND, 3, DMS::LONGITUDE, ':').size();
  })};
#endif
  add({"angle from text (C)", contract_reader, names, colon_readers, ground_apart, "m", false});
  add({"angle to text (C)", contract_writer, names, writers, {}, "m", false});
  add({"angle from degrees, minutes, seconds", free_reader, names, symbol_readers, ground_apart,
       "m", false});
  add({"angle to degrees, minutes, seconds", free_writer, names, writers, {}, "m", false});

  const auto decimals =
      texts_of(in, [](const CoordinateTriple& p) { return format_angle(p.x / kDegree); });
  add({"angle from decimal degrees",
       reading(decimals,
               [](const std::string& text) {
                 return parse_angle(text, Axis::longitude).degrees * kDegree;
               }),
       {"from_chars", "strtod"},
       {reading(decimals,
                [](const std::string& text) {
                  double value = 0;
                  std::from_chars(text.data(), text.data() + text.size(), value);
                  return value * kDegree;
                }),
        reading(
            decimals,
            [](const std::string& text) { return std::strtod(text.c_str(), nullptr) * kDegree; })},
       ground_apart,
       "m",
       false});
  const auto pairs = texts_of(in, [](const CoordinateTriple& p) {
    return format_angle(p.x / kDegree) + " " + format_angle(p.y / kDegree);
  });
  add({"position from decimal degrees",
       reading(pairs,
               [](const std::string& text) {
                 return parse_position(text, Order::longitude_first).longitude * kDegree;
               }),
       {"strtod twice"},
       {reading(pairs,
                [](const std::string& text) {
                  char* end = nullptr;
                  const double longitude = std::strtod(text.c_str(), &end);
                  // The latitude is read for its time.
                  return (longitude + 0 * std::strtod(end, nullptr)) * kDegree;
                })},
       ground_apart,
       "m",
       false});

#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
  const auto references = texts_of(
      in, [](const CoordinateTriple& p) { return format_mgrs(p.x / kDegree, p.y / kDegree); });
  add({"grid reference to easting",
       reading(references, [](const std::string& text) { return parse_mgrs(text).easting; }),
       {"GeographicLib"},
       {reading(references,
                [](const std::string& text) {
                  int zone = 0, digits = 0;
                  bool north = false;
                  double x = 0, y = 0;
                  GeographicLib::MGRS::Reverse(text, zone, north, x, y, digits, false);
                  return x;
                })},
       plane_apart,
       "m",
       false});
  add({"grid reference of a position",
       writing(in,
               [](const CoordinateTriple& p) {
                 return format_mgrs(p.x / kDegree, p.y / kDegree).size();
               }),
       {"GeographicLib"},
       {writing(in,
                [](const CoordinateTriple& p) {
                  int zone = 0;
                  bool north = false;
                  double x = 0, y = 0;
                  std::string text;
                  GeographicLib::UTMUPS::Forward(p.y / kDegree, p.x / kDegree, zone, north, x, y);
                  GeographicLib::MGRS::Forward(zone, north, x, y, p.y / kDegree, 5, text);
                  return text.size();
                })},
       {},
       "m",
       false});
#endif
});

}  // namespace
