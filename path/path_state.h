// path/path_state.h -- the records of a traced path and the per-thread path state of the
// driver (internal header). The exported routines of path/ take these records as arguments;
// path/path_api.h names the same types (incomplete there) and says what a caller passes.
//
// Records, with the routines that write and read each field ("driver" is ynchem).
//
// Options record (Orvq7PathOptions), cleared then filled by wnccmd:
//   field        written by                       read by
//   kind         wnccmd                           wnccim, wnccex, wncpas, wncver
//   first_order  wnccmd                           (recorded only)
//   order        wnccmd; wnccex raises it         wnccim, wnccex, wncini, wnccar
//   per_unknown  wnccmd                           wnccim, wnccex, wncpas, wncver
//   flag17       wnccmd                           (recorded only)
//   flag18       wnccmd; wnccex turns 1 into 2    wncver
//   flag19       wnccmd                           (recorded only)
//
// Limits (double[2]): [0] the bound B (K = 4: 1/h^2, K = 8: 1/h; left as it was for K = 1
// and 2), [1] the cosine limit. Written by wnccmd, read by wncpas and wncver.
//
// Storage layout (Orvq7PathLayout), cleared then filled by wnccmd; the variant check (wnccim,
// wnccex) sets the group forms and then the widths and offsets of the slots:
//   field            written by                 read by
//   store            wnccmd                     wnccim, wnccex
//   nused            wnccmd                     wncfst, wncflu
//   form1, form2     wnccmd; wnccim             widths (variant check)
//   n, nvalues       variant check              wncflu, wncfst
//   slot[s].used     wnccmd                     everything below
//   slot[s].kind     wnccmd                     wncfst (record kind of the triple)
//   slot[s].width    variant check              wncflu, wncfst
//   slot[s].type     wnccmd                     wncfst (2: 4-byte integers, 3: reals)
//   slot[s].offset   variant check              wncflu, wncfst
// Slots have fixed positions: 1 kind 22 (store bit 0), 2 kind 23 (bit 1), 3 kind 43 (bit 2),
// 4..6 the first group (kinds 1, 2, 3), 7..9 the second group (kinds 1, 2, 3); slots 10 and
// 11 are never used. A used slot of width 0 keeps its triple but has no sub-table.
//
// Pairs (int32[2 * 11]): the (count, code) pairs of the storage request in table order,
// pair k at [2k - 2], [2k - 1]; group members are (0, code), their width is decided by the
// group's form. Written by wnccmd, read by nobody else (callers and tests).
//
// March record (Orvq7PathMarch), rebuilt by wncini:
//   field        written by                            read by
//   x            wncini (x0), wnccar (advance)         wncgoo, wnctes, wnctfe, wnctob, wnccar,
//                                                      wncflu
//   t, tprev     wncini (d0 both), wnccar              wncpas (t), wncgoo, wnctes (t), wnctob
//                                                      (t), wnccar, wncflu (t)
//   c            wncini, wnccar                        wncpas, wncflu
//   h            wncini (1e38), wncpas                 wncgoo, wnccar
//   hprev        wncini (1e38), wnccar                 wncgoo, wncflu
//   f            wncini (1), wncpas (1), wncgoo,       wncpas, wncgoo, wnccar
//                wnctob, wnctes, wnccar
//   g            wncini (1)                            wncpas (variant 2)
//   close_prev   wncini (0), wnccar                    wnctfe
//   close        wncini (0), wnctfe                    wnccar, wncflu
//   sign         wncini                                wncflu
//   nstored      wncini (1), wncflu (+1 per point      wnctob, wnccar, wncflu
//                appended after the start)
//   treq         wncini (2, or 6 at order level 1)     wnccar
//
// Table handles (Orvq7PathTables): master and the sub-table of each slot (0: none); written by
// wncflu when the result is created; a copy for the driver (the storage routines work from the
// triples of the master table itself).
#pragma once
#include <cstdint>

#include "path/path_api.h"

namespace impl {
constexpr std::int32_t kPathMaxN = 20;   // largest number of unknowns
constexpr std::int32_t kPathSlots = 11;  // slots of the storage layout
// Reals in the gathered values of one point: 2 + 2n + 2n + (1 + 1 + n) + (1 + 1 + n) at
// n = 20, each integer member rounded up to one real.
constexpr std::int32_t kPathMaxValues = 2 + 4 * kPathMaxN + 2 * (2 + kPathMaxN);
// Fixed slot positions of the storage layout (from 0).
constexpr std::int32_t kSlot22 = 0;      // record kind 22, store bit 0
constexpr std::int32_t kSlot23 = 1;      // record kind 23, store bit 1
constexpr std::int32_t kSlot43 = 2;      // record kind 43, store bit 2
constexpr std::int32_t kSlotGroup1 = 3;  // first group, kinds 1, 2, 3 in slots 3, 4, 5
constexpr std::int32_t kSlotGroup2 = 6;  // second group, kinds 1, 2, 3 in slots 6, 7, 8
// Sub-table element types.
constexpr std::int32_t kTypeInt = 2;
constexpr std::int32_t kTypeReal = 3;
}  // namespace impl

extern "C" {

struct Orvq7PathOptions {
  std::int32_t kind;         // path kind K: 1, 2, 4 or 8; 0 when no kind bit was set
  std::int32_t first_order;  // 1 whenever a kind is set
  std::int32_t order;        // order level 0, 1 or 2
  std::int32_t per_unknown;  // 1 when tol holds n values (mode bit 16)
  std::int32_t flag17;       // 1 when mode bit 17 is set
  std::int32_t flag18;       // 1 unless mode bit 18 is set; 2 after wnccex
  std::int32_t flag19;       // 1 when mode bit 19 is set
};

struct Orvq7PathSlot {
  std::int32_t used;    // 1 when the storage request asks for this quantity
  std::int32_t kind;    // record kind of its triple
  std::int32_t width;   // values per entry; 0: no values, no sub-table
  std::int32_t type;    // 2: 4-byte integers, 3: 8-byte reals
  std::int32_t offset;  // first value in the gathered values of a point, in reals from 0
};

struct Orvq7PathLayout {
  std::int32_t store;    // the storage request word as passed
  std::int32_t nused;    // quantities kept (q): triples in the master table
  std::int32_t form1;    // form of the first group: 1 first, 2 second
  std::int32_t form2;    // form of the second group: 1 first, 2 second (never reached)
  std::int32_t n;        // unknowns the widths were made for; 0 before the variant check
  std::int32_t nvalues;  // reals in the gathered values of one point
  Orvq7PathSlot slot[impl::kPathSlots];
};

struct Orvq7PathMarch {
  double x[impl::kPathMaxN];      // current point
  double t[impl::kPathMaxN];      // current tangent, in the direction of travel
  double tprev[impl::kPathMaxN];  // previous tangent
  double c[impl::kPathMaxN];      // kept with the tangent: second derivative, scale values or
                                  // difference quotient of the tangents (0 at order level 0)
  double h;                       // step H; 1e38 before the first step
  double hprev;                   // previous step f * H; 1e38 before the first step
  double f;                       // step factor
  double g;                       // second factor
  double close_prev;              // closure value of the previous point
  double close;                   // closure value of the current point
  std::int32_t sign;              // orientation sign of the computed tangent: +1 or -1
  std::int32_t nstored;           // points stored in the result
  std::int32_t treq;              // tangent request of the path: 2, or 6 at order level 1
};

struct Orvq7PathTables {
  std::int32_t master;                 // handle of the result table (as itab)
  std::int32_t sub[impl::kPathSlots];  // sub-table of each slot; 0 when none
};

}  // extern "C"

namespace impl {

// The whole state of one path traced by the driver, one copy per thread (path_state.cpp).
// wnccmd and wncini rebuild it at every call of the driver, except lookup_count.
struct PathState {
  Orvq7PathOptions options;
  double limits[2];
  Orvq7PathLayout layout;
  std::int32_t pairs[2 * kPathSlots];
  Orvq7PathMarch march;
  Orvq7PathTables tables;
  // Flags owned by the driver (wncini uses its own accepted = 1, phase = 0 for the start).
  std::int32_t special;   // 0 ordinary; 1 end on a box face; 2 closed; 3 step collapsed
  std::int32_t phase;     // flush phase: 0 start point, 1 along the path, 2 end seen
  std::int32_t redo;      // 0 accept; 1 or 2 correct the same step again
  std::int32_t accepted;  // 0 do not store; 1 store; 2 replace the last stored point
  std::int32_t count;     // accepted points of this path
  // Written by yncrea when the record kind is found; kept from one path to the next on this
  // thread (0 before the first lookup), since a failed lookup leaves it as it was.
  std::int32_t lookup_handle;
  std::int32_t lookup_count;
};

extern thread_local PathState s_ynchem;

}  // namespace impl
