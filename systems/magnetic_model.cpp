#include "tidewater/magnetic_model.hpp"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <iterator>
#include <optional>

#include "block.hpp"
#include "makers.hpp"
#include "store_path.hpp"
#include "tidewater/catalogue.h"
#include "tidewater/magnetic.h"

namespace tidewater {

namespace detail {

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

// The ellipsoid of the models.
constexpr double kWgs84A = 6378137;
constexpr double kWgs84F = 1 / 298.257223563;

// A triangular array; a copy has rows of its own.
class Triangle {
 public:
  explicit Triangle(int32_t degree) {
    const auto rows = static_cast<std::size_t>(degree) + 1;
    block_.resize(rows * (rows + 1) / 2);
    for (std::size_t n = 0; n < rows; ++n) rows_.push_back(block_.data() + n * (n + 1) / 2);
  }
  Triangle(Triangle&&) = default;
  Triangle(const Triangle& other) : Triangle(static_cast<int32_t>(other.rows_.size()) - 1) {
    block_ = other.block_;
    for (std::size_t n = 0; n < rows_.size(); ++n) rows_[n] = block_.data() + n * (n + 1) / 2;
  }
  Triangle& operator=(const Triangle&) = delete;

  // The functions of the library take tables that they do not change without const.
  double** rows() const { return const_cast<double**>(rows_.data()); }

 private:
  std::vector<double> block_;
  std::vector<double*> rows_;
};

// What the library remembers of a series' sums.
struct Sums {
  explicit Sums(int32_t most) {
    for (auto* sum : {&dC, &dS, &lC, &lS, &rC, &rS, &C, &S}) {
      sum->resize(static_cast<std::size_t>(most) + 1);
    }
  }
  std::vector<double> dC, dS, lC, lS, rC, rS, C, S;
  double last_colat = kNowhere, last_radius = kNowhere;
  double tcos = 0, tsin = 0, scale_theta = 0, scale_lambda = 0, scale_r = 0;
};

[[noreturn]] void fail(const std::string& sentence) { throw Error(sentence); }

void need_store(const std::string& store, TWstatus status) {
  if (status == TW_PF_OPEN_ERROR) fail("The parameter store \"" + store + "\" cannot be opened.");
}

std::string shown(double year) {
  char text[40];
  std::snprintf(text, sizeof text, "%.10g", year);
  return text;
}

// The row of a model and those of its epochs.
struct Info {
  Info(const std::string& store, const std::string& model_name) : name(model_name) {
    TWstatus status = TW_SUCCESS;
    std::string key = name;
    key.resize(std::max(key.size(), kModelName));
    int16_t number = 0;
    char publisher[kTextField] = {};
    char table[kTextField] = {};
    int32_t epoch_count = 0;
    TWmagmdl_info(store.c_str(), key.data(), &number, 1, table, &radius, &normalisation, publisher,
                  &first_date, &last_date, &interval, &epoch_count, &status);
    need_store(store, status);
    if (!TW_OK(status)) fail("The magnetic model " + name + " cannot be read.");
    // A set of coefficients and a set of rates are the least that makes a model.
    if (epoch_count < 2) fail("The magnetic model " + name + " has no rates of change.");
    const auto count = static_cast<std::size_t>(epoch_count);
    degrees.resize(count);
    epochs.resize(count);
    table_names.resize(count * kTableName);
    TWepoch_info(store.c_str(), table, degrees.data(), epochs.data(), table_names.data(), &status);
    if (!TW_OK(status) || (count > 2 && !(interval > 0))) {
      fail("The epochs of the magnetic model " + name + " cannot be used.");
    }
  }

  // The epoch of the newest coefficients; the last set holds their rates.
  double newest_epoch() const { return *(epochs.end() - 2); }

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

std::vector<std::string> model_names(const std::string& store) {
  TWstatus status = TW_SUCCESS;
  int32_t count = 0;
  TWmag_mdl_cnt(store.c_str(), &count, &status);
  need_store(store, status);
  if (!TW_OK(status)) fail("The store \"" + store + "\" has no magnetic models.");
  std::vector<char> names(static_cast<std::size_t>(std::max(count, 0)) * kModelName + kTextField);
  TWmagmdl_names(store.c_str(), names.data(), &status);
  if (!TW_OK(status)) fail("The magnetic models of the store \"" + store + "\" cannot be read.");
  std::vector<std::string> list;
  list.reserve(static_cast<std::size_t>(std::max(count, 0)));
  for (int32_t i = 0; i < count; ++i) {
    list.emplace_back(names.data() + static_cast<std::size_t>(i) * kModelName);
  }
  return list;
}

// Letters and digits of a name: "IGRF-14" is "igrf14".
std::string plain(std::string_view name) {
  std::string text;
  for (const char c : name) {
    if (c >= 'A' && c <= 'Z') text += static_cast<char>(c - 'A' + 'a');
    if ((c >= 'a' && c <= 'z') || (c >= '0' && c <= '9')) text += c;
  }
  return text;
}

// A model's name without its generation or year: "igrf".
std::string series_of(std::string_view name) {
  std::string text = plain(name);
  text.resize(text.find_last_not_of("0123456789") + 1);
  return text;
}

// The models that a name may mean: its own, or all of a series.
std::vector<std::string> meant(const std::string& store, std::string_view name) {
  std::vector<std::string> list = model_names(store);
  if (name.empty()) return list;
  const auto keep = [&list](auto&& fits) {
    std::vector<std::string> kept;
    std::copy_if(list.begin(), list.end(), std::back_inserter(kept), fits);
    return kept;
  };
  const std::string wanted = plain(name);
  auto kept = keep([&](const std::string& model) { return model == name; });
  if (kept.empty()) kept = keep([&](const std::string& model) { return plain(model) == wanted; });
  if (kept.empty() && !wanted.empty()) {
    kept = keep([&](const std::string& model) { return series_of(model) == wanted; });
  }
  return kept;
}

// Of those meant the one of the newest coefficients; of two of one epoch the one that is made for
// the present alone.
Info chosen(const std::string& store, std::string_view name) {
  std::optional<Info> newest;
  for (const std::string& model : meant(store, name)) {
    Info info(store, model);
    if (!newest || info.newest_epoch() > newest->newest_epoch() ||
        (info.newest_epoch() == newest->newest_epoch() && info.first_date > newest->first_date)) {
      newest = std::move(info);
    }
  }
  if (newest) return *std::move(newest);
  if (name.empty()) fail("The store \"" + store + "\" has no magnetic models.");
  fail("The store \"" + store + "\" has no magnetic model \"" + std::string(name) +
       "\"; MagneticModel::models() lists those it has.");
}

}  // namespace

class MagneticModelImpl {
 public:
  MagneticModelImpl(const std::string& store, std::string_view name, double date)
      : info(chosen(store, name)),
        year(date),
        most_(*std::max_element(info.degrees.begin(), info.degrees.end())),
        cosines_(most_),
        sines_(most_),
        cosine_rates_(most_),
        sine_rates_(most_),
        rec_a_(most_),
        rec_b_(most_) {
    TWstatus status = TW_SUCCESS;
    TWhar_recur_c(most_, rec_a_.rows(), rec_b_.rows(), &status);
    std::vector<Triangle> triangles;
    std::vector<double**> c_sets;
    std::vector<double**> s_sets;
    for (const int32_t degree : info.degrees) {
      c_sets.push_back(triangles.emplace_back(degree).rows());
      s_sets.push_back(triangles.emplace_back(degree).rows());
    }
    const auto count = static_cast<int32_t>(info.degrees.size());
    TWmm_coef_info(store.c_str(), count, info.degrees.data(), info.table_names.data(),
                   c_sets.data(), s_sets.data(), &status);
    for (std::size_t i = 0; i < c_sets.size() && info.normalisation != 0 && TW_OK(status); ++i) {
      TWhar_normaliz(info.normalisation, info.degrees[i], c_sets[i], s_sets[i], &status);
    }
    if (!TW_OK(status)) fail("The coefficients of " + info.name + " cannot be used.");
    double last_date = kNotANumber;
    TWhar_set_date(date, &last_date, 0, count, info.degrees.data(), info.epochs.data(),
                   info.interval, c_sets.data(), s_sets.data(), &degree_, &rate_degree_,
                   cosines_.rows(), sines_.rows(), cosine_rates_.rows(), sine_rates_.rows(),
                   &status);
    // The library sums from degree 2 on.
    if (!TW_OK(status) || rate_degree_ < 2 || !std::isfinite(date)) {
      fail("The magnetic model " + info.name + " has no field at " + shown(date) +
           "; it is published for " + shown(info.first_date) + " to " + shown(info.last_date) +
           ".");
    }
  }

  // At points that are radians and metres; the words of those that fail are set.
  // What the library writes beside its results is the caller's, so that threads do not meet: the
  // sums, and a copy of recursion(), in which it keeps the sines of a longitude.
  void at(Block& block, MagneticValue* out, Sums& main, Sums& rates, const Triangle& rec_b,
          double& last_lon) const {
    CoordinateTriple vectors[kBlockSize];
    CoordinateTriple changes[kBlockSize];
    MagneticElements elements[kBlockSize];
    MagneticElements element_rates[kBlockSize];
    TWstatus status = TW_SUCCESS;
    TWhar_mag_var(degree_, info.radius, cosines_.rows(), sines_.rows(), rec_a_.rows(), rec_b.rows(),
                  main.dC.data(), main.dS.data(), main.lC.data(), main.lS.data(), main.rC.data(),
                  main.rS.data(), main.C.data(), main.S.data(), &main.last_colat, &main.last_radius,
                  &last_lon, kSameParallel, &main.tcos, &main.tsin, &main.scale_theta,
                  &main.scale_lambda, &main.scale_r, rate_degree_, cosine_rates_.rows(),
                  sine_rates_.rows(), rates.dC.data(), rates.dS.data(), rates.lC.data(),
                  rates.lS.data(), rates.rC.data(), rates.rS.data(), rates.C.data(), rates.S.data(),
                  &rates.last_colat, &rates.last_radius, &rates.tcos, &rates.tsin,
                  &rates.scale_theta, &rates.scale_lambda, &rates.scale_r, kWgs84A,
                  std::sqrt(kWgs84F * (2 - kWgs84F)), block.count, block.now, vectors, elements,
                  changes, element_rates, &status);
    for (int i = 0; i < block.count; ++i) {
      if (!TW_OK(status)) block.fail(i, status);
      if (!std::isfinite(elements[i].total)) block.fail(i, TW_RANGE_ERROR);
      const auto field = [](const CoordinateTriple& v, const MagneticElements& e) {
        return MagneticField{v.x,
                             v.y,
                             v.z,
                             e.horizontal,
                             e.total,
                             e.declination * kDegreesPerRadian,
                             e.inclination * kDegreesPerRadian};
      };
      out[i] = {field(vectors[i], elements[i]), field(changes[i], element_rates[i])};
      if (block.words[i] != TW_SUCCESS) {
        const MagneticField none = {kNotANumber, kNotANumber, kNotANumber, kNotANumber,
                                    kNotANumber, kNotANumber, kNotANumber};
        out[i] = {none, none};
      }
    }
  }

  int32_t most() const { return most_; }
  const Triangle& recursion() const { return rec_b_; }

  const Info info;
  const double year;

 private:
  int32_t most_, degree_ = 0, rate_degree_ = 0;
  Triangle cosines_, sines_, cosine_rates_, sine_rates_, rec_a_, rec_b_;
};

}  // namespace detail

MagneticModel::MagneticModel(std::string_view name, double year)
    : impl_(std::make_shared<const detail::MagneticModelImpl>(detail::store_path(), name, year)) {}

const std::string& MagneticModel::name() const { return impl_->info.name; }
double MagneticModel::year() const { return impl_->year; }
double MagneticModel::first_year() const { return impl_->info.first_date; }
double MagneticModel::last_year() const { return impl_->info.last_date; }

Summary MagneticModel::field(std::size_t count, Coordinates<const double> in, MagneticValue* out,
                             Run run) const noexcept {
  return detail::run_blocks(
      count, run,
      [&](std::size_t at, detail::Block& block) {
        for (int i = 0; i < block.count; ++i) {
          const auto k = static_cast<std::ptrdiff_t>(at + static_cast<std::size_t>(i)) * in.stride;
          const double lon = in.x[k];
          const double lat = in.y[k];
          const double height = in.z == nullptr ? 0 : in.z[k];
          block.now[i] = {lon * detail::kRadiansPerDegree, lat * detail::kRadiansPerDegree, height};
          if (!(std::fabs(lon) <= 720)) block.fail(i, TW_BAD_LONGITUDE);
          if (!(std::fabs(lat) <= 90)) block.fail(i, TW_BAD_LATITUDE);
          if (!(std::fabs(height) <= 1e9)) block.fail(i, TW_BAD_INPUT);
          // A point that has failed is computed somewhere, and not handed out.
          if (block.words[i] != TW_SUCCESS) block.now[i] = {0, 0, 0};
        }
        try {
          detail::Sums main(impl_->most());
          detail::Sums rates(impl_->most());
          const detail::Triangle rec_b = impl_->recursion();
          double last_lon = detail::kNowhere;
          impl_->at(block, out + at, main, rates, rec_b, last_lon);
        } catch (const std::bad_alloc&) {
          for (int i = 0; i < block.count; ++i) block.fail(i, TW_NO_MEMORY);
        }
      },
      [](detail::Block&) {}, [](std::size_t, const detail::Block&) {});
}

MagneticValue MagneticModel::field(Point point) const noexcept {
  MagneticValue value;
  field(1, Coordinates<const double>{&point.x, &point.y, &point.z}, &value);
  return value;
}

std::vector<std::string> MagneticModel::models() {
  return detail::model_names(detail::store_path());
}

}  // namespace tidewater
