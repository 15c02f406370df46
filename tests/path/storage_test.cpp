// tests/path/storage_test.cpp -- checks for path/storage.cpp: wncflu, wncfst, yncrea, yncend.
#include <gtest/gtest.h>

#include <cstdint>
#include <vector>

#include "curves.h"

namespace {

// Stores the march record's point, first moved to (a, b) with tangent (b, -a) when given.
std::int32_t flush(PathRecords& r, std::int32_t phase, std::int32_t accepted,
                   std::vector<double> ab = {}) {
  if (!ab.empty()) {
    r.march.x[0] = ab[0], r.march.x[1] = ab[1];
    r.march.t[0] = ab[1], r.march.t[1] = -ab[0];
  }
  return wncflu(&phase, &accepted, &r.options, &r.layout, &r.march, &r.tables, &r.itab, &r.ierr);
}

std::int32_t count_of(std::int32_t itab, std::int32_t kind, std::int32_t* handle = nullptr) {
  std::int32_t h = -1, count = -1, ierr = -1;
  EXPECT_EQ(yncrea(&itab, &kind, &h, &count, &ierr), 0) << kind;
  if (handle != nullptr) *handle = h;
  return count;
}

TEST(Wncflu, AppendsSkipsAndReplacesThenRecordsTheCounts) {
  PathRecords r(2, 4, 2 + 8);  // kinds 23, 1, 2, 3
  ASSERT_EQ(r.result, 0);
  const std::int64_t live0 = orvq7sys_table_live();
  r.march.nstored = 1;
  ASSERT_EQ(flush(r, 0, 1, {1.5, 2.5}), 0);  // the start point creates the result
  ASSERT_NE(r.itab, 0);
  ASSERT_EQ(flush(r, 1, 1, {3.25, -4.75}), 0);
  ASSERT_EQ(flush(r, 1, 0, {9.0, 9.0}), 0);    // not stored
  ASSERT_EQ(flush(r, 2, 2, {5.125, 6.0}), 0);  // the end point replaces point 2
  EXPECT_EQ(r.march.nstored, 2);
  EXPECT_EQ(orvq7sys_table_live(), live0 + 5);
  // Every triple records 2 entries at the end; points 1 and 2 with their numbers and phases.
  for (std::int32_t kind : {23, 1, 2, 3}) EXPECT_EQ(count_of(r.itab, kind), 2) << kind;
  std::int32_t count = 0, h = 0, ierr = 0;
  EXPECT_EQ(read_kind<double>(r.itab, 23, &count),
            (std::vector<double>{1.5, 2.5, 2.5, -1.5, 5.125, 6.0, 6.0, -5.125}));
  EXPECT_EQ(read_kind<std::int32_t>(r.itab, 1, &count), (std::vector<std::int32_t>{0, 2}));
  EXPECT_EQ(read_kind<std::int32_t>(r.itab, 2, &count), (std::vector<std::int32_t>{1, 2}));
  EXPECT_EQ(read_kind<double>(r.itab, 3, &count), (std::vector<double>{1.5, 2.5, 5.125, 6.0}));
  // The handles of the new result, slot by slot.
  count_of(r.itab, 23, &h);
  EXPECT_EQ(r.tables.master, r.itab);
  EXPECT_EQ(r.tables.sub[1], h);
  EXPECT_EQ(r.tables.sub[0], 0);
  EXPECT_EQ(yncend(&r.itab, &ierr), 0);
  EXPECT_EQ(orvq7sys_table_live(), live0);
}

TEST(Wncflu, PathOfOnePointEndsWithCountOne) {
  // The step collapses at once: phase 2 with nothing to store still records the counts.
  PathRecords r(3, 4, 2 + 32);
  r.march.nstored = 1;
  ASSERT_EQ(flush(r, 0, 1), 0);
  EXPECT_EQ(count_of(r.itab, 2), 0);
  ASSERT_EQ(flush(r, 2, 0), 0);
  EXPECT_EQ(count_of(r.itab, 2), 1);
  EXPECT_EQ(count_of(r.itab, 23), 1);
  std::int32_t ierr = 0;
  EXPECT_EQ(yncend(&r.itab, &ierr), 0);
}

TEST(Wncflu, ExtremumLayoutStoresStepClosureSignAndC) {
  // Kind 22 = (step f*H, closure value); second group = (sign, step, c). The start point
  // stores the step as 0.
  PathRecords r(2, 2, 1 + 128 + 256 + 512, 2);
  ASSERT_EQ(r.result, 0);
  r.march.nstored = 1;
  r.march.hprev = 1e38, r.march.close = -0.375, r.march.sign = -1;
  r.march.c[0] = 0.5, r.march.c[1] = -2.0;
  ASSERT_EQ(flush(r, 0, 1), 0);
  r.march.hprev = 0.0625;
  ASSERT_EQ(flush(r, 2, 1), 0);
  std::int32_t count = 0, ierr = 0;
  EXPECT_EQ(read_kind<double>(r.itab, 22, &count),
            (std::vector<double>{0.0, -0.375, 0.0625, -0.375}));
  EXPECT_EQ(count, 2);
  EXPECT_EQ(read_kind<std::int32_t>(r.itab, 1, &count), (std::vector<std::int32_t>{-1, -1}));
  EXPECT_EQ(read_kind<double>(r.itab, 2, &count), (std::vector<double>{0.0, 0.0625}));
  EXPECT_EQ(read_kind<double>(r.itab, 3, &count), (std::vector<double>{0.5, -2.0, 0.5, -2.0}));
  EXPECT_EQ(yncend(&r.itab, &ierr), 0);
}

TEST(Yncend, ReleasesOnlyTheSubTablesThatExist) {
  // First form, store bit 3 only of the group: kinds 2 and 3 keep handle 0 and count 0.
  PathRecords r(2, 1, 1 + 8, 2);
  ASSERT_EQ(r.result, 0);
  const std::int64_t live0 = orvq7sys_table_live();
  ASSERT_EQ(flush(r, 0, 1), 0);
  ASSERT_EQ(flush(r, 2, 1), 0);
  EXPECT_EQ(orvq7sys_table_live(), live0 + 3);  // master, kind 22, kind 1
  std::int32_t h = -1, ierr = -1;
  EXPECT_EQ(count_of(r.itab, 3, &h), 0);
  EXPECT_EQ(h, 0);
  EXPECT_EQ(count_of(r.itab, 1), 2);
  EXPECT_EQ(yncend(&r.itab, &ierr), 0);
  EXPECT_EQ(orvq7sys_table_live(), live0);
  const std::int32_t none = 0;
  EXPECT_EQ(yncend(&none, &ierr), 0);
  EXPECT_EQ(ierr, 0);
}

TEST(Yncrea, MissingKindGives4712WithItsFrameAndLeavesOutputs) {
  PathRecords r(2, 4, 2);  // kind 23 only
  ASSERT_EQ(flush(r, 0, 1), 0);
  RecordedFrames frames;
  std::int32_t h = -5, count = -6, ierr = 0;
  const std::int32_t kind2[2] = {2, 23};  // only the first element is the kind
  EXPECT_EQ(yncrea(&r.itab, kind2, &h, &count, &ierr), 1);
  EXPECT_EQ(ierr, 4712);
  EXPECT_EQ(h, -5);
  EXPECT_EQ(count, -6);
  const std::int32_t none = 0;
  EXPECT_EQ(yncrea(&none, kind2 + 1, &h, &count, &ierr), 1);  // an absent result is empty
  EXPECT_EQ(frames.frames(), (std::vector<Frame>{{4712, " YNCREA ", 8}, {4712, " YNCREA ", 8}}));
  EXPECT_EQ(yncend(&r.itab, &ierr), 0);
}

TEST(Wncfst, RefusedTablesLeaveNothingBehind) {
  PathRecords r(2, 4, 2 + 8);
  r.march.nstored = 1;
  const std::int64_t live0 = orvq7sys_table_live();
  // Creation: the master and the first sub-table (created and written) go through, the
  // second sub-table is refused; everything made is released and itab stays 0.
  orvq7sys_table_refuse(3, 1);
  EXPECT_EQ(flush(r, 0, 1), 1);
  EXPECT_EQ(r.ierr, 36);
  EXPECT_EQ(r.itab, 0);
  EXPECT_EQ(orvq7sys_table_live(), live0);
  // A later point: the first extension is refused; the result stays whole for yncend.
  ASSERT_EQ(flush(r, 0, 1), 0);
  orvq7sys_table_refuse(0, 1);
  EXPECT_EQ(flush(r, 1, 1), 1);
  EXPECT_EQ(r.ierr, 36);
  EXPECT_EQ(r.march.nstored, 1);
  std::int32_t ierr = 0;
  EXPECT_EQ(yncend(&r.itab, &ierr), 0);
  EXPECT_EQ(orvq7sys_table_live(), live0);
  for (const auto& [phase, accepted] : {std::pair{3, 1}, std::pair{1, -1}}) {  // out of range
    EXPECT_EQ(flush(r, phase, accepted), 1);
    EXPECT_EQ(r.ierr, 4712);
  }
}

}  // namespace
