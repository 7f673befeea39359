#include "magnetic_model.hpp"

#include <algorithm>
#include <limits>
#include <optional>
#include <utility>

#include "ellipsoid.hpp"
#include "status_name.hpp"
#include "tidewater/catalogue.h"

namespace tidewater::command {

namespace {

// A position that differs by less than this many metres keeps the sums of the one before it.
constexpr double kSameParallel = 1e-6;
// A value that no position comes near.
constexpr double kNowhere = 1e30;
// Names in the store's lists, each with room for its terminator.
constexpr std::size_t kModelName = 41;
constexpr std::size_t kTableName = 33;
// Room for any text of a model's row.
constexpr std::size_t kTextField = 64;

}  // namespace

// The row of a model and those of its epochs.
struct MagneticModel::Info {
  Info(const std::string& store, const std::string& model_name) : name(model_name) {
    TWstatus status = TW_SUCCESS;
    std::string key = name;
    int16_t number = 0;
    char publisher[kTextField] = {};
    char table[kTextField] = {};
    int32_t epoch_count = 0;
    TWmagmdl_info(store.c_str(), key.data(), &number, 1, table, &radius, &normalisation, publisher,
                  &first_date, &last_date, &interval, &epoch_count, &status);
    require(status, status == TW_PF_OPEN_ERROR ? store : name);
    // A set of coefficients and a set of rates are the least that makes a model.
    if (epoch_count < 2) require(TW_BAD_HARMONIC_MODEL, name);
    const auto count = static_cast<std::size_t>(epoch_count);
    degrees.resize(count);
    epochs.resize(count);
    table_names.resize(count * kTableName);
    TWepoch_info(store.c_str(), table, degrees.data(), epochs.data(), table_names.data(), &status);
    require(status, name);
    if (count > 2 && !(interval > 0)) require(TW_BAD_HARMONIC_MODEL, name);
  }

  // The epoch of the newest coefficients; the last set holds their rates.
  double newest_epoch() const { return *(epochs.end() - 2); }

  static Info newest(const std::string& store) {
    TWstatus status = TW_SUCCESS;
    int32_t count = 0;
    TWmag_mdl_cnt(store.c_str(), &count, &status);
    require(status, store);
    std::vector<char> names(static_cast<std::size_t>(std::max(count, 0)) * kModelName + kTextField);
    TWmagmdl_names(store.c_str(), names.data(), &status);
    require(status, store);
    std::optional<Info> newest;
    for (int32_t i = 0; i < count; ++i) {
      Info info(store, names.data() + static_cast<std::size_t>(i) * kModelName);
      if (!newest || info.newest_epoch() > newest->newest_epoch()) newest = std::move(info);
    }
    if (!newest) require(TW_NO_SUCH_MODEL, store);
    return *std::move(newest);
  }

  std::string name;
  double radius = 0;
  int16_t normalisation = 0;
  double first_date = 0;
  double last_date = 0;
  double interval = 0;  // years between two epochs
  std::vector<int32_t> degrees;
  std::vector<double> epochs;
  std::vector<char> table_names;
};

MagneticModel::Triangle::Triangle(int32_t degree) {
  const auto rows = static_cast<std::size_t>(degree) + 1;
  block_.resize(rows * (rows + 1) / 2);
  for (std::size_t n = 0; n < rows; ++n) rows_.push_back(block_.data() + n * (n + 1) / 2);
}

void MagneticModel::Series::reserve(int32_t most) {
  cosines = Triangle(most);
  sines = Triangle(most);
  for (auto* sum : {&dC, &dS, &lC, &lS, &rC, &rS, &C, &S}) {
    sum->resize(static_cast<std::size_t>(most) + 1);
  }
  last_colat = last_radius = kNowhere;
}

MagneticModel::MagneticModel(const std::string& store, const std::string& name, double date)
    : last_lon_(kNowhere) {
  const Info info = name.empty() ? Info::newest(store) : Info(store, name);
  name_ = info.name;
  first_date_ = info.first_date;
  last_date_ = info.last_date;
  radius_ = info.radius;
  const int32_t most = *std::max_element(info.degrees.begin(), info.degrees.end());
  main_.reserve(most);
  secular_.reserve(most);
  rec_a_ = Triangle(most);
  rec_b_ = Triangle(most);
  TWstatus status = TW_SUCCESS;
  TWhar_recur_c(most, rec_a_.rows(), rec_b_.rows(), &status);
  set_date(store, info, date);
}

void MagneticModel::set_date(const std::string& store, const Info& info, double date) {
  std::vector<Triangle> triangles;
  std::vector<double**> c_sets;
  std::vector<double**> s_sets;
  for (const int32_t degree : info.degrees) {
    c_sets.push_back(triangles.emplace_back(degree).rows());
    s_sets.push_back(triangles.emplace_back(degree).rows());
  }
  const auto count = static_cast<int32_t>(info.degrees.size());
  TWstatus status = TW_SUCCESS;
  TWmm_coef_info(store.c_str(), count, info.degrees.data(), info.table_names.data(), c_sets.data(),
                 s_sets.data(), &status);
  require(status, info.name);
  for (std::size_t i = 0; i < c_sets.size() && info.normalisation != 0; ++i) {
    TWhar_normaliz(info.normalisation, info.degrees[i], c_sets[i], s_sets[i], &status);
    require(status, info.name);
  }
  double last_date = std::numeric_limits<double>::quiet_NaN();
  TWhar_set_date(date, &last_date, 0, count, info.degrees.data(), info.epochs.data(), info.interval,
                 c_sets.data(), s_sets.data(), &main_.degree, &secular_.degree,
                 main_.cosines.rows(), main_.sines.rows(), secular_.cosines.rows(),
                 secular_.sines.rows(), &status);
  require(status, info.name);
  // The library sums from degree 2 on.
  if (secular_.degree < 2) require(TW_BAD_HARMONIC_MODEL, info.name);
}

std::vector<MagneticField> MagneticModel::at(const std::vector<CoordinateTriple>& points) {
  static const Ellipsoid wgs84 = find_ellipsoid("WGS 84");
  std::vector<CoordinateTriple> vectors(points.size());
  std::vector<CoordinateTriple> vector_rates(points.size());
  std::vector<MagneticElements> elements(points.size());
  std::vector<MagneticElements> rates(points.size());
  Series& m = main_;
  Series& s = secular_;
  TWstatus status = TW_SUCCESS;
  TWhar_mag_var(m.degree, radius_, m.cosines.rows(), m.sines.rows(), rec_a_.rows(), rec_b_.rows(),
                m.dC.data(), m.dS.data(), m.lC.data(), m.lS.data(), m.rC.data(), m.rS.data(),
                m.C.data(), m.S.data(), &m.last_colat, &m.last_radius, &last_lon_, kSameParallel,
                &m.tcos, &m.tsin, &m.scale_theta, &m.scale_lambda, &m.scale_r, s.degree,
                s.cosines.rows(), s.sines.rows(), s.dC.data(), s.dS.data(), s.lC.data(),
                s.lS.data(), s.rC.data(), s.rS.data(), s.C.data(), s.S.data(), &s.last_colat,
                &s.last_radius, &s.tcos, &s.tsin, &s.scale_theta, &s.scale_lambda, &s.scale_r,
                wgs84.a, wgs84.e(), static_cast<int32_t>(points.size()), points.data(),
                vectors.data(), elements.data(), vector_rates.data(), rates.data(), &status);
  require(status, name_);
  std::vector<MagneticField> fields;
  fields.reserve(points.size());
  for (std::size_t i = 0; i < points.size(); ++i) {
    fields.push_back({vectors[i], elements[i], vector_rates[i], rates[i]});
  }
  return fields;
}

}  // namespace tidewater::command
