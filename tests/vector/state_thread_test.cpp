// tests/vector/state_thread_test.cpp -- every vector routine that builds its results in
// per-thread storage, or reads a value kept from the previous call, run on two threads at once
// with different inputs: each thread gets exactly its single-threaded answers.
#include <gtest/gtest.h>

#include "support/thread_compare.h"
#include "vector/vector_api.h"

namespace {

// Two transformations of space, two of the plane, two planes and two points.
const double kSpace[2][12] = {
    {0.36, 0.48, -0.8, -0.8, 0.6, 0, 0.48, 0.64, 0.6, 2.385, -1.25, 0.75},
    {1.5, 0.25, -0.5, 0.125, 2.75, 0.375, -0.625, 0.5, 1.875, -3.5, 0.0625, 9.25}};
const double kPlane[2][6] = {{0.6, 0.8, -0.8, 0.6, 1.75, -2.5},
                             {-1.25, 0.5, 0.75, 2.5, 0.3125, 4.125}};
const double kPlanes[2][9] = {{1.5, 1, 0, -2.25, 0, 1, 0.75, 0, 0},
                              {-0.5, 0.6, 0.8, 3.125, -0.8, 0.6, 2.5, 0, 0.25}};
const double kPoints[2][3] = {{2.385, -7.125, 0.4375}, {-1.0625, 3.75, 12.5}};
const double kConic[2][7] = {{0.5, 1.25, -2, 3.5, 0.7, 0.25, 2.5},
                             {1.5, -0.75, 4.25, 0.125, 2.1, -1, 1}};

struct Case {
  const char* name;
  Sequence run;
};

const Case kCases[] = {
    {"fmat3", [](int v) {
       double b[12];
       fmat3(kSpace[v], b);
       return Answer().reals(b, 12);
     }},
    {"inmat3", [](int v) {
       double b[12];
       std::int32_t flag = -1;
       inmat3(kSpace[v], b, &flag);
       return Answer().reals(b, 12).ints({flag});
     }},
    {"fmat1 regular then singular", [](int v) {
       // The singular call gives back the inverse of this thread's regular one.
       const double zero[9] = {};
       double b[9], c[9];
       std::int32_t f1 = -1, f2 = -1;
       fmat1(kSpace[v], b, &f1);
       fmat1(zero, c, &f2);
       return Answer().reals(b, 9).reals(c, 9).ints({f1, f2});
     }},
    {"inmat2", [](int v) {
       double b[6];
       std::int32_t flag = -1;
       inmat2(kPlane[v], b, &flag);
       return Answer().reals(b, 6).ints({flag});
     }},
    {"xptpln", [](int v) {
       double pp[3];
       std::int32_t st = -1;
       xptpln(kPoints[v], kPlanes[v], pp, &st);
       return Answer().reals(pp, 3).ints({st});
     }},
    {"xptpl1", [](int v) {
       double pp[3], uv[2];
       xptpl1(kPoints[v], kPlanes[v], pp, uv);
       return Answer().reals(pp, 3).reals(uv, 2);
     }},
    {"tr2can, traele and traels on conics", [](int v) {
       double a[7], b[7], c[7];
       const std::int32_t hdr = 86 + v, one = 1, pos = 1, lim = 7;
       tr2can(kConic[v], kPlane[v], a);
       traele(&hdr, kPlane[v], kConic[v], nullptr, b);
       const std::int32_t count = traels(&one, &hdr, kPlane[1 - v], kConic[v], &pos, &lim, c);
       return Answer().reals(a, 7).reals(b, 7).reals(c, 7).ints({count});
     }},
};

TEST(VectorStateThreads, TwoThreadsGetTheirSingleThreadedAnswers) {
  for (const Case& c : kCases) {
    SCOPED_TRACE(c.name);
    EXPECT_EQ(rounds_differing_across_threads(c.run), 0);
  }
}

}  // namespace
