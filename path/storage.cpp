// path/storage.cpp -- point storage and result tables of the path solver: wncflu, wncfst,
// yncrea, yncend. A result is a master table of (kind, sub-table, count) triples, one per kept
// quantity in slot order, and one sub-table per quantity with values, one entry per point.
#include <cstdint>
#include <cstring>

#include "frame/services.h"
#include "frame/status.h"
#include "frame/workspace.h"
#include "path/path_api.h"
#include "path/path_state.h"

namespace {

constexpr std::int32_t kTriple = 3;     // 4-byte integers per quantity in the master table
constexpr std::int32_t kIntSize = 4;    // entry size of the master table, in bytes
constexpr std::int32_t kSelectInt = 2;  // yuttab: index counted in 4-byte integers
constexpr std::int32_t kMaxTriples = kTriple * impl::kPathSlots;

// Entry size in bytes of a slot's sub-table.
std::int32_t entry_size(const Orvq7PathSlot& slot) {
  return slot.width * (slot.type == impl::kTypeInt ? 4 : 8);
}

// Values of slot quantities, written into the gathered values of one point.
void put_reals(double* values, const Orvq7PathSlot& slot, std::int32_t at, const double* v,
               std::int32_t count) {
  for (std::int32_t i = 0; i < count; ++i) values[slot.offset + at + i] = v[i];
}
void put_int(double* values, const Orvq7PathSlot& slot, std::int32_t value) {
  std::memcpy(values + slot.offset, &value, sizeof value);
}

// Gathers the values of the current point for every used slot with values, in the entry
// layout of the public header. `number` is the point's number, `phase` the flush phase.
void gather(const Orvq7PathLayout* layout, const Orvq7PathMarch* march, std::int32_t phase,
            std::int32_t number, double* values) {
  const std::int32_t n = layout->n;
  const double step = phase == 0 ? 0.0 : march->hprev;  // 0 at the start point
  for (std::int32_t s = 0; s < impl::kPathSlots; ++s) {
    const Orvq7PathSlot& slot = layout->slot[s];
    if (slot.used == 0 || slot.width == 0) continue;
    switch (s) {
      case impl::kSlot22: {
        const double pair[2] = {step, march->close};
        put_reals(values, slot, 0, pair, 2);
        break;
      }
      case impl::kSlot23:
        put_reals(values, slot, 0, march->x, n);
        put_reals(values, slot, n, march->t, n);
        break;
      case impl::kSlot43:
        put_reals(values, slot, 0, march->x, n);
        put_reals(values, slot, n, march->c, n);
        break;
      case impl::kSlotGroup1:
        put_int(values, slot, phase);
        break;
      case impl::kSlotGroup1 + 1:
        put_int(values, slot, number);
        break;
      case impl::kSlotGroup1 + 2:
        put_reals(values, slot, 0, march->x, n);
        break;
      case impl::kSlotGroup2:
        put_int(values, slot, march->sign);
        break;
      case impl::kSlotGroup2 + 1:
        put_reals(values, slot, 0, &step, 1);
        break;
      case impl::kSlotGroup2 + 2:
        put_reals(values, slot, 0, march->c, n);
        break;
      default:
        break;
    }
  }
}

// Reads the q triples of a result.
std::int32_t read_triples(const std::int32_t* itab, std::int32_t q, std::int32_t* trip,
                          std::int32_t* ierr) {
  const std::int32_t first = 1, count = kTriple * q;
  return yutrea(itab, &first, &count, trip, ierr);
}
std::int32_t write_triples(const std::int32_t* itab, std::int32_t q, const std::int32_t* trip,
                           std::int32_t* ierr) {
  const std::int32_t first = 1, count = kTriple * q;
  return yutwri(itab, &first, &count, trip, ierr);
}

// Creates a sub-table holding one entry, the given values.
std::int32_t new_sub_table(const Orvq7PathSlot& slot, const double* values, std::int32_t* handle,
                           std::int32_t* ierr) {
  const std::int32_t esize = entry_size(slot), one = 1;
  if (yutini(&esize, &one, handle, ierr) == 1) return 1;
  return yutwri(handle, &one, &one, values + slot.offset, ierr);
}

// Releases the tables of a result under construction; the caller's code in ierr is kept.
void release_partial(std::int32_t master, const std::int32_t* trip, std::int32_t ntrip) {
  std::int32_t code = 0;
  for (std::int32_t t = 0; t < ntrip; ++t) {
    if (trip[kTriple * t + 1] != 0) yutend(&trip[kTriple * t + 1], &code);
  }
  yutend(&master, &code);
}

// First call of wncfst: the master table, then each used slot's triple and sub-table.
std::int32_t create_result(std::int32_t phase, const Orvq7PathLayout* layout, const double* values,
                           std::int32_t* itab, std::int32_t* ierr) {
  const std::int32_t q = layout->nused;
  const std::int32_t esize = kIntSize, entries = kTriple * q;
  std::int32_t master = 0;
  if (yutini(&esize, &entries, &master, ierr) == 1) return 1;
  std::int32_t trip[kMaxTriples] = {};
  std::int32_t t = 0;
  for (std::int32_t s = 0; s < impl::kPathSlots && t < q; ++s) {
    const Orvq7PathSlot& slot = layout->slot[s];
    if (slot.used == 0) continue;
    trip[kTriple * t] = slot.kind;
    if (slot.width > 0) {
      std::int32_t h = 0;
      const std::int32_t r = new_sub_table(slot, values, &h, ierr);
      trip[kTriple * t + 1] = h;  // released below if anything failed
      if (r == 1) {
        release_partial(master, trip, t + 1);
        return 1;
      }
      if (phase == 2) trip[kTriple * t + 2] = 1;
    }
    ++t;
  }
  if (write_triples(&master, q, trip, ierr) == 1) {
    release_partial(master, trip, q);
    return 1;
  }
  *itab = master;
  return 0;
}

// Records the number of entries of every sub-table in its triple (the end of the path).
std::int32_t record_counts(const std::int32_t* itab, std::int32_t q, std::int32_t* ierr) {
  std::int32_t trip[kMaxTriples];
  if (read_triples(itab, q, trip, ierr) == 1) return 1;
  for (std::int32_t t = 0; t < q; ++t) {
    std::int32_t esize = 0, entries = 0;
    if (trip[kTriple * t + 1] != 0 && yutinf(&trip[kTriple * t + 1], &esize, &entries, ierr) == 1) {
      return 1;
    }
    trip[kTriple * t + 2] = entries;
  }
  return write_triples(itab, q, trip, ierr);
}

// Overwrites the last entry of every sub-table with the point's values.
std::int32_t replace_last(const Orvq7PathLayout* layout, const double* values,
                          const std::int32_t* itab, std::int32_t* ierr) {
  const std::int32_t q = layout->nused;
  std::int32_t trip[kMaxTriples];
  if (read_triples(itab, q, trip, ierr) == 1) return 1;
  std::int32_t t = 0;
  for (std::int32_t s = 0; s < impl::kPathSlots && t < q; ++s) {
    const Orvq7PathSlot& slot = layout->slot[s];
    if (slot.used == 0) continue;
    const std::int32_t* h = &trip[kTriple * t + 1];
    ++t;
    if (slot.width == 0 || *h == 0) continue;
    std::int32_t esize = 0, entries = 0;
    if (yutinf(h, &esize, &entries, ierr) == 1) return 1;
    const std::int32_t last = entries > 0 ? entries : 1, one = 1;
    if (yutwri(h, &last, &one, values + slot.offset, ierr) == 1) return 1;
  }
  return 0;
}

}  // namespace

extern "C" {

std::int32_t wncflu(const std::int32_t* phase, const std::int32_t* accepted,
                    const Orvq7PathOptions* /*options*/, const Orvq7PathLayout* layout,
                    Orvq7PathMarch* march, Orvq7PathTables* tables, std::int32_t* itab,
                    std::int32_t* ierr) {
  // (1) Arguments.
  const std::int32_t ph = *phase, acc = *accepted;
  if (ph < 0 || ph > 2 || acc < 0 || acc > 2) return impl::fail(ierr, impl::kErrBadArg);
  *ierr = 0;
  double values[impl::kPathMaxValues] = {};
  const bool empty = *itab == 0;
  if (acc == 1 || (acc == 2 && empty)) {
    // (2) Append: the start point was counted by wncini, later points are counted here.
    const std::int32_t number = ph == 0 ? march->nstored : march->nstored + 1;
    gather(layout, march, ph, number, values);
    if (wncfst(phase, layout, values, itab, ierr) == 1) return 1;
    march->nstored = number;
    if (empty) {
      // The handles of the new result, slot by slot.
      std::int32_t trip[kMaxTriples];
      if (read_triples(itab, layout->nused, trip, ierr) == 1) return 1;
      *tables = Orvq7PathTables{};
      tables->master = *itab;
      std::int32_t t = 0;
      for (std::int32_t s = 0; s < impl::kPathSlots && t < layout->nused; ++s) {
        if (layout->slot[s].used != 0) tables->sub[s] = trip[kTriple * t++ + 1];
      }
    }
    return 0;
  }
  if (acc == 2) {
    // (3) The point replaces the last stored one, keeping its number.
    gather(layout, march, ph, march->nstored, values);
    if (replace_last(layout, values, itab, ierr) == 1) return 1;
  }
  // (4) End of the path: the counts go into the triples, whether or not a point was stored.
  if (ph == 2 && !empty) return record_counts(itab, layout->nused, ierr);
  return 0;
}

std::int32_t wncfst(const std::int32_t* phase, const Orvq7PathLayout* layout, const double* values,
                    std::int32_t* itab, std::int32_t* ierr) {
  const std::int32_t q = layout->nused;
  if (q < 1 || q > impl::kPathSlots) return impl::fail(ierr, impl::kErrBadArg);
  *ierr = 0;
  // (1) First call: create the result with the point.
  if (*itab == 0) return create_result(*phase, layout, values, itab, ierr);
  // (2) Later calls: extend each sub-table by one entry and write the point there.
  std::int32_t trip[kMaxTriples];
  if (read_triples(itab, q, trip, ierr) == 1) return 1;
  bool rewrite = *phase == 2;
  std::int32_t t = 0;
  for (std::int32_t s = 0; s < impl::kPathSlots && t < q; ++s) {
    const Orvq7PathSlot& slot = layout->slot[s];
    if (slot.used == 0) continue;
    std::int32_t* h = &trip[kTriple * t + 1];
    std::int32_t* count = &trip[kTriple * t + 2];
    ++t;
    if (slot.width == 0) continue;
    std::int32_t entries = 1;
    if (*h != 0) {
      std::int32_t esize = 0, one = 1;
      if (yutinf(h, &esize, &entries, ierr) == 1) return 1;
      ++entries;
      if (yutmnc(h, &entries, ierr) == 1) return 1;
      if (yutwri(h, &entries, &one, values + slot.offset, ierr) == 1) return 1;
    } else {
      if (new_sub_table(slot, values, h, ierr) == 1) return 1;
      rewrite = true;
    }
    if (*phase == 2) *count = entries;
  }
  // (3) The triples, when a sub-table was made or the path has ended.
  if (rewrite) return write_triples(itab, q, trip, ierr);
  return 0;
}

std::int32_t yncrea(const std::int32_t* itab, const std::int32_t* kind, std::int32_t* handle,
                    std::int32_t* count, std::int32_t* ierr) {
  // (1) The triples, read in place; an absent result has none.
  const std::int32_t* trip = nullptr;
  std::int32_t ntrip = 0;
  if (*itab != 0) {
    std::int64_t index = 0;
    std::int32_t entries = 0;
    if (yuttab(itab, &kSelectInt, &index, &entries, ierr) == 1) return 1;
    trip = impl::ws_at<std::int32_t>(dynar, index);
    ntrip = entries / kTriple;
  }
  // (2) The first triple of the kind, scanning in order.
  for (std::int32_t t = 0; t < ntrip; ++t) {
    if (trip[kTriple * t] == kind[0]) {
      *handle = trip[kTriple * t + 1];
      *count = trip[kTriple * t + 2];
      *ierr = 0;
      return 0;
    }
  }
  // (3) None.
  impl::trace(impl::kErrBadArg, " YNCREA ");
  return impl::fail(ierr, impl::kErrBadArg);
}

std::int32_t yncend(const std::int32_t* itab, std::int32_t* ierr) {
  *ierr = 0;
  if (*itab == 0) return 0;
  std::int64_t index = 0;
  std::int32_t entries = 0;
  if (yuttab(itab, &kSelectInt, &index, &entries, ierr) == 1) return 1;
  const std::int32_t* trip = impl::ws_at<std::int32_t>(dynar, index);
  // Sub-tables first, in order (releasing them leaves the master's storage in place).
  for (std::int32_t t = 0; t < entries / kTriple; ++t) {
    const std::int32_t h = trip[kTriple * t + 1];
    if (h != 0 && yutend(&h, ierr) == 1) return 1;
  }
  return yutend(itab, ierr);
}

}  // extern "C"
