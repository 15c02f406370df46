// tests/path/storage_test.cpp -- checks for path/storage.cpp: wncflu, wncfst, yncrea, yncend.
#include <gtest/gtest.h>

#include <cstdint>
#include <vector>

#include "curves.h"

namespace {

// Stores the march record's point with the given flush phase and accepted flag.
std::int32_t flush(PathRecords& r, std::int32_t phase, std::int32_t accepted) {
  return wncflu(&phase, &accepted, &r.options, &r.layout, &r.march, &r.tables, &r.itab, &r.ierr);
}

// Moves the march record to the point (a, b) with tangent (b, -a).
void move_to(PathRecords& r, double a, double b) {
  r.march.x[0] = a, r.march.x[1] = b;
  r.march.t[0] = b, r.march.t[1] = -a;
}

std::int32_t count_of(std::int32_t itab, std::int32_t kind) {
  std::int32_t h = -1, count = -1, ierr = -1;
  EXPECT_EQ(yncrea(&itab, &kind, &h, &count, &ierr), 0) << kind;
  return count;
}

TEST(Wncflu, AppendsSkipsAndReplacesThenRecordsTheCounts) {
  PathRecords r(2, 4, 2 + 8);  // kinds 23, 1, 2, 3
  ASSERT_EQ(r.result, 0);
  const std::int64_t live0 = orvq7sys_table_live();
  r.march.nstored = 1;
  move_to(r, 1.5, 2.5);
  ASSERT_EQ(flush(r, 0, 1), 0);  // the start point creates the result
  ASSERT_NE(r.itab, 0);
  move_to(r, 3.25, -4.75);
  ASSERT_EQ(flush(r, 1, 1), 0);
  move_to(r, 9.0, 9.0);
  ASSERT_EQ(flush(r, 1, 0), 0);  // not stored
  move_to(r, 5.125, 6.0);
  ASSERT_EQ(flush(r, 2, 2), 0);  // the end point replaces point 2
  EXPECT_EQ(r.march.nstored, 2);
  EXPECT_EQ(orvq7sys_table_live(), live0 + 5);
  // Every triple records 2 entries at the end; points 1 and 2 with their numbers and phases.
  for (std::int32_t kind : {23, 1, 2, 3}) EXPECT_EQ(count_of(r.itab, kind), 2) << kind;
  std::int32_t count = 0;
  const auto k23 = read_kind(r.itab, 23, &count);
  const double want23[8] = {1.5, 2.5, 2.5, -1.5, 5.125, 6.0, 6.0, -5.125};
  ASSERT_EQ(k23.size(), sizeof want23);
  for (int k = 0; k < 8; ++k) EXPECT_EQ(value_at<double>(k23, k), want23[k]) << k;
  const auto phases = read_kind(r.itab, 1, &count);
  const auto numbers = read_kind(r.itab, 2, &count);
  EXPECT_EQ(value_at<std::int32_t>(phases, 0), 0);
  EXPECT_EQ(value_at<std::int32_t>(phases, 1), 2);
  EXPECT_EQ(value_at<std::int32_t>(numbers, 1), 2);
  EXPECT_EQ(value_at<double>(read_kind(r.itab, 3, &count), 3), 6.0);
  // The handles of the new result, slot by slot.
  std::int32_t h = 0, ierr = 0;
  const std::int32_t kind23 = 23;
  ASSERT_EQ(yncrea(&r.itab, &kind23, &h, &count, &ierr), 0);
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
  r.march.hprev = 1e38;
  r.march.close = -0.375;
  r.march.sign = -1;
  r.march.c[0] = 0.5, r.march.c[1] = -2.0;
  ASSERT_EQ(flush(r, 0, 1), 0);
  r.march.hprev = 0.0625;
  ASSERT_EQ(flush(r, 2, 1), 0);
  std::int32_t count = 0;
  const auto k22 = read_kind(r.itab, 22, &count);
  EXPECT_EQ(count, 2);
  const double want22[4] = {0.0, -0.375, 0.0625, -0.375};
  ASSERT_EQ(k22.size(), sizeof want22);
  for (int k = 0; k < 4; ++k) EXPECT_EQ(value_at<double>(k22, k), want22[k]) << k;
  EXPECT_EQ(value_at<std::int32_t>(read_kind(r.itab, 1, &count), 1), -1);
  EXPECT_EQ(value_at<double>(read_kind(r.itab, 2, &count), 1), 0.0625);
  EXPECT_EQ(value_at<double>(read_kind(r.itab, 3, &count), 3), -2.0);
  std::int32_t ierr = 0;
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
  std::int32_t h = -1, count = -1, ierr = -1;
  const std::int32_t kind3 = 3;
  ASSERT_EQ(yncrea(&r.itab, &kind3, &h, &count, &ierr), 0);
  EXPECT_EQ(h, 0);
  EXPECT_EQ(count, 0);
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
  const std::vector<Frame> want = {{4712, " YNCREA ", 8}, {4712, " YNCREA ", 8}};
  EXPECT_EQ(frames.frames(), want);
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
  // Flags out of range.
  EXPECT_EQ(flush(r, 3, 1), 1);
  EXPECT_EQ(r.ierr, 4712);
  EXPECT_EQ(flush(r, 1, -1), 1);
  EXPECT_EQ(r.ierr, 4712);
}

}  // namespace
