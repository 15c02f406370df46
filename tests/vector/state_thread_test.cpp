// tests/vector/state_thread_test.cpp -- every vector routine that builds its results in
// per-thread storage, or reads a value kept from the previous call, run on two threads at once
// with different inputs: each thread gets exactly its single-threaded answers.
#include <gtest/gtest.h>

#include <cmath>
#include <thread>

#include "support/recording_services.h"
#include "support/thread_compare.h"
#include "vector/vector_api.h"

namespace {

// Inputs: a transformation of space (reals 0-11), one of the plane (12-17), a plane (18-26),
// a point (27-29) and a conic (30-36), from sines scaled by the variant.
const double kZero[9] = {};

Answer run(int v) {
  double in[37], b[12] = {}, c[9] = {}, r3[12] = {}, b2[6] = {}, pp[3] = {}, pq[5] = {}, k1[7] = {};
  for (int k = 0; k < 37; ++k) in[k] = (v + 1) * std::sin(k * k + 1.0);
  std::int32_t f[5] = {-1, -1, -1, -1, -1};
  fmat3(in, b);
  inmat3(in, r3, &f[0]);
  fmat1(in, c, &f[1]);  // then a singular call gives back this thread's inverse
  fmat1(kZero, c, &f[2]);
  inmat2(in + 12, b2, &f[3]);
  xptpln(in + 27, in + 18, pp, &f[4]);
  xptpl1(in + 27, in + 18, pq, pq + 3);
  tr2can(in + 30, in + 12, k1);
  Answer out;
  out.reals(b, 12).reals(r3, 12).reals(c, 9).reals(b2, 6).reals(pp, 3).reals(pq, 5);
  return out.reals(k1, 7).ints({f[0], f[1], f[2], f[3], f[4]});
}

TEST(VectorStateThreads, TwoThreadsGetTheirSingleThreadedAnswers) {
  ASSERT_FALSE(run(0) == run(1));
  EXPECT_EQ(rounds_differing_across_threads(run), 0);
  // On a fresh thread, a singular fmat1 gives back zeros: no other thread's inverse.
  double b[9] = {1, 1, 1, 1, 1, 1, 1, 1, 1};
  std::int32_t flag = -1;
  std::thread([&] { fmat1(kZero, b, &flag); }).join();
  EXPECT_EQ(flag, 1);
  for (double x : b) EXPECT_EQ(bits(x), bits(0.0));
}

}  // namespace
