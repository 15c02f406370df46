// traced_path.cpp -- a curve traced by ynchem from C++: the evaluation routine is a C++ object
// reached through the context pointer, the result table is owned by a small RAII class that
// releases it with yncend, and the points are read back with yncrea and yutrea.
// The curve is the unit circle, from (0, -1) towards +x, counter-clockwise back to its start.
#include <cmath>
#include <cstdint>
#include <cstdio>
#include <numbers>
#include <optional>
#include <vector>

#include <OrvQ7Maths/OrvQ7Maths.h>

namespace {
int failures = 0;

void expect(bool ok, const char* what) {
  std::printf("%-58s %s\n", what, ok ? "ok" : "MISMATCH");
  if (!ok) ++failures;
}

// F(x, y) = x^2 + y^2 - 1 with its gradient and second derivatives.
struct UnitCircle {
  int calls = 0;

  // Per point, the blocks asked for by the bits of req, one after another: 1 the residual,
  // 2 the gradient (1 by 2), 4 the second derivatives (1 by 2 by 2).
  void operator()(std::int32_t npts, const double* x, std::int32_t req, double* out) {
    ++calls;
    for (std::int32_t p = 0; p < npts; ++p, x += 2) {
      if (req & 1) *out++ = x[0] * x[0] + x[1] * x[1] - 1.0;
      if (req & 2) {
        *out++ = 2.0 * x[0];
        *out++ = 2.0 * x[1];
      }
      if (req & 4) {
        for (const double h : {2.0, 0.0, 0.0, 2.0}) *out++ = h;
      }
    }
  }
};

// The routine ynchem calls: hands the request to the object behind ctx.
template <class Curve>
std::int32_t evaluate(void* ctx, const std::int32_t* npts, const double* x, const std::int32_t* req,
                      double* out, std::int32_t* ierr) {
  (*static_cast<Curve*>(ctx))(*npts, x, *req, out);
  *ierr = 0;
  return 0;
}

// A traced path: owns the result table and releases it, with every sub-table, on destruction.
class Path {
 public:
  explicit Path(std::int32_t itab) : itab_(itab) {}
  Path(const Path&) = delete;
  Path& operator=(const Path&) = delete;
  ~Path() {
    std::int32_t ierr = 0;
    if (yncend(&itab_, &ierr) != 0) std::printf("yncend failed: %d\n", ierr);
  }

  // The entries of record kind `kind`, each of `width` values of type T, one after another.
  template <class T>
  std::optional<std::vector<T>> read(std::int32_t kind, std::size_t width) const {
    std::int32_t handle = 0, count = 0, ierr = 0;
    const std::int32_t first = 1;
    if (yncrea(&itab_, &kind, &handle, &count, &ierr) != 0 || handle == 0) return std::nullopt;
    std::vector<T> values(width * static_cast<std::size_t>(count));
    if (yutrea(&handle, &first, &count, values.data(), &ierr) != 0) return std::nullopt;
    return values;
  }

 private:
  std::int32_t itab_;
};
}  // namespace

int main() {
  const std::int64_t live_before = orvq7sys_table_live();
  {
    UnitCircle circle;
    const std::int32_t n = 2, mode = 4, store = 2 + 8;
    const double eps = 1e-20, tol = 1e-2;
    const double xd[4] = {0.0, -1.0, 1.0, 0.0};    // x0 = (0, -1), d0 = (1, 0)
    const double box[4] = {-1.5, -1.5, 1.5, 1.5};  // lower bounds, then upper bounds
    const double pas[4] = {1e-6, 1e-6, 0.5, 0.5};  // minimum steps, then maximum steps
    std::int32_t itab = 0, ierr = -1;
    const std::int32_t result = ynchem(&circle, &n, evaluate<UnitCircle>, &eps, xd, box, pas, &mode,
                                       &tol, &store, &itab, &ierr);
    std::printf("ynchem: result %d, ierr %d, %d evaluations\n", result, ierr, circle.calls);
    expect(result == 0 && ierr == ORVQ7_OK && itab != 0 && circle.calls > 0,
           "ynchem traced the circle, calling the C++ object");
    const Path path(itab);

    const auto xt = path.read<double>(23, 4);  // per point: x, y, then the tangent
    const auto phase = path.read<std::int32_t>(1, 1);
    const auto number = path.read<std::int32_t>(2, 1);
    const auto points = path.read<double>(3, 2);  // per point: x, y
    expect(xt && phase && number && points, "kinds 23, 1, 2 and 3 read back");
    if (!(xt && phase && number && points)) return 1;
    const std::size_t count = phase->size();
    std::printf("%zu points\n", count);
    expect(xt->size() == 4 * count && number->size() == count && points->size() == 2 * count,
           "one entry per point in every kind");
    // Steps of at most 0.9 / sqrt(0.5 / tol + 1 / 0.5^2), about 0.12 here: some fifty points.
    expect(count >= 40 && count <= 120, "some fifty points (between 40 and 120)");

    const std::vector<double> start{0.0, -1.0, 1.0, 0.0};
    expect(std::vector<double>(xt->begin(), xt->begin() + 4) == start,
           "the first point is x0 with the tangent d0");
    expect(std::vector<double>(xt->end() - 4, xt->end()) == start,
           "the last point is x0 again, to the bit, with d0");
    expect(phase->front() == 0 && phase->back() == 2, "phase 0 at the start, 2 at the end");

    bool on_circle = true, tangent = true, same_points = true, numbered = true;
    double turned = 0.0;
    for (std::size_t j = 0; j < count; ++j) {
      const double* p = xt->data() + 4 * j;
      on_circle = on_circle && std::abs(p[0] * p[0] + p[1] * p[1] - 1.0) <= 1e-9;
      // Counter-clockwise at (cos a, sin a) the unit tangent is (-sin a, cos a).
      tangent = tangent && std::abs(p[2] + p[1]) <= 1e-8 && std::abs(p[3] - p[0]) <= 1e-8;
      same_points = same_points && p[0] == (*points)[2 * j] && p[1] == (*points)[2 * j + 1];
      numbered = numbered && (*number)[j] == static_cast<std::int32_t>(j + 1) &&
                 (j == 0 || j == count - 1 || (*phase)[j] == 1);
      if (j > 0) {
        const double* q = p - 4;
        turned += std::atan2(q[0] * p[1] - q[1] * p[0], q[0] * p[0] + q[1] * p[1]);
      }
    }
    expect(on_circle, "every point on the circle: |x^2 + y^2 - 1| <= 1e-9");
    expect(tangent, "every tangent is (-y, x), the direction of travel");
    expect(same_points, "kind 3 holds the points of kind 23");
    expect(numbered, "points numbered 1, 2, ..., phase 1 between the ends");
    expect(std::abs(turned - 2.0 * std::numbers::pi) <= 1e-9, "one whole turn");
  }  // the Path releases the result here
  std::printf("tables live: %lld before, %lld after\n", static_cast<long long>(live_before),
              static_cast<long long>(orvq7sys_table_live()));
  expect(orvq7sys_table_live() == live_before, "no table left live");
  return failures == 0 ? 0 : 1;
}
