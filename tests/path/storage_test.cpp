// tests/path/storage_test.cpp -- checks for path/storage.cpp: wncflu, wncfst, yncrea, yncend.
#include "curves.h"

std::int32_t count_of(std::int32_t itab, std::int32_t kind, std::int32_t* h) {
  std::int32_t count = -1, ierr = -1;
  EXPECT_EQ(yncrea(&itab, &kind, h, &count, &ierr), 0) << kind;
  return count;
}

TEST(Wncflu, AppendsSkipsAndReplacesThenRecordsTheCounts) {
  PathRecords r(2, 4, 2 + 8);  // kinds 23, 1, 2, 3
  ASSERT_EQ(r.result, 0);
  const std::int64_t live0 = orvq7sys_table_live();
  r.march.nstored = 1;
  // Points (a, b) with tangent (b, -a): the start point creates the result; the third is not
  // stored; the end point replaces the second.
  const struct { double a, b; int phase, accepted; } points[] = {
      {1.5, 2.5, 0, 1}, {3.25, -4.75, 1, 1}, {9.0, 9.0, 1, 0}, {5.125, 6.0, 2, 2}};
  for (const auto& p : points) {
    r.march.x[0] = p.a, r.march.x[1] = p.b, r.march.t[0] = p.b, r.march.t[1] = -p.a;
    ASSERT_EQ(r.flush(p.phase, p.accepted), 0);
  }
  EXPECT_EQ(r.march.nstored, 2);
  EXPECT_EQ(orvq7sys_table_live(), live0 + 5);
  // Every triple records 2 entries at the end; points 1 and 2 with their numbers and phases.
  std::int32_t h[4] = {}, kinds[4] = {23, 1, 2, 3}, ierr = 0;
  for (int k = 0; k < 4; ++k) EXPECT_EQ(count_of(r.itab, kinds[k], h + k), 2) << kinds[k];
  EXPECT_EQ(read_kind<double>(r.itab, 23), (Reals{1.5, 2.5, 2.5, -1.5, 5.125, 6, 6, -5.125}));
  EXPECT_EQ(read_kind<std::int32_t>(r.itab, 1), (Ints{0, 2}));
  EXPECT_EQ(read_kind<std::int32_t>(r.itab, 2), (Ints{1, 2}));
  EXPECT_EQ(read_kind<double>(r.itab, 3), (Reals{1.5, 2.5, 5.125, 6.0}));
  // The handles of the new result, slot by slot.
  EXPECT_EQ((Ints{r.tables.master, r.tables.sub[0], r.tables.sub[1], r.tables.sub[3]}),
            (Ints{r.itab, 0, h[0], h[1]}));
  EXPECT_EQ(yncend(&r.itab, &ierr), 0);
  EXPECT_EQ(orvq7sys_table_live(), live0);
}

TEST(Wncflu, ExtremumLayoutStoresStepClosureSignAndC) {
  // Kind 22 = (step f*H, closure value); second group = (sign, step, c). The start point
  // stores the step as 0.
  PathRecords r(2, 2, 1 + 128 + 256 + 512, 2);
  ASSERT_EQ(r.result, 0);
  r.march.nstored = 1, r.march.hprev = 1e38, r.march.close = -0.375, r.march.sign = -1;
  r.march.c[0] = 0.5, r.march.c[1] = -2.0;
  ASSERT_EQ(r.flush(0, 1), 0);
  r.march.hprev = 0.0625;
  ASSERT_EQ(r.flush(2, 1), 0);
  std::int32_t count = 0, ierr = 0;
  EXPECT_EQ(read_kind<double>(r.itab, 22, &count), (Reals{0.0, -0.375, 0.0625, -0.375}));
  EXPECT_EQ(count, 2);
  EXPECT_EQ(read_kind<std::int32_t>(r.itab, 1), (Ints{-1, -1}));
  EXPECT_EQ(read_kind<double>(r.itab, 2), (Reals{0.0, 0.0625}));
  EXPECT_EQ(read_kind<double>(r.itab, 3), (Reals{0.5, -2.0, 0.5, -2.0}));
  EXPECT_EQ(yncend(&r.itab, &ierr), 0);
}

TEST(Yncend, ReleasesOnlyTheSubTablesThatExist) {
  // First form, store bit 3 only of the group: kinds 2 and 3 keep handle 0 and count 0.
  PathRecords r(2, 1, 1 + 8, 2);
  ASSERT_EQ(r.result, 0);
  const std::int64_t live0 = orvq7sys_table_live();
  ASSERT_EQ(r.flush(0, 1), 0);
  ASSERT_EQ(r.flush(2, 1), 0);
  EXPECT_EQ(orvq7sys_table_live(), live0 + 3);  // master, kind 22, kind 1
  std::int32_t h = -1, ierr = -1, h1 = -1;
  EXPECT_EQ((Ints{count_of(r.itab, 3, &h), h, count_of(r.itab, 1, &h1)}), (Ints{0, 0, 2}));
  // A kind not kept gives 4712 with yncrea's frame and leaves the outputs; so does any kind
  // of an absent result. Only the first element of `kind` is read.
  RecordedFrames frames;
  std::int32_t h2 = -5, count = -6;
  const std::int32_t kinds[2] = {23, 1}, none = 0;
  EXPECT_EQ((Ints{yncrea(&r.itab, kinds, &h2, &count, &ierr), ierr}), (Ints{1, 4712}));
  EXPECT_EQ(yncrea(&none, kinds + 1, &h2, &count, &ierr), 1);
  EXPECT_EQ((Ints{h2, count}), (Ints{-5, -6}));
  EXPECT_EQ(frames.frames(), (std::vector<Frame>{{4712, " YNCREA ", 8}, {4712, " YNCREA ", 8}}));
  EXPECT_EQ(yncend(&r.itab, &ierr), 0);
  EXPECT_EQ(orvq7sys_table_live(), live0);
  EXPECT_EQ((Ints{yncend(&none, &ierr), ierr}), (Ints{0, 0}));
}

TEST(Wncfst, RefusedTablesLeaveNothingBehind) {
  PathRecords r(2, 4, 2 + 8);
  r.march.nstored = 1;
  const std::int64_t live0 = orvq7sys_table_live();
  // Creation: the master and the first sub-table (created and written) go through, the
  // second sub-table is refused; everything made is released and itab stays 0.
  orvq7sys_table_refuse(3, 1);
  EXPECT_EQ((Ints{r.flush(0, 1), r.ierr, r.itab}), (Ints{1, 36, 0}));
  EXPECT_EQ(orvq7sys_table_live(), live0);
  // A later point: the first extension is refused; the result stays whole for yncend.
  ASSERT_EQ(r.flush(0, 1), 0);
  orvq7sys_table_refuse(0, 1);
  EXPECT_EQ((Ints{r.flush(1, 1), r.ierr, r.march.nstored}), (Ints{1, 36, 1}));
  std::int32_t ierr = 0;
  EXPECT_EQ(yncend(&r.itab, &ierr), 0);
  EXPECT_EQ(orvq7sys_table_live(), live0);
  EXPECT_EQ((Ints{r.flush(3, 1), r.ierr, r.flush(1, -1), r.ierr}), (Ints{1, 4712, 1, 4712}));
}
