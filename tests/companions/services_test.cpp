// tests/companions/services_test.cpp -- checks for companions/system: traceback, messages,
// code texts, workspace addressing and accounting, copy, fill and sorts, guarded contexts, and
// the growable tables.
#include <gtest/gtest.h>

#include <cmath>
#include <cstring>
#include <tuple>
#include <utility>
#include <vector>

#include "companions/data/data_api.h"
#include "support/real_checks.h"

namespace {

std::int32_t ierr = -1, zero = 0, one = 1, two = 2, three = 3;
// A call's result with its ierr, which is then reset.
std::pair<std::int32_t, std::int32_t> coded(std::int32_t result) {
  return {result, std::exchange(ierr, 0)};
}
// Address of element `index` (from 1) of `size` bytes counted from base.
std::uintptr_t at(const void* base, std::int64_t index, std::uintptr_t size) {
  return reinterpret_cast<std::uintptr_t>(base) + static_cast<std::uintptr_t>(index - 1) * size;
}
// altes with index 77 and handle `held` on entry: (result, index, handle).
std::tuple<std::int32_t, std::int64_t, std::int32_t> take(void* base, std::int32_t type,
                                                          std::int32_t count, std::int32_t held) {
  std::int64_t index = 77;
  const std::int32_t result = altes(base, &type, &count, &index, &held);
  return {result, index, held};
}
std::int32_t make_table(std::int32_t esize, std::int32_t entries, std::int32_t h = 0) {
  EXPECT_EQ(coded(yutini(&esize, &entries, &h, &ierr)), std::pair(0, 0));
  return h;
}
void end_table(std::int32_t h) { EXPECT_EQ(coded(yutend(&h, &ierr)), std::pair(0, 0)); }
// (entry size, entries) of a table.
std::pair<std::int32_t, std::int32_t> info(std::int32_t h) {
  std::int32_t esize = -1, entries = -1;
  EXPECT_EQ(yutinf(&h, &esize, &entries, &ierr), 0);
  return {esize, entries};
}
// Entries first.. of a table of reals (entry size a multiple of 8) from or into a vector.
std::int32_t put(std::int32_t h, std::int32_t first, std::vector<double> v) {
  std::int32_t count = static_cast<std::int32_t>(v.size() * 8) / info(h).first;
  return yutwri(&h, &first, &count, v.data(), &ierr);
}
std::vector<double> get(std::int32_t h, std::int32_t first, std::int32_t count) {
  std::vector<double> v(count * info(h).first / 8, -1.0);
  EXPECT_EQ(yutrea(&h, &first, &count, v.data(), &ierr), 0);
  return v;
}
// Address of a table's storage, from yuttab's index in units of the selector (1, 4, 8 or 16
// bytes).
std::uintptr_t storage(std::int32_t h, std::int32_t selector) {
  std::int64_t index = 0;
  std::int32_t entries = -1;
  EXPECT_EQ(yuttab(&h, &selector, &index, &entries, &ierr), 0);
  return at(dynar, index, std::uintptr_t{1} << (selector == 1 ? 0 : selector));
}

}  // namespace

TEST(Logs, TracebackKeepsNamesAndTheMostRecentFramesMessagesAndGuardedContexts) {
  RecordedFrames rec;
  const std::int32_t c1 = 4715, c2 = 250, c3 = 722, c4 = 104;
  bftier(&c1, "YNF2PO   ", 9);
  bftier(&c2, "XYZVOL;", 7);
  bftier(&c1, "ignored tail", 0);
  bftier(&c2, std::string(40, 'x').data(), 40);  // the first 32 bytes kept, the length as passed
  const std::vector<Frame> want = {
      {4715, "YNF2PO   ", 9}, {250, "XYZVOL;", 7}, {4715, "", 0}, {250, std::string(32, 'x'), 40}};
  EXPECT_EQ(rec.frames(), want);
  orvq7sys_trace_clear();
  for (std::int32_t i = 1; i <= ORVQ7SYS_TRACE_MAX + 5; ++i) bftier(&i, "ABC", 3);
  EXPECT_EQ(std::tuple(orvq7sys_trace_count(), orvq7sys_trace_dropped(), rec.frames().front().code,
                       rec.frames().back().code),
            std::tuple(64, std::int64_t{5}, 6, 69));
  // Frames outside 1..64 are refused before anything is written.
  EXPECT_EQ(orvq7sys_trace_frame(0, nullptr, nullptr, nullptr), 1);
  EXPECT_EQ(orvq7sys_trace_frame(65, nullptr, nullptr, nullptr), 1);
  // A guarded context records the error held in gmacer only for a non-zero status.
  orvq7sys_trace_clear();
  std::memcpy(gmacer, "GUMIN3  ", 8);
  EXPECT_EQ(giuope(nullptr, nullptr, nullptr, nullptr), 0);
  EXPECT_EQ(giufin(&zero, nullptr) & 1, 0);
  EXPECT_TRUE(rec.empty());
  EXPECT_EQ(giufin(&c4, nullptr) & 1, 1);
  giuclo(&one);
  EXPECT_EQ(rec.frames(), (std::vector<Frame>{{104, "GUMIN3  ", 8}}));
  // The message log.
  orvq7sys_msg_clear();
  errmsg(&c3, &zero);
  std::int32_t c = 0, s = -1;
  EXPECT_EQ(orvq7sys_msg_count(), 1);
  EXPECT_EQ(orvq7sys_msg_get(1, &c, &s), 0);
  EXPECT_EQ(std::pair(c, s), std::pair(722, 0));
  EXPECT_EQ(orvq7sys_msg_get(2, &c, &s), 1);
  // Texts for the 24 codes of the library (0, 1, 2, 36, 116, 250, 722, 1036, 4701 to 4704,
  // 4707, 4709, 4710, 4712, 4713, 4715 to 4718, 4720 to 4722; none starts with a u), and
  // "unknown code" for all others.
  std::int32_t known = 0;
  for (int code = -1; code <= 5000; ++code) known += *orvq7sys_code_text(code) != 'u';
  EXPECT_EQ(known, 24);
  EXPECT_STREQ(orvq7sys_code_text(4711), "unknown code");
}

TEST(Altes, BlocksAreAddressedFromTheBaseAndRefusalsChangeNothing) {
  WorkspaceWatch ws;
  alignas(8) char area[16];
  // From dynar (aligned) the block is aligned; from a base 3 bytes past alignment it lies a
  // whole number of elements from that base.
  const std::tuple<void*, int, std::uintptr_t> cases[] = {
      {dynar, 2, 4}, {dynar, 3, 8}, {area + 3, 3, 8}};
  for (auto [base, type, size] : cases) {
    const auto [result, index, handle] = take(base, type, 37, 0);
    ASSERT_EQ(std::tuple(result, handle != 0, ws.outstanding()), std::tuple(0, true, 1));
    EXPECT_EQ(at(base, index, size) % size, base == dynar ? 0u : 3u);
    std::memset(reinterpret_cast<void*>(at(base, index, size)), 0x5a, 37 * size);  // all ours
    EXPECT_EQ(detes(&handle), 0);
    EXPECT_EQ(ws.outstanding(), 0);
  }
  EXPECT_EQ(ws.requests(), 3);
  // Two injected refusals, then types outside 1..4, a negative count, a caller that still
  // holds a block.
  ws.refuse_next(2);
  const std::tuple<int, int, int> refused[] = {{3, 10, 0},  {3, 10, 0}, {0, 10, 0},    {5, 10, 0},
                                               {-3, 10, 0}, {3, -1, 0}, {3, 10, 12345}};
  for (auto [type, count, held] : refused) {
    EXPECT_EQ(take(dynar, type, count, held), std::tuple(1, std::int64_t{77}, held));
  }
  const auto [result, index, handle] = take(dynar, 3, 0, 0);  // granted again, an empty block
  ASSERT_EQ(result, 0);
  EXPECT_EQ(ws.outstanding(), 1);
  // detes: the handle once, then refused; handle 0 is accepted, an unknown one refused.
  const std::int32_t unknown = 987654;
  EXPECT_EQ((std::vector{detes(&handle), detes(&handle), detes(&zero), detes(&unknown)}),
            (std::vector{0, 1, 0, 1}));
  EXPECT_EQ(ws.outstanding(), 0);
}

TEST(CopyFillSort, CopyCountsBytesFillUsesTheLowByteSortsAreStable) {
  double src[3] = {1.5, -2.25, 3.0}, dst[3] = {0, 0, 0};
  std::int32_t n = 16, fill = 0x1ff;
  crccop(src, &n, dst);
  crccop(src, &zero, dst + 2);
  expect_bits(dst, {1.5, -2.25, 0.0});
  unsigned char bytes[4] = {9, 9, 9, 9};
  crcmac(bytes, &three, &fill);
  EXPECT_EQ(std::vector<int>(bytes, bytes + 4), (std::vector<int>{0xff, 0xff, 0xff, 9}));
  std::int32_t table[] = {5, 1, 3, 0, 2, 3, 1, 2, 1, 4, 7, 5};  // 4 rows of 3, key 3
  std::int32_t rows = 4, key = 3, bad_key = 4, work[12], five = 5;
  sori4(table, &three, &rows, &key, work);
  sori4(table, &three, &rows, &bad_key, work);  // key 4 is outside the rows: nothing moves
  EXPECT_EQ(std::vector<int>(table, table + 12),
            (std::vector<int>{1, 2, 1, 5, 1, 3, 0, 2, 3, 4, 7, 5}));
  double v[5] = {3.0, NAN, -1.0, 0.0, -0.0};
  sorr8(v, &five);
  expect_bits(v, {-1.0, 0.0, -0.0, 3.0, NAN});  // equal values keep their order, NaN last
}

TEST(Tables, AppendingAMillionEntriesGrowsGeometrically) {
  const std::int32_t h = make_table(8, 0);
  constexpr std::int32_t kN = 1000000;
  std::int32_t moves = 0;
  std::int64_t cap = orvq7sys_table_capacity(h);
  for (std::int32_t k = 1; k <= kN; ++k) {
    // The path solver's pattern: extend by one, then write the new last entry.
    const double v = 0.5 * k;
    ASSERT_EQ(yutmnc(&h, &k, &ierr), 0);
    ASSERT_EQ(yutwri(&h, &k, &one, &v, &ierr), 0);
    moves += orvq7sys_table_capacity(h) != cap;
    cap = orvq7sys_table_capacity(h);
  }
  // Doubling from 8 entries reaches 2^20 > 1e6 in 17 growths; never more than twice the need.
  EXPECT_LE(moves, 20);
  EXPECT_LT(cap, 2 * std::int64_t{kN});
  // Direct access sees every entry, counted in reals from dynar.
  const auto* d = reinterpret_cast<const double*>(storage(h, 3));
  std::int32_t bad = 0;
  for (std::int32_t k = 1; k <= kN; ++k) bad += d[k - 1] != 0.5 * k;
  EXPECT_EQ(bad, 0);
  end_table(h);
}

TEST(Tables, EntriesGrowShrinkAndCopyAndTheStorageIsAddressedInUnitsOfTheSelector) {
  const std::int64_t live0 = orvq7sys_table_live();
  const std::int32_t h = make_table(16, 4);  // entries of two reals, 64 bytes, zero-filled
  EXPECT_EQ(std::pair(orvq7sys_table_live(), info(h)), std::pair(live0 + 1, std::pair(16, 4)));
  ASSERT_EQ(put(h, 4, {4.5, 4.25, 5.5, 5.25}), 0);  // entries 4 and 5: grows by one
  EXPECT_EQ(info(h), std::pair(16, 5));
  expect_bits(get(h, 3, 3).data(), {0.0, 0.0, 4.5, 4.25, 5.5, 5.25});
  // yuttab: one storage, 16-byte aligned, whatever the unit; entry 4 starts at real 7.
  const std::uintptr_t first = storage(h, 1);
  EXPECT_EQ(first % 16, 0u);
  for (std::int32_t sel : {2, 3, 4}) EXPECT_EQ(storage(h, sel), first) << sel;
  EXPECT_EQ(reinterpret_cast<const double*>(first)[6], 4.5);
  // yutcop: a copy independent of its source.
  std::int32_t copy = 0;
  ASSERT_EQ(yutcop(&h, &copy, &ierr), 0);
  ASSERT_EQ(put(h, 4, {9.0, 9.0}), 0);
  EXPECT_EQ(info(copy), std::pair(16, 5));
  expect_bits(get(copy, 4, 2).data(), {4.5, 4.25, 5.5, 5.25});
  end_table(copy);
  // Shrinking keeps the capacity; entries regained are zero-filled.
  const std::int64_t cap = orvq7sys_table_capacity(h);
  for (std::int32_t n : {1, 4}) ASSERT_EQ(yutmnc(&h, &n, &ierr), 0);
  EXPECT_EQ(orvq7sys_table_capacity(h), cap);
  expect_bits(get(h, 4, 1).data(), {0.0, 0.0});  // the 9.0s are gone
  end_table(h);
  EXPECT_EQ(orvq7sys_table_live(), live0);
}

// Every refused call: code 4712 for bad arguments, 36 for injected refusals of the calls that
// may allocate; nothing written, the table unchanged.
TEST(Tables, RefusalsChangeNothing) {
  const std::int64_t live0 = orvq7sys_table_live(), mine0 = orvq7sys_table_live_thread();
  const std::int32_t h = make_table(8, 2), dead = make_table(8, 1), four = 4, five = 5, minus = -1;
  end_table(dead);
  std::int32_t buf[4] = {7, 7, 7, 7}, out = -9, out2 = -9, k = 0;
  std::int64_t index = -9;
  for (auto refused :
       {coded(yutini(&zero, &one, &out, &ierr)),   // entry size 0
        coded(yutini(&one, &minus, &out, &ierr)),  // negative count
        coded(yutwri(&dead, &one, &one, buf, &ierr)), coded(yutwri(&h, &zero, &one, buf, &ierr)),
        coded(yutwri(&h, &four, &one, buf, &ierr)),  // would leave entry 3 unwritten
        coded(yutwri(&h, &one, &minus, buf, &ierr)),
        coded(yutrea(&h, &two, &two, buf, &ierr)),  // entry 3 does not exist
        coded(yutrea(&dead, &one, &one, buf, &ierr)), coded(yutinf(&dead, &out, &out2, &ierr)),
        coded(yutmnc(&h, &minus, &ierr)), coded(yutmnc(&dead, &one, &ierr)),
        coded(yuttab(&h, &zero, &index, &out, &ierr)),  // selectors 1..4 only
        coded(yuttab(&h, &five, &index, &out, &ierr)),
        coded(yuttab(&dead, &three, &index, &out, &ierr)), coded(yutcop(&dead, &out, &ierr)),
        coded(yutend(&dead, &ierr)), coded(yutend(&zero, &ierr))}) {
    EXPECT_EQ(refused, std::pair(1, 4712)) << "call " << ++k;
  }
  orvq7sys_table_refuse(0, 4);
  for (auto refused : {coded(yutini(&one, &one, &out, &ierr)), coded(put(h, 1, {3.0})),
                       coded(yutmnc(&h, &four, &ierr)), coded(yutcop(&h, &out, &ierr))}) {
    EXPECT_EQ(refused, std::pair(1, 36)) << "call " << ++k;
  }
  EXPECT_EQ(std::tuple(out, out2, index, buf[0]), std::tuple(-9, -9, std::int64_t{-9}, 7));
  EXPECT_EQ(info(h), std::pair(8, 2));
  expect_bits(get(h, 1, 2).data(), {0.0, 0.0});
  // The injection is used up: the next write succeeds. Skipping one call: the one after it
  // is refused.
  EXPECT_EQ(put(h, 1, {3.0}), 0);
  orvq7sys_table_refuse(1, 1);
  EXPECT_EQ(coded(yutmnc(&h, &four, &ierr)), std::pair(0, 0));
  EXPECT_EQ(coded(yutmnc(&h, &one, &ierr)), std::pair(1, 36));
  EXPECT_EQ(coded(yutmnc(&h, &one, &ierr)), std::pair(0, 0));
  // Reads and writes of zero entries right after the last are fine.
  EXPECT_EQ(yutrea(&h, &two, &zero, buf, &ierr), 0);
  EXPECT_EQ(yutwri(&h, &two, &zero, buf, &ierr), 0);
  end_table(h);
  EXPECT_EQ(std::pair(orvq7sys_table_live(), orvq7sys_table_live_thread()),
            std::pair(live0, mine0));
}
