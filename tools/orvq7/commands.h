// tools/orvq7/commands.h -- the computations behind the subcommands, each giving the text it
// prints; the gallery uses the same ones. Bad input throws ToolError.
#pragma once
#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace orvq7tool {

struct Outcome {
  std::string text;  // lines to print
  bool ok = true;    // false: the library routine reported a failure
};

// Roots of the polynomial with coefficients by decreasing power (2 to 5 of them) by the
// named solver: ynzenr, ynze2r, ynze3r, duos, cardan (with its mode), ferari, quadr, tresor.
Outcome roots_report(const std::vector<double>& coef, const std::string& solver,
                     std::int32_t cardan_mode = 1);
// The solvers roots_report knows, for the help text.
const std::vector<std::string>& root_solvers();

// Mean plane and mean line of points of space (3 reals per point) with tolerance tol.
Outcome fit_report(const std::vector<double>& xyz, double tol);

// Closest pair of two segments (other = Q1, Q2), or of a segment and a line (other = unit
// direction, point) in dimension n; seg and other hold 2n reals, the two columns.
Outcome closest_report(const std::vector<double>& seg, const std::vector<double>& other,
                       bool other_is_line, std::size_t n);

// The built-in gallery, written into `folder`; returns 0 when every item succeeded.
int run_gallery(const std::string& folder, double progress_after);

}  // namespace orvq7tool
