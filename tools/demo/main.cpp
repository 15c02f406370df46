// tools/demo/main.cpp -- a small program that calls the vector primitives and the platform
// services and prints what they return.
#include <cstdint>
#include <cstdio>
#include <initializer_list>

#include "companions/system/system_api.h"
#include "frame/frame_api.h"
#include "vector/vector_api.h"

int main() {
  const double a[3] = {1.0, 2.0, 3.0}, b[3] = {-2.0, 0.5, 4.0}, c[3] = {0.0, 1.0, 1.0};
  double w[3];
  const std::int32_t space = 3;
  std::printf("a = (1, 2, 3), b = (-2, 0.5, 4), c = (0, 1, 1)\n");
  std::printf("prosca(a, b)    = %.17g\n", prosca(a, b));
  std::printf("promix(a, b, c) = %.17g\n", promix(a, b, c));
  parvis(a, b, w, &space);
  std::printf("parvis(a, b)    = (%.17g, %.17g, %.17g)\n", w[0], w[1], w[2]);
  parbis(a, b, w, &space);
  std::printf("parbis(a, b)    = (%.17g, %.17g, %.17g)\n", w[0], w[1], w[2]);
  double v[3] = {a[0], a[1], a[2]};
  const std::int32_t n = 3;
  const double squared = devor(v, &n);
  std::printf("devor(a)        = %.17g, a / |a| = (%.17g, %.17g, %.17g)\n", squared, v[0], v[1],
              v[2]);
  const double tol = 1e-9;
  for (double cosine : {0.5, 1.0 + 5e-10, -1.0 - 1e-6}) {
    std::int32_t flag = 0;
    const double angle = parcos(&cosine, &tol, &flag);
    std::printf("parcos(%.10g, 1e-9) = %.17g, flag %d\n", cosine, angle, flag);
  }
  const double m[4] = {2.0, 1.0, 1.0, 2.0}, lambda = 3.0;
  double e[2];
  vectp2(m, &lambda, e);
  std::printf("vectp2([[2, 1], [1, 2]], 3) = (%.17g, %.17g)\n", e[0], e[1]);
  std::printf("cbkver() = %d (workspace service %s)\n", cbkver(),
              orvq7sys_ws_outstanding() == 0 ? "clean" : "leaking");
  std::printf("code 4718: %s\n", orvq7sys_code_text(4718));
  return 0;
}
