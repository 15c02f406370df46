// tests/linalg/elimination_bits_test.cpp -- ynsega, ynmimr and ynmxmr agree to the bit with
// plain transcriptions of their algorithms, on random matrices, on small-integer matrices
// full of pivot ties, and on matrices with zero blocks, infinities and NaNs.
#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <limits>
#include <random>
#include <vector>

#include "linalg/linalg_api.h"
#include "linalg_reference.h"
#include "plain_elimination.h"
#include "support/recording_services.h"

namespace {

// Matrices of kind 0: uniform reals; 1: small integers (many ties, exact cancellations);
// 2: small integers with a sprinkling of zeros, infinities and NaNs; 3: nearly dependent
// rows (the cancellation flush of the determinant).
std::vector<double> sample(std::mt19937_64& rng, int n, int kind) {
  std::uniform_real_distribution<double> u(-1.0, 1.0);
  std::uniform_int_distribution<int> small(-3, 3), pick(0, 40);
  std::vector<double> a(n * n);
  for (double& v : a) v = kind == 0 ? u(rng) : small(rng);
  if (kind == 2) {
    for (double& v : a) {
      const int p = pick(rng);
      if (p == 0) v = std::numeric_limits<double>::quiet_NaN();
      if (p == 1) v = -std::numeric_limits<double>::infinity();
      if (p < 8) v = 0.0;
    }
  }
  if (kind == 3 && n > 1) {
    const double t = u(rng);
    for (int j = 0; j < n; ++j) a[n - 1 + j * n] = a[j * n] * t + a[1 + j * n] * 0.1;
  }
  return a;
}

void expect_same_bits(const std::vector<double>& got, const std::vector<double>& want,
                      const char* what, int n) {
  for (std::size_t e = 0; e < got.size(); ++e) {
    const bool both_nan = std::isnan(got[e]) && std::isnan(want[e]);
    if (!both_nan) {
      ASSERT_EQ(bits(got[e]), bits(want[e])) << what << " n=" << n << " e=" << e;
    }
  }
}

}  // namespace

TEST(EliminationBits, LibraryAgreesWithThePlainTranscriptions) {
  const std::uint64_t seed = test_seed();
  SCOPED_TRACE(testing::Message() << "ORVQ7_SEED=" << seed);
  std::mt19937_64 rng(seed);
  std::uniform_real_distribution<double> u(-1.0, 1.0);
  for (int rep = 0; rep < 150; ++rep) {
    for (std::int32_t n = 1; n <= 20; ++n) {
      const std::vector<double> a = sample(rng, n, rep % 4);
      std::vector<double> b(n), x(n, 0.0), want(n, 0.0);
      for (double& v : b) v = u(rng);
      std::int32_t ierr = -1;
      const int r = ynsega(&n, a.data(), b.data(), x.data(), &ierr);
      ASSERT_EQ(r, plain::solve(n, a.data(), b.data(), want.data())) << "solve n=" << n;
      expect_same_bits(x, want, "solve", n);
      if (n >= 3) {
        std::vector<double> inv(n * n, 0.0), inv_want(n * n, 0.0);
        const int ri = ynmimr(&n, a.data(), inv.data(), &ierr);
        const int pi = plain::invert(n, a.data(), inv_want.data());
        ASSERT_EQ(ri, pi) << "invert n=" << n;
        if (ri == 0) expect_same_bits(inv, inv_want, "invert", n);
      }
      if (n >= 4) {
        double det = 0;
        ASSERT_EQ(ynmxmr(&n, a.data(), &det, &ierr), 0);
        expect_same_bits({det}, {plain::determinant(n, a.data())}, "determinant", n);
      }
    }
  }
}
