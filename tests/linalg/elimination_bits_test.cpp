// tests/linalg/elimination_bits_test.cpp -- ynsega, ynmimr and ynmxmr agree to the bit with
// plain transcriptions of their algorithms, on random matrices, on small-integer matrices
// full of pivot ties, on matrices with zeros, infinities and NaNs, and on matrices with
// nearly dependent rows (the determinant's cancellation flush).
#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <random>
#include <vector>

#include "linalg/linalg_api.h"
#include "linalg_reference.h"
#include "plain_elimination.h"
#include "support/recording_services.h"

namespace {
std::vector<double> matrix_of_kind(std::mt19937_64& rng, int n, int kind) {
  std::uniform_int_distribution<int> small(-3, 3), pick(0, 40);
  std::vector<double> a = sample(rng, n * n);
  if (kind == 0) return a;
  for (double& v : a) {
    v = small(rng);
    const int p = kind == 2 ? pick(rng) : 99;
    if (p < 8) v = p == 0 ? std::numeric_limits<double>::quiet_NaN() : p == 1 ? -INFINITY : 0.0;
  }
  if (kind == 3) {
    for (int j = 0; j < n; ++j) a[n - 1 + j * n] = a[j * n] * 0.3 + a[1 % n + j * n] * 0.1;
  }
  return a;
}
// Equal bit patterns, or both NaN.
bool same(double x, double y) { return bits(x) == bits(y) || (std::isnan(x) && std::isnan(y)); }
}  // namespace

TEST(EliminationBits, LibraryAgreesWithThePlainTranscriptions) {
  const std::uint64_t seed = test_seed();
  SCOPED_TRACE(testing::Message() << "ORVQ7_SEED=" << seed);
  std::mt19937_64 rng(seed);
  for (int rep = 0; rep < 200; ++rep) {
    for (std::int32_t n = 1; n <= 20; ++n) {
      const std::vector<double> a = matrix_of_kind(rng, n, rep % 4), b = sample(rng, n);
      std::vector<double> x(n, 0.0), want(n, 0.0), inv(n * n, 0.0), inv_want(n * n, 0.0);
      std::int32_t ierr = -1;
      ASSERT_EQ(ynsega(&n, a.data(), b.data(), x.data(), &ierr),
                plain::solve(n, a.data(), b.data(), want.data())) << "n=" << n;
      for (int i = 0; i < n; ++i) ASSERT_TRUE(same(x[i], want[i])) << "solve n=" << n;
      if (n >= 3) {
        const int r = ynmimr(&n, a.data(), inv.data(), &ierr);
        ASSERT_EQ(r, plain::invert(n, a.data(), inv_want.data())) << "n=" << n;
        for (int e = 0; r == 0 && e < n * n; ++e) {
          ASSERT_TRUE(same(inv[e], inv_want[e])) << "invert n=" << n;
        }
      }
      double det = 0;
      if (n >= 4 && ynmxmr(&n, a.data(), &det, &ierr) == 0) {
        ASSERT_TRUE(same(det, plain::determinant(n, a.data()))) << "determinant n=" << n;
      }
    }
  }
}
