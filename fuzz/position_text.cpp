// Any text as an angle, a position and a grid reference: figures within their ranges or a reason.

#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <string_view>

#include "tidewater/position_text.hpp"

using namespace tidewater;

namespace {

void require(bool holds) {
  if (!holds) std::abort();
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string_view text(reinterpret_cast<const char*>(data), size);
  for (const bool comma : {false, true}) {
    for (const Axis axis : {Axis::unknown, Axis::longitude, Axis::latitude}) {
      const ParsedAngle angle = parse_angle(text, axis, comma);
      require(angle ? std::fabs(angle.degrees) <= (angle.axis == Axis::latitude ? 90 : 360)
                    : std::isnan(angle.degrees));
    }
    for (const Order order : {Order::unknown, Order::longitude_first, Order::latitude_first}) {
      const ParsedPosition position = parse_position(text, order, comma);
      require(position ? std::fabs(position.latitude) <= 90 && std::fabs(position.longitude) <= 360
                       : std::isnan(position.latitude) && std::isnan(position.longitude));
    }
  }
  if (const GridPosition grid = parse_mgrs(text)) {
    const ParsedPosition centre = position_of(grid);
    require(centre && std::fabs(centre.latitude) <= 90);
  }
  return 0;
}
