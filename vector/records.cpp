// vector/records.cpp -- control-point grids and records of curves and surfaces: trapnt,
// rbctra, rbstra, rbclcp, rbslcp.
// A record is a header of 16-bit fields followed, from a fixed byte position, by the points
// as reals: a curve has 7 fields (bytes 0..13) and its points from byte 16; a surface has 11
// fields (bytes 0..21) and its points from byte 24. Fields are numbered from 1.
#include <cstdint>
#include <cstring>

#include "vector/vector_api.h"

namespace {

constexpr std::int32_t kSpace = 3;        // the only dimension trapnt transforms
constexpr std::size_t kCurvePoints = 16;   // byte position of a curve's points
constexpr std::size_t kSurfacePoints = 24; // byte position of a surface's points

// Field k (from 1) of a record's header, read bytewise (a record need not be aligned for
// 16-bit access through another type).
std::int32_t header_field(const void* rec, int k) {
  std::int16_t v;
  std::memcpy(&v, static_cast<const unsigned char*>(rec) + 2 * (k - 1), sizeof v);
  return v;
}

const double* points_in(const void* rec, std::size_t at) {
  return reinterpret_cast<const double*>(static_cast<const unsigned char*>(rec) + at);
}

double* points_out(void* rec, std::size_t at) {
  return reinterpret_cast<double*>(static_cast<unsigned char*>(rec) + at);
}

}  // namespace

extern "C" {

std::int32_t trapnt(const double* a, const std::int32_t* dim, const std::int32_t* nu,
                    const std::int32_t* ld, const std::int32_t* nv, const void* /*unused*/,
                    const double* p, double* q) {
  if (*dim != kSpace || *nu < 1 || *nv < 1) return 0;
  if (*nv > 1 && *ld < 1) return 0;  // rows would start before the grid
  // Row j = 1..nv, then point i = 1..nu; point (i, j) at real ((i-1) + (j-1) ld) dim + 1.
  const std::int64_t rows = *nv, cols = *nu, lead = *ld;
  for (std::int64_t j = 0; j < rows; ++j) {
    for (std::int64_t i = 0; i < cols; ++i) {
      const std::int64_t at = (i + j * lead) * kSpace;
      fmat6(p + at, p + at + 1, p + at + 2, a, q + at, q + at + 1, q + at + 2);
    }
  }
  return 0;
}

std::int32_t rbctra(const double* a, const void* rin, void* rout) {
  // dim = field 2, nu = ld = field 5, nv = 1; the header of rout is not written.
  const std::int32_t dim = header_field(rin, 2), nu = header_field(rin, 5), nv = 1;
  trapnt(a, &dim, &nu, &nu, &nv, nullptr, points_in(rin, kCurvePoints),
         points_out(rout, kCurvePoints));
  return 0;
}

std::int32_t rbstra(const double* a, const void* rin, void* rout) {
  // dim = 3, nu = ld = field 7, nv = field 8; the header of rout is not written.
  const std::int32_t dim = kSpace, nu = header_field(rin, 7), nv = header_field(rin, 8);
  trapnt(a, &dim, &nu, &nu, &nv, nullptr, points_in(rin, kSurfacePoints),
         points_out(rout, kSurfacePoints));
  return 0;
}

std::int32_t rbclcp(const std::int16_t* hdr, std::int32_t* o1, std::int32_t* o2,
                    std::int32_t* o3, std::int32_t* o4, std::int32_t* o5, std::int32_t* o6,
                    std::int32_t* o7) {
  // Fields 1, 2, 5, 7, 3, 4, 6.
  *o1 = header_field(hdr, 1);
  *o2 = header_field(hdr, 2);
  *o3 = header_field(hdr, 5);
  *o4 = header_field(hdr, 7);
  *o5 = header_field(hdr, 3);
  *o6 = header_field(hdr, 4);
  *o7 = header_field(hdr, 6);
  return 0;
}

std::int32_t rbslcp(const std::int16_t* hdr, std::int32_t* o1, std::int32_t* o2,
                    std::int32_t* o3, std::int32_t* o4, std::int32_t* o5, std::int32_t* o6,
                    std::int32_t* o7, std::int32_t* o8, std::int32_t* o9, std::int32_t* o10,
                    std::int32_t* o11) {
  // Fields 1, 2, 7, 8, 11, 3, 5, 9, 4, 6, 10.
  *o1 = header_field(hdr, 1);
  *o2 = header_field(hdr, 2);
  *o3 = header_field(hdr, 7);
  *o4 = header_field(hdr, 8);
  *o5 = header_field(hdr, 11);
  *o6 = header_field(hdr, 3);
  *o7 = header_field(hdr, 5);
  *o8 = header_field(hdr, 9);
  *o9 = header_field(hdr, 4);
  *o10 = header_field(hdr, 6);
  *o11 = header_field(hdr, 10);
  return 0;
}

}  // extern "C"
