// tests/vector/records_test.cpp -- checks for vector/records.cpp.
#include <gtest/gtest.h>

#include <cstdint>

#include "support/recording_services.h"
#include "vector/vector_api.h"

namespace {

// Identity plus the translation (1, -2, 0.5): every transformed coordinate is exact.
const double kShift[12] = {1, 0, 0, 0, 1, 0, 0, 0, 1, 1, -2, 0.5};

struct CurveRecord {
  std::int16_t field[8];  // seven fields, then the two bytes before the points
  double point[9];
};

struct SurfaceRecord {
  std::int16_t field[12];  // eleven fields, then the two bytes before the points
  double point[15];
};

}  // namespace

TEST(Trapnt, TransformsTheGridPointsOnlyAndSkipsBadShapes) {
  // nu = 2 points per row, ld = 3, nv = 2 rows: points at reals 1-3, 4-6, 10-12 and 13-15.
  double p[18], q[18];
  for (int k = 0; k < 18; ++k) {
    p[k] = k;
    q[k] = -1;
  }
  std::int32_t dim = 3, nu = 2, ld = 3, nv = 2;
  EXPECT_EQ(trapnt(kShift, &dim, &nu, &ld, &nv, nullptr, p, q), 0);
  const double t[3] = {1, -2, 0.5};
  for (int k = 0; k < 18; ++k) {
    const bool in_grid = k < 6 || (k >= 9 && k < 15);
    EXPECT_EQ(q[k], in_grid ? k + t[k % 3] : -1.0) << "real " << k + 1;
  }
  for (double& v : q) v = -1;
  for (std::int32_t bad : {2, 4}) EXPECT_EQ(trapnt(kShift, &bad, &nu, &ld, &nv, nullptr, p, q), 0);
  std::int32_t zero = 0;
  trapnt(kShift, &dim, &zero, &ld, &nv, nullptr, p, q);
  trapnt(kShift, &dim, &nu, &ld, &zero, nullptr, p, q);
  for (double v : q) EXPECT_EQ(v, -1.0);
  trapnt(kShift, &dim, &nu, &ld, &nv, nullptr, p, p);  // in place
  EXPECT_EQ(p[12], 13.0);
  EXPECT_EQ(p[13], 11.0);
  EXPECT_EQ(p[14], 14.5);
}

TEST(Rbctra, TransformsSpaceCurvesAndLeavesTheHeaderAlone) {
  CurveRecord in{}, out{};
  in.field[1] = 3;  // dimension
  in.field[4] = 2;  // number of points
  for (int k = 0; k < 9; ++k) in.point[k] = 0.25 * k;
  for (auto& f : out.field) f = 77;
  for (double& v : out.point) v = -9;
  EXPECT_EQ(rbctra(kShift, &in, &out), 0);
  EXPECT_EQ(out.point[0], 1.0);
  EXPECT_EQ(out.point[4], -1.0);
  EXPECT_EQ(out.point[5], 1.75);
  EXPECT_EQ(out.point[6], -9.0);  // a third point is not part of the curve
  for (auto f : out.field) EXPECT_EQ(f, 77);
  in.field[1] = 2;  // a plane curve: nothing to do
  for (double& v : out.point) v = -9;
  rbctra(kShift, &in, &out);
  for (double v : out.point) EXPECT_EQ(v, -9.0);
}

TEST(Rbstra, TransformsTheGridOfASurface) {
  SurfaceRecord in{}, out{};
  in.field[6] = 2;  // points in the first direction, also the leading dimension
  in.field[7] = 2;  // points in the second direction
  for (int k = 0; k < 15; ++k) in.point[k] = k;
  for (double& v : out.point) v = -1;
  for (auto& f : out.field) f = 77;
  EXPECT_EQ(rbstra(kShift, &in, &out), 0);
  EXPECT_EQ(out.point[0], 1.0);
  EXPECT_EQ(out.point[10], 8.0);
  EXPECT_EQ(out.point[11], 11.5);
  EXPECT_EQ(out.point[12], -1.0);
  for (auto f : out.field) EXPECT_EQ(f, 77);
}

TEST(Rbclcp, UnpacksFieldsInTheirOrderSignExtended) {
  const std::int16_t h[7] = {11, -12, 13, 14, 15, 16, -32768};
  std::int32_t o[7];
  EXPECT_EQ(rbclcp(h, &o[0], &o[1], &o[2], &o[3], &o[4], &o[5], &o[6]), 0);
  const std::int32_t want[7] = {11, -12, 15, -32768, 13, 14, 16};  // fields 1 2 5 7 3 4 6
  for (int k = 0; k < 7; ++k) EXPECT_EQ(o[k], want[k]) << k;
}

TEST(Rbslcp, UnpacksFieldsInTheirOrder) {
  const std::int16_t h[11] = {101, 102, 103, 104, 105, 106, 107, -108, 109, 110, 111};
  std::int32_t o[11];
  EXPECT_EQ(rbslcp(h, &o[0], &o[1], &o[2], &o[3], &o[4], &o[5], &o[6], &o[7], &o[8], &o[9],
                   &o[10]),
            0);
  // Fields 1, 2, 7, 8, 11, 3, 5, 9, 4, 6, 10.
  const std::int32_t want[11] = {101, 102, 107, -108, 111, 103, 105, 109, 104, 106, 110};
  for (int k = 0; k < 11; ++k) EXPECT_EQ(o[k], want[k]) << k;
}
