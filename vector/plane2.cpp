// vector/plane2.cpp -- affine transformations of the plane applied to elements: tr2vec,
// tr2pt, tr2ang, tr2axs, tr2cir, tr2can, tr2ln, tr2crv, tr2sha and the dispatchers traele
// and traels.
// T = (t1, t2, t3, t4, t5, t6): linear part by columns, then the translation. Element
// layouts and header words are described in vector/vector_api.h. Every routine reads its
// inputs into locals before writing, so an output may be its input.
#include <cmath>
#include <cstdint>
#include <limits>

#include "frame/services.h"
#include "frame/tolerances.h"
#include "vector/vector_api.h"

namespace {

constexpr double kTwoPi = 6.283185307179586;
constexpr std::int32_t kConicBytes = 56;  // the seven reals of a conic

// Header word: type code in bits 0-7; bit 8 says a type-104 point carries its angle.
constexpr std::int32_t kCodeMask = 0xFF;
constexpr std::int32_t kCarriesAngle = 0x100;

// Parts of a line element, as bits of tr2ln's flag.
constexpr std::int32_t kLinePoint = 1;
constexpr std::int32_t kLineDirection = 2;
constexpr std::int32_t kLineParameters = 4;
constexpr std::int32_t kLineAll = 255;  // what traele asks for

constexpr int kMaxNesting = 8;  // shapes nested deeper than this are left as they were
constexpr std::int64_t kUnbounded = std::numeric_limits<std::int64_t>::max();
constexpr double kMaxCount = 2147483647.0;

// ---- State of tr2can kept between calls, one copy per thread ----
//   conic  the transformed conic, built here and copied out with crccop; no later call
//          reads it
struct Tr2canState {
  double conic[7] = {};
};
thread_local Tr2canState s_tr2can;

// A count, length or header word stored as a real: a whole number within [lo, hi].
bool whole_in(double v, double lo, double hi, std::int64_t* out) {
  if (!(v >= lo && v <= hi) || v != std::trunc(v)) return false;
  *out = static_cast<std::int64_t>(v);
  return true;
}

bool as_count(double v, std::int64_t* out) { return whole_in(v, 0.0, kMaxCount, out); }

double det_of(const double* t) { return t[0] * t[3] - t[1] * t[2]; }

// Codes 90, 95, 92, 85: centre, then (angle, size) pairs as described with the header
// word layout; tolerances 4 and 5 read once per element.
struct PairMap {
  double det;
  double scale;  // sqrt(|det|) for a similarity-preserving map, else not used
  bool similar;
};

PairMap pair_map(const double* t) {
  const double tol4 = impl::tol(4), tol5 = impl::tol(5);
  PairMap m;
  m.det = det_of(t);
  // Orthogonal columns of equal length, both tests inclusive.
  m.similar = std::fabs(t[3] * t[1] + t[0] * t[2]) <= tol5 &&
              std::fabs(t[0] * t[0] - t[3] * t[3] + t[1] * t[1] - t[2] * t[2]) <= tol4;
  m.scale = std::sqrt(std::fabs(m.det));
  return m;
}

void map_pair(const PairMap& m, const double* t, double angle, double size, double* angle_out,
              double* size_out) {
  const double sized = m.similar ? m.scale * size : size;
  if (m.det >= 0.0) {
    *angle_out = tr2ang(&angle, t);
    *size_out = sized;
  } else {
    // Deliberately tr2ang of pi, minus the angle (not the image of the angle itself).
    const double pi = impl::kPi;
    *angle_out = tr2ang(&pi, t) - angle;
    *size_out = -sized;
  }
}

// Types 90 and 95 (8 reals): centre, angle, size, four reals copied.
void map_centre_angle_size(const double* t, const double* e, double* ep) {
  const PairMap m = pair_map(t);
  double out[8];
  tr2pt(e, t, out);
  map_pair(m, t, e[2], e[3], &out[2], &out[3]);
  for (int k = 4; k < 8; ++k) out[k] = e[k];
  for (int k = 0; k < 8; ++k) ep[k] = out[k];
}

// Type 92 (7 reals): centre, (angle 1, size 1), (angle 2, size 2), a seventh real copied.
void map_centre_two_pairs(const double* t, const double* e, double* ep) {
  const PairMap m = pair_map(t);
  double out[7];
  tr2pt(e, t, out);
  map_pair(m, t, e[2], e[3], &out[2], &out[3]);
  map_pair(m, t, e[4], e[5], &out[4], &out[5]);
  out[6] = e[6];
  for (int k = 0; k < 7; ++k) ep[k] = out[k];
}

bool transform_element(std::int32_t hdr, const double* t, const double* e, std::int64_t avail,
                       double* ep, int depth);

// A shape within avail reals: m, then entries (header word, L, L reals). Stops at the first
// value that is not a count or header word, or at an entry that does not fit.
bool transform_shape(const double* t, const double* s, std::int64_t avail, double* sp,
                     int depth) {
  std::int64_t m;
  if (depth > kMaxNesting || avail < 1 || !as_count(s[0], &m)) return false;
  sp[0] = s[0];
  std::int64_t at = 1;  // position (from 0) of the next entry
  for (std::int64_t k = 0; k < m; ++k) {
    if (avail - at < 2) break;
    std::int64_t hdr, len;
    if (!whole_in(s[at], -2147483648.0, kMaxCount, &hdr) || !as_count(s[at + 1], &len)) break;
    if (len > avail - at - 2) break;
    const double h = s[at], l = s[at + 1];
    sp[at] = h;
    sp[at + 1] = l;
    transform_element(static_cast<std::int32_t>(hdr), t, s + at + 2, len, sp + at + 2,
                      depth + 1);
    at += 2 + len;
  }
  return true;
}

// One element of the header word's type within avail reals; false when nothing was written
// (type not handled, or the element does not fit).
bool transform_element(std::int32_t hdr, const double* t, const double* e, std::int64_t avail,
                       double* ep, int depth) {
  const std::int32_t code = hdr & kCodeMask;
  auto fits = [avail](std::int64_t size) { return size <= avail; };
  switch (code) {
    case 80:
      if (!fits(2)) return false;
      tr2pt(e, t, ep);
      return true;
    case 81: {
      if (!fits(6)) return false;
      std::int32_t flag = kLineAll;
      tr2ln(e, t, ep, &flag);
      return true;
    }
    case 82:
      if (!fits(5)) return false;
      tr2cir(e, t, ep);
      return true;
    case 83:
      if (!fits(6)) return false;
      tr2axs(e, t, ep);
      return true;
    case 85: {
      if (!fits(8)) return false;
      const double eighth = e[7];
      map_centre_two_pairs(t, e, ep);
      ep[7] = eighth;
      return true;
    }
    case 86:
    case 87:
    case 88:
      if (!fits(7)) return false;
      tr2can(e, t, ep);
      return true;
    case 89: {
      std::int64_t n;
      if (!fits(1) || !as_count(e[0], &n) || !fits(1 + 2 * n)) return false;
      tr2crv(e, t, ep);
      return true;
    }
    case 90:
    case 95:
      if (!fits(8)) return false;
      map_centre_angle_size(t, e, ep);
      return true;
    case 92:
      if (!fits(7)) return false;
      map_centre_two_pairs(t, e, ep);
      return true;
    case 102:
      return transform_shape(t, e, avail, ep, depth);
    case 104: {
      const bool angle = (hdr & kCarriesAngle) != 0;
      if (!fits(angle ? 3 : 2)) return false;
      if (angle) {
        const double a = e[2];
        tr2pt(e, t, ep);
        ep[2] = tr2ang(&a, t);
      } else {
        tr2pt(e, t, ep);
      }
      return true;
    }
    default:
      return false;
  }
}

}  // namespace

extern "C" {

std::int32_t tr2vec(const double* v, const double* t, double* vp) {
  const double x = v[0], y = v[1];
  const double u = t[0] * x + t[2] * y;
  const double w = t[1] * x + t[3] * y;
  vp[0] = u;
  vp[1] = w;
  return 0;
}

std::int32_t tr2pt(const double* p, const double* t, double* pp) {
  const double x = p[0], y = p[1];
  const double u = (t[0] * x + t[2] * y) + t[4];
  const double w = (t[1] * x + t[3] * y) + t[5];
  pp[0] = u;
  pp[1] = w;
  return 0;
}

double tr2ang(const double* a, const double* t) {
  // (1) The direction of the angle, transformed as a vector.
  const double d[2] = {std::cos(*a), std::sin(*a)};
  double w[2];
  tr2vec(d, t, w);
  // (2) Its angle, y first.
  double b = std::atan2(w[1], w[0]);
  // (3) Strict: -0 stays -0.
  if (b < 0.0) b = b + kTwoPi;
  return b;
}

std::int32_t tr2axs(const double* ax, const double* t, double* axp) {
  const double tol = impl::tol(12);
  // (1) The origin as a point.
  double origin[2];
  tr2pt(ax + 4, t, origin);
  // (2) Each direction as a vector, normalised when longer than tol (strict); a collapsed
  //     direction keeps the caller's previous output slots.
  double dir[2][2] = {};
  bool keep[2];
  for (int k = 0; k < 2; ++k) {
    double w[2];
    tr2vec(ax + 2 * k, t, w);
    const double s = std::sqrt(w[0] * w[0] + w[1] * w[1]);
    keep[k] = s > tol;
    if (keep[k]) {
      dir[k][0] = w[0] / s;
      dir[k][1] = w[1] / s;
    }
  }
  for (int k = 0; k < 2; ++k) {
    if (!keep[k]) continue;
    axp[2 * k] = dir[k][0];
    axp[2 * k + 1] = dir[k][1];
  }
  axp[4] = origin[0];
  axp[5] = origin[1];
  return 0;
}

std::int32_t tr2cir(const double* c, const double* t, double* cp) {
  const double tol = impl::tol(5);
  // (1)-(2) Centre and radius.
  const double det = det_of(t);
  double centre[2];
  tr2pt(c, t, centre);
  const double radius = std::sqrt(std::fabs(det)) * c[2];
  // (3) The sweep of the input.
  const double sweep = c[4] - c[3];
  // (4) A reversing map starts at the image of the old end.
  double start = det < 0.0 ? tr2ang(&c[4], t) : tr2ang(&c[3], t);
  // (5) End from the sweep; a start that is not >= 0 (NaN) is moved by 2 pi with the end.
  double end = start + sweep;
  if (!(start >= 0.0)) {
    start = start + kTwoPi;
    end = end + kTwoPi;
  }
  // (6) Strict: a (nearly) zero sweep is a full circle.
  if (std::fabs(end - start) < tol) end = end + kTwoPi;
  cp[0] = centre[0];
  cp[1] = centre[1];
  cp[2] = radius;
  cp[3] = start;
  cp[4] = end;
  return 0;
}

std::int32_t tr2can(const double* c, const double* t, double* cp) {
  const double tol4 = impl::tol(4);
  double* r = s_tr2can.conic;
  // (1) Shape value, centre, size, orientation.
  const double det = det_of(t);
  const double e = c[0], size = c[3], orient = c[4], start = c[5], end = c[6];
  r[0] = e;
  tr2pt(c + 1, t, r + 1);
  r[3] = std::sqrt(std::fabs(det)) * size;
  r[4] = tr2ang(&orient, t);
  if (det < 0.0) {
    if (std::fabs(e) > 1.0 - tol4) {
      // (3) Open kinds, linear parameters (strict: |e| = 1 - tol4 is closed).
      r[5] = -end;
      r[6] = -start;
    } else {
      // (4) Closed kind, angular parameters; a start that is not > 0 moves by 2 pi.
      r[5] = kTwoPi - end;
      r[6] = kTwoPi - start;
      if (!(r[5] > 0.0)) {
        r[5] = r[5] + kTwoPi;
        r[6] = r[6] + kTwoPi;
      }
    }
  } else {
    // (2) det >= 0, or NaN: the parameters are copied.
    r[5] = start;
    r[6] = end;
  }
  // (5) Copied out with the copy service.
  crccop(r, &kConicBytes, cp);
  return 0;
}

std::int32_t tr2ln(const double* l, const double* t, double* lp, std::int32_t* flag) {
  const double tol2 = impl::tol(2), tol3 = impl::tol(3), tol5 = impl::tol(5);
  const double tol12 = impl::tol(12);
  const std::int32_t want = *flag & (kLinePoint | kLineDirection | kLineParameters);
  std::int32_t done = 0;
  double q[2] = {}, d[2] = {}, p[2] = {};
  // (1) The point.
  if (want & kLinePoint) {
    tr2pt(l, t, q);
    done |= kLinePoint;
  }
  // (2) Direction and parameters need the image of the direction, w, and its length s.
  if (want & (kLineDirection | kLineParameters)) {
    double w[2];
    tr2vec(l + 2, t, w);
    const double s = std::sqrt(w[0] * w[0] + w[1] * w[1]);
    if (!(s <= tol12)) {  // inclusive collapse test, as for an axis system
      if (want & kLineDirection) {
        d[0] = w[0] / s;
        d[1] = w[1] / s;
        done |= kLineDirection;
      }
      if (want & kLineParameters) {
        // (3) Parameters kept exactly by a length-preserving map, else scaled by s.
        if (std::fabs(s - 1.0) < tol5) {
          p[0] = l[4];
          p[1] = l[5];
        } else {
          p[0] = s * l[4];
          p[1] = s * l[5];
        }
        // (4) Snap to the point, then collapse a too-short segment; both strict.
        for (double& v : p) {
          if (std::fabs(v) < tol2) v = 0.0;
        }
        if (std::fabs(p[1] - p[0]) < tol3) p[1] = p[0];
        done |= kLineParameters;
      }
    }
  }
  if (done & kLinePoint) {
    lp[0] = q[0];
    lp[1] = q[1];
  }
  if (done & kLineDirection) {
    lp[2] = d[0];
    lp[3] = d[1];
  }
  if (done & kLineParameters) {
    lp[4] = p[0];
    lp[5] = p[1];
  }
  *flag = done;
  return 0;
}

std::int32_t tr2crv(const double* c, const double* t, double* cp) {
  std::int64_t n;
  if (!as_count(c[0], &n)) return 0;
  cp[0] = c[0];
  for (std::int64_t k = 0; k < n; ++k) tr2pt(c + 1 + 2 * k, t, cp + 1 + 2 * k);
  return 0;
}

std::int32_t tr2sha(const double* s, const double* t, double* sp) {
  transform_shape(t, s, kUnbounded, sp, 0);
  return 0;
}

std::int32_t traele(const std::int32_t* hdr, const double* t, const double* e,
                    const void* /*unused*/, double* ep) {
  transform_element(*hdr, t, e, kUnbounded, ep, 0);
  return 0;
}

std::int32_t traels(const std::int32_t* n, const std::int32_t* hdr, const double* t,
                    const double* e, const std::int32_t* pos, const std::int32_t* lim,
                    double* ep) {
  // In order k = 1..n; each element must lie within reals pos(k)..lim.
  std::int32_t done = 0;
  for (std::int32_t k = 0; k < *n; ++k) {
    const std::int64_t at = pos[k];
    if (at < 1 || at > *lim) continue;
    const std::int64_t avail = static_cast<std::int64_t>(*lim) - at + 1;
    if (transform_element(hdr[k], t, e + (at - 1), avail, ep + (at - 1), 0)) ++done;
  }
  return done;
}

}  // extern "C"
