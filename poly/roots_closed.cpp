// poly/roots_closed.cpp -- the older closed-form root subroutines: duos, cardan, ferari,
// quadr, tresor, itdeg3. Coefficients by decreasing power; roots are complex pairs
// (re, im), slot k at roots[2k]. They report through a case flag, never fail and record no
// traceback frame. Intermediate coefficient arrays are locals: no call reads another's.
#include <cmath>
#include <complex>
#include <cstdint>

#include "frame/tolerances.h"
#include "poly/poly_api.h"
#include "vector/vector_api.h"

namespace {

constexpr double kEps = impl::kNegligible;        // 1e-15, absolute unless stated
constexpr double kDominates = impl::kCubicRatio;  // 3e-8, cardan: q^2 dominates p^3
constexpr double kTwoPi = 6.283185307179586;
constexpr double kSqrt3 = 1.7320508075688772;
// tresor
constexpr double kTinyConstant = 1e-30;  // |c3| at or below: the root 0 is split off
constexpr double kNearZeroRoot = 1e-6;   // |c3| and |c3 / c2| at or below: Newton from 0
constexpr double kHugeP = 1e25;          // |P| at or above: closed form abandoned
constexpr double kHugeQ = 1e38;          // |q| at or above: closed form abandoned
constexpr double kSmallP = 1e-11;        // 1e-11 q^2 > |4 P^3|: P negligible
constexpr double kFlatD = 1e-10;         // 1e-10 q^2 > D: imaginary part from sigma
constexpr double kLargeD = 1e10;         // D > 1e10 q^2: root -q / (3P)
constexpr std::int32_t kTresorDegenerate = 13;
constexpr std::int32_t kTresorHuge = 33;
// itdeg3
constexpr std::int32_t kNewtonCounts = 30;  // the 30th count stops the loop
constexpr std::int32_t kItdegLimit = 11;
constexpr std::int32_t kItdegFlat = 12;
// quartics
constexpr double kBiquadratic = 1e-30;  // resolvent root below: biquadratic / no Q / s

// duos flags
constexpr std::int32_t kDuosReal = 0;
constexpr std::int32_t kDuosNone = 1;
constexpr std::int32_t kDuosAll = 2;
constexpr std::int32_t kDuosLinear = 3;
constexpr std::int32_t kDuosComplex = 4;
// cardan flags
constexpr std::int32_t kCardanOneReal = 1;
constexpr std::int32_t kCardanQuadratic = 2;
constexpr std::int32_t kCardanThreeReal = 3;

void set_slot(double* roots, int k, double re, double im) {
  roots[2 * k] = re;
  roots[2 * k + 1] = im;
}

void swap_slots(double* roots, int j, int k) {
  const double re = roots[2 * j], im = roots[2 * j + 1];
  roots[2 * j] = roots[2 * k];
  roots[2 * j + 1] = roots[2 * k + 1];
  roots[2 * k] = re;
  roots[2 * k + 1] = im;
}

// Slots 0..2 into decreasing order of real part, whole pairs exchanged; a slot moves only
// past a strictly larger one.
void sort3_decreasing(double* roots) {
  if (roots[2] > roots[0]) swap_slots(roots, 0, 1);
  if (roots[4] > roots[2]) swap_slots(roots, 1, 2);
  if (roots[2] > roots[0]) swap_slots(roots, 0, 1);
}

void subtract_from_real_parts(double* roots, int slots, double t) {
  for (int k = 0; k < slots; ++k) roots[2 * k] = roots[2 * k] - t;
}

// duos on x^2 + b1 x + b2 into two slots; returns its flag.
std::int32_t monic_duos(double b1, double b2, double* roots) {
  const double q[3] = {1.0, b1, b2};
  std::int32_t f = 0;
  duos(q, roots, &f);
  return f;
}

// Resolvent of the quartic x^4 + b x^3 + c x^2 + d x + e (shared by ferari and quadr):
// P = c - 1.5 (b^2 / 4), Q = (b / 2)(b^2 / 4 - c) + d,
// R = 3 (b^2 / 4)^2 - 4e + c (c - b^2) + b d, summed left to right.
struct Resolvent {
  double p, q, r;
};
Resolvent quartic_resolvent(double b, double c, double d, double e) {
  const double bb4 = (b * b) / 4.0;
  Resolvent z;
  z.p = c - 1.5 * bb4;
  z.q = (b / 2.0) * (bb4 - c) + d;
  z.r = ((3.0 * (bb4 * bb4) - 4.0 * e) + c * (c - b * b)) + b * d;
  return z;
}

// The two pairs of a Ferrari quartic: (s +- sqrt(u)/2) and (-s +- sqrt(v)/2), real when
// the radicand is >= 0 (inclusive), a conjugate pair otherwise.
void ferrari_pairs(double s, double w, double a, double z, double* roots) {
  const double u = (-w - a) - z;
  const double v = (w - a) - z;
  if (u >= 0.0) {
    set_slot(roots, 0, s + std::sqrt(u) / 2.0, 0.0);
    set_slot(roots, 1, s - std::sqrt(u) / 2.0, 0.0);
  } else {
    set_slot(roots, 0, s, std::sqrt(-u) / 2.0);
    set_slot(roots, 1, s, -(std::sqrt(-u) / 2.0));
  }
  if (v >= 0.0) {
    set_slot(roots, 2, -s + std::sqrt(v) / 2.0, 0.0);
    set_slot(roots, 3, -s - std::sqrt(v) / 2.0, 0.0);
  } else {
    set_slot(roots, 2, -s, std::sqrt(-v) / 2.0);
    set_slot(roots, 3, -s, -(std::sqrt(-v) / 2.0));
  }
}

// Real cube root with the sign of x, of magnitude cbrt(|x|).
double signed_cbrt_of_minus(double q) {
  const double mag = std::cbrt(std::fabs(q));
  return q > 0.0 ? -mag : mag;
}

}  // namespace

extern "C" {

void duos(const double* coef, double* roots, std::int32_t* flag) {
  const double a = coef[0], b = coef[1], c = coef[2];
  // (1) Exactly zero leading coefficient: degenerate or linear.
  if (a == 0.0) {
    if (b == 0.0) {
      *flag = c == 0.0 ? kDuosAll : kDuosNone;  // roots untouched
      return;
    }
    const double x = -c / b;
    set_slot(roots, 0, x, 0.0);
    set_slot(roots, 1, x, 0.0);
    *flag = kDuosLinear;
    return;
  }
  // (2) Conjugate pair when d > b^2 (strict); multiplying by h keeps the sign of a in the
  // imaginary parts.
  const double d = (4.0 * a) * c;
  const double h = 0.5 / a;
  if (d > b * b) {
    const double im = std::sqrt(d - b * b) * h;
    set_slot(roots, 0, -b * h, im);
    set_slot(roots, 1, -b * h, -im);
    *flag = kDuosComplex;
    return;
  }
  // (3) Two real roots: the sign of b picks the non-cancelling sum (b = -0 counts as
  // positive); the other root from the product c / a.
  const double s = std::fabs(std::sqrt(b * b - d));
  const double q = b >= 0.0 ? -h * (b + s) : -h * (b - s);
  set_slot(roots, 1, q, 0.0);
  if (q == 0.0) {
    set_slot(roots, 0, 0.0, 0.0);
  } else {
    set_slot(roots, 0, c / (a * q), 0.0);
  }
  *flag = kDuosReal;
}

void cardan(const double* coef, const std::int32_t* mode, double* roots, std::int32_t* flag) {
  const std::int32_t md = *mode;
  // Every slot starts as (0, 0): a slot not formed (mode 2) holds (-t, 0) after the shift.
  for (int k = 0; k < 6; ++k) roots[k] = 0.0;
  // (1) Negligible leading coefficient: the quadratic c1, c2, c3 (duos's flag dropped).
  if (std::fabs(coef[0]) < kEps) {
    std::int32_t f = 0;
    duos(coef + 1, roots, &f);
    *flag = kCardanQuadratic;
    return;
  }
  // (2) Normalise.
  const double b = coef[1] / coef[0];
  const double c = coef[2] / coef[0];
  const double d = coef[3] / coef[0];
  // (3) Exactly zero constant: the root 0 and the quadratic x^2 + b x + c, no shift.
  if (d == 0.0) {
    *flag = kCardanOneReal;
    if (md == 2) return;
    if (monic_duos(b, c, roots + 2) == kDuosReal) {
      *flag = kCardanThreeReal;
      sort3_decreasing(roots);
    }
    return;
  }
  // (4) Depress; absolute test zeroes p and q.
  const double t = b / 3.0;
  double p = c - b * t;
  double q = d + (((2.0 * b) * t) / 3.0 - c) * t;
  if (std::fabs(p) < kEps) p = 0.0;
  if (std::fabs(q) < kEps) q = 0.0;
  std::int32_t quad_flag = -1;  // flag of the duos call of (6)-(8), when one is made
  if (p == 0.0 && q == 0.0) {
    // (5) Triple root y = 0 in every slot.
    *flag = kCardanThreeReal;
  } else if (p == 0.0) {
    // (6) y = real cube root of -q; the pair from z^2 + y z - q / y.
    *flag = kCardanOneReal;
    const double y = signed_cbrt_of_minus(q);
    set_slot(roots, 0, y, 0.0);
    if (md != 2) quad_flag = monic_duos(y, -q / y, roots + 2);
  } else if (q == 0.0) {
    // (7) y = 0; the pair from z^2 + p.
    *flag = kCardanOneReal;
    set_slot(roots, 0, 0.0, 0.0);
    if (md != 2) quad_flag = monic_duos(0.0, p, roots + 2);
  } else {
    // (8) Discriminant 4 p^3 + 27 q^2.
    const double delta = 4.0 * ((p * p) * p) + 27.0 * (q * q);
    if (delta < -kEps) {
      // Three distinct real roots, trigonometric form; parcos clamps to [0, pi].
      const double r = std::sqrt(-p / 3.0);
      const double arg = (3.0 * q) / ((2.0 * p) * r);
      const double tol = kEps;
      std::int32_t pf = 0;
      const double theta = parcos(&arg, &tol, &pf);
      const double y1 = (2.0 * r) * std::cos(theta / 3.0);
      set_slot(roots, 0, y1, 0.0);
      if (md != 2) {
        const double y2 = (2.0 * r) * std::cos((theta + kTwoPi) / 3.0);
        set_slot(roots, 1, y2, 0.0);
        set_slot(roots, 2, -q / (y1 * y2), 0.0);  // the product of the roots is -q
      }
      *flag = kCardanThreeReal;
    } else if (std::fabs(delta) <= kEps) {
      // Double root (inclusive band): y1 = 2 cbrt(|q / 2|) with the sign of -q.
      *flag = kCardanThreeReal;
      const double mag = 2.0 * std::cbrt(std::fabs(q / 2.0));
      const double y1 = q > 0.0 ? -mag : mag;
      set_slot(roots, 0, y1, 0.0);
      if (md != 2) {
        set_slot(roots, 1, -y1 / 2.0, 0.0);
        set_slot(roots, 2, -y1 / 2.0, 0.0);
      }
    } else {
      // One real root (also a NaN discriminant); the pair only with mode 1 itself.
      *flag = kCardanOneReal;
      const double big_r = std::sqrt(delta / 108.0);
      double y;
      if ((kDominates * 27.0) * (q * q) >= 4.0 * std::fabs((p * p) * p)) {
        // q dominates: the cancelling cube root rewritten as p / (3 cbrt(q)).
        if (q >= 0.0) {
          y = p / (3.0 * std::cbrt(q)) + std::cbrt(-q / 2.0 - big_r);
        } else {
          y = std::cbrt(-q / 2.0 + big_r) - p / (3.0 * std::cbrt(std::fabs(q)));
        }
      } else {
        y = std::cbrt(-q / 2.0 + big_r) + std::cbrt(-q / 2.0 - big_r);
      }
      set_slot(roots, 0, y, 0.0);
      if (md == 1) quad_flag = monic_duos(y, -q / y, roots + 2);
    }
  }
  // Two real roots from the quadratic make three real roots.
  if (quad_flag == kDuosReal) *flag = kCardanThreeReal;
  // (9) Shift every slot back by t.
  subtract_from_real_parts(roots, 3, t);
  // (10) Decreasing order; with mode 2 only slot 0 is a root, so it stays where it is.
  if (*flag == kCardanThreeReal && md != 2) sort3_decreasing(roots);
}

void ferari(const double* coef, double* roots, std::int32_t* flag) {
  // (1) Negligible leading coefficient: nothing computed.
  if (std::fabs(coef[0]) < kEps) {
    *flag = 3;
    return;
  }
  // (2) Normalise.
  const double b = coef[1] / coef[0];
  const double c = coef[2] / coef[0];
  const double d = coef[3] / coef[0];
  const double e = coef[4] / coef[0];
  *flag = 0;
  // (3) Exactly zero constant: the root 0 and the cubic (its flag discarded), no shift.
  if (e == 0.0) {
    set_slot(roots, 0, 0.0, 0.0);
    const double cubic[4] = {1.0, b, c, d};
    const std::int32_t mode = 1;
    std::int32_t cf = 0;
    cardan(cubic, &mode, roots + 2, &cf);
    return;
  }
  // (4) Resolvent z^3 + A z^2 + B z + E, A = 2P, B = R, E = -Q^2.
  const Resolvent rv = quartic_resolvent(b, c, d, e);
  double ca = 2.0 * rv.p;
  double cb = rv.r;
  double ce = -(rv.q * rv.q);
  // (5) Relative clean-up, at most one coefficient zeroed, in this order.
  if (kEps * std::fabs(ca) > std::fabs(ce) && kEps * std::fabs(cb) > std::fabs(ce)) {
    ce = 0.0;
  } else if (kEps * std::fabs(ca) > std::fabs(cb) && kEps * std::fabs(ce) > std::fabs(cb)) {
    cb = 0.0;
  } else if (kEps * std::fabs(cb) > std::fabs(ca) && kEps * std::fabs(ce) > std::fabs(ca)) {
    ca = 0.0;
  }
  // (6) The resolvent by cardan, first root only.
  const double cubic[4] = {1.0, ca, cb, ce};
  const std::int32_t mode = 0;
  double res[6];
  std::int32_t cf = 0;
  cardan(cubic, &mode, res, &cf);
  if (cf == kCardanOneReal || cf == kCardanThreeReal) {
    *flag = 0;
  } else {
    *flag = cf;
  }
  // (7) One Newton step on the resolvent, kept only when it lowers |f|.
  auto f = [&](double z) { return (((z * z) * z + ca * (z * z)) + cb * z) + ce; };
  double z = res[0];
  const double fp = (3.0 * (z * z) + (2.0 * ca) * z) + cb;
  if (fp != 0.0) {
    const double z1 = z - f(z) / fp;
    if (std::fabs(f(z)) > std::fabs(f(z1))) z = z1;
  }
  // (8) s = sqrt(z) / 2, or 0 for z <= 0.
  double s;
  if (z <= 0.0) {
    z = 0.0;
    s = 0.0;
  } else {
    s = std::sqrt(z) / 2.0;
  }
  // (9) w = Q / s, or 2 sqrt(B) when z is tiny and B > 0, else 0.
  double w;
  if (z >= kBiquadratic) {
    w = rv.q / s;
  } else if (cb > 0.0) {
    w = 2.0 * std::sqrt(cb);
  } else {
    w = 0.0;
  }
  // (10)-(12) The two pairs, with the cleaned A.
  ferrari_pairs(s, w, ca, z, roots);
  // (13) Undo the shift x = y - b / 4.
  subtract_from_real_parts(roots, 4, b / 4.0);
}

void quadr(const double* coef, double* roots, std::int32_t* flag) {
  // (1) Exactly zero leading coefficient: nothing computed.
  if (coef[0] == 0.0) {
    *flag = 3;
    return;
  }
  const double b = coef[1] / coef[0];
  const double c = coef[2] / coef[0];
  const double d = coef[3] / coef[0];
  const double e = coef[4] / coef[0];
  const Resolvent rv = quartic_resolvent(b, c, d, e);
  const double ca = 2.0 * rv.p;
  // (2) The resolvent by tresor (its code is the flag); a negative root loses its sign.
  const double cubic[4] = {1.0, ca, rv.r, -(rv.q * rv.q)};
  double res[6];
  tresor(cubic, res, flag);
  double z = res[0];
  if (z < 0.0) {
    *flag = 1;
    z = -z;
  }
  const double s = std::sqrt(z) / 2.0;
  if (z < kBiquadratic) {
    // (3) Biquadratic: u^2 + P u + (P^2 - R) / 4, roots +-sqrt(u1), +-sqrt(u2) (principal).
    double u[4] = {0.0, 0.0, 0.0, 0.0};
    *flag = monic_duos(rv.p, (rv.p * rv.p - rv.r) / 4.0, u);
    const std::complex<double> r1 = std::sqrt(std::complex<double>(u[0], u[1]));
    const std::complex<double> r2 = std::sqrt(std::complex<double>(u[2], u[3]));
    set_slot(roots, 0, r1.real(), r1.imag());
    set_slot(roots, 1, r2.real(), r2.imag());
    set_slot(roots, 2, -r1.real(), -r1.imag());
    set_slot(roots, 3, -r2.real(), -r2.imag());
  } else {
    // (4) w = Q / s and the two pairs.
    ferrari_pairs(s, rv.q / s, ca, z, roots);
  }
  // (5) Undo the shift.
  subtract_from_real_parts(roots, 4, b / 4.0);
}

void tresor(const double* coef, double* roots, std::int32_t* code) {
  const double c0 = coef[0], c1 = coef[1], c2 = coef[2], c3 = coef[3];
  const double zero = 0.0;
  auto start_slots = [roots] {
    set_slot(roots, 0, 0.0, 0.0);
    set_slot(roots, 1, 0.0, 0.0);
    set_slot(roots, 2, 1.0, 0.0);
  };
  // (8) Orderings after duos; `three` when the root 0 was split off into slot 0.
  auto after_duos = [roots, code](std::int32_t f, bool three) {
    if (f == kDuosNone || f == kDuosAll || f == kDuosLinear) {
      *code = kTresorDegenerate;
      if (f == kDuosAll) {
        for (int k = 0; k < 3; ++k) set_slot(roots, k, 1.0, 0.0);
      }
      return;
    }
    *code = 0;
    if (f != kDuosReal) return;  // a conjugate pair stays as duos wrote it
    if (three) {
      sort3_decreasing(roots);
    } else if (roots[2] > roots[0]) {
      swap_slots(roots, 0, 1);
    }
  };
  // (1) Exactly zero leading coefficient: the quadratic into slots 0 and 1.
  if (c0 == 0.0) {
    start_slots();
    std::int32_t f = 0;
    duos(coef + 1, roots, &f);
    after_duos(f, false);
    return;
  }
  // (2) Negligible constant: the root 0, and the quadratic into slots 1 and 2.
  if (std::fabs(c3) <= kTinyConstant) {
    start_slots();
    std::int32_t f = 0;
    duos(coef, roots + 2, &f);
    after_duos(f, true);
    return;
  }
  // (3) A root near 0: Newton from 0.
  if (std::fabs(c3) <= kNearZeroRoot && c2 != 0.0 && std::fabs(c3 / c2) <= kNearZeroRoot) {
    itdeg3(coef, &zero, roots, code);
    return;
  }
  // (4) Depressed cubic y^3 + 3P y + q, x = y - t.
  const double k = 1.0 / (3.0 * c0);
  const double t = c1 * k;
  const double p = (c2 - c1 * t) * k;
  const double q = c3 / c0 - (2.0 * p + k * c2) * t;
  // (5) Too large for the closed form.
  if (std::fabs(p) >= kHugeP || std::fabs(q) >= kHugeQ) {
    std::int32_t ic = 0;
    itdeg3(coef, &zero, roots, &ic);
    *code = kTresorHuge;
    return;
  }
  // (6) D = q^2 + 4P^3.
  const double p4 = 4.0 * ((p * p) * p);
  double dd = q * q + p4;
  double y1, m, sigma = 0.0;
  if (kSmallP * (q * q) > std::fabs(p4)) {
    // P negligible.
    const double u = std::cbrt(-q);
    y1 = u - p / u;
    m = p / u;
  } else {
    if (std::fabs(dd) <= kEps) dd = 0.0;  // absolute
    if (dd < 0.0) {
      // Three real roots: y = r sin(phi + 2j pi / 3), r = sqrt(-4P).
      const double r = std::sqrt(-4.0 * p);
      const double arg = -q / (p * r);
      const double phi = darsin(&arg) / 3.0;
      const double minus_half = -0.5;
      const double third = darcos(&minus_half);  // 2 pi / 3
      const double y[3] = {r * std::sin(phi), r * std::sin(phi + third),
                           r * std::sin(phi - third)};
      double largest = y[0], smallest = y[0];
      for (int j = 1; j < 3; ++j) {
        if (y[j] > largest) largest = y[j];
        if (y[j] < smallest) smallest = y[j];
      }
      set_slot(roots, 0, largest, 0.0);
      set_slot(roots, 1, -q / (largest * smallest), 0.0);
      set_slot(roots, 2, smallest, 0.0);
    } else if (dd == 0.0) {
      // Double root g and simple root -2g; g > 0 exactly when P q < 0.
      const double mag = std::fabs(std::sqrt(-p));
      const double g = p * q < 0.0 ? mag : -mag;
      for (int j = 0; j < 3; ++j) set_slot(roots, j, g, 0.0);
      set_slot(roots, g >= 0.0 ? 2 : 0, -2.0 * g, 0.0);
    }
    if (dd <= 0.0) {
      // (7) Shift the three real roots.
      subtract_from_real_parts(roots, 3, t);
      *code = 0;
      return;
    }
    if (dd > kLargeD * (q * q)) {
      y1 = -q / (3.0 * p);
      m = std::sqrt(p);
    } else {
      // D > 0 (or NaN).
      sigma = std::sqrt(dd);
      const double u = std::cbrt((sigma - q) / 2.0);
      m = p / u;
      y1 = u - m;
    }
  }
  // One real root and a conjugate pair.
  const double h = y1 / 2.0;
  double v = m + h;
  if (kFlatD * (q * q) > dd) v = (sigma / 3.0) / std::cbrt(2.0 * (q * q));
  const double iota = v * kSqrt3;
  set_slot(roots, 0, y1, 0.0);
  set_slot(roots, 1, -h, iota);
  set_slot(roots, 2, -h, -iota);
  // (7) Shift.
  subtract_from_real_parts(roots, 3, t);
  *code = 0;
}

void itdeg3(const double* coef, const double* start, double* roots, std::int32_t* code) {
  const double c0 = coef[0], c1 = coef[1], c2 = coef[2], c3 = coef[3];
  // (1) Slots 1 and 2 start as (0, 0) and (1, 0).
  set_slot(roots, 1, 0.0, 0.0);
  set_slot(roots, 2, 1.0, 0.0);
  double x = *start;
  // (2) Newton; the 30th count stops with the last iterate.
  for (std::int32_t count = 1;; ++count) {
    if (count == kNewtonCounts) {
      *code = kItdegLimit;
      set_slot(roots, 0, x, 0.0);
      break;
    }
    const double fp = ((3.0 * c0) * x + 2.0 * c1) * x + c2;
    if (fp == 0.0) {  // a NaN derivative goes on
      set_slot(roots, 0, 0.0, 0.0);
      *code = kItdegFlat;
      return;
    }
    const double x1 = x - (((c0 * x + c1) * x + c2) * x + c3) / fp;
    // Deliberate: the bound uses x1 with its sign, so a negative root never converges.
    if (std::fabs(x1 - x) < kEps * x1) {
      *code = 0;
      x = x1;
      set_slot(roots, 0, x, 0.0);
      break;
    }
    x = x1;
  }
  // (3) Deflation: x^2 + (c1 / c0 + x) x - c3 / (c0 x).
  const std::int32_t f = monic_duos(c1 / c0 + x, -c3 / (c0 * x), roots + 2);
  if (f == kDuosNone || f == kDuosAll || f == kDuosLinear) *code = kTresorDegenerate;
}

}  // extern "C"
