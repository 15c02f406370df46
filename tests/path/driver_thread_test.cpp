// tests/path/driver_thread_test.cpp -- paths traced by ynchem on several threads at once.
#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>
#include <thread>
#include <vector>

#include "curves.h"

namespace {

struct Traced {
  Curve curve;
  Path path;
};

// The circle (K = 4), Viviani's curve (K = 4), a circle of radius^2 2 keeping phases and
// numbers (K = 8, the step bound of this thread), and the sphere with the plane (K = 2).
std::vector<Traced> paths() {
  std::vector<Traced> v;
  v.push_back({Curve(Curve::kCircle, 2), Path{{1, 0}, {0, 1}}});
  v.push_back({Curve(Curve::kViviani, 3), Path{{0, 0, 2}, {0, 1, 0}}});
  v.push_back({Curve(Curve::kCircle, 2, 2.0), Path{{1, 1}, {-1, 1}}});
  v.push_back({Curve(Curve::kSpherePlane, 3), Path{{1, 0, 0}, {0, 1, 0}}});
  v[2].path.mode = 8, v[2].path.store = 2 + 16, v[3].path.mode = 2;
  return v;
}

TEST(YnchemThreads, PathsAtOnceMatchTheirSequentialRuns) {
  std::vector<Traced> want = paths();
  for (Traced& t : want) {
    run_path(t.curve, t.path);
    ASSERT_EQ(t.path.result, 0);
    ASSERT_GT(t.path.count, 20);
  }
  const std::int64_t live0 = orvq7sys_table_live();
  std::vector<int> mismatches(want.size(), 0);
  std::vector<std::thread> pool;
  for (std::size_t k = 0; k < want.size(); ++k) {
    pool.emplace_back([&, k] {
      for (int round = 0; round < 8; ++round) {
        Traced t = paths()[k];
        run_path(t.curve, t.path);
        const Path &got = t.path, &w = want[k].path;
        mismatches[k] += got.ierr != 0 || got.xt.size() != w.xt.size() ||
                         std::memcmp(got.xt.data(), w.xt.data(), 8 * w.xt.size()) != 0 ||
                         got.number != w.number || got.phase != w.phase;
      }
    });
  }
  for (auto& t : pool) t.join();
  for (std::size_t k = 0; k < want.size(); ++k) EXPECT_EQ(mismatches[k], 0) << "path " << k;
  EXPECT_EQ(orvq7sys_table_live(), live0);
}

}  // namespace
