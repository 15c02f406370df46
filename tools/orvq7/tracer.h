// tools/orvq7/tracer.h -- traces the curve of a typed system with ynchem, reads the points
// back from the result table, and says how the path ended.
#pragma once
#include <cstdint>
#include <string>
#include <vector>

#include "equations.h"

namespace orvq7tool {

// What to trace. Vectors of per-unknown values hold n values (tol: 1 or n).
struct TracePlan {
  std::string title;                 // for the picture and the report
  std::vector<double> start;         // x0, on the curve
  std::vector<double> direction;     // d0; empty: the curve's tangent at x0
  std::vector<double> lower, upper;  // the box
  std::vector<double> step_min, step_max;
  std::vector<double> tol;            // one value, or n values (per-unknown tolerance)
  std::int32_t kind = 4;              // path kind 2, 4 or 8
  bool order2 = false;                // curvature from the tangents (kinds 4 and 8)
  bool turn_test = true;              // reject steps whose tangent turns by over 22.5 degrees
  double eps = 1e-20;                 // residual threshold: sum of squares at most eps
  bool snap = false;                  // move a start point near the curve onto it
  double snapped = 0.0;               // set by check_plan: how far the start point moved
  std::uint64_t max_calls = 2000000;  // evaluation routine calls before giving up; 0: none
  double progress_after = 1.0;        // seconds before a progress line; negative: never
  std::string progress_name;          // shown in the progress line
};

enum class Ending { kClosed, kLeftBox, kInside, kFailed };

struct TraceResult {
  std::int32_t code = 0;             // ynchem's ierr
  std::int32_t result = 0;           // ynchem's result, 0 or 1
  std::size_t n = 0;                 // unknowns
  std::vector<double> direction;     // d0 as used: the one given or the tangent, made unit
  std::vector<double> points;        // n per point, in the order of the path
  std::vector<double> tangents;      // n per point
  std::vector<std::int32_t> phases;  // flush phase of each point (0 start, 1 along, 2 end)
  Ending ending = Ending::kFailed;
  std::size_t face_unknown = 0;   // for kLeftBox: the unknown (from 0) ...
  bool face_upper = false;        // ... and the bound of the face crossed
  std::string ending_text;        // one line: how the path ended
  double length = 0.0;            // length of the polyline through the points
  std::uint64_t calls = 0;        // calls of the evaluation routine
  std::uint64_t evaluations = 0;  // evaluations of the expressions at a point
  double seconds = 0.0;
  std::size_t count() const { return n == 0 ? 0 : points.size() / n; }
};

// Fills in the defaults of a plan for the system (direction excepted) and checks it: sizes,
// box, steps, tolerances, start point inside the box and on the curve (with plan.snap, a
// start point off the curve is first moved onto it by Gauss-Newton steps of least length:
// x -= J' (J J')^-1 F, solved by ynsega, at most 50, while the residual sum decreases);
// sets the system's difference scales from the box. Throws ToolError.
void check_plan(EquationSystem& system, TracePlan& plan);

// Traces the path of a checked plan. An input error found before the trace (no tangent at
// the start) throws ToolError; a failure of the solver is reported in the result
// (result 1, code, ending kFailed, ending_text naming the code).
TraceResult trace_path(const EquationSystem& system, const TracePlan& plan);

// The names of the unknowns when none are given: x, y (2); x, y, z (3); x1 .. xn.
std::vector<std::string> default_names(std::size_t n);

}  // namespace orvq7tool
