#include <gtest/gtest.h>

#include <cmath>
#include <cstdlib>

#include "support/harmonics.hpp"
#include "support/little_memory.hpp"

using namespace tidewater::test;

namespace {

// Coefficient sets of given degrees, with row tables of TWhar_alocCtnm().
class Sets {
 public:
  explicit Sets(std::vector<int32_t> set_degrees) : degrees(std::move(set_degrees)) {
    std::size_t size = 0;
    for (const int32_t n : degrees) size += static_cast<std::size_t>((n + 1) * (n + 2) / 2);
    c_block.resize(size);
    s_block.resize(size);
    C.resize(degrees.size());
    S.resize(degrees.size());
    TWstatus status = 0;
    TWhar_alocCtnm(static_cast<int32_t>(degrees.size()), degrees.data(), c_block.data(),
                   s_block.data(), C.data(), S.data(), &status);
    EXPECT_EQ(status, TW_SUCCESS);
  }
  ~Sets() {
    for (double** table : C) std::free(table);
    for (double** table : S) std::free(table);
  }
  Sets(const Sets&) = delete;
  Sets& operator=(const Sets&) = delete;

  // C of set i is base + 100 i + 10 n + m, S its negative with another unit digit.
  void number() {
    for (std::size_t i = 0; i < degrees.size(); ++i) {
      for (int32_t n = 0; n <= degrees[i]; ++n) {
        for (int32_t m = 0; m <= n; ++m) {
          C[i][n][m] = value(i, n, m);
          S[i][n][m] = -value(i, n, m) - 0.5;
        }
      }
    }
  }
  static double value(std::size_t i, int32_t n, int32_t m) {
    // quadratic in i, so that differences of sets differ too
    return 100.0 * static_cast<double>(i * i) + 10 * n + m + (i > 0 ? 0.25 * n : 0);
  }

  std::vector<int32_t> degrees;
  std::vector<double> c_block, s_block;
  std::vector<double**> C, S;
};

// The four outputs of an interpolation.
struct Outputs {
  explicit Outputs(int32_t degree)
      : cnm(degree, kUntouched),
        snm(degree, kUntouched),
        ctnm(degree, kUntouched),
        stnm(degree, kUntouched) {}
  bool untouched() const {
    for (const Triangle* t : {&cnm, &snm, &ctnm, &stnm}) {
      for (const double v : t->block()) {
        if (v != kUntouched) return false;
      }
    }
    return true;
  }
  Triangle cnm, snm, ctnm, stnm;
};

TEST(HarmonicTables, RowsOfSetsStandOneBehindTheOther) {
  const Sets sets({3, 2, 0, 5});
  const std::ptrdiff_t starts[] = {0, 10, 16, 17};
  for (std::size_t i = 0; i < 4; ++i) {
    for (int32_t n = 0; n <= sets.degrees[i]; ++n) {
      EXPECT_EQ(sets.C[i][n] - sets.c_block.data(), starts[i] + n * (n + 1) / 2);
      EXPECT_EQ(sets.S[i][n] - sets.s_block.data(), starts[i] + n * (n + 1) / 2);
    }
  }
}

TEST(HarmonicTables, NoSetsAndNegativeDegrees) {
  double block = 0;
  double** C[2] = {};
  double** S[2] = {};
  for (const int32_t k : {0, -1, -2147483647}) {
    TWstatus status = 0;
    TWhar_alocCtnm(k, nullptr, &block, &block, C, S, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_EQ(C[0], nullptr);
  }
  const int32_t degrees[] = {-2147483647, 0};
  TWstatus status = 0;
  TWhar_alocCtnm(2, degrees, &block, &block, C, S, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_EQ(C[1][0], &block);  // a set without rows takes no room
  for (double*** table : {&C[0], &C[1], &S[0], &S[1]}) {
    EXPECT_NE(*table, nullptr);
    std::free(*table);
  }
}

TEST(HarmonicTables, SixTablesNeverReachTheCaller) {
  double blocks[6][6] = {};
  double* mine[6] = {blocks[5], blocks[4], blocks[3], blocks[2], blocks[1], blocks[0]};
  for (const int32_t N : {2, 0, -1, -2147483647}) {
    TWstatus status = 0;
    TWhar_aloc_Cnm(N, blocks[0], blocks[1], blocks[2], blocks[3], blocks[4], blocks[5], &mine[0],
                   &mine[1], &mine[2], &mine[3], &mine[4], &mine[5], &status);
    EXPECT_EQ(status, TW_SUCCESS);
    for (std::size_t k = 0; k < 6; ++k) EXPECT_EQ(mine[k], blocks[5 - k]);
  }
}

TEST(HarmonicTables, ANullBlockIsNotReadNorCountedFrom) {
  TWstatus status = 0;
  TWhar_aloc_Cnm(3, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr,
                 nullptr, nullptr, nullptr, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  const int32_t degrees[] = {1, 2};
  double** C[2] = {};
  double** S[2] = {};
  TWhar_alocCtnm(2, degrees, nullptr, nullptr, C, S, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  for (double** table : {C[0], C[1], S[0], S[1]}) {
    EXPECT_EQ(table[0], nullptr);
    EXPECT_EQ(table[1], nullptr);
    std::free(table);
  }
}

TEST(HarmonicTables, AFailedAllocationLeavesNothing) {
  TIDEWATER_NEED_MEMORY_LIMIT();
  expect_with_little_memory([] {
    static double block[16];
    const int32_t degrees[] = {2, 2147483646, 3};
    double* other[1] = {};
    double** C[3] = {other, other, other};
    double** S[3] = {other, other, other};
    TWstatus status = 0;
    TWhar_alocCtnm(3, degrees, block, block, C, S, &status);
    return status == TW_NO_MEMORY && !C[0] && !C[1] && !S[0] && !S[1] && C[2] == other &&
           S[2] == other;
  });
  expect_with_little_memory([] {
    static double block[16];
    TWstatus status = 0;
    TWhar_aloc_Cnm(2147483647, block, block, block, block, block, block, nullptr, nullptr, nullptr,
                   nullptr, nullptr, nullptr, &status);
    return status == TW_NO_MEMORY;
  });
}

TEST(HarmonicRecursion, ConstantsOfDegreeFour) {
  Triangle a(4, kUntouched), b(4, kUntouched);
  TWstatus status = 0;
  TWhar_recur_c(4, a.rows(), b.rows(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_EQ(a(0, 0), 1);
  EXPECT_EQ(a(1, 1), std::sqrt(3.0));
  EXPECT_DOUBLE_EQ(a(2, 2), std::sqrt(1.25));
  EXPECT_DOUBLE_EQ(a(3, 3), std::sqrt(7.0 / 6));
  EXPECT_DOUBLE_EQ(a(4, 4), std::sqrt(1.125));
  EXPECT_DOUBLE_EQ(a(1, 0), std::sqrt(3.0));
  EXPECT_DOUBLE_EQ(a(2, 1), std::sqrt(5.0));
  EXPECT_DOUBLE_EQ(a(3, 2), std::sqrt(7.0));
  EXPECT_DOUBLE_EQ(a(4, 3), 3);
  // by hand: sqrt((2n - 1)(2n + 1) / ((n - m)(n + m)))
  EXPECT_DOUBLE_EQ(a(2, 0), std::sqrt(15.0 / 4));
  EXPECT_DOUBLE_EQ(a(3, 0), std::sqrt(35.0 / 9));
  EXPECT_DOUBLE_EQ(a(3, 1), std::sqrt(35.0 / 8));
  EXPECT_DOUBLE_EQ(a(4, 0), std::sqrt(63.0 / 16));
  EXPECT_DOUBLE_EQ(a(4, 1), std::sqrt(63.0 / 15));
  EXPECT_DOUBLE_EQ(a(4, 2), std::sqrt(63.0 / 12));
  EXPECT_DOUBLE_EQ(b(2, 0), -std::sqrt(5.0 / 4));
  EXPECT_DOUBLE_EQ(b(3, 0), -std::sqrt(28.0 / 27));
  EXPECT_DOUBLE_EQ(b(3, 1), -std::sqrt(21.0 / 24));
  EXPECT_DOUBLE_EQ(b(4, 0), -std::sqrt(81.0 / 80));
  EXPECT_DOUBLE_EQ(b(4, 1), -std::sqrt(72.0 / 75));
  EXPECT_DOUBLE_EQ(b(4, 2), -std::sqrt(45.0 / 60));
  // the places of the sines hold no constant
  for (int32_t n = 0; n <= 4; ++n) {
    EXPECT_EQ(b(n, n), kUntouched);
    if (n > 0) {
      EXPECT_EQ(b(n, n - 1), kUntouched);
    }
  }
}

TEST(HarmonicRecursion, LowDegrees) {
  TWstatus status = 0;
  Triangle a1(1, kUntouched), b1(1, kUntouched);
  TWhar_recur_c(1, a1.rows(), b1.rows(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_EQ(a1(1, 0), std::sqrt(3.0));
  EXPECT_EQ(a1(1, 1), std::sqrt(3.0));
  Triangle a0(0, kUntouched), b0(0, kUntouched);
  TWhar_recur_c(0, a0.rows(), b0.rows(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_EQ(a0(0, 0), 1);
  TWhar_recur_c(-2147483647, nullptr, nullptr, &status);
  EXPECT_EQ(status, TW_SUCCESS);
}

TEST(HarmonicNormalisation, SchmidtToFull) {
  Coefficients c(3);
  for (int32_t n = 0; n <= 3; ++n) {
    for (int32_t m = 0; m <= n; ++m) {
      c.C(n, m) = 3 + m;
      c.S(n, m) = -7 - m;
    }
  }
  TWstatus status = 0;
  TWhar_normaliz(2, 3, c.C.rows(), c.S.rows(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_EQ(c.C(1, 1), 4 / std::sqrt(3.0));
  EXPECT_EQ(c.C(0, 0), 3);
  for (int32_t n = 0; n <= 3; ++n) {
    for (int32_t m = 0; m <= n; ++m) {
      EXPECT_DOUBLE_EQ(c.C(n, m) * std::sqrt(2.0 * n + 1), 3 + m);
      EXPECT_DOUBLE_EQ(c.S(n, m) * std::sqrt(2.0 * n + 1), -7 - m);
    }
  }
}

TEST(HarmonicNormalisation, DoubleFactorialOfKindOne) {
  Coefficients c(4);
  for (int32_t n = 0; n <= 4; ++n) {
    for (int32_t m = 0; m <= n; ++m) {
      c.C(n, m) = 2;
      c.S(n, m) = -3;
    }
  }
  TWstatus status = 0;
  TWhar_normaliz(1, 4, c.C.rows(), c.S.rows(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  // By hand, g / (2 (2n + 1) h) with g = (2m - 1)!! (2m)(2m + 1) .. (n + m), h = (n - m)!:
  const double squared[5][5] = {
      {1},
      {1.0 / 3, 2.0 / 6},
      {1.0 / 5, 6.0 / 10, 12.0 / 10},
      {1.0 / 7, 24.0 / (14 * 2), 60.0 / 14, 90.0 / 14},
      {1.0 / 9, 120.0 / (18 * 6), 360.0 / (18 * 2), 630.0 / 18, 840.0 / 18}};
  for (int32_t n = 0; n <= 4; ++n) {
    for (int32_t m = 0; m <= n; ++m) {
      EXPECT_DOUBLE_EQ(c.C(n, m), 2 * std::sqrt(squared[n][m])) << n << ' ' << m;
      EXPECT_DOUBLE_EQ(c.S(n, m), -3 * std::sqrt(squared[n][m])) << n << ' ' << m;
    }
  }
  // A textbook conversion, with (n + m)! / (n - m)!, agrees at order 1 and parts from it at
  // order 2.
  const double textbook_21 = std::sqrt(6.0 / (2 * 5)), textbook_22 = std::sqrt(24.0 / (2 * 5));
  EXPECT_DOUBLE_EQ(c.C(2, 1), 2 * textbook_21);
  EXPECT_GT(std::fabs(c.C(2, 2) - 2 * textbook_22), 0.5);
}

TEST(HarmonicNormalisation, OtherKindsChangeNothing) {
  for (const int32_t kind : {0, 3, -1, 2147483647}) {
    Triangle C(2, 5), S(2, 6);
    TWstatus status = 0;
    TWhar_normaliz(kind, 2, C.rows(), S.rows(), &status);
    EXPECT_EQ(status, TW_BAD_HARMONIC_MODEL);
    for (const double v : C.block()) EXPECT_EQ(v, 5);
    for (const double v : S.block()) EXPECT_EQ(v, 6);
  }
  TWstatus status = 0;
  TWhar_normaliz(1, -1, nullptr, nullptr, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  TWhar_normaliz(2, -1, nullptr, nullptr, &status);
  EXPECT_EQ(status, TW_SUCCESS);
}

class HarmonicInterpolation : public testing::Test {
 protected:
  HarmonicInterpolation() { sets_.number(); }
  TWstatus interpolate(int16_t flag, double dt, double tolerance, int32_t n_main, int32_t n_sec) {
    TWstatus status = 0;
    TWhar_intp_Cnm(flag, 4, dt, tolerance, 1, n_main, n_sec, sets_.C.data(), sets_.S.data(),
                   out_.cnm.rows(), out_.snm.rows(), out_.ctnm.rows(), out_.stnm.rows(), &status);
    return status;
  }
  Sets sets_{{2, 3, 3}};
  Outputs out_{3};
};

TEST_F(HarmonicInterpolation, BetweenTwoModels) {
  EXPECT_EQ(interpolate(0, 3, 0, 3, 2), TW_SUCCESS);
  for (int32_t n = 0; n <= 3; ++n) {
    for (int32_t m = 0; m <= n; ++m) {
      // set 1 plus three quarters of the 300 that set 2 is above it
      EXPECT_EQ(out_.cnm(n, m), Sets::value(1, n, m) + 225);
      EXPECT_EQ(out_.snm(n, m), -Sets::value(1, n, m) - 0.5 - 225);
      EXPECT_EQ(out_.ctnm(n, m), n <= 2 ? 75 : kUntouched);
      EXPECT_EQ(out_.stnm(n, m), n <= 2 ? -75 : kUntouched);
    }
  }
}

TEST_F(HarmonicInterpolation, LastIntervalHoldsRates) {
  EXPECT_EQ(interpolate(1, 3, 0, 2, 3), TW_SUCCESS);
  for (int32_t n = 0; n <= 3; ++n) {
    for (int32_t m = 0; m <= n; ++m) {
      const double c = Sets::value(1, n, m), rate = Sets::value(2, n, m);
      EXPECT_EQ(out_.cnm(n, m), n <= 2 ? c + 3 * rate : kUntouched);
      EXPECT_EQ(out_.snm(n, m), n <= 2 ? -c - 0.5 + 3 * (-rate - 0.5) : kUntouched);
      EXPECT_EQ(out_.ctnm(n, m), rate);
      EXPECT_EQ(out_.stnm(n, m), -rate - 0.5);
    }
  }
}

TEST_F(HarmonicInterpolation, TheToleranceItselfIsInterpolated) {
  for (const int16_t flag : {int16_t{0}, int16_t{1}}) {
    EXPECT_EQ(interpolate(flag, 1, 1, 3, 3), TW_SUCCESS);
    EXPECT_NE(out_.cnm(3, 1), Sets::value(1, 3, 1));
    EXPECT_EQ(interpolate(flag, std::nextafter(1.0, 0), 1, 3, 3), TW_SUCCESS);
    EXPECT_EQ(out_.cnm(3, 1), Sets::value(1, 3, 1));
    EXPECT_EQ(out_.snm(3, 1), -Sets::value(1, 3, 1) - 0.5);
    EXPECT_NE(out_.ctnm(3, 1), 0);  // the rates are formed all the same
    EXPECT_EQ(interpolate(flag, kNaN, 0, 3, 3), TW_SUCCESS);
    EXPECT_EQ(out_.cnm(3, 1), Sets::value(1, 3, 1));
  }
}

TEST_F(HarmonicInterpolation, AnyOtherFlagIsRefused) {
  for (const int16_t flag : {int16_t{2}, int16_t{-1}, int16_t{32767}}) {
    EXPECT_EQ(interpolate(flag, 1, 0, 3, 3), TW_BAD_INPUT);
    EXPECT_TRUE(out_.untouched());
  }
}

// Three models at 2000, 2010, 2020 and the rates of the last as a fourth set.
class HarmonicDate : public testing::Test {
 protected:
  HarmonicDate() { sets_.number(); }
  TWstatus set(double date, double tolerance = 0, int32_t epoch_count = 4) {
    TWstatus status = 0;
    TWhar_set_date(date, &last_date_, tolerance, epoch_count, sets_.degrees.data(), epochs_, 10,
                   sets_.C.data(), sets_.S.data(), &n_main_, &n_sec_, out_.cnm.rows(),
                   out_.snm.rows(), out_.ctnm.rows(), out_.stnm.rows(), &status);
    return status;
  }
  void expect_untouched_outputs() {
    EXPECT_TRUE(out_.untouched());
    EXPECT_EQ(n_main_, -7);
    EXPECT_EQ(n_sec_, -7);
  }
  static double value(std::size_t i) { return Sets::value(i, 1, 1); }

  Sets sets_{{4, 2, 3, 2}};
  Outputs out_{4};
  const double epochs_[4] = {2000, 2010, 2020, 2025};
  double last_date_ = 1e30;
  int32_t n_main_ = -7, n_sec_ = -7;
};

TEST_F(HarmonicDate, FewerThanTwoEpochsHaveNoInterval) {
  EXPECT_EQ(set(2002, 0, 1), TW_BAD_INPUT);
  EXPECT_EQ(set(1999, 0, 1), TW_BAD_DATE);
  EXPECT_EQ(set(2006, 0, 1), TW_BAD_DATE);
  EXPECT_EQ(set(2002, 0, 0), TW_BAD_INPUT);
  EXPECT_EQ(set(2002, 0, -2147483647), TW_BAD_INPUT);
  expect_untouched_outputs();
  EXPECT_EQ(last_date_, 1e30);
  last_date_ = 2002;
  EXPECT_EQ(set(2002, 0, 1), TW_SUCCESS);  // nothing to do
  expect_untouched_outputs();
}

TEST_F(HarmonicDate, LimitsOfTheDate) {
  EXPECT_EQ(set(std::nextafter(2000.0, 0)), TW_BAD_DATE);
  EXPECT_EQ(set(std::nextafter(2030.0, 3000)), TW_BAD_DATE);
  EXPECT_EQ(set(kInfinity), TW_BAD_DATE);
  EXPECT_EQ(set(-kInfinity), TW_BAD_DATE);
  expect_untouched_outputs();
  EXPECT_EQ(last_date_, 1e30);
  EXPECT_EQ(set(2000), TW_SUCCESS);
  EXPECT_EQ(set(2030), TW_SUCCESS);
  EXPECT_EQ(last_date_, 2030);
}

TEST_F(HarmonicDate, TheFirstEpochWithAToleranceIsItsSet) {
  EXPECT_EQ(set(2000, 1e-9), TW_SUCCESS);
  EXPECT_EQ(n_main_, 4);  // not interpolated: the degree of the set itself
  EXPECT_EQ(n_sec_, 2);
  for (int32_t n = 0; n <= 4; ++n) {
    for (int32_t m = 0; m <= n; ++m) EXPECT_EQ(out_.cnm(n, m), Sets::value(0, n, m));
  }
  EXPECT_EQ(out_.ctnm(2, 1), (Sets::value(1, 2, 1) - Sets::value(0, 2, 1)) / 10);
  EXPECT_EQ(out_.ctnm(3, 1), kUntouched);
}

TEST_F(HarmonicDate, WithoutAToleranceAnEpochCountsAsInterpolated) {
  EXPECT_EQ(set(2000, 0), TW_SUCCESS);
  EXPECT_EQ(n_main_, 2);
  EXPECT_EQ(out_.cnm(1, 1), value(0));
  EXPECT_EQ(out_.cnm(3, 1), kUntouched);
}

TEST_F(HarmonicDate, EachIntervalHasItsBase) {
  EXPECT_EQ(set(2004), TW_SUCCESS);
  EXPECT_DOUBLE_EQ(out_.cnm(1, 1), value(0) + 0.4 * (value(1) - value(0)));
  EXPECT_EQ(set(2010), TW_SUCCESS);
  EXPECT_EQ(out_.cnm(1, 1), value(1));
  EXPECT_DOUBLE_EQ(out_.ctnm(1, 1), (value(2) - value(1)) / 10);
  EXPECT_EQ(set(2019), TW_SUCCESS);
  EXPECT_DOUBLE_EQ(out_.cnm(1, 1), value(1) + 0.9 * (value(2) - value(1)));
  EXPECT_EQ(n_main_, 2);
}

TEST_F(HarmonicDate, AfterTheLastModelTheRatesServe) {
  for (const double date : {2020.0, 2023.0, 2027.0}) {  // beyond the epoch of the rates too
    last_date_ = 1e30;
    EXPECT_EQ(set(date), TW_SUCCESS);
    EXPECT_EQ(n_main_, 2);
    EXPECT_EQ(n_sec_, 2);
    EXPECT_DOUBLE_EQ(out_.cnm(1, 1), value(2) + (date - 2020) * value(3));
    EXPECT_EQ(out_.ctnm(1, 1), value(3));
  }
}

TEST_F(HarmonicDate, LessThanAUnitChangesNothing) {
  last_date_ = 2005;
  EXPECT_EQ(set(2005.9), TW_SUCCESS);
  EXPECT_EQ(set(2004.1), TW_SUCCESS);
  EXPECT_EQ(set(std::nextafter(2006.0, 0)), TW_SUCCESS);
  expect_untouched_outputs();
  EXPECT_EQ(last_date_, 2005);
  EXPECT_EQ(set(2006), TW_SUCCESS);
  EXPECT_EQ(last_date_, 2006);
  EXPECT_DOUBLE_EQ(out_.cnm(1, 1), value(0) + 0.6 * (value(1) - value(0)));
  EXPECT_EQ(set(2005), TW_SUCCESS);  // and a whole one back
  EXPECT_EQ(last_date_, 2005);
}

TEST_F(HarmonicDate, WholeUnitsCountAgainstTheTolerance) {
  last_date_ = 2005;
  EXPECT_EQ(set(2007.9, 2), TW_SUCCESS);  // truncated to the tolerance itself
  expect_untouched_outputs();
  EXPECT_EQ(set(2008, 2), TW_SUCCESS);
  EXPECT_EQ(last_date_, 2008);
}

TEST_F(HarmonicDate, NotANumber) {
  last_date_ = kNaN;  // holds no date yet
  EXPECT_EQ(set(2005), TW_SUCCESS);
  EXPECT_EQ(last_date_, 2005);
  EXPECT_EQ(set(kNaN), TW_SUCCESS);  // passes both limits, and has no dt to interpolate by
  EXPECT_TRUE(std::isnan(last_date_));
  EXPECT_EQ(n_main_, 3);
  EXPECT_EQ(out_.cnm(1, 1), value(2));
}

TEST_F(HarmonicDate, AModelOfOneEpochAndItsRates) {
  const double epochs[] = {2020, 2025};
  TWstatus status = 0;
  TWhar_set_date(2022.5, &last_date_, 0, 2, sets_.degrees.data(), epochs, 5, sets_.C.data(),
                 sets_.S.data(), &n_main_, &n_sec_, out_.cnm.rows(), out_.snm.rows(),
                 out_.ctnm.rows(), out_.stnm.rows(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_DOUBLE_EQ(out_.cnm(1, 1), value(0) + 2.5 * value(1));
}

}  // namespace
