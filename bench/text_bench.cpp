#include <array>
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
std::shared_ptr<Side> peer_reading([[maybe_unused]] const std::vector<Text>& texts) {
#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
  std::vector<std::string> strings;
  for (const Text& text : texts) strings.emplace_back(text.data());
  return side([strings, values = std::vector<double>(strings.size())]() mutable {
    GeographicLib::DMS::flag axis;
    for (std::size_t i = 0; i < strings.size(); ++i) {
      values[i] = GeographicLib::DMS::Decode(strings[i], axis);
    }
  });
#else
  return nullptr;
#endif
}

std::shared_ptr<Side> peer_writing([[maybe_unused]] const std::vector<CoordinateTriple>& points) {
#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
  return side([points, texts = std::vector<std::string>(points.size())]() mutable {
    for (std::size_t i = 0; i < points.size(); ++i) {
      texts[i] =
          GeographicLib::DMS::Encode(points[i].x / kArcSecond / 3600, GeographicLib::DMS::SECOND, 3,
                                     GeographicLib::DMS::LONGITUDE, ':');
    }
  });
#else
  return nullptr;
#endif
}

const Suite suite([] {
  const auto points = box(-180, -90, 180, 90);
  const auto texts = written(points);
  add({"Angle from text",
       side([texts, values = std::vector<double>(texts.size())]() mutable {
         TWstatus word = 0;
         for (std::size_t i = 0; i < texts.size(); ++i) {
           TWascii_to_rad(texts[i].data(), kColonForm, 0, &values[i], &word);
         }
       }),
       {"GeographicLib"},
       {peer_reading(texts)},
       {},
       "",
       false});
  add({"Angle to text",
       side([points, out = texts]() mutable {
         TWstatus word = 0;
         for (std::size_t i = 0; i < points.size(); ++i) {
           TWrad_to_ascii(points[i].x, kColonForm, 0, out[i].data(), &word);
         }
       }),
       {"GeographicLib"},
       {peer_writing(points)},
       {},
       "",
       false});
});

}  // namespace
