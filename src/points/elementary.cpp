#include "points/elementary.hpp"

#include "points/double_double.hpp"

namespace tidewater::points {

namespace {

constexpr double kInf = __builtin_inf();
constexpr double kPi = 0x1.921fb54442d18p+1;

// 2 / pi, 32 bits an element, the first of weight 2^-32.
constexpr uint32_t kTwoOverPi[] = {
    0xa2f9836e, 0x4e441529, 0xfc2757d1, 0xf534ddc0, 0xdb629599, 0x3c439041, 0xfe5163ab,
    0xdebbc561, 0xb7246e3a, 0x424dd2e0, 0x06492eea, 0x09d1921c, 0xfe1deb1c, 0xb129a73e,
    0xe88235f5, 0x2ebb4484, 0xe99c7026, 0xb45f7e41, 0x3991d639, 0x835339f4, 0x9c845f8b,
    0xbdf9283b, 0x1ff897ff, 0xde05980f, 0xef2f118b, 0x5a0a6d1f, 0x6d367ecf, 0x27cb09b7,
    0x4f463f66, 0x9e5fea2d, 0x7527bac7, 0xebe5f17b, 0x3d0739f7, 0x8a5292ea, 0x6bfb5fb1,
    0x1f8d5d08, 0x56033046, 0xfc7b6bab, 0xf0cfbc20, 0x9af4361d, 0xa9e39161};

}  // namespace

// After M. Payne and R. Hanek, "Radian reduction for trigonometric functions", SIGNUM Newsletter
// 18(1), 1983: of x times 2 / pi only the bits that say the quadrant, and enough behind them.
SinCos<double> far_sincos(double v) {
  if (!(abs(v) < kInf)) return {v - v, v - v};
  const int exponent = static_cast<int>((bits(v) >> 52) & 0x7ff) - 1075;
  const uint64_t whole = (static_cast<uint64_t>(bits(v)) & 0xfffffffffffff) | (uint64_t{1} << 52);
  // |v| = whole 2^exponent.  Words before the first give whole turns.
  constexpr int kWords = 7;
  const int first = exponent >= 2 ? (exponent - 2) / 32 : 0;
  uint32_t product[kWords + 2] = {};  // the lowest word first
  uint64_t carry = 0;
  for (int i = 0; i < kWords + 1; ++i) {
    const uint64_t low = i < kWords ? kTwoOverPi[first + kWords - 1 - i] : 0;
    const uint64_t high = i > 0 ? kTwoOverPi[first + kWords - i] : 0;
    // Each of the two products is below 2^64 - 2^33, but their sum may not be.
    const uint64_t a = low * (whole & 0xffffffff) + (carry & 0xffffffff);
    const uint64_t b = high * (whole >> 32) + (carry >> 32);
    const uint64_t sum = (a & 0xffffffff) + (b & 0xffffffff);
    product[i] = static_cast<uint32_t>(sum);
    carry = (sum >> 32) + (a >> 32) + (b >> 32);
  }
  product[kWords + 1] = static_cast<uint32_t>(carry);

  // The point stands `behind` bits from the right.
  const int behind = 32 * (first + kWords) - exponent;
  const auto word_at = [&](int bit) {  // 32 bits from this one on
    uint64_t two = 0;
    for (int k = 1; k >= 0; --k) {
      const int i = (bit >= 0 ? bit / 32 : -1) + k;
      two = two << 32 | (i >= 0 && i < kWords + 2 ? product[i] : 0);
    }
    return static_cast<uint32_t>(two >> (bit >= 0 ? bit % 32 : bit + 32));
  };
  int64_t quadrant = word_at(behind) & 3;
  const bool upper = (word_at(behind - 1) & 1) != 0;  // nearer to the next quadrant
  DoubleDouble rest = {0, 0};
  double weight = 1;
  for (int at = behind - 32; at > -32; at -= 32) {
    weight *= 0x1p-32;
    const uint32_t word = upper ? ~word_at(at) : word_at(at);
    rest = rest + word * weight;
  }
  rest = rest * DoubleDouble{0x1.921fb54442d18p+0, 0x1.1a62633145c07p-54};
  if (upper) {
    ++quadrant;
    rest = {-rest.high, -rest.low};
  }
  SinCos<double> at = sincos_of_rest(rest.high, rest.low, quadrant);
  if (v < 0) at.sin = -at.sin;
  return at;
}

double odd_log(double v) {
  if (v == 0) return -kInf;
  if (!(v > 0)) return v == v ? __builtin_nan("") : v;
  if (v == kInf) return v;
  return log(v * 0x1p54) - 0x1.2b708872320e2p+5;  // 54 ln 2
}

double far_exp(double v) {
  if (v > 709.782712893384) return kInf;
  if (v < -745.1332191019412) return 0;
  if (v != v) return v;
  // By half the power twice, which is in range.
  const auto p = expm1_parts(v);
  const double half = nearest_whole(0.5 * p.k);
  return (1.0 + (p.r + p.tail)) * power_of_two(half) * power_of_two(p.k - half);
}

double odd_atan2(double y, double x) {
  if (x != x || y != y) return x + y;  // NOLINT(misc-redundant-expression)
  const bool back = copysign(1.0, x) < 0;
  if (abs(x) == kInf && abs(y) == kInf) return copysign(back ? 0.75 * kPi : 0.25 * kPi, y);
  if (y == 0 || abs(x) == kInf) return copysign(back ? kPi : 0.0, y);
  if (x == 0 || abs(y) == kInf) return copysign(0.5 * kPi, y);
  const double scale = greater(abs(x), abs(y)) > 1 ? 0x1p-600 : 0x1p600;
  return atan2(y * scale, x * scale);
}

}  // namespace tidewater::points
