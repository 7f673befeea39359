#include "registry.hpp"

#include <algorithm>
#include <array>
#include <charconv>
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <limits>
#include <mutex>
#include <numbers>
#include <tuple>

#include "registry_names.hpp"
#include "registry_reader.hpp"
#include "store_path.hpp"
#include "words.hpp"

namespace tidewater::detail {

namespace {

constexpr double kUnknown = std::numeric_limits<double>::quiet_NaN();
constexpr std::size_t kNameSize = 100;
constexpr std::size_t kAxesSize = 4;
constexpr std::size_t kFileSize = 80;
constexpr std::size_t kKindSize = 8;

// Units whose numbers are sexagesimal digits.
constexpr int kDegreesMinutesSeconds = 9110;
constexpr int kDegreesMinutes = 9111;

// A text in the registry's one large one.
struct Name {
  uint32_t at = 0;
  uint32_t size = 0;
};

// Rows as the store has them; all are found by code.
struct Row {
  int code;
  Name name;
};

struct SystemRow : Row {
  SystemKind kind;
  int base, datum, conversion;
  Name axes;
  int unit, horizontal, vertical, area;
};

struct DatumRow : Row {
  int ellipsoid, meridian, area;
  double epoch, ensemble_accuracy;
};

struct EllipsoidRow : Row {
  double a;
  int unit;
  double inverse_flattening, b;
};

struct MeridianRow : Row {
  Parameter longitude;
};

struct UnitRow : Row {
  UnitRecord::Kind kind;
  double factor;
};

struct AreaRow : Row {
  double west, south, east, north;
};

struct Values {
  std::array<double, 7> value;
  std::array<int, 7> unit;
};

struct ConversionRow : Row {
  int method;
  Values values;
};

struct OperationRow : Row {
  int method, source, target, interpolation, area;
  double accuracy;
  int replaced_by;
  std::array<int, 4> steps;
  uint32_t values;  // in the table of values, of a transformation
  std::array<Name, 2> files;
};

struct MoreValuesRow {
  int code;
  std::array<double, 8> value;
  std::array<int, 8> unit;
};

struct GridRow {
  Name file, proj_file;
  bool reversed;
};

struct PairRow {
  int code, second;
};

struct AliasRow : Row {
  int kind;
};

enum AliasKind : int { kSystemAlias, kDatumAlias, kEllipsoidAlias, kUnitAlias, kNoAlias };

struct DeprecatedRow : Row {
  int replaced_by;
};

constexpr auto by_code = [](const auto& row, int code) { return row.code < code; };

template <class AnyRow>
const AnyRow* find(const std::vector<AnyRow>& rows, int code) {
  const auto found = std::lower_bound(rows.begin(), rows.end(), code, by_code);
  return found != rows.end() && found->code == code ? &*found : nullptr;
}

// The registry has given codes below this to its later entries.
constexpr int kFirstOfTheOlder = 2000;

// A name's key with the code it stands for; the older entry goes before the later one.
struct Key {
  std::string key;
  bool later;
  int code;

  bool operator<(const Key& other) const {
    return std::tie(key, later, code) < std::tie(other.key, other.later, other.code);
  }
};

// What a search goes through.
struct Entry {
  std::string folded;
  int code;
  bool alias;
};

struct Names {
  std::vector<Entry> entries;
  std::vector<Key> systems, datums, ellipsoids, meridians, units;
};

constexpr std::array<std::pair<std::string_view, UnitRecord::Kind>, 4> kUnitKinds = {
    {{"length", UnitRecord::Kind::length},
     {"angle", UnitRecord::Kind::angle},
     {"scale", UnitRecord::Kind::scale},
     {"time", UnitRecord::Kind::time}}};

// Digits DDD.MMSSsss or DDD.MMmmm in radians.
double sexagesimal(double value, bool seconds) {
  constexpr double kPart = 1e12;  // the registry has no more decimals
  constexpr double kSecond = std::numbers::pi / 648000;
  const double digits = std::round(std::abs(value) * kPart);
  const double degrees = std::floor(digits / kPart);
  const double rest = digits - degrees * kPart;
  const double minutes = seconds ? std::floor(rest / 1e10) : rest / 1e10;
  const double remainder = seconds ? (rest - minutes * 1e10) / 1e8 : 0;
  return std::copysign((degrees * 3600 + minutes * 60 + remainder) * kSecond, value);
}

}  // namespace

struct Registry::Tables {
  std::string path;
  std::string text;
  std::vector<SystemRow> systems;
  std::vector<DatumRow> datums;
  std::vector<PairRow> members;
  std::vector<EllipsoidRow> ellipsoids;
  std::vector<MeridianRow> meridians;
  std::vector<UnitRow> units;
  std::vector<AreaRow> areas;
  std::vector<ConversionRow> conversions;
  std::vector<OperationRow> operations;
  std::vector<Values> values;
  std::vector<MoreValuesRow> more_values;
  std::vector<GridRow> grids;
  std::vector<Row> methods;
  std::vector<Row> parameters;
  std::vector<PairRow> method_parameters;
  std::vector<AliasRow> aliases;
  std::vector<DeprecatedRow> deprecated;
  // For each datum the places in `operations` of those from or to it.
  std::vector<std::pair<int, uint32_t>> ends;

  // Made when names are first asked for.
  mutable std::once_flag names_made;
  mutable Names names_once_made;

  explicit Tables(const std::string& store) : path(store) {
    StoreReader reader(store);
    text.reserve(1U << 20);
    read_systems(reader);
    read_datums(reader);
    read_small_tables(reader);
    read_conversions(reader);
    read_operations(reader);
    index_operations();
  }

  std::string_view view(Name name) const {
    return std::string_view(text).substr(name.at, name.size);
  }
  std::string string(Name name) const { return std::string(view(name)); }

  Name keep(std::string_view value) {
    const Name name = {static_cast<uint32_t>(text.size()), static_cast<uint32_t>(value.size())};
    text += value;
    return name;
  }

  Row read_head(StoreReader& reader) {
    const int code = reader.integer();
    return {code, keep(reader.text(kNameSize))};
  }

  static double coordinate(const StoreReader& reader, double value, double limit) {
    reader.require(std::abs(value) <= limit, "an area lies outside the Earth");
    return value;
  }

  // Reads the rows of a table, which ascend by code.
  template <class AnyRow, class Read>
  static void read(StoreReader& reader, const char* table, std::vector<AnyRow>& rows, Read one) {
    reader.begin(table);
    rows.reserve(rows.size() + std::min<std::size_t>(reader.rows(), 1U << 16));
    int last = 0;
    while (reader.next()) {
      rows.push_back(one());
      reader.require(rows.back().code > last, "its code is not above that of the row before");
      last = rows.back().code;
    }
  }

  // The same, where several rows have one code.
  template <class AnyRow, class Read>
  static void read_groups(StoreReader& reader, const char* table, std::vector<AnyRow>& rows,
                          Read one) {
    reader.begin(table);
    int last = 0;
    while (reader.next()) {
      rows.push_back(one());
      reader.require(rows.back().code >= last, "its code is below that of the row before");
      last = rows.back().code;
    }
  }

  Name read_axes(StoreReader& reader, SystemKind kind) {
    const std::string_view axes = reader.text(kAxesSize);
    bool known = horizontal_axes(axes);
    if (kind == SystemKind::geocentric) known = axes == "XYZ";
    if (kind == SystemKind::geographic2d) known = known && axes.size() == 2;
    if (kind == SystemKind::geographic3d) known = known && axes.size() == 3;
    if (kind == SystemKind::vertical) known = axes == "U" || axes == "D";
    reader.require(known, "its axes are none of its kind");
    return keep(axes);
  }

  void read_systems(StoreReader& reader) {
    read(reader, "geodetic systems", systems, [&] {
      SystemRow row{};
      static_cast<Row&>(row) = read_head(reader);
      const int dimension = reader.integer();
      reader.require(dimension >= 1 && dimension <= 3, "its kind is none of 1, 2, 3");
      row.kind = dimension == 1   ? SystemKind::geocentric
                 : dimension == 2 ? SystemKind::geographic2d
                                  : SystemKind::geographic3d;
      row.datum = reader.integer();
      row.axes = read_axes(reader, row.kind);
      row.unit = reader.integer();
      row.area = reader.integer();
      return row;
    });
    const std::size_t geodetic = systems.size();
    const auto datum_of = [&](int code) {
      const auto end = systems.begin() + static_cast<std::ptrdiff_t>(geodetic);
      const auto found = std::lower_bound(systems.begin(), end, code, by_code);
      reader.require(found != end && found->code == code, "its base is no geodetic system");
      return found->datum;
    };
    read(reader, "projected systems", systems, [&] {
      SystemRow row{};
      static_cast<Row&>(row) = read_head(reader);
      row.kind = SystemKind::projected;
      row.base = reader.integer();
      row.datum = datum_of(row.base);
      row.conversion = reader.integer();
      row.axes = read_axes(reader, row.kind);
      row.unit = reader.integer();
      row.area = reader.integer();
      return row;
    });
    read(reader, "vertical systems", systems, [&] {
      SystemRow row{};
      static_cast<Row&>(row) = read_head(reader);
      row.kind = SystemKind::vertical;
      row.datum = reader.integer();
      row.axes = read_axes(reader, row.kind);
      row.unit = reader.integer();
      row.area = reader.integer();
      return row;
    });
    const auto ascending = [](const Row& a, const Row& b) { return a.code < b.code; };
    std::stable_sort(systems.begin(), systems.end(), ascending);
    std::vector<SystemRow> compound;
    read(reader, "compound systems", compound, [&] {
      SystemRow row{};
      static_cast<Row&>(row) = read_head(reader);
      row.kind = SystemKind::compound;
      row.horizontal = reader.integer();
      row.vertical = reader.integer();
      row.area = reader.integer();
      // The parts are read already, so that none of them can be a compound system.
      const SystemRow* horizontal = find(systems, row.horizontal);
      const SystemRow* vertical = find(systems, row.vertical);
      reader.require(horizontal != nullptr && (horizontal->kind == SystemKind::projected ||
                                               horizontal->kind == SystemKind::geographic2d),
                     "its horizontal part is no system of two axes");
      reader.require(vertical != nullptr && vertical->kind == SystemKind::vertical,
                     "its vertical part is no system");
      row.datum = horizontal->datum;
      row.unit = horizontal->unit;
      const std::string axes = string(horizontal->axes) + string(vertical->axes);
      row.axes = keep(axes);
      return row;
    });
    systems.insert(systems.end(), compound.begin(), compound.end());
    std::stable_sort(systems.begin(), systems.end(), ascending);
    read(reader, "deprecated systems", deprecated, [&] {
      DeprecatedRow row{};
      static_cast<Row&>(row) = read_head(reader);
      row.replaced_by = reader.integer();
      return row;
    });
  }

  void read_datums(StoreReader& reader) {
    read(reader, "datums", datums, [&] {
      DatumRow row{};
      static_cast<Row&>(row) = read_head(reader);
      row.ellipsoid = reader.integer();
      row.meridian = reader.integer();
      row.area = reader.integer();
      row.epoch = reader.real();
      row.ensemble_accuracy = reader.real();
      return row;
    });
    read_groups(reader, "datum members", members, [&] {
      const int ensemble = reader.integer();
      return PairRow{ensemble, reader.integer()};
    });
    read(reader, "ellipsoids", ellipsoids, [&] {
      EllipsoidRow row{};
      static_cast<Row&>(row) = read_head(reader);
      row.a = reader.real();
      row.unit = reader.integer();
      row.inverse_flattening = reader.real();
      row.b = reader.real();
      reader.require(row.a > 0 && row.b >= 0 && row.b <= row.a &&
                         (row.inverse_flattening == 0 || row.inverse_flattening > 1),
                     "it is no ellipsoid");
      return row;
    });
    read(reader, "meridians", meridians, [&] {
      MeridianRow row{};
      static_cast<Row&>(row) = read_head(reader);
      row.longitude.value = reader.real();
      row.longitude.unit = reader.integer();
      return row;
    });
  }

  void read_small_tables(StoreReader& reader) {
    read(reader, "units", units, [&] {
      UnitRow row{};
      static_cast<Row&>(row) = read_head(reader);
      const std::string_view kind = reader.text(kKindSize);
      const auto known = std::find_if(kUnitKinds.begin(), kUnitKinds.end(),
                                      [kind](const auto& k) { return k.first == kind; });
      reader.require(known != kUnitKinds.end(), "its kind is none of length, angle, scale, time");
      row.kind = known->second;
      row.factor = reader.real();
      reader.require(row.factor >= 0, "its factor is negative");
      return row;
    });
    read(reader, "areas", areas, [&] {
      AreaRow row{};
      static_cast<Row&>(row) = read_head(reader);
      row.west = coordinate(reader, reader.real(), 180);
      row.south = coordinate(reader, reader.real(), 90);
      row.east = coordinate(reader, reader.real(), 180);
      row.north = coordinate(reader, reader.real(), 90);
      return row;
    });
    read(reader, "methods", methods, [&] { return read_head(reader); });
    read(reader, "parameters", parameters, [&] { return read_head(reader); });
    read_groups(reader, "method parameters", method_parameters, [&] {
      const int method = reader.integer();
      return PairRow{method, reader.integer()};
    });
    // Other names ascend within their kind.
    reader.begin("aliases");
    while (reader.next()) {
      AliasRow row{};
      row.kind = reader.integer();
      static_cast<Row&>(row) = read_head(reader);
      aliases.push_back(row);
    }
  }

  template <std::size_t count>
  static void read_values(StoreReader& reader, std::array<double, count>& value,
                          std::array<int, count>& unit) {
    for (double& v : value) v = reader.real();
    for (int& u : unit) u = reader.integer();
  }

  void read_conversions(StoreReader& reader) {
    read(reader, "conversions", conversions, [&] {
      ConversionRow row{};
      static_cast<Row&>(row) = read_head(reader);
      row.method = reader.integer();
      read_values(reader, row.values.value, row.values.unit);
      return row;
    });
  }

  void read_operations(StoreReader& reader) {
    const auto accuracy = [&] {
      const double stated = reader.real();
      return stated < 0 ? kUnknown : stated;
    };
    read(reader, "transformations", operations, [&] {
      OperationRow row{};
      static_cast<Row&>(row) = read_head(reader);
      row.method = reader.integer();
      row.source = reader.integer();
      row.target = reader.integer();
      row.area = reader.integer();
      row.accuracy = accuracy();
      row.replaced_by = reader.integer();
      row.values = static_cast<uint32_t>(values.size());
      Values& given = values.emplace_back();
      read_values(reader, given.value, given.unit);
      return row;
    });
    read(reader, "transformations continued", more_values, [&] {
      MoreValuesRow row{};
      row.code = reader.integer();
      read_values(reader, row.value, row.unit);
      return row;
    });
    read(reader, "grid transformations", operations, [&] {
      OperationRow row{};
      static_cast<Row&>(row) = read_head(reader);
      row.method = reader.integer();
      row.source = reader.integer();
      row.target = reader.integer();
      row.interpolation = reader.integer();
      row.area = reader.integer();
      row.accuracy = accuracy();
      row.replaced_by = reader.integer();
      for (Name& file : row.files) file = keep(reader.text(kFileSize));
      reader.require(row.files[0].size > 0, "it names no grid");
      return row;
    });
    read(reader, "concatenated operations", operations, [&] {
      OperationRow row{};
      static_cast<Row&>(row) = read_head(reader);
      row.source = reader.integer();
      row.target = reader.integer();
      row.area = reader.integer();
      row.accuracy = accuracy();
      row.replaced_by = reader.integer();
      for (int& step : row.steps) step = reader.integer();
      reader.require(row.steps[0] > 0, "it has no steps");
      return row;
    });
    std::stable_sort(operations.begin(), operations.end(),
                     [](const Row& a, const Row& b) { return a.code < b.code; });
    reader.begin("grids");
    while (reader.next()) {
      GridRow row{};
      row.file = keep(reader.text(kFileSize));
      row.proj_file = keep(reader.text(kFileSize));
      row.reversed = reader.integer() != 0;
      grids.push_back(row);
    }
    std::stable_sort(grids.begin(), grids.end(), [this](const GridRow& a, const GridRow& b) {
      return view(a.file) < view(b.file);
    });
  }

  // What operations go by: the datum, or the code of a compound system below zero; 0 for none.
  int end_of(int system_code) const {
    const SystemRow* row = find(systems, system_code);
    if (row == nullptr) return 0;
    return row->kind == SystemKind::compound ? -row->code : row->datum;
  }

  void index_operations() {
    for (uint32_t i = 0; i < operations.size(); ++i) {
      const int source = end_of(operations[i].source);
      const int target = end_of(operations[i].target);
      if (source != 0) ends.emplace_back(source, i);
      if (target != 0 && target != source) ends.emplace_back(target, i);
    }
    std::sort(ends.begin(), ends.end());
  }

  // Names

  template <class AnyRow>
  std::vector<Key> keys_of(const std::vector<AnyRow>& rows, int alias_kind) const {
    std::vector<Key> keys;
    const auto add = [&](const Row& row) {
      keys.push_back({name_key(view(row.name)), row.code < kFirstOfTheOlder, row.code});
    };
    for (const AnyRow& row : rows) add(row);
    for (const AliasRow& row : aliases) {
      if (row.kind == alias_kind && find(rows, row.code)) add(row);
    }
    std::sort(keys.begin(), keys.end());
    return keys;
  }

  std::vector<Entry> entries() const {
    std::vector<Entry> out;
    for (const SystemRow& row : systems) out.push_back({folded(view(row.name)), row.code, false});
    for (const AliasRow& row : aliases) {
      if (row.kind == kSystemAlias && find(systems, row.code)) {
        out.push_back({folded(view(row.name)), row.code, true});
      }
    }
    return out;
  }

  const Names& names() const {
    std::call_once(names_made, [this] {
      names_once_made = {entries(),
                         keys_of(systems, kSystemAlias),
                         keys_of(datums, kDatumAlias),
                         keys_of(ellipsoids, kEllipsoidAlias),
                         keys_of(meridians, kNoAlias),
                         keys_of(units, kUnitAlias)};
    });
    return names_once_made;
  }

  // A row by the name itself before one by another name.
  template <class AnyRow>
  int code_of(const std::vector<Key>& keys, const std::vector<AnyRow>& rows,
              std::string_view name) const {
    const std::string wanted = name_key(name);
    if (wanted.empty()) return 0;
    auto key = std::lower_bound(keys.begin(), keys.end(), Key{wanted, false, 0});
    int first = 0;
    for (; key != keys.end() && key->key == wanted; ++key) {
      if (name_key(view(find(rows, key->code)->name)) == wanted) return key->code;
      if (first == 0) first = key->code;
    }
    return first;
  }

  // Parameters

  // The codes of a method's parameters.
  std::pair<const PairRow*, const PairRow*> parameters_of(int method) const {
    const auto first =
        std::lower_bound(method_parameters.begin(), method_parameters.end(), method, by_code);
    auto last = first;
    while (last != method_parameters.end() && last->code == method) ++last;
    const PairRow* begin = method_parameters.data() + (first - method_parameters.begin());
    return {begin, begin + (last - first)};
  }

  std::vector<Parameter> parameters_with(int method, const Values& given,
                                         const MoreValuesRow* more) const {
    std::vector<Parameter> out;
    const auto [first, last] = parameters_of(method);
    std::size_t i = 0;
    for (const PairRow* p = first; p != last; ++p, ++i) {
      if (i < given.value.size()) {
        out.push_back({p->second, given.value[i], given.unit[i]});
      } else if (more && i - given.value.size() < more->value.size()) {
        out.push_back({p->second, more->value[i - 7], more->unit[i - 7]});
      } else {
        break;
      }
    }
    return out;
  }

  GridName grid(int parameter, Name file) const {
    GridName out = {parameter, string(file), {}, false};
    const auto found =
        std::lower_bound(grids.begin(), grids.end(), std::string_view(out.name),
                         [this](const GridRow& g, std::string_view n) { return view(g.file) < n; });
    if (found != grids.end() && view(found->file) == out.name) {
      out.proj_name = string(found->proj_file);
      out.proj_reversed = found->reversed;
    }
    return out;
  }

  OperationRecord record(const OperationRow& row) const {
    OperationRecord out = {
        row.code, string(row.name), row.method,      row.source, row.target, row.interpolation,
        row.area, row.accuracy,     row.replaced_by, {},         {},         {}};
    if (row.steps[0] != 0) {
      for (const int step : row.steps) {
        if (step != 0) out.steps.push_back(step);
      }
    } else if (row.files[0].size > 0) {
      const auto [first, last] = parameters_of(row.method);
      for (std::size_t i = 0; i < row.files.size() && row.files[i].size > 0; ++i) {
        out.grids.push_back(grid(first + i < last ? first[i].second : 0, row.files[i]));
      }
    } else {
      out.parameters = parameters_with(row.method, values[row.values], find(more_values, row.code));
    }
    return out;
  }

  template <class Wanted>
  std::vector<OperationRecord> operations_of(int end, Wanted wanted) const {
    std::vector<const OperationRow*> rows;
    if (end != 0) {
      auto at = std::lower_bound(ends.begin(), ends.end(), std::pair{end, uint32_t{0}});
      for (; at != ends.end() && at->first == end; ++at) {
        if (wanted(operations[at->second])) rows.push_back(&operations[at->second]);
      }
    }
    std::stable_sort(rows.begin(), rows.end(), [](const OperationRow* a, const OperationRow* b) {
      // What is not known goes last.
      const auto rank = [](double accuracy) { return std::isnan(accuracy) ? HUGE_VAL : accuracy; };
      return rank(a->accuracy) < rank(b->accuracy);
    });
    std::vector<OperationRecord> out;
    out.reserve(rows.size());
    for (const OperationRow* row : rows) out.push_back(record(*row));
    return out;
  }
};

Registry::Registry(const std::string& path) : tables_(std::make_unique<const Tables>(path)) {}

Registry::~Registry() = default;

const Registry& Registry::shared() {
  // Never destroyed: threads may outlive the static objects of a process.
  static const Registry* const registry = new Registry(store_path());
  return *registry;
}

std::optional<SystemRecord> Registry::system(int code) const {
  const SystemRow* row = find(tables_->systems, code);
  if (!row) return std::nullopt;
  return SystemRecord{row->code,       tables_->string(row->name),
                      row->kind,       row->base,
                      row->datum,      row->conversion,
                      row->unit,       tables_->string(row->axes),
                      row->horizontal, row->vertical,
                      row->area};
}

std::optional<DatumRecord> Registry::datum(int code) const {
  const DatumRow* row = find(tables_->datums, code);
  if (!row) return std::nullopt;
  DatumRecord out = {row->code,
                     tables_->string(row->name),
                     row->ellipsoid,
                     row->meridian,
                     row->area,
                     row->epoch == 0 ? kUnknown : row->epoch,
                     row->ensemble_accuracy == 0 ? kUnknown : row->ensemble_accuracy,
                     {}};
  const auto& members = tables_->members;
  auto member = std::lower_bound(members.begin(), members.end(), code, by_code);
  for (; member != members.end() && member->code == code; ++member) {
    out.members.push_back(member->second);
  }
  return out;
}

std::optional<EllipsoidRecord> Registry::ellipsoid(int code) const {
  const EllipsoidRow* row = find(tables_->ellipsoids, code);
  if (!row) return std::nullopt;
  const double inverse_flattening =
      row->b > 0 && row->b < row->a ? row->a / (row->a - row->b) : row->inverse_flattening;
  return EllipsoidRecord{row->code, tables_->string(row->name), base_value({0, row->a, row->unit}),
                         inverse_flattening};
}

std::optional<MeridianRecord> Registry::meridian(int code) const {
  const MeridianRow* row = find(tables_->meridians, code);
  if (!row) return std::nullopt;
  return MeridianRecord{row->code, tables_->string(row->name), base_value(row->longitude)};
}

std::optional<UnitRecord> Registry::unit(int code) const {
  const UnitRow* row = find(tables_->units, code);
  if (!row) return std::nullopt;
  return UnitRecord{row->code, tables_->string(row->name), row->factor, row->kind};
}

std::optional<AreaRecord> Registry::area(int code) const {
  const AreaRow* row = find(tables_->areas, code);
  if (!row) return std::nullopt;
  return AreaRecord{row->code, tables_->string(row->name), row->west, row->south, row->east,
                    row->north};
}

std::optional<ConversionRecord> Registry::conversion(int code) const {
  const ConversionRow* row = find(tables_->conversions, code);
  if (!row) return std::nullopt;
  return ConversionRecord{row->code, tables_->string(row->name), row->method,
                          tables_->parameters_with(row->method, row->values, nullptr)};
}

std::optional<OperationRecord> Registry::operation(int code) const {
  const OperationRow* row = find(tables_->operations, code);
  if (!row) return std::nullopt;
  return tables_->record(*row);
}

std::optional<DeprecatedSystem> Registry::deprecated(int code) const {
  const DeprecatedRow* row = find(tables_->deprecated, code);
  if (!row) return std::nullopt;
  return DeprecatedSystem{row->code, tables_->string(row->name), row->replaced_by};
}

std::string Registry::method_name(int code) const {
  const Row* row = find(tables_->methods, code);
  return row ? tables_->string(row->name) : std::string();
}

std::string Registry::parameter_name(int code) const {
  const Row* row = find(tables_->parameters, code);
  return row ? tables_->string(row->name) : std::string();
}

double Registry::base_value(const Parameter& parameter) const {
  if (parameter.unit == 0) return parameter.value;  // a pure number
  if (parameter.unit == kDegreesMinutesSeconds || parameter.unit == kDegreesMinutes) {
    return sexagesimal(parameter.value, parameter.unit == kDegreesMinutesSeconds);
  }
  const UnitRow* row = find(tables_->units, parameter.unit);
  if (!row || row->factor == 0) {
    throw Error("The registry in \"" + tables_->path + "\" has a value in the unit " +
                std::to_string(parameter.unit) + ", which has no factor.");
  }
  // Epochs are years of the calendar, not spans of seconds.
  if (row->kind == UnitRecord::Kind::time) return parameter.value;
  return parameter.value * row->factor;
}

std::optional<SystemRecord> Registry::system(std::string_view name) const {
  return system(tables_->code_of(tables_->names().systems, tables_->systems, name));
}

std::optional<DatumRecord> Registry::datum(std::string_view name) const {
  return datum(tables_->code_of(tables_->names().datums, tables_->datums, name));
}

std::optional<EllipsoidRecord> Registry::ellipsoid(std::string_view name) const {
  return ellipsoid(tables_->code_of(tables_->names().ellipsoids, tables_->ellipsoids, name));
}

std::optional<MeridianRecord> Registry::meridian(std::string_view name) const {
  return meridian(tables_->code_of(tables_->names().meridians, tables_->meridians, name));
}

std::optional<UnitRecord> Registry::unit(std::string_view name) const {
  return unit(tables_->code_of(tables_->names().units, tables_->units, name));
}

std::vector<int> Registry::systems() const {
  std::vector<int> out;
  for (const SystemRow& row : tables_->systems) out.push_back(row.code);
  return out;
}

std::vector<int> Registry::ellipsoids() const {
  std::vector<int> out;
  for (const EllipsoidRow& row : tables_->ellipsoids) out.push_back(row.code);
  return out;
}

std::vector<int> Registry::operations() const {
  std::vector<int> out;
  for (const OperationRow& row : tables_->operations) out.push_back(row.code);
  return out;
}

std::vector<OperationRecord> Registry::operations(int source, int target) const {
  const int from = tables_->end_of(source);
  const int to = tables_->end_of(target);
  if (to == 0) return {};
  return tables_->operations_of(from, [&](const OperationRow& row) {
    const int row_from = tables_->end_of(row.source);
    const int row_to = tables_->end_of(row.target);
    return (row_from == from && row_to == to) || (row_from == to && row_to == from);
  });
}

std::vector<OperationRecord> Registry::operations(int system) const {
  return tables_->operations_of(tables_->end_of(system), [](const OperationRow&) { return true; });
}

std::vector<Found> Registry::search(std::string_view words, std::size_t limit) const {
  const std::string query = folded(words);
  std::vector<std::string_view> parts = split_words(query);
  if (parts.size() > 1 && parts[0] == "epsg") parts.erase(parts.begin());
  if (parts.empty()) return {};
  int code = 0;
  if (parts.size() == 1) std::from_chars(parts[0].data(), parts[0].data() + parts[0].size(), code);

  // Best first: how well the name answers, a name before another name, the kind, the code.
  struct Rank {
    int match;
    bool alias;
    bool other_kind;
    int code;

    bool operator<(const Rank& other) const {
      return std::tie(match, alias, other_kind, code) <
             std::tie(other.match, other.alias, other.other_kind, other.code);
    }
  };
  std::vector<Rank> ranks;
  for (const Entry& entry : tables_->names().entries) {
    const Match match = match_of(entry.folded, parts, query);
    const bool is_code = entry.code == code;
    if (match == Match::none && !is_code) continue;
    const SystemKind kind = find(tables_->systems, entry.code)->kind;
    ranks.push_back({is_code ? -1 : static_cast<int>(match), entry.alias,
                     kind != SystemKind::projected && kind != SystemKind::geographic2d,
                     entry.code});
  }
  std::sort(ranks.begin(), ranks.end());
  std::vector<Found> out;
  for (const Rank& rank : ranks) {
    if (out.size() == limit) break;
    if (std::any_of(out.begin(), out.end(), [&](const Found& f) { return f.code == rank.code; })) {
      continue;
    }
    const SystemRow* row = find(tables_->systems, rank.code);
    out.push_back({row->code, tables_->string(row->name), row->kind});
  }
  return out;
}

std::vector<std::string> Registry::suggest(std::string_view name, std::size_t limit) const {
  const std::string wanted = name_key(name);
  if (wanted.empty()) return {};
  const std::size_t most = std::max<std::size_t>(2, wanted.size() / 3);
  std::vector<std::tuple<std::size_t, bool, int>> near;
  const auto consider = [&](const Row& row, bool alias) {
    // The whole name, or what stands behind its datum: "Lambert-93" of "RGF93 v1 / Lambert-93".
    const std::string_view full = tables_->view(row.name);
    const std::size_t slash = full.find(" / ");
    std::size_t apart = letters_apart(wanted, name_key(full), most);
    if (slash != std::string_view::npos) {
      apart = std::min(apart, letters_apart(wanted, name_key(full.substr(slash)), most));
    }
    if (apart <= most) near.emplace_back(apart, alias, row.code);
  };
  for (const SystemRow& row : tables_->systems) consider(row, false);
  for (const AliasRow& row : tables_->aliases) {
    if (row.kind == kSystemAlias && find(tables_->systems, row.code)) consider(row, true);
  }
  std::sort(near.begin(), near.end());
  std::vector<std::string> out;
  for (const auto& [apart, alias, code] : near) {
    if (out.size() == limit) break;
    std::string found = tables_->string(find(tables_->systems, code)->name);
    if (std::find(out.begin(), out.end(), found) == out.end()) out.push_back(std::move(found));
  }
  return out;
}

}  // namespace tidewater::detail
