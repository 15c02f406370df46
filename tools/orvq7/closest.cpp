// tools/orvq7/closest.cpp -- closest pair of two segments, or of a segment and a line.
#include <fmt/format.h>

#include <cmath>

#include "closest/closest_api.h"
#include "commands.h"
#include "input.h"

namespace orvq7tool {
namespace {

constexpr std::int32_t kNotUnique = 4717;

std::string point_text(const std::vector<double>& p) {
  return fmt::format("({:.10g})", fmt::join(p, ", "));
}

// (1 - t) P1 + t P2 for the segment of 2n reals.
std::vector<double> on_segment(const std::vector<double>& seg, std::size_t n, double t) {
  std::vector<double> p(n);
  for (std::size_t i = 0; i < n; ++i) p[i] = (1.0 - t) * seg[i] + t * seg[n + i];
  return p;
}

}  // namespace

Outcome closest_report(const std::vector<double>& seg, const std::vector<double>& other,
                       bool other_is_line, std::size_t n) {
  if (n < 2 || n > 1000000) throw ToolError(fmt::format("dimension {}: expected 2 or more", n));
  if (seg.size() != 2 * n || other.size() != 2 * n)
    throw ToolError(fmt::format("every point and direction needs {} coordinates", n));
  const std::int32_t dim = static_cast<std::int32_t>(n);
  Outcome o;
  double dist2 = 0.0, t1 = 0.0, t2 = 0.0;
  std::int32_t ierr = 0, result = 0;
  std::vector<double> p, q;
  if (!other_is_line) {
    result = ynoall(&dim, seg.data(), other.data(), &dist2, &t1, &t2, &ierr);
    p = on_segment(seg, n, t1);
    q = on_segment(other, n, t2);
    o.text += fmt::format("segments    in dimension {}\n", n);
    o.text += fmt::format("t1          {:.17g}   point {}\n", t1, point_text(p));
    o.text += fmt::format("t2          {:.17g}   point {}\n", t2, point_text(q));
  } else {
    // The line's direction is made unit here: the routine takes |U| = 1 as given.
    std::vector<double> line(other);
    double len2 = 0.0;
    for (std::size_t i = 0; i < n; ++i) len2 += line[i] * line[i];
    const double len = std::sqrt(len2);
    if (!(len > 0.0) || !std::isfinite(len)) throw ToolError("line: the direction is zero");
    for (std::size_t i = 0; i < n; ++i) line[i] /= len;
    result = ynoal2(&dim, seg.data(), line.data(), &dist2, &t1, &t2, &ierr);
    p = on_segment(seg, n, t1);
    q.resize(n);
    for (std::size_t i = 0; i < n; ++i) q[i] = line[n + i] + t2 * line[i];
    o.text += fmt::format("segment and line in dimension {} (direction made unit)\n", n);
    o.text += fmt::format("t           {:.17g}   point {}\n", t1, point_text(p));
    o.text += fmt::format("s           {:.17g}   point {}\n", t2, point_text(q));
  }
  o.text += fmt::format("distance    {:.17g} (squared {:.17g})\n", std::sqrt(dist2), dist2);
  if (result == 1 && ierr == kNotUnique) {
    o.text += "note        code 4717: parallel or degenerate, one closest pair of many\n";
  } else if (result == 1) {
    o.text += fmt::format("failed      code {}\n", ierr);
    o.ok = false;
  }
  return o;
}

}  // namespace orvq7tool
