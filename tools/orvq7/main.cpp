// tools/orvq7/main.cpp -- orvq7, the demonstration program of OrvQ7Maths: traces curves typed
// as equations, solves polynomials, fits planes and lines, finds closest points, and with no
// arguments runs a gallery of all of these that writes its text and pictures into a folder.
//
// Exit status: 0 success; 1 a library routine reported a failure; 2 bad input (one line on
// standard error naming the problem).
#include <fmt/format.h>

#include <CLI/CLI.hpp>
#include <cstdio>
#include <exception>
#include <string>
#include <vector>

#include "commands.h"
#include "equations.h"
#include "frame/frame_api.h"
#include "input.h"
#include "output.h"
#include "tracer.h"

namespace orvq7tool {
namespace {

constexpr int kExitFailed = 1;
constexpr int kExitBadInput = 2;

struct TraceArgs {
  std::vector<std::string> equations;
  std::string vars, start, dir, box, step, tol, axes = "1,2", out = "orvq7-out", name = "trace";
  std::int32_t kind = 4;
  bool order2 = false, no_turn_test = false, json = false, quiet = false, snap = false;
  double eps = 1e-20, progress = 1.0;
  std::uint64_t max_calls = 2000000;
};

// An axis given by name or by number from 1.
std::size_t axis_index(const std::string& text, const std::vector<std::string>& names) {
  for (std::size_t i = 0; i < names.size(); ++i)
    if (names[i] == text) return i;
  const double v = parse_real(text, "axes");
  if (v >= 1 && v <= static_cast<double>(names.size()) && v == std::floor(v))
    return static_cast<std::size_t>(v) - 1;
  throw ToolError(
      fmt::format("axes: '{}' is neither an unknown nor a number 1 to {}", text, names.size()));
}

int run_trace(const TraceArgs& a) {
  const std::size_t n = a.equations.size() + 1;
  std::vector<std::string> names =
      a.vars.empty() ? default_names(n) : parse_names(a.vars, "unknowns");
  EquationSystem system(names, a.equations);
  TracePlan plan;
  plan.title = fmt::format("Curve of {} equation{} in {} unknowns", a.equations.size(),
                           a.equations.size() == 1 ? "" : "s", system.unknowns());
  plan.start = parse_list(a.start, "start point");
  if (!a.dir.empty()) plan.direction = parse_list(a.dir, "start direction");
  const Ranges box = parse_ranges(a.box, system.unknowns(), "box");
  plan.lower = box.lower;
  plan.upper = box.upper;
  if (!a.step.empty()) {
    const Ranges steps = parse_ranges(a.step, system.unknowns(), "steps");
    plan.step_min = steps.lower;
    plan.step_max = steps.upper;
  }
  if (!a.tol.empty()) plan.tol = parse_list(a.tol, "tolerance");
  plan.kind = a.kind;
  plan.order2 = a.order2;
  plan.turn_test = !a.no_turn_test;
  plan.eps = a.eps;
  plan.snap = a.snap;
  plan.max_calls = a.max_calls;
  plan.progress_after = a.quiet ? -1.0 : a.progress;
  plan.progress_name = a.name;
  const std::size_t comma = a.axes.find(',');
  if (comma == std::string::npos) throw ToolError("axes: two unknowns expected, like 1,2 or x,z");
  const std::size_t ax = axis_index(a.axes.substr(0, comma), system.names());
  const std::size_t ay = axis_index(a.axes.substr(comma + 1), system.names());
  if (ax == ay) throw ToolError("axes: the two axes must differ");
  check_plan(system, plan);
  const std::filesystem::path folder = prepare_folder(a.out);

  const TraceResult r = trace_path(system, plan);
  fmt::print("{}", trace_report(system, plan, r));
  if (r.ending == Ending::kFailed) {
    std::fflush(stdout);
    fmt::print(stderr, "orvq7 trace: the path {}\n", r.ending_text);
    return kExitFailed;
  }
  const std::filesystem::path data = folder / (a.name + (a.json ? ".json" : ".csv"));
  const std::filesystem::path picture = folder / (a.name + ".svg");
  write_file(data, a.json ? points_json(system, plan, r) : points_csv(system, r));
  write_file(picture, render_svg(trace_picture(system, plan, r, ax, ay)));
  fmt::print("  wrote      {}, {}\n", data.string(), picture.string());
  return 0;
}

std::vector<double> read_points(const std::string& file) {
  const CsvTable t = read_csv_file(file);
  std::size_t cols[3] = {0, 1, 2};
  if (!t.header.empty()) {
    const char* want[3] = {"x", "y", "z"};
    bool named = true;
    for (int c = 0; c < 3; ++c) {
      bool found = false;
      for (std::size_t k = 0; k < t.header.size(); ++k)
        if (t.header[k] == want[c]) cols[c] = k, found = true;
      named = named && found;
    }
    if (!named) cols[0] = 0, cols[1] = 1, cols[2] = 2;
  }
  if (t.columns < 3)
    throw ToolError(fmt::format("{}: {} columns, expected x, y, z", file, t.columns));
  if (t.rows.empty()) throw ToolError(fmt::format("{}: no points", file));
  std::vector<double> xyz;
  for (const auto& row : t.rows)
    for (std::size_t c : cols) xyz.push_back(row[c]);
  return xyz;
}

int print_outcome(const Outcome& o) {
  fmt::print("{}", o.text);
  return o.ok ? 0 : kExitFailed;
}

std::vector<double> join_points(const std::vector<std::string>& pair, const char* what) {
  std::vector<double> a = parse_list(pair.at(0), what), b = parse_list(pair.at(1), what);
  if (a.size() != b.size())
    throw ToolError(
        fmt::format("{}: the two points have {} and {} coordinates", what, a.size(), b.size()));
  a.insert(a.end(), b.begin(), b.end());
  return a;
}

int run(int argc, char** argv) {
  CLI::App app{
      "orvq7 -- demonstration program of OrvQ7Maths. With no arguments it runs the "
      "gallery: curves traced, polynomials solved, a plane fitted, closest points, "
      "written as text and SVG pictures into a folder."};
  app.set_version_flag("--version", std::string("orvq7 ") + orvq7_version_text());
  app.require_subcommand(0, 1);
  std::string gallery_out = "orvq7-gallery";
  double gallery_progress = 1.0;
  app.add_option("--out", gallery_out, "folder of the gallery (no subcommand)")
      ->capture_default_str();

  auto* gallery = app.add_subcommand("gallery", "run the gallery (the default)");
  gallery->add_option("--out", gallery_out, "folder to write into")->capture_default_str();
  gallery->add_option("--progress", gallery_progress,
                      "seconds before a progress line (negative: none)");

  TraceArgs ta;
  auto* trace = app.add_subcommand(
      "trace", "trace the curve of n-1 equations in n unknowns from a start point");
  trace
      ->add_option("-e,--eq", ta.equations,
                   "an equation, 'expr' (= 0) or 'lhs = rhs'; give n-1 of them")
      ->required();
  trace->add_option("--vars", ta.vars,
                    "names of the unknowns, comma-separated "
                    "(default x,y / x,y,z / x1..xn)");
  trace->add_option("--start", ta.start, "start point on the curve, n values")->required();
  trace->add_option("--dir", ta.dir, "start direction, n values (default: the tangent)");
  trace->add_option("--box", ta.box, "lo:hi per unknown, comma-separated, or one for all")
      ->required();
  trace->add_option("--step", ta.step,
                    "min:max step per unknown, or one for all (default width*1e-7 : width/10)");
  trace->add_option("--tol", ta.tol,
                    "path tolerance, 1 or n values (default by kind: 2 width/100, "
                    "4 width/4000, 8 0.1)");
  trace
      ->add_option("--kind", ta.kind,
                   "path kind: 2 steps of at most 0.9 tol; 4 chords within about tol/5 of the "
                   "curve; 8 tangent turning by about 0.9 tol radians per step")
      ->check(CLI::IsMember({2, 4, 8}))
      ->capture_default_str();
  trace->add_flag("--secant-curvature", ta.order2,
                  "curvature from the last two tangents, no second derivatives (kinds 4, 8)");
  trace->add_flag("--no-turn-test", ta.no_turn_test, "accept steps that turn by over 22.5 deg");
  trace->add_option("--eps", ta.eps, "residual threshold: sum of squares at most eps")
      ->capture_default_str();
  trace->add_flag("--snap", ta.snap, "move a start point near the curve onto it first");
  trace->add_option("--axes", ta.axes, "the two unknowns of the picture, by name or number")
      ->capture_default_str();
  trace->add_option("--out", ta.out, "folder to write into")->capture_default_str();
  trace->add_option("--name", ta.name, "stem of the files written")->capture_default_str();
  trace->add_flag("--json", ta.json, "write the points as JSON instead of CSV");
  trace
      ->add_option("--max-calls", ta.max_calls,
                   "stop after this many calls of the evaluation routine (0: none)")
      ->capture_default_str();
  trace->add_option("--progress", ta.progress, "seconds before a progress line (negative: none)")
      ->capture_default_str();
  trace->add_flag("--quiet", ta.quiet, "no progress line");

  std::vector<std::string> coef_text;
  std::string solver = "ynzenr";
  std::int32_t cardan_mode = 1;
  auto* roots = app.add_subcommand("roots", "roots of a polynomial of degree 1 to 4");
  roots->add_option("coefficients", coef_text, "coefficients by decreasing power")->required();
  roots->add_option("--solver", solver, fmt::format("solver: {}", fmt::join(root_solvers(), ", ")))
      ->capture_default_str();
  roots->add_option("--mode", cardan_mode, "cardan's mode: 1 all roots, 2 the first only")
      ->capture_default_str();

  std::string fit_file;
  double fit_tol = 1e-6;
  auto* fit = app.add_subcommand("fit", "mean plane and mean line of points from a CSV file");
  fit->add_option("file", fit_file, "CSV file: x,y,z per line (header optional)")->required();
  fit->add_option("--tol", fit_tol, "tolerance of the fit")->capture_default_str();

  std::vector<std::string> seg1, seg2, line;
  auto* closest = app.add_subcommand("closest",
                                     "closest pair of two segments, or of a segment "
                                     "and a line, in any dimension");
  closest->add_option("--seg1", seg1, "first segment: two points, each comma-separated")
      ->expected(2)
      ->required();
  auto* s2 = closest->add_option("--seg2", seg2, "second segment: two points")->expected(2);
  auto* ln = closest->add_option("--line", line, "a line: direction, then a point")->expected(2);
  s2->excludes(ln);

  try {
    app.parse(argc, argv);
  } catch (const CLI::CallForHelp& e) {
    return app.exit(e);
  } catch (const CLI::CallForAllHelp& e) {
    return app.exit(e);
  } catch (const CLI::CallForVersion& e) {
    return app.exit(e);
  } catch (const CLI::ParseError& e) {
    std::string where = "orvq7";
    for (const CLI::App* sub : app.get_subcommands()) where += " " + sub->get_name();
    fmt::print(stderr, "{}: error: {} (see {} --help)\n", where, e.what(), where);
    return kExitBadInput;
  }

  if (*trace) return run_trace(ta);
  if (*roots) {
    std::vector<double> coef;
    for (const std::string& c : coef_text) coef.push_back(parse_real(c, "coefficient"));
    return print_outcome(roots_report(coef, solver, cardan_mode));
  }
  if (*fit) return print_outcome(fit_report(read_points(fit_file), fit_tol));
  if (*closest) {
    if (seg2.empty() && line.empty()) throw ToolError("give --seg2 or --line");
    const std::vector<double> a = join_points(seg1, "first segment");
    const std::vector<double> b =
        line.empty() ? join_points(seg2, "second segment") : join_points(line, "line");
    if (a.size() != b.size())
      throw ToolError(fmt::format("the first segment is in dimension {}, the other in {}",
                                  a.size() / 2, b.size() / 2));
    return print_outcome(closest_report(a, b, !line.empty(), a.size() / 2));
  }
  return run_gallery(gallery_out, gallery_progress);
}

}  // namespace
}  // namespace orvq7tool

int main(int argc, char** argv) {
  std::string where = "orvq7";
  if (argc > 1 && argv[1][0] != '-') where += std::string(" ") + argv[1];
  try {
    return orvq7tool::run(argc, argv);
  } catch (const orvq7tool::ToolError& e) {
    std::fflush(stdout);
    fmt::print(stderr, "{}: error: {}\n", where, e.what());
  } catch (const std::exception& e) {
    std::fflush(stdout);
    fmt::print(stderr, "{}: error: {}\n", where, e.what());
  }
  return orvq7tool::kExitBadInput;
}
