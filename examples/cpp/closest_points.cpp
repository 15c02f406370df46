// closest_points.cpp -- closest points of two 3D segments (ynoall) and a nearest search over
// a list of points and over the polyline through them (ynoaon), from C++.
#include <array>
#include <cstdint>
#include <cstdio>

#include <OrvQ7Maths/OrvQ7Maths.h>

namespace {
int failures = 0;

void expect(bool ok, const char* what) {
  std::printf("%-52s %s\n", what, ok ? "ok" : "MISMATCH");
  if (!ok) ++failures;
}

// A segment of 3D space: its two end points one after the other, a (3, 2) array.
using Segment = std::array<double, 6>;

struct Closest {
  std::int32_t result, code;
  double dist2, t1, t2;
};

Closest closest(const Segment& s1, const Segment& s2) {
  const std::int32_t n = 3;
  Closest c{};
  c.result = ynoall(&n, s1.data(), s2.data(), &c.dist2, &c.t1, &c.t2, &c.code);
  std::printf("ynoall: result %d, code %d, t1 %.17g, t2 %.17g, dist2 %.17g\n", c.result, c.code,
              c.t1, c.t2, c.dist2);
  return c;
}

struct Nearest {
  std::int32_t result, index;
  double dist2, t;
};

// pts holds plane points one after another, a (2, m) array.
template <std::size_t L>
Nearest nearest(const std::array<double, L>& pts, const std::array<double, 2>& x,
                std::int32_t mode) {
  const std::int32_t n = 2, m = L / 2;
  Nearest r{};
  std::int32_t code = -1;
  r.result = ynoaon(&n, x.data(), &m, pts.data(), &mode, &r.dist2, &r.index, &r.t, &code);
  std::printf("ynoaon mode %d: index %d, dist2 %.17g, t %.17g\n", mode, r.index, r.dist2, r.t);
  return r;
}
}  // namespace

int main() {
  // Skew segments along x and along y, one unit apart in z: the common perpendicular joins
  // (1,0,0), the middle of the first, to (1,0,1), the middle of the second.
  const Segment along_x{0.0, 0.0, 0.0, 2.0, 0.0, 0.0};
  const Segment along_y{1.0, -1.0, 1.0, 1.0, 1.0, 1.0};
  const Closest a = closest(along_x, along_y);
  expect(a.result == 0 && a.code == ORVQ7_OK, "skew segments: a unique pair");
  expect(a.t1 == 0.5 && a.t2 == 0.5 && a.dist2 == 1.0, "  at t1 = t2 = 1/2, squared distance 1");

  // The second segment moved to x = 3, past the end of the first: the pair lies on the edge
  // t1 = 1, between (2,0,0) and its nearest point (3,0,1) of the other, squared distance 2.
  const Segment beyond{3.0, -1.0, 1.0, 3.0, 1.0, 1.0};
  const Closest b = closest(along_x, beyond);
  expect(b.result == 0 && b.t1 == 1.0 && b.t2 == 0.5 && b.dist2 == 2.0,
         "  clamped to the end: t1 = 1, t2 = 1/2, distance 2");

  // Parallel and overlapping over x in [1, 2]: 4717, the middle of the overlap as the pair.
  const Segment parallel{1.0, 1.0, 0.0, 3.0, 1.0, 0.0};
  const Closest c = closest(along_x, parallel);
  expect(c.result == 1 && c.code == ORVQ7_ERR_NOT_UNIQUE, "parallel overlap: not unique (4717)");
  expect(c.t1 == 0.75 && c.t2 == 0.25 && c.dist2 == 1.0, "  middle of the overlap, distance 1");

  // From X = (5, 1.5): points (0,0), (4,0), (4,3) at squared distances 27.25, 3.25, 3.25 (the
  // tie keeps point 2); as a polyline, segment 2 passes through (4, 1.5) at its middle.
  const std::array<double, 6> pts{0.0, 0.0, 4.0, 0.0, 4.0, 3.0};
  const std::array<double, 2> x{5.0, 1.5};
  const Nearest p = nearest(pts, x, 0);
  expect(p.result == 0 && p.index == 2 && p.dist2 == 3.25 && p.t == 0.0,
         "nearest point: point 2 (tie kept), 3.25");
  const Nearest s = nearest(pts, x, 8467);
  expect(s.result == 0 && s.index == 2 && s.dist2 == 1.0 && s.t == 0.5,
         "nearest on the polyline: segment 2 at t = 1/2, 1");

  return failures == 0 ? 0 : 1;
}
