// tests/poly/gauss_legendre_test.cpp -- checks for poly/gauss_legendre.cpp.
#include <gtest/gtest.h>

#include <cmath>
#include <vector>

#include "poly/poly_api.h"
#include "support/recording_services.h"

namespace {

// Abscissae seen by the recording integrands, in call order. record1 returns 1 on call
// number g_hit (from 1) and 0 on the others, or x^p + x^(p-1) when g_hit is 0.
std::vector<double> g_xs, g_ys;
int g_hit = 0, g_power = 0;
double record1(const double* x) {
  g_xs.push_back(*x);
  if (g_hit > 0) return static_cast<int>(g_xs.size()) == g_hit ? 1.0 : 0.0;
  return std::pow(*x, g_power) + std::pow(*x, g_power - 1);
}
double record2(const double* x, const double* y) {
  g_xs.push_back(*x);
  g_ys.push_back(*y);
  return *x * *y;
}
void reset(int hit, int power = 0) {
  g_xs.clear();
  g_ys.clear();
  g_hit = hit;
  g_power = power;
}

// Positive nodes and weights (t, w) of the rules of kRules[r] points, by increasing t: Newton's
// method on the Legendre recurrence in 80-digit decimal arithmetic, w = 2 / ((1 - x^2)
// P'(x)^2), rounded to the nearest double.
const int kRules[8] = {2, 4, 6, 8, 10, 12, 16, 20};
// clang-format off
const std::vector<std::pair<double, double>> kExact[8] = {
    {{0x1.279a74590331cp-1, 0x1.0000000000000p+0}},
    {{0x1.5c23fd9dd3dfcp-2, 0x1.4de5f840c24cap-1}, {0x1.b8e6dbcf63985p-1, 0x1.64340f7e7b66bp-2}},
    {{0x1.e8b12d03675c5p-3, 0x1.df24d499545e8p-2}, {0x1.528a09655c95ep-1, 0x1.716b7b5794c1cp-2},
     {0x1.dd6ca4e80a01ep-1, 0x1.5edf601e2dbf8p-3}},
    {{0x1.77ac94f3c7345p-3, 0x1.736360b199343p-2}, {0x1.0d129583284b4p-1, 0x1.413c50a255615p-2},
     {0x1.97e4ab249f41ep-1, 0x1.c76fb531d2b96p-3}, {0x1.ebab1cb0acc67p-1, 0x1.9ea1d04ca0374p-4}},
    {{0x1.30e507891e27ap-3, 0x1.2e9de7014d6efp-2}, {0x1.bbcc009016adcp-2, 0x1.13baa7a559bfep-2},
     {0x1.5bdb9228de198p-1, 0x1.c0b059d00bc31p-3}, {0x1.bae995e9cb2f3p-1, 0x1.32138c878efe5p-3},
     {0x1.f2a3e062af2d8p-1, 0x1.1115f8b62dc1fp-4}},
    {{0x1.007a5f8f630e4p-3, 0x1.fe40ce6d4f025p-3}, {0x1.78a8d20a8b19dp-2, 0x1.de3155c256ab5p-3},
     {0x1.2cb4f05c077f9p-1, 0x1.a0163e6b1ab72p-3}, {0x1.8a30aeed88f36p-1, 0x1.47d7258f22d8fp-3},
     {0x1.cee874ffb88b4p-1, 0x1.b60602bce6181p-4}, {0x1.f68f1d8e42e81p-1, 0x1.8275d9dea6d8fp-5}},
    {{0x1.852bd6676a9f9p-4, 0x1.83feae80e4dfcp-3}, {0x1.205cae642337cp-2, 0x1.75f8c77e0c00fp-3},
     {0x1.d50259a43a772p-2, 0x1.5a6ebbb5a75fcp-3}, {0x1.3c5a466d5e8b8p-1, 0x1.325f61bca3cbfp-3},
     {0x1.82c45dda4726bp-1, 0x1.fe7af2bad386ap-4}, {0x1.bb3403514e483p-1, 0x1.85c4ee79cc258p-4},
     {0x1.e39f56616f9b0p-1, 0x1.fdfb1a2c1265dp-5}, {0x1.fa92c264d787ep-1, 0x1.bcddab4b7c211p-6}},
    {{0x1.3973df98b86b0p-4, 0x1.38d6c490a3370p-3}, {0x1.d281636928bc0p-3, 0x1.31819b52c5992p-3},
     {0x1.7eaccf15652c4p-2, 0x1.230348f34a535p-3}, {0x1.05905c13f7ff7p-1, 0x1.0db2c5db26dffp-3},
     {0x1.45a8d3fa710dbp-1, 0x1.e41ff31573b48p-4}, {0x1.7e1f37346a54ep-1, 0x1.a1817a317a821p-4},
     {0x1.ada0bd5efd6e7p-1, 0x1.5519fe196e24ap-4}, {0x1.d31064173fd92p-1, 0x1.00b467df7e475p-4},
     {0x1.ed8dba7bd769fp-1, 0x1.4c9b5ea53b67fp-5}, {0x1.fc7b5a0c71ce0p-1, 0x1.209680274e8afp-6}},
};
// clang-format on

}  // namespace

TEST(Gauleg, NodesAndWeightsAreTheCorrectlyRoundedValues) {
  // On [-1, 1], m = 0 and h = 1: the integrand sees +t then -t exactly, and one that is 1
  // on call 2k + 1 only makes the result w_k exactly.
  const double a = -1, b = 1;
  for (int r = 0; r < 8; ++r) {
    for (int k = 0; k < static_cast<int>(kExact[r].size()); ++k) {
      const auto [t, w] = kExact[r][k];
      reset(2 * k + 1);
      std::int32_t n = kRules[r];
      const double got = gauleg(record1, &a, &b, &n);
      ASSERT_EQ(g_xs.size(), static_cast<std::size_t>(kRules[r]));
      EXPECT_EQ((std::vector{bits(g_xs[2 * k]), bits(g_xs[2 * k + 1]), bits(got)}),
                (std::vector{bits(t), bits(-t), bits(w)}))
          << n << " points, node " << k;
    }
  }
}

TEST(Gauleg, CallsCountOrderAndExactness) {
  // Counts clamped to 1..20 and rounded up to a rule; pairs by increasing node, m + u
  // first; x^(2k-1) + x^(2k-2) on [0, 1] is exact: 1 / (2k) + 1 / (2k - 1).
  const double a = 0, b = 1;
  const int asked[11] = {-5, 0, 1, 3, 5, 7, 9, 11, 13, 17, 50};
  const int rules[11] = {2, 2, 2, 4, 6, 8, 10, 12, 16, 20, 20};
  for (int i = 0; i < 11; ++i) {
    const int rule = rules[i];
    reset(0, 2 * rule - 1);
    std::int32_t n = asked[i];
    const double got = gauleg(record1, &a, &b, &n);
    ASSERT_EQ(g_xs.size(), static_cast<std::size_t>(rule)) << n;
    EXPECT_NEAR(got, 1.0 / (2 * rule) + 1.0 / (2 * rule - 1), 4e-16) << n;
    for (int k = 0; k < rule; k += 2) {
      EXPECT_GT(g_xs[k], k > 0 ? g_xs[k - 2] : 0.5);
      EXPECT_NEAR(g_xs[k] - 0.5, 0.5 - g_xs[k + 1], 1e-15);
    }
  }
  // Reversed interval: the negated value. Empty interval: 0 after calls at the point.
  reset(0, 3);
  std::int32_t n = 1;
  EXPECT_NEAR(gauleg(record1, &b, &a, &n), -(0.25 + 1.0 / 3), 1e-16);
  const double p = 2.385;
  reset(0, 1);
  EXPECT_EQ(gauleg(record1, &p, &p, &n), 0.0);
  EXPECT_EQ(g_xs, std::vector<double>(2, p));
}

TEST(Dauleg, CallOrderCountAndExactness) {
  const double a = 0, b = 1, c = 0, d = 2;
  std::int32_t nx = 1, ny = 1;
  reset(0);
  EXPECT_NEAR(dauleg(record2, &a, &b, &c, &d, &nx, &ny), 1.0, 1e-15);
  // (xp, yp), (xp, ym), (xm, yp), (xm, ym).
  ASSERT_EQ(g_xs.size(), 4u);
  EXPECT_TRUE(g_xs[0] > 0.5 && g_xs[1] == g_xs[0] && g_xs[2] < 0.5 && g_xs[3] == g_xs[2]);
  EXPECT_TRUE(g_ys[0] > 1 && g_ys[1] < 1 && g_ys[2] == g_ys[0] && g_ys[3] == g_ys[1]);
  // 4 kx ky calls: 3 -> 4 points, 13 -> 16 points.
  nx = 3;
  ny = 13;
  reset(0);
  EXPECT_NEAR(dauleg(record2, &a, &b, &c, &d, &nx, &ny), 1.0, 1e-15);
  EXPECT_EQ(g_xs.size(), 4u * 2 * 8);
}
