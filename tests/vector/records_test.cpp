// tests/vector/records_test.cpp -- checks for vector/records.cpp.
#include <gtest/gtest.h>

#include <cstdint>

#include "support/real_checks.h"
#include "vector/vector_api.h"

namespace {
// Identity plus the translation (1, -2, 0.5): every transformed coordinate is exact.
const double kShift[12] = {1, 0, 0, 0, 1, 0, 0, 0, 1, 1, -2, 0.5};
}  // namespace

TEST(Trapnt, TransformsTheGridPointsOnlyAndSkipsBadShapes) {
  // nu = 2 points per row, ld = 3, nv = 2 rows: points at reals 1-6 and 10-15.
  double p[18], q[18];
  for (int k = 0; k < 18; ++k) p[k] = k, q[k] = -1;
  std::int32_t dim = 3, nu = 2, ld = 3, nv = 2, two = 2, zero = 0;
  trapnt(kShift, &dim, &nu, &ld, &nv, nullptr, p, q);
  expect_bits(q, {1, -1, 2.5, 4, 2, 5.5, -1, -1, -1, 10, 8, 11.5, 13, 11, 14.5, -1, -1, -1});
  trapnt(kShift, &two, &nu, &ld, &nv, nullptr, p, p);
  trapnt(kShift, &dim, &zero, &ld, &nv, nullptr, p, p);
  trapnt(kShift, &dim, &nu, &ld, &zero, nullptr, p, p);
  trapnt(kShift, &dim, &nu, &zero, &nv, nullptr, p, p);
  EXPECT_EQ(p[0], 0.0);  // none of them did anything
}

TEST(Records, CurveAndSurfacePointsMoveHeadersStay) {
  struct {
    std::int16_t field[8];  // seven fields, then two bytes before the points at byte 16
    double point[9];
  } curve{{0, 3, 0, 0, 2}, {0, 1, 2, 3, 4, 5, 6, 7, 8}}, cout{};
  for (auto& f : cout.field) f = 77;
  rbctra(kShift, &curve, &cout);  // dimension 3 (field 2), 2 points (field 5)
  expect_bits(cout.point, {1, -1, 2.5, 4, 2, 5.5, 0});
  EXPECT_EQ(cout.field[1], 77);
  curve.field[1] = 2;  // a plane curve: nothing is done
  rbctra(kShift, &curve, &curve);
  EXPECT_EQ(curve.point[0], 0.0);
  struct {
    std::int16_t field[12];  // eleven fields, then two bytes before the points at byte 24
    double point[15];
  } surf{{0, 0, 0, 0, 0, 0, 2, 2}, {}}, sout{};
  for (int k = 0; k < 15; ++k) surf.point[k] = k;
  rbstra(kShift, &surf, &sout);  // 2 by 2 points (fields 7 and 8)
  expect_bits(sout.point + 9, {10, 8, 11.5, 0});
}

TEST(Records, HeaderFieldsUnpackInTheirOrderSignExtended) {
  const std::int16_t c[7] = {11, -12, 13, 14, 15, 16, -32768};
  std::int32_t o[11];
  rbclcp(c, &o[0], &o[1], &o[2], &o[3], &o[4], &o[5], &o[6]);
  const std::int32_t cw[7] = {11, -12, 15, -32768, 13, 14, 16};  // fields 1 2 5 7 3 4 6
  for (int k = 0; k < 7; ++k) EXPECT_EQ(o[k], cw[k]) << k;
  const std::int16_t s[11] = {101, 102, 103, 104, 105, 106, 107, -108, 109, 110, 111};
  rbslcp(s, &o[0], &o[1], &o[2], &o[3], &o[4], &o[5], &o[6], &o[7], &o[8], &o[9], &o[10]);
  // Fields 1, 2, 7, 8, 11, 3, 5, 9, 4, 6, 10.
  const std::int32_t sw[11] = {101, 102, 107, -108, 111, 103, 105, 109, 104, 106, 110};
  for (int k = 0; k < 11; ++k) EXPECT_EQ(o[k], sw[k]) << k;
}
