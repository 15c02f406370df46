// poly/gauss_legendre.cpp -- fixed Gauss-Legendre rules over an interval and a rectangle:
// gauleg, dauleg. The integrand gets each abscissa by reference in a local of the routine,
// so nothing is kept between calls and an integrand may itself integrate.
#include <cstdint>

#include "poly/poly_api.h"

namespace {

// Non-negative half of the 2, 4, 6, 8, 10, 12, 16 and 20 point rules on [-1, 1]: per rule
// the positive nodes in increasing order with their weights, rule after rule (39 pairs).
// Each value is the exact node or weight rounded to the nearest double.
struct NodeWeight {
  double t, w;
};
constexpr NodeWeight kRules[39] = {
  // 2 points
  {0.5773502691896257, 1.0},
  // 4 points
  {0.33998104358485626, 0.6521451548625461},
  {0.8611363115940526, 0.34785484513745385},
  // 6 points
  {0.2386191860831969, 0.46791393457269104},
  {0.6612093864662645, 0.3607615730481386},
  {0.932469514203152, 0.17132449237917036},
  // 8 points
  {0.1834346424956498, 0.362683783378362},
  {0.525532409916329, 0.31370664587788727},
  {0.7966664774136267, 0.22238103445337448},
  {0.9602898564975363, 0.10122853629037626},
  // 10 points
  {0.14887433898163122, 0.29552422471475287},
  {0.4333953941292472, 0.26926671930999635},
  {0.6794095682990244, 0.21908636251598204},
  {0.8650633666889845, 0.1494513491505806},
  {0.9739065285171717, 0.06667134430868814},
  // 12 points
  {0.1252334085114689, 0.24914704581340277},
  {0.3678314989981802, 0.2334925365383548},
  {0.5873179542866175, 0.20316742672306592},
  {0.7699026741943047, 0.16007832854334622},
  {0.9041172563704749, 0.10693932599531843},
  {0.9815606342467192, 0.04717533638651183},
  // 16 points
  {0.09501250983763744, 0.1894506104550685},
  {0.2816035507792589, 0.18260341504492358},
  {0.45801677765722737, 0.16915651939500254},
  {0.6178762444026438, 0.14959598881657674},
  {0.755404408355003, 0.12462897125553388},
  {0.8656312023878318, 0.09515851168249279},
  {0.9445750230732326, 0.062253523938647894},
  {0.9894009349916499, 0.027152459411754096},
  // 20 points
  {0.07652652113349734, 0.15275338713072584},
  {0.22778585114164507, 0.14917298647260374},
  {0.37370608871541955, 0.14209610931838204},
  {0.5108670019508271, 0.13168863844917664},
  {0.636053680726515, 0.11819453196151841},
  {0.7463319064601508, 0.10193011981724044},
  {0.8391169718222188, 0.08327674157670475},
  {0.912234428251326, 0.06267204833410907},
  {0.9639719272779138, 0.04060142980038694},
  {0.9931285991850949, 0.017614007139152118}
};

// Position (from 1) of the first and the last pair of the rule used for a requested count
// n = 1..20: the count is rounded up to the next tabulated rule.
constexpr std::int32_t kFirst[20] = {1,  1,  2,  2,  4,  4,  7,  7,  11, 11,
                                     16, 16, 22, 22, 22, 22, 30, 30, 30, 30};
constexpr std::int32_t kLast[20] = {1,  1,  3,  3,  6,  6,  10, 10, 15, 15,
                                    21, 21, 29, 29, 29, 29, 39, 39, 39, 39};
constexpr std::int32_t kMaxPoints = 20;

// The table slice [first, last) (0-based) for a requested count clamped to 1..20.
struct Rule {
  std::int32_t first, last;
};
Rule rule_for(std::int32_t n) {
  if (n < 1) n = 1;
  if (n > kMaxPoints) n = kMaxPoints;
  return Rule{kFirst[n - 1] - 1, kLast[n - 1]};
}

}  // namespace

extern "C" {

double gauleg(Orvq7Integrand1 f, const double* a, const double* b, const std::int32_t* n) {
  // (1) Clamp and look up.
  const Rule rule = rule_for(*n);
  // (2) Midpoint and half-length (negative for b < a).
  const double m = (*a + *b) * 0.5;
  const double h = (*b - *a) * 0.5;
  double s = 0.0;
  // (3) Pairs in table order; f at m + u first, then at m - u.
  for (std::int32_t k = rule.first; k < rule.last; ++k) {
    const double u = kRules[k].t * h;
    double x = m + u;
    const double fp = f(&x);
    x = m - u;
    const double fm = f(&x);
    s += kRules[k].w * (fp + fm);
  }
  // (4)
  return h * s;
}

double dauleg(Orvq7Integrand2 f, const double* a, const double* b, const double* c,
              const double* d, const std::int32_t* nx, const std::int32_t* ny) {
  // (1) A rule for each direction.
  const Rule rx = rule_for(*nx);
  const Rule ry = rule_for(*ny);
  // (2)
  const double mx = (*a + *b) * 0.5, hx = (*b - *a) * 0.5;
  const double my = (*c + *d) * 0.5, hy = (*d - *c) * 0.5;
  double s = 0.0;
  // (3) x pairs outside, y pairs inside; four calls per pair of pairs, in this order:
  // (xp, yp), (xp, ym), (xm, yp), (xm, ym). Each call gets fresh copies of its abscissae.
  for (std::int32_t i = rx.first; i < rx.last; ++i) {
    const double xp = mx + kRules[i].t * hx;
    const double xm = mx - kRules[i].t * hx;
    for (std::int32_t j = ry.first; j < ry.last; ++j) {
      const double yp = my + kRules[j].t * hy;
      const double ym = my - kRules[j].t * hy;
      double x = xp, y = yp;
      const double f1 = f(&x, &y);
      x = xp;
      y = ym;
      const double f2 = f(&x, &y);
      x = xm;
      y = yp;
      const double f3 = f(&x, &y);
      x = xm;
      y = ym;
      const double f4 = f(&x, &y);
      s += (kRules[i].w * kRules[j].w) * (((f1 + f2) + f3) + f4);
    }
  }
  // (4)
  return (hx * hy) * s;
}

}  // extern "C"
