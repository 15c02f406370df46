// tools/orvq7/tracer.cpp -- a typed system traced with ynchem, its result table read back.
#include "tracer.h"

#include <fmt/format.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <cmath>
#include <cstdio>
#include <cstring>

#include "companions/system/system_api.h"
#include "input.h"
#include "linalg/linalg_api.h"
#include "path/path_api.h"

namespace orvq7tool {
namespace {

using Clock = std::chrono::steady_clock;

constexpr std::int32_t kMaxUnknowns = 20;
// Option word bits of ynchem.
constexpr std::int32_t kOrder2Bit = 1 << 15;
constexpr std::int32_t kPerUnknownTolBit = 1 << 16;
constexpr std::int32_t kNoTurnTestBit = 1 << 18;
// Storage request: point and tangent (kind 23), and the first group: flush phase (kind 1),
// point number (kind 2), point (kind 3).
constexpr std::int32_t kStore = 2 | 8 | 16 | 32;
constexpr std::int32_t kKindPointTangent = 23, kKindPhase = 1, kKindPoint = 3;
constexpr std::int32_t kNoTangent = 4710;

// Default path tolerances, relative to the smallest box width w: kind 2 bounds the step
// (0.9 tol: w / 100), kind 4 the distance of a chord from the curve (about tol / 5, with
// tol = w / 4000); kind 8 the turn of the tangent per step (about 0.9 tol radians, tol 0.1).
double default_tol(std::int32_t kind, double w) {
  if (kind == 2) return w / 100.0;
  if (kind == 4) return w / 4000.0;
  return 0.1;
}

// The progress line of a long trace, on standard error.
struct Progress {
  Clock::time_point start = Clock::now();
  Clock::time_point last;
  double after = 1.0;
  bool tty = false;
  bool shown = false;
  std::string name;
  std::size_t n = 0;
  const std::vector<std::string>* names = nullptr;

  static void report(void* user, std::uint64_t calls, const double* x) {
    auto& p = *static_cast<Progress*>(user);
    if (p.after < 0.0) return;
    const Clock::time_point now = Clock::now();
    const double elapsed = std::chrono::duration<double>(now - p.start).count();
    if (elapsed < p.after) return;
    const double every = p.tty ? 0.2 : 1.0;
    if (p.shown && std::chrono::duration<double>(now - p.last).count() < every) return;
    std::string at;
    for (std::size_t i = 0; i < p.n && i < 6; ++i)
      at += fmt::format("{}{} = {:.5g}", i == 0 ? "" : ", ", (*p.names)[i], x[i]);
    if (p.n > 6) at += ", ...";
    const std::string text =
        fmt::format("tracing {}: {} evaluations, {:.1f} s, at {}", p.name, calls, elapsed, at);
    if (p.tty)
      fmt::print(stderr, "\r\033[K{}", text);
    else
      fmt::print(stderr, "{}\n", text);
    std::fflush(stderr);
    p.shown = true;
    p.last = now;
  }
  void finish() const {
    if (shown && tty) fmt::print(stderr, "\r\033[K");
  }
};

// The frames of the calling thread's traceback, "WNCGOO, YNCHEM", oldest first.
std::string traceback_text() {
  std::string text;
  const std::int32_t count = orvq7sys_trace_count();
  for (std::int32_t k = 1; k <= count; ++k) {
    std::int32_t code = 0, len = 0;
    char name[64] = {};
    if (orvq7sys_trace_frame(k, &code, name, &len) != 0) continue;
    std::string frame(name, static_cast<std::size_t>(std::clamp(len, 0, 63)));
    frame.erase(std::remove_if(frame.begin(), frame.end(),
                               [](char c) { return c == ' ' || c == ';' || c == '\0'; }),
                frame.end());
    text += (text.empty() ? "" : ", ") + frame;
  }
  return text;
}

std::string code_text(std::int32_t code) {
  const char* text = orvq7sys_code_text(code);
  return text != nullptr ? text : "unknown code";
}

// All entries of the quantity of record kind `kind`, as raw bytes of `esize` per entry.
std::vector<unsigned char> read_quantity(std::int32_t itab, std::int32_t kind, std::int32_t esize,
                                         std::int32_t* count) {
  std::int32_t handle = 0, ierr = 0, size = 0, entries = 0;
  *count = 0;
  if (yncrea(&itab, &kind, &handle, count, &ierr) == 1 || handle == 0)
    throw ToolError(fmt::format("the result holds no quantity of record kind {}", kind));
  if (yutinf(&handle, &size, &entries, &ierr) == 1 || size != esize || entries < *count)
    throw ToolError(fmt::format("the result's record kind {} has entries of {} bytes", kind, size));
  std::vector<unsigned char> bytes(static_cast<std::size_t>(*count) * esize);
  const std::int32_t first = 1;
  if (*count > 0 && yutrea(&handle, &first, count, bytes.data(), &ierr) == 1)
    throw ToolError(fmt::format("reading record kind {}: code {}", kind, ierr));
  return bytes;
}

void read_result(std::int32_t itab, TraceResult& r) {
  const std::int32_t n = static_cast<std::int32_t>(r.n);
  std::int32_t count = 0, count23 = 0, count1 = 0;
  const auto pts = read_quantity(itab, kKindPoint, 8 * n, &count);
  const auto pt = read_quantity(itab, kKindPointTangent, 16 * n, &count23);
  const auto ph = read_quantity(itab, kKindPhase, 4, &count1);
  r.points.resize(static_cast<std::size_t>(count) * n);
  std::memcpy(r.points.data(), pts.data(), pts.size());
  r.tangents.assign(static_cast<std::size_t>(count) * n, 0.0);
  for (std::int32_t j = 0; j < count && j < count23; ++j)
    std::memcpy(&r.tangents[j * n], pt.data() + (2 * j + 1) * 8 * n, 8 * n);
  r.phases.assign(count, 0);
  std::memcpy(r.phases.data(), ph.data(), std::min(ph.size(), r.phases.size() * 4));
}

// Gauss-Newton steps of least length towards the curve from x: x -= J' y, (J J') y = F.
// Stops when the residual sum is at most eps, stops decreasing, or after 50 steps.
void snap_to_curve(const EquationSystem& system, double eps, std::vector<double>& x) {
  const std::size_t n = system.unknowns(), m = system.equations();
  std::vector<double> f(m), jac(m * n), a(m * m), y(m), trial(n);
  double r = system.residual_sum(x.data());
  for (int iter = 0; iter < 50 && r > eps; ++iter) {
    system.residuals(x.data(), f.data());
    system.jacobian(x.data(), jac.data());
    for (std::size_t p = 0; p < m; ++p)
      for (std::size_t q = 0; q < m; ++q) {
        double s = 0.0;
        for (std::size_t i = 0; i < n; ++i) s += jac[p + m * i] * jac[q + m * i];
        a[p + m * q] = s;
      }
    const std::int32_t order = static_cast<std::int32_t>(m);
    std::int32_t ierr = 0;
    if (ynsega(&order, a.data(), f.data(), y.data(), &ierr) == 1) return;
    for (std::size_t i = 0; i < n; ++i) {
      double s = 0.0;
      for (std::size_t k = 0; k < m; ++k) s += jac[k + m * i] * y[k];
      trial[i] = x[i] - s;
    }
    const double rt = system.residual_sum(trial.data());
    if (!(rt < r)) return;
    x = trial;
    r = rt;
  }
}

}  // namespace

std::vector<std::string> default_names(std::size_t n) {
  if (n == 2) return {"x", "y"};
  if (n == 3) return {"x", "y", "z"};
  std::vector<std::string> names;
  for (std::size_t i = 1; i <= n; ++i) names.push_back(fmt::format("x{}", i));
  return names;
}

void check_plan(EquationSystem& system, TracePlan& plan) {
  const std::size_t n = system.unknowns(), m = system.equations();
  if (m + 1 != n)
    throw ToolError(
        fmt::format("{} equation{} in {} unknowns: a curve needs n - 1 equations "
                    "in n unknowns",
                    m, m == 1 ? "" : "s", n));
  if (n < 2 || n > static_cast<std::size_t>(kMaxUnknowns))
    throw ToolError(fmt::format("{} unknowns: the solver takes 2 to {}", n, kMaxUnknowns));
  auto need = [n](const std::vector<double>& v, const char* what) {
    if (v.size() != n)
      throw ToolError(
          fmt::format("{}: {} values given, expected {} (one per unknown)", what, v.size(), n));
  };
  need(plan.start, "start point");
  need(plan.lower, "box");
  need(plan.upper, "box");
  if (!plan.direction.empty()) need(plan.direction, "start direction");
  if (plan.kind != 2 && plan.kind != 4 && plan.kind != 8)
    throw ToolError(fmt::format("path kind {}: expected 2, 4 or 8", plan.kind));
  if (plan.order2 && plan.kind == 2)
    throw ToolError("the curvature from the tangents needs path kind 4 or 8");
  double wmin = 0.0;
  std::vector<double> scales(n);
  for (std::size_t i = 0; i < n; ++i) {
    const double w = plan.upper[i] - plan.lower[i];
    if (!(w > 0.0))
      throw ToolError(fmt::format("box: the range of {} is empty", system.names()[i]));
    if (!std::isfinite(w))
      throw ToolError(fmt::format("box: the range of {} is too wide", system.names()[i]));
    wmin = i == 0 ? w : std::min(wmin, w);
    scales[i] = std::min(1.0, w);
  }
  system.set_scales(scales);
  if (plan.step_max.empty())
    for (std::size_t i = 0; i < n; ++i)
      plan.step_max.push_back((plan.upper[i] - plan.lower[i]) / 10.0);
  if (plan.step_min.empty())
    for (std::size_t i = 0; i < n; ++i)
      plan.step_min.push_back((plan.upper[i] - plan.lower[i]) * 1e-7);
  if (plan.step_min.size() == 1) plan.step_min.resize(n, plan.step_min[0]);
  if (plan.step_max.size() == 1) plan.step_max.resize(n, plan.step_max[0]);
  need(plan.step_min, "minimum step");
  need(plan.step_max, "maximum step");
  for (std::size_t i = 0; i < n; ++i)
    if (!(plan.step_min[i] > 0.0 && plan.step_min[i] < plan.step_max[i]))
      throw ToolError(fmt::format("steps of {}: need 0 < minimum < maximum, got {} and {}",
                                  system.names()[i], plan.step_min[i], plan.step_max[i]));
  if (plan.tol.empty()) plan.tol.push_back(default_tol(plan.kind, wmin));
  if (plan.tol.size() != 1 && plan.tol.size() != n)
    throw ToolError(
        fmt::format("tolerance: {} values given, expected 1 or {}", plan.tol.size(), n));
  if (plan.tol.size() == n && n > 1 && plan.kind == 8)
    throw ToolError("path kind 8 takes a single tolerance");
  for (double t : plan.tol)
    if (!(t > 0.0)) throw ToolError(fmt::format("tolerance {} is not positive", t));
  if (!(plan.eps > 0.0)) throw ToolError(fmt::format("eps {} is not positive", plan.eps));

  for (std::size_t i = 0; i < n; ++i)
    if (plan.start[i] < plan.lower[i] || plan.start[i] > plan.upper[i])
      throw ToolError(fmt::format("start point: {} = {} lies outside its box range {}:{}",
                                  system.names()[i], plan.start[i], plan.lower[i], plan.upper[i]));
  double moved = 0.0;
  double r = system.residual_sum(plan.start.data());
  if (plan.snap && r > plan.eps && std::isfinite(r)) {
    std::vector<double> x = plan.start;
    snap_to_curve(system, plan.eps, x);
    for (std::size_t i = 0; i < n; ++i) moved += (x[i] - plan.start[i]) * (x[i] - plan.start[i]);
    moved = std::sqrt(moved);
    for (std::size_t i = 0; i < n; ++i)
      if (x[i] < plan.lower[i] || x[i] > plan.upper[i])
        throw ToolError(
            fmt::format("start point: moved onto the curve, {} = {} lies outside "
                        "its box range {}:{}",
                        system.names()[i], x[i], plan.lower[i], plan.upper[i]));
    plan.start = x;
    r = system.residual_sum(plan.start.data());
  }
  if (!std::isfinite(r))
    throw ToolError("start point: the equations give no number there (NaN or infinite)");
  if (r > plan.eps)
    throw ToolError(
        fmt::format("start point is off the curve: sum of squared residuals {:.3g} "
                    "> eps {:.3g}{}",
                    r, plan.eps, plan.snap ? " after snapping" : " (--snap moves it onto it)"));
  plan.snapped = moved;
}

TraceResult trace_path(const EquationSystem& system, const TracePlan& plan) {
  const std::int32_t n = static_cast<std::int32_t>(system.unknowns());
  TraceResult r;
  r.n = system.unknowns();
  Progress progress;
  progress.after = plan.progress_after;
  progress.tty = isatty(STDERR_FILENO) != 0;
  progress.name = plan.progress_name;
  progress.n = r.n;
  progress.names = &system.names();
  EvalContext ctx;
  ctx.system = &system;
  ctx.max_calls = plan.max_calls;
  ctx.progress = &Progress::report;
  ctx.progress_user = &progress;
  const std::uint64_t evaluations0 = system.evaluations();

  // The start direction: as given, or the tangent of the curve at x0.
  r.direction = plan.direction;
  if (r.direction.empty()) {
    std::vector<double> t(n);
    const std::int32_t npts = 1, req = 2;
    std::int32_t ierr = 0;
    orvq7sys_trace_clear();
    if (ynumde(&ctx, &n, evaluate_system, &npts, plan.start.data(), &req, t.data(), &ierr) == 1)
      throw ToolError(fmt::format("no tangent at the start point ({}: {}); give a direction", ierr,
                                  ierr == kNoTangent ? "degenerate derivatives" : code_text(ierr)));
    r.direction = t;
  }
  // The driver takes d0 as the first tangent, length included: give it unit length.
  double len2 = 0.0;
  for (double d : r.direction) len2 += d * d;
  const double len = std::sqrt(len2);
  if (!(len > 0.0) || !std::isfinite(len)) throw ToolError("the start direction is zero");
  for (double& d : r.direction) d /= len;
  for (std::size_t i = 0; i < r.n; ++i) {
    if ((plan.start[i] == plan.lower[i] && r.direction[i] < 0.0) ||
        (plan.start[i] == plan.upper[i] && r.direction[i] > 0.0))
      throw ToolError(
          fmt::format("the start direction leaves the box at once ({} = {} is on "
                      "its {} bound)",
                      system.names()[i], plan.start[i], r.direction[i] < 0.0 ? "lower" : "upper"));
  }

  std::vector<double> xd(plan.start), box(plan.lower), pas(plan.step_min), tol(plan.tol);
  xd.insert(xd.end(), r.direction.begin(), r.direction.end());
  box.insert(box.end(), plan.upper.begin(), plan.upper.end());
  pas.insert(pas.end(), plan.step_max.begin(), plan.step_max.end());
  std::int32_t mode = plan.kind;
  if (plan.order2) mode |= kOrder2Bit;
  if (plan.tol.size() > 1) mode |= kPerUnknownTolBit;
  if (!plan.turn_test) mode |= kNoTurnTestBit;
  tol.resize(n, tol[0]);
  const std::int32_t store = kStore;
  std::int32_t itab = 0, ierr = 0;

  orvq7sys_trace_clear();
  const Clock::time_point t0 = Clock::now();
  r.result = ynchem(&ctx, &n, evaluate_system, &plan.eps, xd.data(), box.data(), pas.data(), &mode,
                    tol.data(), &store, &itab, &ierr);
  r.seconds = std::chrono::duration<double>(Clock::now() - t0).count();
  progress.finish();
  r.code = ierr;
  r.calls = ctx.calls;
  r.evaluations = system.evaluations() - evaluations0;

  if (r.result == 1) {
    r.ending = Ending::kFailed;
    std::string why = ctx.failure.empty() ? code_text(ierr) : ctx.failure;
    const std::string frames = traceback_text();
    r.ending_text = fmt::format("failed with code {}: {}{}", ierr, why,
                                frames.empty() ? "" : fmt::format(" (traceback: {})", frames));
    return r;
  }
  try {
    read_result(itab, r);
  } catch (...) {
    std::int32_t e = 0;
    yncend(&itab, &e);
    throw;
  }
  std::int32_t e = 0;
  yncend(&itab, &e);

  const std::size_t count = r.count();
  for (std::size_t j = 1; j < count; ++j) {
    double s = 0.0;
    for (std::size_t i = 0; i < r.n; ++i) {
      const double d = r.points[j * r.n + i] - r.points[(j - 1) * r.n + i];
      s += d * d;
    }
    r.length += std::sqrt(s);
  }
  // How it ended: back on x0 exactly (closure stores x0 itself), on a face of the box
  // (the end point is put on the face exactly), or elsewhere (the step collapsed).
  const double* last = &r.points[(count - 1) * r.n];
  bool closed = count > 1;
  for (std::size_t i = 0; i < r.n; ++i) closed = closed && last[i] == plan.start[i];
  if (closed) {
    r.ending = Ending::kClosed;
    r.ending_text = "closed on its start point";
    return r;
  }
  for (std::size_t i = 0; i < r.n; ++i) {
    if (last[i] == plan.lower[i] || last[i] == plan.upper[i]) {
      r.ending = Ending::kLeftBox;
      r.face_unknown = i;
      r.face_upper = last[i] == plan.upper[i];
      r.ending_text =
          fmt::format("left the box through the face {} = {} ({} bound of {})", system.names()[i],
                      last[i], r.face_upper ? "upper" : "lower", system.names()[i]);
      return r;
    }
  }
  r.ending = Ending::kInside;
  r.ending_text = ierr != 0
                      ? fmt::format("ended inside the box (code {}: {})", ierr, code_text(ierr))
                      : "ended inside the box: the step fell below its minimum";
  return r;
}

}  // namespace orvq7tool
