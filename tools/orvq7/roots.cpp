// tools/orvq7/roots.cpp -- roots of polynomials of degree 1 to 4 by the library's solvers.
#include <fmt/format.h>

#include <cmath>
#include <complex>
#include <limits>

#include "commands.h"
#include "input.h"
#include "poly/poly_api.h"

namespace orvq7tool {
namespace {

const double kNaN = std::numeric_limits<double>::quiet_NaN();

// Number of coefficients each fixed-degree solver takes (0: any degree 1 to 4).
std::size_t coefficients_of(const std::string& solver) {
  if (solver == "duos" || solver == "ynze2r") return 3;
  if (solver == "cardan" || solver == "tresor" || solver == "ynze3r") return 4;
  if (solver == "ferari" || solver == "quadr") return 5;
  return 0;
}

std::string term(double c, std::size_t power, bool first) {
  const double a = std::fabs(c);
  std::string s = first ? (c < 0 ? "-" : "") : (c < 0 ? " - " : " + ");
  if (a != 1.0 || power == 0) s += fmt::format("{:g}", a);
  if (power >= 1) s += (a != 1.0 ? " x" : "x");
  if (power >= 2) s += fmt::format("^{}", power);
  return s;
}

std::string polynomial_text(const std::vector<double>& c) {
  std::string s;
  for (std::size_t k = 0; k < c.size(); ++k)
    if (c[k] != 0.0 || (s.empty() && k + 1 == c.size()))
      s += term(c[k], c.size() - 1 - k, s.empty());
  return s.empty() ? "0" : s;
}

std::string complex_text(double re, double im) {
  if (im == 0.0) return fmt::format("{:.17g}", re);
  return fmt::format("{:.17g} {} {:.17g} i", re, im < 0 ? "-" : "+", std::fabs(im));
}

// |p(z)| by Horner's scheme in complex arithmetic, coefficients by decreasing power.
double residual(const std::vector<double>& c, double re, double im) {
  std::complex<double> z(re, im), s(0.0, 0.0);
  for (double ck : c) s = s * z + ck;
  return std::abs(s);
}

// The meaning of each solver's case flag or code.
std::string flag_text(const std::string& solver, std::int32_t flag) {
  if (solver == "duos") {
    switch (flag) {
      case 0:
        return "two real roots";
      case 1:
        return "no solution (c0 = c1 = 0, c2 != 0)";
      case 2:
        return "every x is a solution (all coefficients 0)";
      case 3:
        return "linear (c0 = 0): one root, in both slots";
      case 4:
        return "a pair of complex conjugate roots";
    }
  } else if (solver == "cardan") {
    switch (flag) {
      case 1:
        return "one real root and a complex pair";
      case 2:
        return "leading coefficient below 1e-15: solved as a quadratic";
      case 3:
        return "three real roots";
    }
  } else if (solver == "ferari") {
    if (flag == 0) return "four roots";
    if (flag == 3) return "leading coefficient below 1e-15: nothing computed";
  } else if (solver == "quadr") {
    switch (flag) {
      case 0:
        return "four roots";
      case 1:
        return "four roots (negative resolvent root, sign discarded)";
      case 3:
        return "leading coefficient 0: nothing computed";
      case 11:
        return "Newton reached its count on the resolvent";
      case 12:
        return "zero derivative met in the resolvent's Newton";
      case 13:
        return "degenerate resolvent";
      case 33:
        return "huge resolvent coefficients";
    }
  } else if (solver == "tresor") {
    switch (flag) {
      case 0:
        return "success";
      case 11:
        return "Newton reached its count";
      case 12:
        return "zero derivative met in Newton";
      case 13:
        return "degenerate quadratic";
      case 33:
        return "huge coefficients: Newton's result";
    }
  }
  return flag == 0 ? "success" : "see the solver's documentation";
}

}  // namespace

const std::vector<std::string>& root_solvers() {
  static const std::vector<std::string> solvers = {"ynzenr", "ynze2r", "ynze3r", "duos",
                                                   "cardan", "ferari", "quadr",  "tresor"};
  return solvers;
}

Outcome roots_report(const std::vector<double>& coef, const std::string& solver,
                     std::int32_t cardan_mode) {
  bool known = false;
  for (const std::string& s : root_solvers()) known = known || s == solver;
  if (!known)
    throw ToolError(
        fmt::format("unknown solver '{}' (one of {})", solver, fmt::join(root_solvers(), ", ")));
  if (coef.size() < 2 || coef.size() > 5)
    throw ToolError(
        fmt::format("{} coefficients: degree {} is out of range (1 to 4, so 2 to 5 "
                    "coefficients)",
                    coef.size(), static_cast<long>(coef.size()) - 1));
  const std::size_t need = coefficients_of(solver);
  if (need != 0 && coef.size() != need)
    throw ToolError(fmt::format("{} takes {} coefficients (degree {}), got {}", solver, need,
                                need - 1, coef.size()));

  double roots[8];
  for (double& r : roots) r = kNaN;
  std::int32_t flag = 0, result = 0, slots = 0;
  std::string status;
  if (solver == "ynzenr") {
    const std::int32_t n = static_cast<std::int32_t>(coef.size()) - 1;
    std::int32_t nroots = 0;
    result = ynzenr(&n, coef.data(), &nroots, roots, &flag);
    slots = result == 0 ? nroots : 0;
    status = fmt::format("result {}, code {}{}, degree solved {}", result, flag,
                         result == 0 ? "" : fmt::format(" ({})", flag_text(solver, flag)), nroots);
  } else if (solver == "ynze2r" || solver == "ynze3r") {
    result =
        solver == "ynze2r" ? ynze2r(coef.data(), roots, &flag) : ynze3r(coef.data(), roots, &flag);
    slots = result == 0 ? static_cast<std::int32_t>(need) - 1 : 0;
    status = fmt::format("result {}, code {}{}", result, flag,
                         flag == 4709 ? " (leading coefficient 0)" : "");
  } else {
    if (solver == "duos") {
      duos(coef.data(), roots, &flag);
      slots = (flag == 1 || flag == 2) ? 0 : 2;
    } else if (solver == "cardan") {
      cardan(coef.data(), &cardan_mode, roots, &flag);
      // Flag 2 solved a quadratic into slots 0 and 1; mode 2 forms slot 0 only; a mode other
      // than 1 forms no conjugate pair.
      slots = flag == 2 ? 2 : (cardan_mode == 2 || (flag == 1 && cardan_mode != 1)) ? 1 : 3;
    } else if (solver == "ferari") {
      ferari(coef.data(), roots, &flag);
      slots = flag == 3 ? 0 : 4;
    } else if (solver == "quadr") {
      quadr(coef.data(), roots, &flag);
      slots = flag == 3 ? 0 : 4;
    } else {
      tresor(coef.data(), roots, &flag);
      slots = coef[0] == 0.0 ? 2 : 3;  // a quadratic's two roots; slot 2 is no root then
    }
    status = fmt::format("flag {} ({})", flag, flag_text(solver, flag));
  }

  Outcome o;
  o.ok = result == 0;
  o.text += fmt::format("polynomial  {}\n", polynomial_text(coef));
  o.text += fmt::format("solver      {}: {}\n", solver, status);
  for (std::int32_t k = 0; k < slots; ++k) {
    const double re = roots[2 * k], im = roots[2 * k + 1];
    o.text += fmt::format("root {}      {:<44} |p(root)| = {:.3g}\n", k + 1, complex_text(re, im),
                          residual(coef, re, im));
  }
  if (o.ok && slots == 0) o.text += "no roots\n";
  if (solver == "ynzenr" && o.ok && slots == 1)
    o.text += "note        for a x + b, ynzenr returns b / a as documented (the root is -b / a)\n";
  return o;
}

}  // namespace orvq7tool
