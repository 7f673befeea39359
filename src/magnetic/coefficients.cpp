// Coefficient sets of a spherical-harmonic model: row tables, recursion constants, normalisation,
// and the coefficients of a date.
// S. A. Holmes and W. E. Featherstone, A unified approach to the Clenshaw summation and the
// recursive computation of very high degree and order normalised associated Legendre functions,
// Journal of Geodesy 76 (2002), 279-299, eq. 12.

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <cstdlib>
#include <initializer_list>

#include "tidewater/harmonic_synthesis.h"

namespace {

// How many units of time beyond its epoch the last set may be used.
constexpr double kExtrapolation = 5.0;

// Doubles in front of row n of a triangular array.
constexpr int64_t row_offset(int64_t n) { return n * (n + 1) / 2; }

constexpr int64_t row_count(int32_t degree) { return std::max<int64_t>(int64_t{degree} + 1, 0); }

// The rows of a triangular array that begins so many doubles into a block, from the C allocator;
// null where that fails.  The block is not read: the rows of a null one are null.  Not inline: a
// compiler that saw the table released unread would leave out the allocation and its failure.
[[gnu::noinline]] double** make_row_table(int32_t degree, double* block, int64_t first = 0) {
  const int64_t rows = row_count(degree);
  // Room for one pointer at least, so that null means a failure and nothing else.
  const auto places = static_cast<std::size_t>(std::max<int64_t>(rows, 1));
  // Where a pointer has 32 bits the product may be more than it counts: calloc looks.
  auto** table = static_cast<double**>(std::calloc(places, sizeof(double*)));
  if (!table) return nullptr;
  for (int64_t n = 0; n < rows; ++n) {
    table[n] = block ? block + first + row_offset(n) : nullptr;
  }
  return table;
}

void release(double**& table) {
  std::free(table);
  table = nullptr;
}

}  // namespace

void TWhar_aloc_Cnm(int32_t N, double* block1, double* block2, double* block3, double* block4,
                    double* block5, double* block6, void*, void*, void*, void*, void*, void*,
                    TWstatus* status) {
  *status = TW_SUCCESS;
  // By contract: the row tables arrive as plain values, so what is built here cannot reach the
  // caller. It is released at once, since nobody else could.
  for (double* block : {block1, block2, block3, block4, block5, block6}) {
    double** table = make_row_table(N, block);
    if (!table) *status = TW_NO_MEMORY;
    release(table);
  }
}

void TWhar_alocCtnm(int32_t k, const int32_t* degrees, double* c_block, double* s_block,
                    double*** c_sets, double*** s_sets, TWstatus* status) {
  *status = TW_SUCCESS;
  int64_t offset = 0;
  for (int32_t i = 0; i < k; ++i) {
    c_sets[i] = make_row_table(degrees[i], c_block, offset);
    s_sets[i] = make_row_table(degrees[i], s_block, offset);
    if (!c_sets[i] || !s_sets[i]) {
      *status = TW_NO_MEMORY;
      for (int32_t made = 0; made <= i; ++made) {
        release(c_sets[made]);
        release(s_sets[made]);
      }
      return;
    }
    offset += row_offset(row_count(degrees[i]));
  }
}

void TWhar_recur_c(int32_t N, double** rec_a, double** rec_b, TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t degree = 2; degree <= N; ++degree) {
    const double n = degree;
    for (int32_t order = 0; order <= degree - 2; ++order) {
      const double m = order;
      const double p = (n + m) * (n - m);
      rec_a[degree][order] = std::sqrt((2 * n - 1) * (2 * n + 1) / p);
      rec_b[degree][order] =
          -std::sqrt((n + m - 1) * (n - m - 1) * (2 * n + 1) / ((2 * n - 3) * p));
    }
  }
  for (int32_t m = 0; m < N; ++m) rec_a[m + 1][m] = std::sqrt(2.0 * m + 3);
  if (N >= 1) rec_a[1][1] = std::sqrt(3.0);
  for (int32_t degree = 2; degree <= N; ++degree) {
    const double n = degree;
    rec_a[degree][degree] = std::sqrt((2 * n + 1) / (2 * n));
  }
  if (N >= 0) rec_a[0][0] = 1;
}

void TWhar_normaliz(int32_t kind, int32_t N, double** C, double** S, TWstatus* status) {
  *status = TW_SUCCESS;
  if (kind == 2) {
    for (int32_t n = 0; n <= N; ++n) {
      const double root = std::sqrt(2.0 * n + 1);
      for (int32_t m = 0; m <= n; ++m) {
        C[n][m] /= root;
        S[n][m] /= root;
      }
    }
  } else if (kind == 1) {
    // By contract: f is the double factorial (2m - 1)!!, not the factorial of a textbook
    // conversion.
    double f = 1;
    for (int32_t m = 1; m <= N; ++m) {
      f *= 2.0 * m - 1;
      double g = f;
      double h = 1;
      for (int32_t n = m; n <= N; ++n) {
        g *= static_cast<double>(n) + m;
        if (n - m > 1) h *= n - m;
        const double factor = std::sqrt(g / ((2.0 * n + 1) * h * 2));
        C[n][m] *= factor;
        S[n][m] *= factor;
      }
    }
    for (int32_t n = 0; n <= N; ++n) {
      const double root = std::sqrt(2.0 * n + 1);
      C[n][0] /= root;
      S[n][0] /= root;
    }
  } else {
    *status = TW_BAD_HARMONIC_MODEL;
  }
}

void TWhar_intp_Cnm(int16_t last_interval, double interval, double dt, double tolerance, int32_t i,
                    int32_t n_main, int32_t n_sec, double*** c_sets, double*** s_sets, double** cnm,
                    double** snm, double** ctnm, double** stnm, TWstatus* status) {
  *status = TW_SUCCESS;
  if (last_interval != 0 && last_interval != 1) {
    *status = TW_BAD_INPUT;
    return;
  }
  // In the last interval set i + 1 holds the rates themselves.
  const bool rates = last_interval == 1;
  const bool interpolating = dt >= tolerance;

  const auto at_date = [=](double*** sets, double** out) {
    for (int32_t n = 0; n <= n_main; ++n) {
      for (int32_t m = 0; m <= n; ++m) {
        out[n][m] = sets[i][n][m];
        // Set i + 1 may be of a lower degree: without interpolation it is not looked at.
        if (!interpolating) continue;
        const double next = sets[i + 1][n][m];
        out[n][m] += rates ? next * dt : (next - sets[i][n][m]) * dt / interval;
      }
    }
  };
  const auto rate = [=](double*** sets, double** out) {
    for (int32_t n = 0; n <= n_sec; ++n) {
      for (int32_t m = 0; m <= n; ++m) {
        const double next = sets[i + 1][n][m];
        out[n][m] = rates ? next : (next - sets[i][n][m]) / interval;
      }
    }
  };
  at_date(c_sets, cnm);
  at_date(s_sets, snm);
  rate(c_sets, ctnm);
  rate(s_sets, stnm);
}

void TWhar_set_date(double date, double* last_date, double tolerance, int32_t epoch_count,
                    const int32_t* degrees, const double* epochs, double interval, double*** c_sets,
                    double*** s_sets, int32_t* n_main, int32_t* n_sec, double** cnm, double** snm,
                    double** ctnm, double** stnm, TWstatus* status) {
  *status = TW_SUCCESS;
  if (epoch_count < 1) {
    *status = TW_BAD_INPUT;
    return;
  }
  if (date < epochs[0] || date > epochs[epoch_count - 1] + kExtrapolation) {
    *status = TW_BAD_DATE;
    return;
  }
  // By contract: truncated first, so that less than one whole unit never leads to new coefficients.
  if (std::fabs(std::trunc(date - *last_date)) <= tolerance) return;
  if (epoch_count < 2) {  // a set without rates: there is nothing to interpolate
    *status = TW_BAD_INPUT;
    return;
  }
  *last_date = date;
  int32_t i = epoch_count - 2;  // the last set of all is never the base
  while (epochs[i] > date) --i;
  const double dt = date - epochs[i];
  *n_sec = std::min(degrees[i], degrees[i + 1]);
  *n_main = dt >= tolerance ? *n_sec : degrees[i];
  const int16_t last_interval = i == epoch_count - 2 ? 1 : 0;
  TWhar_intp_Cnm(last_interval, interval, dt, tolerance, i, *n_main, *n_sec, c_sets, s_sets, cnm,
                 snm, ctnm, stnm, status);
}
