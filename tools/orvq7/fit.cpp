// tools/orvq7/fit.cpp -- mean plane and mean line of points of space.
#include <fmt/format.h>

#include <cmath>
#include <limits>

#include "commands.h"
#include "fitting/fitting_api.h"
#include "input.h"

namespace orvq7tool {
namespace {

const char* sign(double v) { return std::signbit(v) ? "-" : "+"; }

}  // namespace

Outcome fit_report(const std::vector<double>& xyz, double tol) {
  if (xyz.size() % 3 != 0) throw ToolError("points: three coordinates per point expected");
  if (xyz.empty()) throw ToolError("points: none given");
  if (!(tol > 0.0) || !std::isfinite(tol))
    throw ToolError(fmt::format("tolerance {} is not positive", tol));
  if (xyz.size() / 3 > static_cast<std::size_t>(std::numeric_limits<std::int32_t>::max() / 3))
    throw ToolError("points: too many");
  const std::int32_t ld = 3, n = static_cast<std::int32_t>(xyz.size() / 3);
  Outcome o;
  o.text += fmt::format("points      {}, tolerance {}\n", n, tol);

  double g[3], s[6], l[3];
  const std::int32_t sres = solmpr(xyz.data(), &ld, &n, &tol, g, s, l);
  o.text += fmt::format("centroid    ({:.10g}, {:.10g}, {:.10g})\n", g[0], g[1], g[2]);
  if (sres == 1) {
    o.text += "spread      none: every point lies within tol / 2 of the centroid\n";
    o.ok = false;
    return o;
  }
  o.text += fmt::format("scatter     eigenvalues {:.6g}, {:.6g}, {:.6g}\n", l[0], l[1], l[2]);

  const double kUnset = std::numeric_limits<double>::quiet_NaN();
  double a = 0, b = 0, c = 0, d = 0, e = kUnset;
  if (plmoyn(xyz.data(), &ld, &n, &tol, &a, &b, &c, &d, &e) == 0) {
    o.text += fmt::format("mean plane  {:.10g} x {} {:.10g} y {} {:.10g} z {} {:.10g} = 0\n", a,
                          sign(b), std::fabs(b), sign(c), std::fabs(c), sign(d), std::fabs(d));
    o.text += fmt::format(
        "            half-thickness {:.6g} (every point within it of the "
        "plane)\n",
        e);
  } else if (!std::isnan(e)) {
    o.text += fmt::format(
        "mean plane  none: the points lie along a line (largest squared "
        "distance {:.3g})\n",
        e);
  } else {
    o.text += "mean plane  none: no unique plane (points on a line or coincident)\n";
  }

  double line[6];
  if (drmoyn(xyz.data(), &ld, &n, &tol, line) == 0) {
    double far2 = 0.0;
    std::int32_t k = 0;
    ecrdrt(xyz.data(), &ld, &n, line, &far2, &k);
    o.text += fmt::format("mean line   direction ({:.10g}, {:.10g}, {:.10g})\n", line[0], line[1],
                          line[2]);
    o.text +=
        fmt::format("            through ({:.10g}, {:.10g}, {:.10g})\n", line[3], line[4], line[5]);
    o.text += fmt::format("            farthest point {} at distance {:.6g}\n", k, std::sqrt(far2));
  } else {
    o.text += "mean line   none: the largest spread is not in one direction\n";
  }
  return o;
}

}  // namespace orvq7tool
