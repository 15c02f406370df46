// path/options.cpp -- option decoding of a path: wnccmd, wnccim, wnccex. The option word is
// scanned bit by bit in increasing order; the storage request becomes (count, code) pairs in a
// fixed order and a layout of fixed slots, whose widths the variant check fixes for n.
#include <cmath>
#include <cstdint>

#include "frame/status.h"
#include "path/path_api.h"
#include "path/path_state.h"

namespace {

constexpr double kCosLimit = 0.92388;                     // cosine of 22.5 degrees
constexpr std::uint32_t kModeKindBits = 0xfu;             // bits 0-3
constexpr std::uint32_t kModeHighBits = 0xfff00000u;      // bits 20-31
constexpr std::uint32_t kStoreRefusedBits = 0x3fff8000u;  // bits 15-29
constexpr std::uint32_t kStoreGroup1Bits = 8u | 16u | 32u;
constexpr std::uint32_t kStoreGroup2Bits = 128u | 256u | 512u;
constexpr std::uint32_t kStoreForm1Bit = 1u << 30;
constexpr std::uint32_t kStoreForm2Bit = 1u << 29;

bool bit(std::uint32_t word, int b) { return ((word >> b) & 1u) != 0; }

// Adds slot s with its pair (count, code) at the end of the pairs list.
void add_quantity(Orvq7PathLayout* layout, std::int32_t* pairs, std::int32_t s, std::int32_t count,
                  std::int32_t code, std::int32_t type) {
  const std::int32_t q = layout->nused;
  pairs[2 * q] = count;
  pairs[2 * q + 1] = code;
  layout->slot[s].used = 1;
  layout->slot[s].kind = code;
  layout->slot[s].type = type;
  layout->nused = q + 1;
}

// Adds the three members of a group starting at slot s0: kinds 1, 2, 3 with pairs (0, kind).
void add_group(Orvq7PathLayout* layout, std::int32_t* pairs, std::int32_t s0, std::int32_t type2) {
  add_quantity(layout, pairs, s0, 0, 1, impl::kTypeInt);
  add_quantity(layout, pairs, s0 + 1, 0, 2, type2);
  add_quantity(layout, pairs, s0 + 2, 0, 3, impl::kTypeReal);
}

// Widths and offsets of the used slots for n unknowns. A group member holds values in the
// group's second form, or in its first form when its own store bit is set (bits 3-5, 7-9).
void make_widths(std::int32_t n, Orvq7PathLayout* layout) {
  const std::uint32_t store = static_cast<std::uint32_t>(layout->store);
  std::int32_t offset = 0;
  for (std::int32_t s = 0; s < impl::kPathSlots; ++s) {
    Orvq7PathSlot& slot = layout->slot[s];
    if (slot.used == 0) continue;
    std::int32_t width = 0;
    if (s == impl::kSlot22) {
      width = 2;
    } else if (s == impl::kSlot23 || s == impl::kSlot43) {
      width = 2 * n;
    } else {
      const bool group1 = s < impl::kSlotGroup2;
      const std::int32_t member = s - (group1 ? impl::kSlotGroup1 : impl::kSlotGroup2);
      const std::int32_t form = group1 ? layout->form1 : layout->form2;
      const int member_bit = (group1 ? 3 : 7) + member;
      if (form == 2 || bit(store, member_bit)) width = member == 2 ? n : 1;
    }
    slot.width = width;
    slot.offset = offset;
    // An integer quantity packs two values in each real of the gathered values.
    offset += slot.type == impl::kTypeInt ? (width + 1) / 2 : width;
  }
  layout->n = n;
  layout->nvalues = offset;
}

}  // namespace

extern "C" {

std::int32_t wnccmd(const std::int32_t* n, const double* pas, const std::int32_t* mode,
                    const double* tol, const std::int32_t* store, const std::int32_t* variant,
                    Orvq7PathOptions* options, double* limits, Orvq7PathLayout* layout,
                    std::int32_t* pairs, std::int32_t* ierr) {
  // (1) Clear the status and the three records.
  *ierr = 0;
  *options = Orvq7PathOptions{};
  *layout = Orvq7PathLayout{};
  for (std::int32_t k = 0; k < 2 * impl::kPathSlots; ++k) pairs[k] = 0;
  // (2) Dimension.
  const std::int32_t nn = *n;
  if (nn < 2) return impl::fail(ierr, impl::kErrBadArg);
  if (nn > impl::kPathMaxN) return impl::fail(ierr, impl::kErrCapacity);
  // (3) Step bounds: 0 < pas(i,1) < pas(i,2), both strict (a NaN fails).
  for (std::int32_t i = 0; i < nn; ++i) {
    if (!(0.0 < pas[i] && pas[i] < pas[nn + i])) return impl::fail(ierr, impl::kErrBadArg);
  }
  // (4) Option word, bits 0-14 in increasing order: the first set bit must be a kind bit and
  // no other bit of 0-14 may follow it.
  const std::uint32_t m = static_cast<std::uint32_t>(*mode);
  for (int b = 0; b <= 14; ++b) {
    if (!bit(m, b)) continue;
    if (options->kind != 0 || (kModeKindBits & (1u << b)) == 0) {
      return impl::fail(ierr, impl::kErrCapacity);
    }
    options->kind = 1 << b;
    options->first_order = 1;
    if (b >= 2) options->order = 1;
  }
  if (bit(m, 15)) {
    if (options->order != 1) return impl::fail(ierr, impl::kErrCapacity);
    options->order = 2;
  }
  if (bit(m, 16)) options->per_unknown = 1;
  if (bit(m, 17)) options->flag17 = 1;
  options->flag18 = bit(m, 18) ? 0 : 1;
  if (bit(m, 19)) options->flag19 = 1;
  if ((m & kModeHighBits) != 0) return impl::fail(ierr, impl::kErrCapacity);
  // (5) Tolerances, strictly positive (a NaN fails).
  const std::int32_t ntol = options->per_unknown == 1 ? nn : 1;
  for (std::int32_t i = 0; i < ntol; ++i) {
    if (!(tol[i] > 0.0)) return impl::fail(ierr, impl::kErrBadArg);
  }
  // (6) Derived limits. h is pas(1,2), or the smallest pas(i,2) (first one kept on ties).
  limits[1] = kCosLimit;
  if (options->kind == 8) {
    const double c = 1.0 / std::sqrt(tol[0] * tol[0] + 1.0);
    if (c > kCosLimit) limits[1] = c;
  }
  if (options->kind == 4 || options->kind == 8) {
    double h = pas[nn];
    if (options->per_unknown == 1) {
      for (std::int32_t i = 1; i < nn; ++i) {
        if (pas[nn + i] < h) h = pas[nn + i];
      }
    }
    limits[0] = options->kind == 8 ? 1.0 / h : 1.0 / (h * h);
  }
  // (7) Storage request, in the order of its bits.
  const std::uint32_t st = static_cast<std::uint32_t>(*store);
  layout->store = *store;
  layout->form1 = 1;
  layout->form2 = 1;
  if (bit(st, 0)) add_quantity(layout, pairs, impl::kSlot22, 2, 22, impl::kTypeReal);
  if (bit(st, 1)) add_quantity(layout, pairs, impl::kSlot23, 2 * nn, 23, impl::kTypeReal);
  if (bit(st, 2)) add_quantity(layout, pairs, impl::kSlot43, 2 * nn, 43, impl::kTypeReal);
  if ((st & kStoreGroup1Bits) != 0) add_group(layout, pairs, impl::kSlotGroup1, impl::kTypeInt);
  if ((st & kStoreGroup2Bits) != 0) add_group(layout, pairs, impl::kSlotGroup2, impl::kTypeReal);
  if (layout->nused == 0) return impl::fail(ierr, impl::kErrCapacity);
  if ((st & kStoreRefusedBits) != 0) return impl::fail(ierr, impl::kErrCapacity);
  if ((st & kStoreForm1Bit) != 0) layout->form1 = 2;
  // Deliberate: bit 29 was refused just above, so the second form of the second group is
  // never reached; the branch is kept with the decoder.
  if ((st & kStoreForm2Bit) != 0) layout->form2 = 2;
  // (8) Variant check.
  if (*variant == 1) return wnccim(n, options, layout, ierr);
  if (*variant == 2) return wnccex(n, options, layout, ierr);
  return impl::fail(ierr, impl::kErrCapacity);
}

std::int32_t wnccim(const std::int32_t* n, const Orvq7PathOptions* options, Orvq7PathLayout* layout,
                    std::int32_t* ierr) {
  if (*n < 2 || *n > impl::kPathMaxN) return impl::fail(ierr, impl::kErrCapacity);
  // (1) Kind against order level and per-unknown tolerance; K = 1 and 0 are refused.
  const std::int32_t k = options->kind, order = options->order;
  const bool ok = (k == 2 && order == 0) || (k == 4 && (order == 1 || order == 2)) ||
                  (k == 8 && (order == 1 || order == 2) && options->per_unknown == 0);
  if (!ok) return impl::fail(ierr, impl::kErrCapacity);
  // (2) The first group in its second form.
  layout->form1 = 2;
  // (3) Store: bit 1 required, bit 0 and the second group refused.
  const std::uint32_t st = static_cast<std::uint32_t>(layout->store);
  if (!bit(st, 1) || bit(st, 0) || (st & kStoreGroup2Bits) != 0) {
    return impl::fail(ierr, impl::kErrCapacity);
  }
  make_widths(*n, layout);
  *ierr = 0;
  return 0;
}

std::int32_t wnccex(const std::int32_t* n, Orvq7PathOptions* options, Orvq7PathLayout* layout,
                    std::int32_t* ierr) {
  if (*n < 2 || *n > impl::kPathMaxN) return impl::fail(ierr, impl::kErrCapacity);
  // (1) Kind against order level and per-unknown tolerance; K = 0 is refused.
  const std::int32_t k = options->kind, order = options->order;
  const bool high = order == 1 || order == 2;
  const bool ok = (k == 1 && order == 0 && options->per_unknown == 0) || (k == 2 && order == 0) ||
                  (k == 4 && high) || (k == 8 && high && options->per_unknown == 0);
  if (!ok) return impl::fail(ierr, impl::kErrCapacity);
  // (2) The signed turn test of the extremum path.
  if (options->flag18 == 1) options->flag18 = 2;
  // (3) The second group needs the curve's second derivative.
  const std::uint32_t st = static_cast<std::uint32_t>(layout->store);
  if ((st & kStoreGroup2Bits) != 0 && options->order < 1) options->order = 1;
  make_widths(*n, layout);
  *ierr = 0;
  return 0;
}

}  // extern "C"
