#include "operation.hpp"

#include <algorithm>
#include <cmath>
#include <optional>
#include <tuple>

#include "makers.hpp"
#include "system_impl.hpp"

namespace tidewater::detail {

namespace {

constexpr int kWgs84 = 4326;
constexpr int kEtrs89 = 4258;
constexpr int kGreenwich = 8901;
constexpr int kLongitudeRotation = 9601;

// --- areas --------------------------------------------------------------------------------------

double overlap(double a1, double a2, double b1, double b2) {
  return std::max(0.0, std::min(a2, b2) - std::max(a1, b1));
}

// Width of a span of longitudes that may cross the 180th meridian.
double width(const Area& area) {
  return area.east >= area.west ? area.east - area.west : area.east - area.west + 360;
}

double shared_longitudes(const Area& a, const Area& b) {
  const double a2 = a.west + width(a);
  const double b2 = b.west + width(b);
  double sum = 0;
  for (const double turn : {-360.0, 0.0, 360.0})
    sum += overlap(a.west, a2, b.west + turn, b2 + turn);
  return sum;
}

// How much of an area another covers, from 0 to 1.
double coverage(const Area& wanted, const Area& by) {
  const double w = std::max(width(wanted), 1e-9);
  const double h = std::max(wanted.north - wanted.south, 1e-9);
  double lon = shared_longitudes(wanted, by);
  double lat = overlap(wanted.south, wanted.north, by.south, by.north);
  // An area may be a point.
  if (w <= 1e-9) {
    Area wide = wanted;
    wide.east += 1e-6;
    lon = shared_longitudes(wide, by) > 0 ? w : 0;
  }
  if (h <= 1e-9) lat = wanted.south >= by.south && wanted.north <= by.north ? h : 0;
  return std::min(1.0, lon / w) * std::min(1.0, lat / h);
}

// What two areas have in common; the first where that is nothing.
Area common(const Area& a, const Area& b) {
  if (width(b) >= 360 && b.south <= -90 && b.north >= 90) return a;
  if (width(a) >= 360 && a.south <= -90 && a.north >= 90) return b;
  Area result = a;
  result.south = std::max(a.south, b.south);
  result.north = std::min(a.north, b.north);
  double best = 0;
  if (width(b) >= 360) {
    best = width(a);
  } else if (width(a) >= 360) {
    result.west = b.west;
    result.east = b.east;
    best = width(b);
  } else {
    for (const double turn : {-360.0, 0.0, 360.0}) {
      const double west = std::max(a.west, b.west + turn);
      const double east = std::min(a.west + width(a), b.west + width(b) + turn);
      if (east - west <= best) continue;
      best = east - west;
      result.west = west < 180 ? west : west - 360;
      result.east = east > 180 ? east - 360 : east;
    }
  }
  if (best <= 0 || result.south >= result.north) return a;
  result.name = a.name == b.name ? a.name : a.name + " and " + b.name;
  return result;
}

Area area_of(const Definition& definition) {
  return {definition.area, definition.west, definition.south, definition.east, definition.north};
}

Area area_of(const OperationRecord& operation) {
  if (const auto area = Registry::shared().area(operation.area)) {
    return {area->name, area->west, area->south, area->east, area->north};
  }
  return {};
}

// --- ways ---------------------------------------------------------------------------------------

int datum_of(int system) {
  const auto record = Registry::shared().system(system);
  return record ? record->datum : 0;
}

// A system of the registry on the definition's datum, 0 where there is none.
int registered_system(const Definition& definition) {
  if (definition.kind == SystemKind::compound && definition.horizontal_code != 0) {
    return definition.horizontal_code;
  }
  if (definition.code != 0) return definition.code;
  if (definition.datum.code == 0) return 0;
  if (definition.base_code != 0 && datum_of(definition.base_code) == definition.datum.code) {
    return definition.base_code;
  }
  const Registry& registry = Registry::shared();
  for (const int code : registry.systems()) {
    const auto record = registry.system(code);
    if (record->datum == definition.datum.code && record->kind == SystemKind::geographic2d) {
      return code;
    }
  }
  return 0;
}

// The steps of an operation in order, each in its direction; empty where they do not join.
std::vector<Link> expanded(const Link& link) {
  if (link.operation.steps.empty()) return {link};
  const Registry& registry = Registry::shared();
  std::vector<Link> links;
  int at = datum_of(link.operation.source);
  for (const int code : link.operation.steps) {
    auto step = registry.operation(code);
    // Steps have no steps of their own: a store that says so might lead in a circle.
    if (!step || !step->steps.empty()) return {};
    const int from = datum_of(step->source);
    const int to = datum_of(step->target);
    const bool reversed = from != at;
    if (reversed && to != at) return {};
    at = reversed ? from : to;
    links.push_back({*std::move(step), reversed});
  }
  if (link.reversed) {
    std::reverse(links.begin(), links.end());
    for (Link& inner : links) inner.reversed = !inner.reversed;
  }
  return links;
}

std::string grid_names(const OperationRecord& operation) {
  std::string names;
  for (const GridName& grid : operation.grids) {
    names += (names.empty() ? "the grid " : ", ") + grid.name;
    if (!grid.proj_name.empty() && grid.proj_name != grid.name) {
      names += " (or " + grid.proj_name + ")";
    }
  }
  return names;
}

std::string hindrance(const OperationRecord& operation, const TransformationOptions& options) {
  if (is_similarity_or_offset(operation.method)) {
    if (depends_on_time(operation.method) && !std::isfinite(options.epoch)) {
      return "the epoch of the coordinates";
    }
    return "";
  }
  if (is_shift_grid(operation.method)) {
    if (!shift_grid_file(operation, options.grid_folders).empty()) return "";
    return grid_names(operation);
  }
  return "the method " + Registry::shared().method_name(operation.method);
}

// Does a later operation between the same systems take its place?  Where the grids of all later
// ones are not there, an older one serves if it can.
bool replaced(const OperationRecord& operation, const TransformationOptions& options) {
  if (operation.replaced_by == 0) return false;
  if (!hindrance(operation, options).empty()) return true;
  constexpr int kMost = 8;  // a store may say that two replace each other
  int code = operation.replaced_by;
  for (int i = 0; i < kMost && code != 0; ++i) {
    const auto later = Registry::shared().operation(code);
    const bool lacks_grid = later && is_shift_grid(later->method) &&
                            shift_grid_file(*later, options.grid_folders).empty();
    if (!lacks_grid) return true;
    code = later->replaced_by;
  }
  return false;
}

std::optional<Way> way_of(const OperationRecord& operation, bool reversed,
                          const TransformationOptions& options) {
  Way way;
  way.links = expanded({operation, reversed});
  if (way.links.empty()) return std::nullopt;
  way.name = operation.name;
  if (reversed) way.name = "inverse of " + way.name;
  way.accuracy = operation.accuracy;
  way.area = area_of(operation);
  for (const Link& link : way.links) {
    const std::string hinders = hindrance(link.operation, options);
    if (!hinders.empty()) way.missing += (way.missing.empty() ? "" : ", ") + hinders;
  }
  return way;
}

// A datum ensemble and its members are one within the ensemble's accuracy, in metres.
std::optional<double> ensemble_accuracy(int whole, int part) {
  const auto record = Registry::shared().datum(datum_of(whole));
  if (!record) return std::nullopt;
  const auto& members = record->members;
  if (std::find(members.begin(), members.end(), datum_of(part)) == members.end()) {
    return std::nullopt;
  }
  return record->ensemble_accuracy;
}

// The ways between the datums of two registered systems by one operation of the registry, which may
// be a concatenated one.
std::vector<Way> direct_ways(int source, int target, const TransformationOptions& options) {
  const Registry& registry = Registry::shared();
  const int source_datum = datum_of(source);
  std::vector<Way> list;
  for (const OperationRecord& operation : registry.operations(source, target)) {
    if (replaced(operation, options)) continue;
    if (auto way = way_of(operation, datum_of(operation.source) != source_datum, options)) {
      list.push_back(*std::move(way));
    }
  }
  auto accuracy = ensemble_accuracy(source, target);
  if (!accuracy) accuracy = ensemble_accuracy(target, source);
  if (accuracy) {
    Way way;
    way.name = "a datum ensemble and its member taken as one";
    way.accuracy = *accuracy;
    list.push_back(std::move(way));
  }
  return list;
}

// One way after the other; nothing where the second begins by taking back the first's last step:
// that is a way to where the step began, and over there it is found without the step.
std::optional<Way> joined(const Way& first, const Way& second) {
  if (!first.links.empty() && !second.links.empty()) {
    const Link& last = first.links.back();
    const Link& next = second.links.front();
    if (last.operation.code == next.operation.code && last.reversed != next.reversed) {
      return std::nullopt;
    }
  }
  Way way = first;
  way.links.insert(way.links.end(), second.links.begin(), second.links.end());
  way.name += " + " + second.name;
  way.accuracy += second.accuracy;
  way.area = common(first.area, second.area);
  if (!second.missing.empty()) {
    way.missing += (way.missing.empty() ? "" : ", ") + second.missing;
  }
  return way;
}

void rank(std::vector<Way>& list, const Area& wanted) {
  const auto key = [&](const Way& way) {
    const double covered = coverage(wanted, way.area);
    // Boxes of systems and operations differ by hairs.
    const double grade = covered > 0.98 ? 0 : 1 + std::round((1 - covered) * 10);
    return std::tuple(way.missing.empty() ? 0 : 1, grade,
                      std::isfinite(way.accuracy) ? way.accuracy : 1e6, way.links.size(),
                      way.links.empty() ? 0 : -way.links[0].operation.code);
  };
  std::stable_sort(list.begin(), list.end(),
                   [&](const Way& a, const Way& b) { return key(a) < key(b); });
}

bool same_links(const Way& a, const Way& b) {
  return std::equal(a.links.begin(), a.links.end(), b.links.begin(), b.links.end(),
                    [](const Link& one, const Link& other) {
                      return one.operation.code == other.operation.code &&
                             one.reversed == other.reversed;
                    });
}

// The registry joins some steps itself: of ways with the same steps the better one stays.
void drop_repeated(std::vector<Way>& list) {
  for (std::size_t i = 0; i < list.size(); ++i) {
    list.erase(std::remove_if(list.begin() + static_cast<std::ptrdiff_t>(i) + 1, list.end(),
                              [&](const Way& way) { return same_links(list[i], way); }),
               list.end());
  }
}

bool usable(const std::vector<Way>& list, const Area& wanted) {
  return std::any_of(list.begin(), list.end(), [&](const Way& way) {
    return way.missing.empty() && coverage(wanted, way.area) > 0;
  });
}

// The rotation that turns a system's datum to the same one on Greenwich, if there is one.
std::optional<OperationRecord> rotation_from(int system) {
  const int datum = datum_of(system);
  const auto record = Registry::shared().datum(datum);
  if (!record || record->meridian == kGreenwich) return std::nullopt;
  for (OperationRecord& operation : Registry::shared().operations(system)) {
    if (operation.method == kLongitudeRotation && datum_of(operation.source) == datum) {
      return std::move(operation);
    }
  }
  return std::nullopt;
}

// By one operation, also from and to the same datum on Greenwich.
std::vector<Way> turned_ways(int source, int target, const TransformationOptions& options) {
  std::vector<Way> list = direct_ways(source, target, options);
  const auto first = rotation_from(source);
  const auto last = rotation_from(target);
  const auto append = [&](int from, int to) {
    for (const Way& middle : direct_ways(from, to, options)) {
      std::optional<Way> way = middle;
      if (from != source) way = joined(*way_of(*first, false, options), *way);
      if (way && to != target) way = joined(*way, *way_of(*last, true, options));
      if (way) list.push_back(*std::move(way));
    }
  };
  // The rotation itself is among the ways by one operation.
  const bool turn_first = first && datum_of(first->target) != datum_of(target);
  const bool turn_last = last && datum_of(last->target) != datum_of(source);
  if (turn_first) append(first->target, target);
  if (turn_last) append(source, last->target);
  if (turn_first && turn_last) append(first->target, last->target);
  return list;
}

// Ways over a system in between.
void add_ways_over(int source, int hub, int target, const Area& wanted,
                   const TransformationOptions& options, std::vector<Way>& list) {
  auto first = turned_ways(source, hub, options);
  if (first.empty()) return;
  auto second = turned_ways(hub, target, options);
  if (second.empty()) return;
  rank(first, wanted);
  rank(second, wanted);
  // The best few of each side; the others are worse on that side.
  constexpr std::size_t kFew = 6;
  for (std::size_t i = 0; i < std::min(kFew, first.size()); ++i) {
    for (std::size_t j = 0; j < std::min(kFew, second.size()); ++j) {
      if (!(coverage(first[i].area, second[j].area) > 0)) continue;
      if (auto way = joined(first[i], second[j])) list.push_back(*std::move(way));
    }
  }
}

std::vector<Way> ways_between(int source, int target, const Area& wanted,
                              const TransformationOptions& options) {
  std::vector<Way> list = turned_ways(source, target, options);
  if (usable(list, wanted)) return list;
  const int pivot = datum_of(kWgs84);
  const bool to_pivot = datum_of(source) == pivot || datum_of(target) == pivot;
  if (!to_pivot) add_ways_over(source, kWgs84, target, wanted, options, list);
  if (usable(list, wanted)) return list;
  // Any other datum in between: the ensemble of which an end is a member, and what an operation
  // leads to from either end.
  std::vector<int> seen = {datum_of(source), datum_of(target), pivot};
  const auto over = [&](int hub) {
    const int datum = datum_of(hub);
    if (std::find(seen.begin(), seen.end(), datum) != seen.end()) return;
    seen.push_back(datum);
    add_ways_over(source, hub, target, wanted, options, list);
  };
  for (const int end : {source, target}) {
    if (ensemble_accuracy(kEtrs89, end)) over(kEtrs89);
    if (datum_of(end) == pivot) continue;
    for (const OperationRecord& operation : Registry::shared().operations(end)) {
      over(datum_of(operation.source) == datum_of(end) ? operation.target : operation.source);
    }
  }
  return list;
}

}  // namespace

bool same_datum(const DatumDefinition& a, const DatumDefinition& b) {
  if (a.code != 0 || b.code != 0) return a.code == b.code;
  return a.name == b.name && a.ellipsoid.a == b.ellipsoid.a &&
         a.ellipsoid.inverse_flattening == b.ellipsoid.inverse_flattening &&
         a.to_wgs84 == b.to_wgs84;
}

std::vector<Way> ways(const Definition& source, const Definition& target,
                      const TransformationOptions& options) {
  const int from = registered_system(source);
  const int to = registered_system(target);
  if (from == 0 || to == 0) return {};
  const Area wanted = area_of_both(source, target, options);
  std::vector<Way> list = ways_between(from, to, wanted, options);
  rank(list, wanted);
  std::erase_if(list, [&](const Way& way) { return !(coverage(wanted, way.area) > 0); });
  drop_repeated(list);
  return list;
}

Area area_of_both(const Definition& source, const Definition& target,
                  const TransformationOptions& options) {
  return options.area ? *options.area : common(area_of(source), area_of(target));
}

int geographic_of(const Link& link) { return link.operation.source; }

std::vector<Way> height_ways(int source, int target, const Definition& own, const Area& wanted,
                             const TransformationOptions& options) {
  const Registry& registry = Registry::shared();
  const int vertical = datum_of(source != 0 ? source : target);
  const bool both = source != 0 && target != 0;
  std::vector<Way> list;
  const auto append = [&](const OperationRecord& operation, bool reversed) {
    if (operation.replaced_by != 0) return;
    Way way;
    way.links = {{operation, reversed}};
    way.name = (reversed ? "inverse of " : "") + operation.name;
    way.accuracy = operation.accuracy;
    way.area = area_of(operation);
    const int read_in = operation.interpolation;
    const bool by_grid = both ? is_offset_grid(operation.method) : is_geoid_grid(operation.method);
    if (by_grid) {
      // Offsets are read at the source's positions, undulations at those of their own datum.
      const int read_at = both ? own.datum.code : datum_of(operation.source);
      if (read_in != 0 && datum_of(read_in) != read_at) {
        way.missing = both ? "positions on the datum in which its grid is read"
                           : "a grid that is read in another datum";
      } else if (geoid_grid_file(operation, options.grid_folders).empty()) {
        way.missing = grid_names(operation);
      }
    } else if (!is_height_offset(operation.method)) {
      way.missing = "the method " + registry.method_name(operation.method);
    }
    list.push_back(std::move(way));
  };
  if (both) {
    for (const OperationRecord& operation : registry.operations(source, target)) {
      append(operation, datum_of(operation.source) != vertical);
    }
  } else {
    const auto from_heights = [&](const std::vector<OperationRecord>& operations) {
      for (const OperationRecord& operation : operations) {
        if (is_geoid_grid(operation.method)) append(operation, source != 0);
      }
    };
    from_heights(registry.operations(source + target));
    if (!usable(list, wanted)) {
      // Newer entries lead to compound systems.
      for (const int code : registry.systems()) {
        const auto record = registry.system(code);
        if (record->kind == SystemKind::compound && datum_of(record->vertical) == vertical) {
          from_heights(registry.operations(code));
        }
      }
    }
  }
  rank(list, wanted);
  // An operation on the positions' own datum needs no other step.
  std::stable_partition(list.begin(), list.end(), [&](const Way& way) {
    return way.missing.empty() && coverage(wanted, way.area) > 0.98 &&
           datum_of(way.links[0].operation.source) == own.datum.code;
  });
  std::erase_if(list, [&](const Way& way) { return !(coverage(wanted, way.area) > 0); });
  return list;
}

Way way_by_operation(const OperationRecord& operation, bool reversed,
                     const TransformationOptions& options) {
  auto way = way_of(operation, reversed, options);
  if (!way) {
    throw Error("The steps of EPSG:" + std::to_string(operation.code) + ", " + operation.name +
                ", do not join.");
  }
  return *std::move(way);
}

std::unique_ptr<const Step> datum_step(const Link& link, const TransformationOptions& options,
                                       bool flat) {
  const OperationRecord& operation = link.operation;
  const Frame source = frame_of(datum_from_registry(datum_of(operation.source)));
  const Frame target = frame_of(datum_from_registry(datum_of(operation.target)));
  if (is_similarity_or_offset(operation.method)) {
    return similarity_or_offset(link, source, target, options.epoch, flat);
  }
  return shift_grid_step(link, source, target, options.grid_folders, flat);
}

}  // namespace tidewater::detail
