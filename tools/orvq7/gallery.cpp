// tools/orvq7/gallery.cpp -- the built-in gallery: curves traced with ynchem (one CSV and one
// SVG picture each), polynomials solved, a plane and a line fitted, closest points; the text
// goes to standard output and to summary.txt in the folder.
#include <fmt/format.h>

#include <cstdio>
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

struct GalleryCurve {
  std::string name;  // stem of the files
  std::string title;
  std::vector<std::string> names;
  std::vector<std::string> equations;
  std::vector<double> start, direction, lower, upper;
  std::size_t ax, ay;  // axes of the picture
  std::int32_t kind = 4;
  std::vector<double> tol;  // empty: the default of the kind
};

// clang-format off
const std::vector<GalleryCurve>& gallery_curves() {
  static const std::vector<GalleryCurve> curves = {
      {"circle", "A circle that closes on its start", {"x", "y"}, {"x^2 + y^2 - 1"},
       {1, 0}, {0, 1}, {-1.5, -1.5}, {1.5, 1.5}, 0, 1, 4, {}},
      {"viviani", "Viviani's curve: a sphere cut by a cylinder", {"x", "y", "z"},
       {"x^2 + y^2 + z^2 - 4", "(x - 1)^2 + y^2 - 1"},
       {0, 0, 2}, {0, 1, 0}, {-2.5, -2.5, -2.5}, {2.5, 2.5, 2.5}, 1, 2, 4, {}},
      {"folium", "The folium of Descartes leaves its box", {"x", "y"}, {"x^3 + y^3 - 3*x*y"},
       {1.5, 1.5}, {1, -1}, {-3, -3}, {3, 3}, 0, 1, 4, {}},
      {"lissajous5", "A closed curve in five unknowns", {"x1", "x2", "x3", "x4", "x5"},
       {"x1^2 + x2^2 - 1", "x3 - (x1^2 - x2^2)", "x4 - 2*x1*x2", "x5 - (x1*x3 - x2*x4)"},
       {1, 0, 1, 0, 1}, {0, 1, 0, 2, 0}, {-1.5, -1.5, -1.5, -1.5, -1.5},
       {1.5, 1.5, 1.5, 1.5, 1.5}, 3, 4, 4, {}},
  };
  return curves;
}
// clang-format on

struct GalleryPolynomial {
  std::vector<double> coef;
  std::string solver;
};

const std::vector<GalleryPolynomial>& gallery_polynomials() {
  static const std::vector<GalleryPolynomial> polys = {
      {{1, -6, 11, -6}, "ynzenr"},    // (x - 1)(x - 2)(x - 3)
      {{1, 0, -10, 0, 9}, "ynzenr"},  // (x^2 - 1)(x^2 - 9)
      {{1, 2, 5}, "duos"},            // roots -1 +- 2i
      {{1, -2, -1, 2}, "tresor"},     // (x - 2)(x - 1)(x + 1)
      {{1, 0, 0, 0, 1}, "quadr"},     // x^4 + 1
  };
  return polys;
}

// Points within 0.01 of the plane z = 0.3 x - 0.2 y + 1, on a 5 by 3 grid.
std::vector<double> plane_points() {
  std::vector<double> p;
  for (int j = -1; j <= 1; ++j)
    for (int i = -2; i <= 2; ++i) {
      const double x = i, y = j, dz = 0.01 * (((i + 2 * j + 9) % 3) - 1);
      p.insert(p.end(), {x, y, 0.3 * x - 0.2 * y + 1.0 + dz});
    }
  return p;
}

// Points near the line through (1, 0, -1) along (1, 2, 2) / 3.
std::vector<double> line_points() {
  std::vector<double> p;
  for (int k = 0; k < 9; ++k) {
    const double s = k - 4.0, e = 0.005 * ((k % 3) - 1);
    p.insert(p.end(), {1.0 + s / 3.0 + e, 2.0 * s / 3.0 - e, -1.0 + 2.0 * s / 3.0});
  }
  return p;
}

class Summary {
 public:
  void add(const std::string& text) {
    fmt::print("{}", text);
    std::fflush(stdout);
    text_ += text;
  }
  const std::string& text() const { return text_; }

 private:
  std::string text_;
};

}  // namespace

int run_gallery(const std::string& folder_name, double progress_after) {
  const std::filesystem::path folder = prepare_folder(folder_name);
  Summary out;
  int failures = 0;
  out.add(fmt::format("OrvQ7Maths {} gallery, writing into {}\n\n", orvq7_version_text(),
                      folder.string()));

  out.add("== Curves traced with ynchem\n\n");
  for (const GalleryCurve& c : gallery_curves()) {
    EquationSystem system(c.names, c.equations);
    TracePlan plan;
    plan.title = c.title;
    plan.start = c.start;
    plan.direction = c.direction;
    plan.lower = c.lower;
    plan.upper = c.upper;
    plan.kind = c.kind;
    plan.tol = c.tol;
    plan.progress_after = progress_after;
    plan.progress_name = c.name;
    check_plan(system, plan);
    const TraceResult r = trace_path(system, plan);
    out.add(trace_report(system, plan, r));
    if (r.ending == Ending::kFailed) {
      ++failures;
      out.add("\n");
      continue;
    }
    const std::filesystem::path csv = folder / (c.name + ".csv");
    const std::filesystem::path svg = folder / (c.name + ".svg");
    write_file(csv, points_csv(system, r));
    write_file(svg, render_svg(trace_picture(system, plan, r, c.ax, c.ay)));
    out.add(fmt::format("  wrote      {}, {}\n\n", csv.string(), svg.string()));
  }

  out.add("== Polynomial roots\n\n");
  for (const GalleryPolynomial& p : gallery_polynomials()) {
    const Outcome o = roots_report(p.coef, p.solver);
    failures += o.ok ? 0 : 1;
    out.add(o.text + "\n");
  }

  out.add("== Mean plane of 15 points within 0.01 of z = 0.3 x - 0.2 y + 1\n\n");
  Outcome o = fit_report(plane_points(), 1e-6);
  failures += o.ok ? 0 : 1;
  out.add(o.text + "\n");
  out.add("== Mean line of 9 points near the line through (1, 0, -1) along (1, 2, 2)\n\n");
  o = fit_report(line_points(), 1e-6);
  failures += o.ok ? 0 : 1;
  out.add(o.text + "\n");

  out.add("== Closest points\n\n");
  o = closest_report({0, 0, 0, 2, 0, 0}, {1, -1, 1, 1, 1, 1}, false, 3);
  failures += o.ok ? 0 : 1;
  out.add(o.text + "\n");
  o = closest_report({0, 0, 0, 0, 1, 1, 1, 1}, {1, -1, 0, 0, 0, 0, 3, 3}, true, 4);
  failures += o.ok ? 0 : 1;
  out.add(o.text + "\n");

  out.add(failures == 0 ? "Every item succeeded.\n"
                        : fmt::format("{} item(s) failed.\n", failures));
  write_file(folder / "summary.txt", out.text());
  fmt::print("Text in {}\n", (folder / "summary.txt").string());
  return failures == 0 ? 0 : 1;
}

}  // namespace orvq7tool
