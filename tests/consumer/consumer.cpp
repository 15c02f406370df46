// consumer.cpp -- a C++ program built against an installed OrvQ7Maths with find_package:
// the headers include one another from the installed tree, and the platform libraries'
// own services are reachable through their targets.
#include <cstdint>
#include <cstdio>

#include "companions/system/system_api.h"
#include "frame/frame_api.h"
#include "vector/vector_api.h"

int main() {
  const double a[3] = {1.0, 2.0, 2.0};
  double v[3] = {a[0], a[1], a[2]};
  const std::int32_t n = 3;
  const double squared = devor(v, &n);  // 9, then v / 3
  double values[4] = {3.0, -1.0, 2.0, -0.0};
  const std::int32_t count = 4;
  sorr8(values, &count);
  const bool ok = squared == 9.0 && v[0] == 1.0 / 3.0 && v[1] == 2.0 / 3.0 &&
                  values[0] == -1.0 && values[1] == -0.0 && values[3] == 3.0;
  std::printf("devor and sorr8 through the installed package: %s\n", ok ? "ok" : "FAILED");
  return ok ? 0 : 1;
}
