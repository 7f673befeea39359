#include <array>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>

#include "harness.hpp"
#include "tidewater/text.h"

#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
#include <GeographicLib/DMS.hpp>
#endif

using namespace tidewater::bench;

namespace {

constexpr double kArcSecond = 3.141592653589793 / 180 / 3600;

using Text = std::array<char, 52>;

const AngleUnit kColonForm = {{"dd:mm:ss"}, 3, 5, kArcSecond};

std::vector<Text> written(const std::vector<CoordinateTriple>& points) {
  std::vector<Text> texts(points.size());
  for (std::size_t i = 0; i < points.size(); ++i) {
    TWstatus word = 0;
    TWrad_to_ascii(points[i].x, kColonForm, 0, texts[i].data(), &word);
  }
  return texts;
}

// The peer's own form of the same angles, where it is compiled in.
Kernel peer_reading([[maybe_unused]] const std::vector<Text>& texts) {
#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
  std::vector<std::string> strings;
  for (const Text& text : texts) strings.emplace_back(text.data());
  return [strings] {
    double sum = 0;
    GeographicLib::DMS::flag axis;
    for (const std::string& text : strings) sum += GeographicLib::DMS::Decode(text, axis);
    keep(sum);
  };
#else
  return {};
#endif
}

Kernel peer_writing([[maybe_unused]] const std::vector<CoordinateTriple>& points) {
#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
  return [points] {
    std::size_t sum = 0;
    for (const auto& p : points) {
      sum += GeographicLib::DMS::Encode(p.x / kArcSecond / 3600, GeographicLib::DMS::SECOND, 3,
                                        GeographicLib::DMS::LONGITUDE, ':')
                 .size();
    }
    keep(static_cast<double>(sum));
  };
#else
  return {};
#endif
}

const Suite suite([] {
  const auto points = box(-180, -90, 180, 90);
  const auto texts = written(points);
  add({"angle from text", "GeographicLib",
       [texts] {
         double sum = 0;
         for (const Text& text : texts) {
           double value = 0;
           TWstatus word = 0;
           TWascii_to_rad(text.data(), kColonForm, 0, &value, &word);
           sum += value;
         }
         keep(sum);
       },
       peer_reading(texts),
       [texts] {
         double sum = 0;
         for (const Text& text : texts) sum += std::strtod(text.data(), nullptr);
         keep(sum);
       }});
  add({"angle to text", "GeographicLib",
       [points] {
         double sum = 0;
         Text text;
         for (const auto& p : points) {
           TWstatus word = 0;
           TWrad_to_ascii(p.x, kColonForm, 0, text.data(), &word);
           sum += text[0];
         }
         keep(sum);
       },
       peer_writing(points),
       [points] {
         double sum = 0;
         Text text;
         for (const auto& p : points) {
           sum += std::snprintf(text.data(), text.size(), "%.3f", p.x / kArcSecond);
         }
         keep(sum);
       }});
});

}  // namespace
