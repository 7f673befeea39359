// Any coefficients, dates and points through the harmonic functions, with arrays of exactly the
// sizes that the headers name: what is cached between calls never leads beside them, and a fresh
// start gives the same field.

#include <cmath>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <iterator>
#include <limits>
#include <memory>
#include <vector>

#include "bytes.hpp"
#include "tidewater/magnetic.h"

namespace {

void fail(const char* what) {
  std::fprintf(stderr, "%s\n", what);
  std::abort();
}

int between(Bytes& bytes, int low, int high) { return low + bytes.byte() % (high - low + 1); }

double number(Bytes& bytes) {
  static const double kSpecial[] = {0,
                                    -0.0,
                                    1e-300,
                                    1e300,
                                    1.5707963267948966,
                                    -1.5707963267948966,
                                    3.141592653589793,
                                    std::numeric_limits<double>::infinity(),
                                    std::numeric_limits<double>::quiet_NaN(),
                                    6371200};
  const std::uint8_t kind = bytes.byte();
  if (kind >= 240) return bytes.any_double();
  if (kind >= 200) return kSpecial[bytes.byte() % std::size(kSpecial)];
  return (kind - 100) / 32.0;
}

// A triangular array over blocks of exactly its rows' sizes.
class Triangle {
 public:
  explicit Triangle(int32_t degree) {
    for (int32_t n = 0; n <= degree; ++n) {
      rows_.emplace_back(new double[static_cast<std::size_t>(n) + 1]());
      table_.push_back(rows_.back().get());
    }
  }
  double** rows() { return table_.data(); }
  void fill(Bytes& bytes) {
    for (std::size_t n = 0; n < table_.size(); ++n) {
      for (std::size_t m = 0; m <= n; ++m) table_[n][m] = number(bytes);
    }
  }

 private:
  std::vector<std::unique_ptr<double[]>> rows_;
  std::vector<double*> table_;
};

// Work arrays and what is remembered of one series.
struct Cache {
  explicit Cache(int32_t degree) {
    for (auto& sum : sums) sum.assign(static_cast<std::size_t>(degree) + 1, 0);
  }

  std::vector<double> sums[8];
  double colat = 1e30, radius = 1e30, lon = 1e30;
  double tcos = 0, tsin = 0, theta = 0, lambda = 0, r = 0;
};

bool same(double a, double b) { return a == b || (std::isnan(a) && std::isnan(b)); }

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  Bytes bytes(data, size);
  TWstatus status = 0;

  // Sets of a model, and the coefficients of a date.
  const int32_t k = between(bytes, 1, 4);
  std::vector<int32_t> degrees;
  std::vector<double> epochs;
  std::vector<Triangle> c_of_set, s_of_set;
  int32_t N = 2;
  for (int32_t i = 0; i < k; ++i) {
    degrees.push_back(between(bytes, 2, 9));
    epochs.push_back(2000 + 5 * i);
    N = std::max(N, degrees.back());
    c_of_set.emplace_back(degrees.back()).fill(bytes);
    s_of_set.emplace_back(degrees.back()).fill(bytes);
  }
  std::vector<double**> c_sets, s_sets;
  for (int32_t i = 0; i < k; ++i) {
    const auto at = static_cast<std::size_t>(i);
    TWhar_normaliz(between(bytes, 0, 3), degrees[at], c_of_set[at].rows(), s_of_set[at].rows(),
                   &status);
    c_sets.push_back(c_of_set[at].rows());
    s_sets.push_back(s_of_set[at].rows());
  }
  {
    std::vector<double**> c_tables(c_sets.size()), s_tables(c_sets.size());
    double block = 0;
    TWhar_alocCtnm(k, degrees.data(), &block, &block, c_tables.data(), s_tables.data(), &status);
    for (auto* tables : {&c_tables, &s_tables}) {
      for (double** table : *tables) std::free(table);
    }
    TWhar_aloc_Cnm(between(bytes, -3, 9), &block, &block, &block, &block, &block, &block, nullptr,
                   nullptr, nullptr, nullptr, nullptr, nullptr, &status);
  }
  Triangle C(N), S(N), Ct(N), St(N), rec_a(N), rec_b(N);
  int32_t n_main = N, n_sec = N;
  double last_date = std::numeric_limits<double>::quiet_NaN();
  TWhar_recur_c(N, rec_a.rows(), rec_b.rows(), &status);
  const double date = bytes.byte() < 200 ? 1999 + 0.1 * bytes.byte() : number(bytes);
  TWhar_set_date(date, &last_date, number(bytes), k, degrees.data(), epochs.data(), number(bytes),
                 c_sets.data(), s_sets.data(), &n_main, &n_sec, C.rows(), S.rows(), Ct.rows(),
                 St.rows(), &status);

  // A walk over points with one cache, and each of them again with a new one.
  const double tolerance = bytes.byte() % 2 == 0 ? 0 : number(bytes);
  const double a = bytes.byte() % 2 == 0 ? 6378137 : number(bytes);
  const double e = bytes.byte() % 2 == 0 ? 0.0818191908426215 : number(bytes);
  const double radius = bytes.byte() % 2 == 0 ? 6371200 : number(bytes);
  Cache walk(N), rates(n_sec);
  const auto field_of = [&](Cache& f, int32_t count, const CoordinateTriple* in,
                            CoordinateTriple* field, MagneticElements* elements) {
    TWhar_mag_val(n_main, radius, C.rows(), S.rows(), rec_a.rows(), rec_b.rows(), f.sums[0].data(),
                  f.sums[1].data(), f.sums[2].data(), f.sums[3].data(), f.sums[4].data(),
                  f.sums[5].data(), f.sums[6].data(), f.sums[7].data(), &f.colat, &f.radius, &f.lon,
                  tolerance, &f.tcos, &f.tsin, &f.theta, &f.lambda, &f.r, a, e, count, in, field,
                  elements, &status);
  };
  for (int call = 0; call < 4 && !bytes.empty(); ++call) {
    const int32_t count = between(bytes, -1, 9);
    std::vector<CoordinateTriple> in(count > 0 ? static_cast<std::size_t>(count) : 0);
    for (CoordinateTriple& p : in) {
      const double x = number(bytes), y = number(bytes), z = number(bytes);
      p = {x, y, z};
    }
    std::vector<CoordinateTriple> field(in.size()), sec_field(in.size());
    std::vector<MagneticElements> elements(in.size()), yearly(in.size());
    const int kind = bytes.byte() % 3;
    if (kind == 0) {
      // By contract a sum of no points clears the first: there must be one.
      if (count <= 0) continue;
      TWhar_sum(static_cast<int16_t>(between(bytes, -1, 6)), n_main, radius, C.rows(), S.rows(),
                rec_a.rows(), rec_b.rows(), walk.sums[0].data(), walk.sums[1].data(),
                walk.sums[2].data(), walk.sums[3].data(), walk.sums[4].data(), walk.sums[5].data(),
                walk.sums[6].data(), walk.sums[7].data(), &walk.colat, &walk.radius, &walk.lon,
                tolerance, &walk.tcos, &walk.tsin, &walk.theta, &walk.lambda, &walk.r, a, e, 3.9e14,
                9.78, 9.83, count, in.data(), field.data(), &status);
      walk = Cache(N);  // the caches hold for one mode
    } else if (kind == 1) {
      field_of(walk, count, in.data(), field.data(), elements.data());
      if (tolerance != 0) continue;
      // Points that were remembered exactly give what they give for the first time.
      for (std::size_t i = 0; i < in.size(); ++i) {
        Cache fresh(N);
        CoordinateTriple alone = {};
        MagneticElements alone_elements = {};
        field_of(fresh, 1, &in[i], &alone, &alone_elements);
        if (!same(alone.x, field[i].x) || !same(alone.y, field[i].y) ||
            !same(alone.z, field[i].z) || !same(alone_elements.total, elements[i].total)) {
          std::fprintf(stderr, "%zu: %.17g %.17g %.17g, alone %.17g %.17g %.17g\n", i, field[i].x,
                       field[i].y, field[i].z, alone.x, alone.y, alone.z);
          fail("TWhar_mag_val: another field alone than on a walk");
        }
      }
      walk = Cache(N);  // the table of sines is the last point's now
    } else {
      TWhar_mag_var(
          n_main, radius, C.rows(), S.rows(), rec_a.rows(), rec_b.rows(), walk.sums[0].data(),
          walk.sums[1].data(), walk.sums[2].data(), walk.sums[3].data(), walk.sums[4].data(),
          walk.sums[5].data(), walk.sums[6].data(), walk.sums[7].data(), &walk.colat, &walk.radius,
          &walk.lon, tolerance, &walk.tcos, &walk.tsin, &walk.theta, &walk.lambda, &walk.r,
          std::min(n_sec, n_main), Ct.rows(), St.rows(), rates.sums[0].data(), rates.sums[1].data(),
          rates.sums[2].data(), rates.sums[3].data(), rates.sums[4].data(), rates.sums[5].data(),
          rates.sums[6].data(), rates.sums[7].data(), &rates.colat, &rates.radius, &rates.tcos,
          &rates.tsin, &rates.theta, &rates.lambda, &rates.r, a, e, count, in.data(), field.data(),
          elements.data(), sec_field.data(), yearly.data(), &status);
    }
  }
  return 0;
}
