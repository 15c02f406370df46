// tests/companions/tables_test.cpp -- checks for companions/system/tables.cpp: growable tables.
#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>
#include <vector>

#include "companions/data/data_api.h"
#include "support/recording_services.h"

namespace {

// Creates a table or fails the test.
std::int32_t make_table(std::int32_t esize, std::int32_t entries) {
  std::int32_t h = 0, ierr = -1;
  EXPECT_EQ(yutini(&esize, &entries, &h, &ierr), 0);
  EXPECT_EQ(ierr, 0);
  EXPECT_NE(h, 0);
  return h;
}

void end_table(std::int32_t h) {
  std::int32_t ierr = -1;
  EXPECT_EQ(yutend(&h, &ierr), 0);
  EXPECT_EQ(ierr, 0);
}

// Address of byte k (from 1) of a table's storage, through yuttab with selector 1.
template <class T>
T* storage(std::int32_t h, std::int32_t selector) {
  std::int64_t index = 0;
  std::int32_t entries = -1, ierr = -1;
  EXPECT_EQ(yuttab(&h, &selector, &index, &entries, &ierr), 0);
  const std::uintptr_t b = reinterpret_cast<std::uintptr_t>(dynar);
  return reinterpret_cast<T*>(b + static_cast<std::uintptr_t>(index - 1) * sizeof(T));
}

}  // namespace

TEST(Yutini, EntriesStartZeroAndWritesReadBack) {
  const std::int64_t live0 = orvq7sys_table_live();
  const std::int32_t h = make_table(12, 3);
  EXPECT_EQ(orvq7sys_table_live(), live0 + 1);
  std::int32_t esize = 0, entries = 0, ierr = -1;
  ASSERT_EQ(yutinf(&h, &esize, &entries, &ierr), 0);
  EXPECT_EQ(esize, 12);
  EXPECT_EQ(entries, 3);
  std::int32_t got[9];
  std::memset(got, 0x5a, sizeof got);
  std::int32_t first = 1, count = 3;
  ASSERT_EQ(yutrea(&h, &first, &count, got, &ierr), 0);
  for (std::int32_t v : got) EXPECT_EQ(v, 0);
  // Write entries 3..4 (the table grows by one), read 2..4.
  const std::int32_t put[6] = {31, 32, 33, 41, 42, 43};
  first = 3;
  count = 2;
  ASSERT_EQ(yutwri(&h, &first, &count, put, &ierr), 0);
  ASSERT_EQ(yutinf(&h, &esize, &entries, &ierr), 0);
  EXPECT_EQ(entries, 4);
  first = 2;
  count = 3;
  ASSERT_EQ(yutrea(&h, &first, &count, got, &ierr), 0);
  const std::int32_t want[9] = {0, 0, 0, 31, 32, 33, 41, 42, 43};
  EXPECT_EQ(std::memcmp(got, want, sizeof want), 0);
  end_table(h);
  EXPECT_EQ(orvq7sys_table_live(), live0);
}

TEST(Yutmnc, ShrinkKeepsCapacityAndRegrowthIsZeroFilled) {
  const std::int32_t h = make_table(8, 0);
  std::int32_t ierr = -1, first = 1, count = 4;
  const double put[4] = {1.5, 2.5, 3.5, 4.5};
  ASSERT_EQ(yutwri(&h, &first, &count, put, &ierr), 0);
  const std::int64_t cap = orvq7sys_table_capacity(h);
  std::int32_t n = 1;
  ASSERT_EQ(yutmnc(&h, &n, &ierr), 0);
  EXPECT_EQ(orvq7sys_table_capacity(h), cap);
  n = 3;
  ASSERT_EQ(yutmnc(&h, &n, &ierr), 0);
  double got[3] = {-1, -1, -1};
  count = 3;
  ASSERT_EQ(yutrea(&h, &first, &count, got, &ierr), 0);
  EXPECT_EQ(bits(got[0]), bits(1.5));
  EXPECT_EQ(bits(got[1]), bits(0.0));  // the old 2.5 is gone
  EXPECT_EQ(bits(got[2]), bits(0.0));
  end_table(h);
}

TEST(Yutwri, AppendingAMillionEntriesGrowsGeometrically) {
  const std::int32_t h = make_table(8, 0);
  constexpr std::int32_t kN = 1000000;
  std::int32_t ierr = 0, one = 1, moves = 0;
  std::int64_t cap = orvq7sys_table_capacity(h);
  for (std::int32_t k = 1; k <= kN; ++k) {
    // The path solver's pattern: extend by one, then write the new last entry.
    const double v = 0.5 * k;
    ASSERT_EQ(yutmnc(&h, &k, &ierr), 0);
    ASSERT_EQ(yutwri(&h, &k, &one, &v, &ierr), 0);
    const std::int64_t c = orvq7sys_table_capacity(h);
    if (c != cap) ++moves;
    cap = c;
  }
  // Doubling from 8 entries reaches 2^20 > 1e6 in 17 growths; never more than twice the need.
  EXPECT_LE(moves, 20);
  EXPECT_LT(cap, 2 * std::int64_t{kN});
  // Direct access sees every entry, counted in reals from dynar.
  const double* d = storage<double>(h, 3);
  std::int32_t bad = 0;
  for (std::int32_t k = 1; k <= kN; ++k) bad += d[k - 1] != 0.5 * k;
  EXPECT_EQ(bad, 0);
  end_table(h);
}

TEST(Yuttab, IndexCountsInTheUnitsOfTheSelector) {
  const std::int32_t h = make_table(4, 6);
  const std::int32_t put[6] = {11, 12, 13, 14, 15, 16};
  std::int32_t ierr = 0, first = 1, count = 6;
  ASSERT_EQ(yutwri(&h, &first, &count, put, &ierr), 0);
  const auto* as_bytes = storage<unsigned char>(h, 1);
  const auto* as_ints = storage<std::int32_t>(h, 2);
  const auto* as_reals = storage<double>(h, 3);
  EXPECT_EQ(static_cast<const void*>(as_bytes), static_cast<const void*>(as_ints));
  EXPECT_EQ(static_cast<const void*>(as_bytes), static_cast<const void*>(as_reals));
  EXPECT_EQ(reinterpret_cast<std::uintptr_t>(as_bytes) % 16, 0u);
  EXPECT_EQ(as_ints[4], 15);
  std::int32_t sel = 3, entries = 0;
  std::int64_t index = 0;
  ASSERT_EQ(yuttab(&h, &sel, &index, &entries, &ierr), 0);
  EXPECT_EQ(entries, 6);  // entries, whatever the selector
  end_table(h);
}

TEST(Yutcop, CopyIsIndependentOfItsSource) {
  const std::int32_t h = make_table(8, 2);
  std::int32_t ierr = 0, first = 1, count = 2, copy = 0;
  const double put[2] = {2.25, -7.125};
  ASSERT_EQ(yutwri(&h, &first, &count, put, &ierr), 0);
  ASSERT_EQ(yutcop(&h, &copy, &ierr), 0);
  EXPECT_NE(copy, h);
  const double other = 9.0;
  count = 1;
  ASSERT_EQ(yutwri(&h, &first, &count, &other, &ierr), 0);
  end_table(h);
  std::int32_t esize = 0, entries = 0;
  ASSERT_EQ(yutinf(&copy, &esize, &entries, &ierr), 0);
  EXPECT_EQ(esize, 8);
  EXPECT_EQ(entries, 2);
  double got[2];
  count = 2;
  ASSERT_EQ(yutrea(&copy, &first, &count, got, &ierr), 0);
  EXPECT_EQ(bits(got[0]), bits(2.25));
  EXPECT_EQ(bits(got[1]), bits(-7.125));
  end_table(copy);
}

// Every refused call: code 4712, nothing written, the table unchanged.
TEST(Tables, BadArgumentsAreRefusedWithoutChange) {
  const std::int64_t live0 = orvq7sys_table_live();
  const std::int32_t h = make_table(4, 2);
  std::int32_t dead = make_table(4, 1);
  end_table(dead);
  const std::int32_t z = 0, one = 1, two = 2, three = 3, four = 4, minus = -1;
  std::int32_t buf[4] = {7, 7, 7, 7}, out = -9, out2 = -9, ierr = 0;
  std::int64_t index = -9;
  auto refused = [&](std::int32_t result) {
    EXPECT_EQ(result, 1);
    EXPECT_EQ(ierr, 4712);
    ierr = 0;
  };
  refused(yutini(&z, &one, &out, &ierr));      // entry size 0
  refused(yutini(&one, &minus, &out, &ierr));  // negative count
  refused(yutwri(&dead, &one, &one, buf, &ierr));
  refused(yutwri(&h, &z, &one, buf, &ierr));     // first below 1
  refused(yutwri(&h, &four, &one, buf, &ierr));  // would leave entry 3 unwritten
  refused(yutwri(&h, &one, &minus, buf, &ierr));
  refused(yutrea(&h, &two, &two, buf, &ierr));  // entry 3 does not exist
  refused(yutrea(&dead, &one, &one, buf, &ierr));
  refused(yutinf(&dead, &out, &out2, &ierr));
  refused(yutmnc(&h, &minus, &ierr));
  refused(yutmnc(&dead, &one, &ierr));
  refused(yuttab(&h, &z, &index, &out, &ierr));  // selector 0
  const std::int32_t five = 5;
  refused(yuttab(&h, &five, &index, &out, &ierr));
  refused(yuttab(&dead, &three, &index, &out, &ierr));
  refused(yutcop(&dead, &out, &ierr));
  refused(yutend(&dead, &ierr));
  refused(yutend(&z, &ierr));
  EXPECT_EQ(out, -9);
  EXPECT_EQ(out2, -9);
  EXPECT_EQ(index, -9);
  EXPECT_EQ(buf[0], 7);
  ASSERT_EQ(yutinf(&h, &out, &out2, &ierr), 0);
  EXPECT_EQ(out2, 2);
  // Reads and writes of zero entries at the end are fine.
  EXPECT_EQ(yutrea(&h, &three, &z, buf, &ierr), 0);
  EXPECT_EQ(yutwri(&h, &three, &z, buf, &ierr), 0);
  end_table(h);
  EXPECT_EQ(orvq7sys_table_live(), live0);
}

TEST(Tables, InjectedRefusalsGiveCode36AndChangeNothing) {
  const std::int64_t live0 = orvq7sys_table_live_thread();
  const std::int32_t h = make_table(8, 1);
  const std::int32_t one = 1, two = 2;
  std::int32_t out = -9, ierr = 0;
  const double v = 3.0;
  orvq7sys_table_refuse(0, 4);
  EXPECT_EQ(yutini(&one, &one, &out, &ierr), 1);
  EXPECT_EQ(ierr, 36);
  EXPECT_EQ(yutwri(&h, &one, &one, &v, &ierr), 1);
  EXPECT_EQ(yutmnc(&h, &two, &ierr), 1);
  EXPECT_EQ(yutcop(&h, &out, &ierr), 1);
  EXPECT_EQ(ierr, 36);
  EXPECT_EQ(out, -9);
  // The injection is used up: reads never count, the next write succeeds.
  std::int32_t esize = 0, entries = 0;
  ASSERT_EQ(yutinf(&h, &esize, &entries, &ierr), 0);
  EXPECT_EQ(entries, 1);
  double got = -1.0;
  ASSERT_EQ(yutrea(&h, &one, &one, &got, &ierr), 0);
  EXPECT_EQ(bits(got), bits(0.0));
  EXPECT_EQ(yutwri(&h, &one, &one, &v, &ierr), 0);
  // Skipping: the next call goes through, the one after is refused.
  orvq7sys_table_refuse(1, 1);
  EXPECT_EQ(yutmnc(&h, &two, &ierr), 0);
  EXPECT_EQ(yutmnc(&h, &one, &ierr), 1);
  EXPECT_EQ(yutmnc(&h, &one, &ierr), 0);
  end_table(h);
  EXPECT_EQ(orvq7sys_table_live_thread(), live0);
}
