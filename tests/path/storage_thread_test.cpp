// tests/path/storage_thread_test.cpp -- paths started and stored on several threads at once.
#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <thread>
#include <vector>

#include "curves.h"

TEST(PathThreads, StartsStepsAndResultsStayPerThread) {
  constexpr int kThreads = 4, kPoints = 200;
  const std::int64_t live0 = orvq7sys_table_live();
  std::vector<int> failures(kThreads, 0);
  std::vector<std::thread> pool;
  for (int th = 0; th < kThreads; ++th) {
    pool.emplace_back([th, &failures] {
      // Circle of radius^2 = th + 1 from (r, 0); K = 8 so the step bound is kept per thread.
      const double r = std::sqrt(th + 1.0);
      PathRecords rec(2, 8, 2 + 16);
      Curve c(Curve::kCircle, 2, th + 1.0);
      const double xd[4] = {r, 0.0, 0.0, 1.0}, box[4] = {-9, -9, 9, 9};
      const double eps = 1e-20;
      std::int32_t variant = 1, err = 0;
      if (rec.result != 0 ||
          wncini(&c, &rec.dim, eval_curve, &eps, xd, box, &rec.options, &rec.layout, rec.pairs,
                 &rec.march, &rec.tables, &rec.itab, &rec.ierr) != 0) {
        ++failures[th];
        return;
      }
      for (int k = 1; k < kPoints; ++k) {
        if (wncpas(&rec.dim, &variant, &rec.options, rec.limits, rec.tol, rec.pas, &rec.march,
                   &err) != 0) {
          ++failures[th];
        }
        rec.march.x[0] = th + 0.001 * k;
        std::int32_t phase = k + 1 == kPoints ? 2 : 1, accepted = 1;
        if (wncflu(&phase, &accepted, &rec.options, &rec.layout, &rec.march, &rec.tables, &rec.itab,
                   &err) != 0) {
          ++failures[th];
        }
      }
      // The points of this thread's own path, numbered 1..kPoints.
      std::int32_t count = 0;
      const auto numbers = read_kind(rec.itab, 2, &count);
      const auto points = read_kind(rec.itab, 3, &count);
      if (count != kPoints || value_at<std::int32_t>(numbers, kPoints - 1) != kPoints ||
          value_at<double>(points, 2 * (kPoints - 1)) != th + 0.001 * (kPoints - 1)) {
        ++failures[th];
      }
      if (yncend(&rec.itab, &err) != 0) ++failures[th];
    });
  }
  for (auto& t : pool) t.join();
  for (int th = 0; th < kThreads; ++th) EXPECT_EQ(failures[th], 0) << "thread " << th;
  EXPECT_EQ(orvq7sys_table_live(), live0);
}
