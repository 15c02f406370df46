/* poly/poly_api.h -- polynomial roots, evaluation and quadrature
 * (public header; compiles as C11 and as C++). Conventions: frame/frame_api.h. */
#ifndef ORVQ7_POLY_POLY_API_H
#define ORVQ7_POLY_POLY_API_H

#include <stdint.h>

#include "frame/frame_api.h"

ORVQ7_BEGIN_DECLS

/* ==========================================================================================
 * Closed-form and polished roots of polynomials
 *
 * Coefficients by decreasing power: coef[0] is the leading one (a quadratic is
 * c0 x^2 + c1 x + c2). Roots are complex pairs (real part, imaginary part) stored one after
 * another; a real root has imaginary part +0. Slot k is roots[2k], roots[2k+1]. coef and
 * roots must not overlap. The older subroutines (duos .. itdeg3) report through a case flag
 * and never fail; ynze2r, ynze3r and ynzenr follow the status convention. None records a
 * traceback frame.
 * State: none kept between calls (intermediate arrays are locals); all are safe to call
 * concurrently on distinct arguments.
 * Non-finite coefficients never hang or crash: every loop is counted; the roots are then
 * whatever the stated arithmetic gives (usually NaN).
 * ======================================================================================== */

/** duos -- real quadratic c0 x^2 + c1 x + c2.
 *   coef   in   real(3)
 *   roots  out  real(4)   2 complex slots, written as the flag says
 *   flag   out  int32
 *     0  two real roots (possibly equal): slot 1 = q with q = -h (b + s) when c1 >= 0
 *        (-0 counts as positive), -h (b - s) otherwise, h = 0.5 / c0, s = |sqrt(c1^2 - d)|,
 *        d = 4 c0 c2; slot 0 = c2 / (c0 q), or (0, 0) when q = 0
 *     1  c0 = c1 = 0, c2 != 0: no solution; roots untouched
 *     2  c0 = c1 = c2 = 0: every x solves it; roots untouched
 *     3  c0 = 0, c1 != 0: linear; both slots hold (-c2 / c1, 0)
 *     4  d > c1^2 (strict): conjugate pair (-c1 h, +-sqrt(d - c1^2) h); with c0 < 0 the
 *        negative imaginary part comes first (kept as computed) */
ORVQ7_API void duos(const double* coef, double* roots, int32_t* flag);

/** cardan -- real cubic c0 x^3 + c1 x^2 + c2 x + c3 by Cardano's formulas.
 *   coef   in   real(4)
 *   mode   in   int32     1: all three roots; 2: slot 0 only; any other value: all three,
 *                         except in the one-real-root case (flag 1 with a conjugate pair),
 *                         where the pair is formed only with mode 1
 *   roots  out  real(6)   all six reals are written; a slot not formed holds (-t, 0) with
 *                         t = c1 / (3 c0) (or 0) and is no root
 *   flag   out  int32
 *     1  one real root in slot 0 and a conjugate pair (or a root 0 with a non-real
 *        quadratic remainder)
 *     2  |c0| < 1e-15: c1 x^2 + c2 x + c3 was solved by duos into slots 0 and 1 (slot 2 is
 *        (0, 0), and so are slots duos leaves untouched); duos's flag is not passed on
 *     3  three real roots, sorted by decreasing value (slot 0 >= slot 1 >= slot 2); with
 *        mode 2 no sort is done, so slot 0 keeps the root that was formed
 * Thresholds: 1e-15 absolute on the depressed p and q and on the discriminant
 * 4 p^3 + 27 q^2; 3e-8 for the dominance of q in the one-real-root case. */
ORVQ7_API void cardan(const double* coef, const int32_t* mode, double* roots, int32_t* flag);

/** ferari -- real quartic c0 x^4 + ... + c4 by Ferrari's resolvent, solved with cardan.
 *   coef   in   real(5)
 *   roots  out  real(8)   4 complex slots (two pairs: +-s + ..., -s + ... minus c1 / (4 c0))
 *   flag   out  int32     0 four roots computed (also when c4 = 0: slot 0 = (0, 0) and the
 *                         cubic's roots in slots 1..3, its flag discarded);
 *                         3 |c0| < 1e-15: nothing computed, roots untouched */
ORVQ7_API void ferari(const double* coef, double* roots, int32_t* flag);

/** quadr -- real quartic, second Ferrari variant: resolvent solved with tresor, no clean-up
 * of the resolvent and no c4 = 0 shortcut.
 *   coef   in   real(5)
 *   roots  out  real(8)
 *   flag   out  int32     0 four roots computed; 1 the resolvent root was negative and its
 *                         sign was discarded; 3 c0 = 0 exactly: nothing computed, roots
 *                         untouched; otherwise tresor's code (11, 12, 13, 33) or, when the
 *                         resolvent root is below 1e-30 (biquadratic case, roots
 *                         +-sqrt(u1), +-sqrt(u2) with principal complex square roots),
 *                         duos's flag */
ORVQ7_API void quadr(const double* coef, double* roots, int32_t* flag);

/** tresor -- real cubic c0 x^3 + c1 x^2 + c2 x + c3 (trigonometric case for three real
 * roots, Newton by itdeg3 near a root 0 or for huge coefficients).
 *   coef   in   real(4)
 *   roots  out  real(6)   three real roots in decreasing order, or a real root in slot 0
 *                         and a conjugate pair in slots 1 and 2
 *   code   out  int32
 *     0   success
 *     13  c0 = 0 or |c3| <= 1e-30 and the quadratic met a degenerate duos case: duos flag
 *         1 or 3 returns at once (slots as initialised, (0,0), (0,0), (1,0), where duos did
 *         not write), flag 2 sets all three slots to (1, 0)
 *     33  |P| >= 1e25 or |q| >= 1e38 (P one third of the depressed p): itdeg3's result
 *     or itdeg3's code (0, 11, 12, 13) when |c3| <= 1e-6, c2 != 0 and |c3 / c2| <= 1e-6
 * With c0 = 0 the two roots go to slots 0 and 1 (decreasing when real) and slot 2 is (1, 0).
 * With |c3| <= 1e-30 the root 0 is split off and the three real values are sorted. */
ORVQ7_API void tresor(const double* coef, double* roots, int32_t* code);

/** itdeg3 -- one real root of a cubic by Newton from `start`, then the other two by
 * deflation (duos on x^2 + (c1 / c0 + x) x - c3 / (c0 x)).
 *   coef   in   real(4)
 *   start  in   real
 *   roots  out  real(6)   slot 0 the Newton root; slots 1, 2 from the deflation (initially
 *                         (0, 0) and (1, 0))
 *   code   out  int32
 *     0   converged: |x' - x| < 1e-15 x' (signed x', so a negative root never converges)
 *     11  the 30th count was reached (29 Newton steps): the last iterate is used
 *     12  zero derivative met: slot 0 = (0, 0), no deflation
 *     13  the deflated quadratic was degenerate (duos flag 1, 2 or 3) */
ORVQ7_API void itdeg3(const double* coef, const double* start, double* roots, int32_t* code);

/** ynze2r -- real quadratic c0 x^2 + c1 x + c2.
 *   coef   in   real(3)
 *   roots  out  real(4)   beta = c1 / 2, D = beta^2 - c0 c2:
 *                         max(beta^2, |c0 c2|) 1e-15 >= |D|: double root -beta / c0 twice;
 *                         D > 0: q / c0 and c2 / q, q = -(beta + sqrt D) (beta >= 0) or
 *                         -(beta - sqrt D); D < 0: (-beta / c0, +-sqrt(-D) / c0)
 *   err    out  int32
 * Result  0 success, 1 failure
 *   err   result  when                 outputs
 *   0     0       success              roots written
 *   4709  1       c0 = 0 exactly       roots untouched */
ORVQ7_API int32_t ynze2r(const double* coef, double* roots, int32_t* err);

/** ynze3r -- real cubic c0 x^3 + ... + c3: closed form for the root of largest magnitude,
 * Newton polish (at most 100 steps, stopped when |f'| <= 1e-15 or |f| stops decreasing),
 * then deflation solved by ynze2r.
 *   coef   in   real(4)
 *   roots  out  real(6)   slot 0 the polished real root, slots 1 and 2 ynze2r's roots of
 *                         c0 z^2 + (c1 + c0 x) z + g, g = -c3 / x when |x| > 1e-15,
 *                         else c2 + x (c1 + c0 x)
 *   err    out  int32
 * Result  0 success, 1 failure
 *   err   result  when                 outputs
 *   0     0       success              roots written
 *   4709  1       c0 = 0 exactly       roots untouched
 * The test that treats q as zero uses max(|2t^3|, |t c|, d) with d signed, on purpose. */
ORVQ7_API int32_t ynze3r(const double* coef, double* roots, int32_t* err);

/** ynzenr -- real polynomial of degree n = 1..4, dispatched by degree; a vanishing leading
 * coefficient drops the degree by one (the trailing coefficients are used).
 *   n       in   int32       degree
 *   coef    in   real(n+1)
 *   nroots  out  int32       set to n first; then the degree actually solved (0 when a
 *                            linear polynomial has no root)
 *   roots   out  real(2n)    nroots slots: ferari (n = 4, unless |c0| < 1e-15), ynze3r,
 *                            ynze2r; degree 1 (a x + b): (a, b) cleaned by yntrzr's gap rule
 *                            with tol 1e-15 into (r0, r1), root r1 / r0 -- the quotient as
 *                            it stands, b / a, not -b / a, on purpose
 *   err     out  int32
 * Result  0 success, 1 failure
 *   err    result  when                                       outputs
 *   0      0       success                                    nroots, roots written
 *   4712   1       n < 1                                      nroots = n, roots untouched
 *   4718   1       n > 4                                      nroots = n, roots untouched
 *   4717   1       the degree-1 pair is (0, 0) after cleaning  nroots = 1
 *   other  1       ynze3r, ynze2r or yntrzr failed (code kept)
 * State: none kept between calls. */
ORVQ7_API int32_t ynzenr(const int32_t* n, const double* coef, int32_t* nroots, double* roots,
                         int32_t* err);

/* ==========================================================================================
 * Polynomial evaluation, derivatives and Bernstein form
 *
 * Coefficients by increasing power: c[0] is the constant term; m is the number of
 * coefficients (not the degree). None reports an error. State: none; all are safe to call
 * concurrently.
 * ======================================================================================== */

/** cor -- value of c(0) + c(1) t + ... + c(m-1) t^(m-1) by Horner's scheme from the highest
 * coefficient: s = 0, then s = s t + c(k) for k = m-1 down to 0.
 *   c  in  real(m);  m  in  int32;  t  in  real
 * Result the value; 0 when m < 1 (c not read). */
ORVQ7_API double cor(const double* c, const int32_t* m, const double* t);

/** deriv -- first derivative at t: s = (m-1) c(m-1), then s = s t + k c(k), k = m-2 .. 1.
 *   c  in  real(m);  m  in  int32;  t  in  real
 * Result the derivative; 0 without reading c when m < 2 or m > 20. */
ORVQ7_API double deriv(const double* c, const int32_t* m, const double* t);

/** dersec -- second derivative at t: s = (m-1)(m-2) c(m-1), then s = s t + k(k-1) c(k),
 * k = m-2 .. 2. No upper limit on m; m = 1 and m = 2 still read c(m-1) and give 0 times it.
 *   c  in  real(m);  m  in  int32;  t  in  real
 * Result the derivative; 0 without reading c when m < 1. */
ORVQ7_API double dersec(const double* c, const int32_t* m, const double* t);

/** derter -- third derivative at t: s = 0, then s = s t + k(k-1)(k-2) c(k), k = m-1 .. 3.
 *   c  in  real(m);  m  in  int32;  t  in  real
 * Result the derivative; 0 when m < 4. No upper limit on m. */
ORVQ7_API double derter(const double* c, const int32_t* m, const double* t);

/** bernst -- Bernstein basis polynomial B(i, n)(t) = binom(n, i) t^i (1 - t)^(n-i), from a
 * built-in table of the expanded coefficients of binom(n, i) (1 - t)^(n-i) evaluated by
 * cor, times t^i formed by binary powering (a real raised to an integer power).
 *   i  in  int32;  n  in  int32;  t  in  real
 * Result B(i, n)(t) for 0 <= i <= n <= 19; 1 when i <= 0 and n <= 0; 0 for every other
 * (i, n), without reading the table. */
ORVQ7_API double bernst(const int32_t* i, const int32_t* n, const double* t);

/* ==========================================================================================
 * Gauss-Legendre quadrature
 *
 * Fixed Gauss-Legendre rules of 2, 4, 6, 8, 10, 12, 16 and 20 points; a requested count is
 * clamped to 1..20 and rounded up to the next rule: 1-2 -> 2, 3-4 -> 4, 5-6 -> 6, 7-8 -> 8,
 * 9-10 -> 10, 11-12 -> 12, 13-16 -> 16, 17-20 -> 20. Nodes and weights are the standard
 * values rounded to the nearest double. Not adaptive; no error is reported.
 * The integrand receives each abscissa by reference, in a copy of the routine's own; it must
 * not write through the pointer. State: none (the abscissae are locals), so the integrand may
 * itself integrate.
 * ======================================================================================== */

/** Integrand of gauleg: f(x), x by reference. */
typedef double (*Orvq7Integrand1)(const double* x);
/** Integrand of dauleg: f(x, y), both by reference. */
typedef double (*Orvq7Integrand2)(const double* x, const double* y);

/** gauleg -- integral of f over [a, b] by the Gauss-Legendre rule for n points.
 *   f  in  Orvq7Integrand1;  a, b  in  real;  n  in  int32  requested point count
 * m = (a + b) 0.5, h = (b - a) 0.5, s = 0; for each tabulated pair (t, w), positive nodes
 * in increasing order: u = t h, s += w (f(m + u) + f(m - u)), f called at m + u first.
 * Result h s. f is called exactly 2k times for a rule of 2k points. b < a gives the
 * negated integral. */
ORVQ7_API double gauleg(Orvq7Integrand1 f, const double* a, const double* b, const int32_t* n);

/** dauleg -- double integral of f over [a, b] x [c, d], tensor product of the rules for nx
 * and ny points.
 *   f  in  Orvq7Integrand2;  a, b, c, d  in  real;  nx, ny  in  int32
 * For each x pair (ti, wi): xp = mx + ti hx, xm = mx - ti hx; for each y pair (tj, wj):
 * yp, ym likewise; s += wi wj (f(xp, yp) + f(xp, ym) + f(xm, yp) + f(xm, ym)), the four
 * calls in that order. Result hx hy s; f is called exactly 4 kx ky times. */
ORVQ7_API double dauleg(Orvq7Integrand2 f, const double* a, const double* b, const double* c,
                        const double* d, const int32_t* nx, const int32_t* ny);

ORVQ7_END_DECLS

#endif /* ORVQ7_POLY_POLY_API_H */
