// tests/companions/system_test.cpp -- checks for companions/system: traceback, messages, code
// texts, workspace addressing and accounting, copy, fill and sorts, guarded contexts.
#include <gtest/gtest.h>

#include <cmath>
#include <cstring>
#include <limits>

#include "companions/data/data_api.h"
#include "support/recording_services.h"

TEST(Bftier, KeepsNameBytesAndLengthAsGiven) {
  RecordedFrames rec;
  const std::int32_t c1 = 4715, c2 = 250;
  bftier(&c1, "YNF2PO   ", 9);
  bftier(&c2, "XYZVOL;", 7);
  bftier(&c1, "ignored tail", 0);
  const std::vector<Frame> want = {
      {4715, "YNF2PO   ", 9}, {250, "XYZVOL;", 7}, {4715, "", 0}};
  EXPECT_EQ(rec.frames(), want);
}

TEST(Bftier, BoundedTracebackKeepsTheMostRecentAndCountsTheDropped) {
  RecordedFrames rec;
  for (std::int32_t i = 1; i <= ORVQ7SYS_TRACE_MAX + 5; ++i) bftier(&i, "ABC", 3);
  EXPECT_EQ(orvq7sys_trace_count(), ORVQ7SYS_TRACE_MAX);
  EXPECT_EQ(orvq7sys_trace_dropped(), 5);
  EXPECT_EQ(rec.frames().front().code, 6);
  EXPECT_EQ(rec.frames().back().code, ORVQ7SYS_TRACE_MAX + 5);
  std::int32_t code = -1, len = -1;
  char name[ORVQ7SYS_NAME_MAX];
  EXPECT_EQ(orvq7sys_trace_frame(0, &code, name, &len), 1);
  EXPECT_EQ(orvq7sys_trace_frame(ORVQ7SYS_TRACE_MAX + 1, &code, name, &len), 1);
  EXPECT_EQ(code, -1);
  // A name longer than what is kept: its length is still the one passed.
  orvq7sys_trace_clear();
  const std::string long_name(40, 'x');
  bftier(&code, long_name.data(), 40);
  ASSERT_EQ(rec.frames().size(), 1u);
  EXPECT_EQ(rec.frames()[0].len, 40);
  EXPECT_EQ(rec.frames()[0].name, std::string(ORVQ7SYS_NAME_MAX, 'x'));
}

TEST(Errmsg, LogsCodeAndSeverityPerThread) {
  orvq7sys_msg_clear();
  const std::int32_t code = 722, sev = 0;
  errmsg(&code, &sev);
  ASSERT_EQ(orvq7sys_msg_count(), 1);
  std::int32_t c = 0, s = -1;
  EXPECT_EQ(orvq7sys_msg_get(1, &c, &s), 0);
  EXPECT_EQ(c, 722);
  EXPECT_EQ(s, 0);
  EXPECT_EQ(orvq7sys_msg_get(2, &c, &s), 1);
  orvq7sys_msg_clear();
  EXPECT_EQ(orvq7sys_msg_count(), 0);
}

TEST(CodeText, NamesEveryCodeOfTheLibrary) {
  for (std::int32_t code : {0, 1, 2, 36, 116, 250, 722, 1036, 4701, 4702, 4703, 4704, 4707,
                            4709, 4710, 4712, 4713, 4715, 4716, 4717, 4718, 4720, 4721, 4722}) {
    EXPECT_STRNE(orvq7sys_code_text(code), "unknown code") << code;
  }
  EXPECT_STREQ(orvq7sys_code_text(4711), "unknown code");
  EXPECT_STREQ(orvq7sys_code_text(-1), "unknown code");
}

TEST(Altes, BlockIsAddressedFromTheBaseInUnitsOfItsType) {
  WorkspaceWatch ws;
  const std::int32_t types[] = {2, 3};
  for (std::int32_t type : types) {
    std::int32_t count = 37, handle = 0;
    std::int64_t index = 0;
    ASSERT_EQ(altes(dynar, &type, &count, &index, &handle), 0);
    EXPECT_NE(handle, 0);
    EXPECT_EQ(ws.outstanding(), 1);
    // Element k of the block is element index + k - 1 of dynar, counted from 1.
    const std::uintptr_t size = type == 2 ? 4 : 8;
    const std::uintptr_t first =
        reinterpret_cast<std::uintptr_t>(dynar) + static_cast<std::uintptr_t>(index - 1) * size;
    EXPECT_EQ(first % size, 0u);  // dynar is aligned, so the block is too
    std::memset(reinterpret_cast<void*>(first), 0x5a, static_cast<std::size_t>(count) * size);
    EXPECT_EQ(detes(&handle), 0);
    EXPECT_EQ(ws.outstanding(), 0);
  }
  EXPECT_EQ(ws.requests(), 2);
}

TEST(Altes, UnalignedBaseStillGivesAWholeNumberOfElements) {
  alignas(8) char area[16];
  void* base = area + 3;
  std::int32_t type = 3, count = 4, handle = 0;
  std::int64_t index = 0;
  ASSERT_EQ(altes(base, &type, &count, &index, &handle), 0);
  const std::uintptr_t first =
      reinterpret_cast<std::uintptr_t>(base) + static_cast<std::uintptr_t>(index - 1) * 8;
  std::memset(reinterpret_cast<void*>(first), 0, 32);  // the whole block is ours to write
  EXPECT_EQ(detes(&handle), 0);
}

TEST(Altes, RefusalsLeaveHandleAndIndexUnchanged) {
  WorkspaceWatch ws;
  std::int64_t index = 77;
  std::int32_t handle = 0, count = 10;
  for (std::int32_t bad_type : {0, 5, -3}) {
    EXPECT_EQ(altes(dynar, &bad_type, &count, &index, &handle), 1);
  }
  std::int32_t type = 3, negative = -1;
  EXPECT_EQ(altes(dynar, &type, &negative, &index, &handle), 1);
  std::int32_t held = 12345;  // a caller that still holds a block
  EXPECT_EQ(altes(dynar, &type, &count, &index, &held), 1);
  EXPECT_EQ(held, 12345);
  ws.refuse_next(2);
  EXPECT_EQ(altes(dynar, &type, &count, &index, &handle), 1);
  EXPECT_EQ(altes(dynar, &type, &count, &index, &handle), 1);
  EXPECT_EQ(handle, 0);
  EXPECT_EQ(index, 77);
  EXPECT_EQ(ws.outstanding(), 0);
  // The third request is granted again.
  ASSERT_EQ(altes(dynar, &type, &count, &index, &handle), 0);
  EXPECT_EQ(detes(&handle), 0);
  std::int32_t zero = 0;
  handle = 0;
  EXPECT_EQ(altes(dynar, &type, &zero, &index, &handle), 0);  // an empty block
  EXPECT_EQ(detes(&handle), 0);
}

TEST(Detes, ZeroHandleIsAcceptedAndUnknownOrReleasedHandleFails) {
  WorkspaceWatch ws;
  const std::int32_t zero = 0, unknown = 987654;
  EXPECT_EQ(detes(&zero), 0);
  EXPECT_EQ(detes(&unknown), 1);
  std::int32_t type = 2, count = 3, handle = 0;
  std::int64_t index = 0;
  ASSERT_EQ(altes(dynar, &type, &count, &index, &handle), 0);
  EXPECT_EQ(detes(&handle), 0);
  EXPECT_EQ(detes(&handle), 1);  // released twice: the second is refused, nothing freed
  EXPECT_EQ(ws.outstanding(), 0);
}

TEST(CopyAndFill, CopyCountsBytesAndFillUsesTheLowByte) {
  double src[3] = {1.5, -2.25, 3.0}, dst[3] = {0, 0, 0};
  std::int32_t n = 16;
  crccop(src, &n, dst);
  EXPECT_EQ(dst[0], 1.5);
  EXPECT_EQ(dst[1], -2.25);
  EXPECT_EQ(dst[2], 0.0);
  std::int32_t none = 0;
  crccop(src, &none, dst + 2);
  EXPECT_EQ(dst[2], 0.0);
  unsigned char bytes[4] = {9, 9, 9, 9};
  std::int32_t three = 3, fill = 0x1ff;
  crcmac(bytes, &three, &fill);
  EXPECT_EQ(bytes[0], 0xff);
  EXPECT_EQ(bytes[2], 0xff);
  EXPECT_EQ(bytes[3], 9);
}

TEST(Sorts, RowsByKeyStableAndRealsWithNaNLast) {
  std::int32_t table[] = {5, 1, 3, 0, 2, 3, 1, 2, 1, 4, 7, 5};  // 4 rows of 3, key 3
  std::int32_t m = 3, n = 4, key = 3, work[12];
  sori4(table, &m, &n, &key, work);
  const std::int32_t want[] = {1, 2, 1, 5, 1, 3, 0, 2, 3, 4, 7, 5};
  EXPECT_TRUE(std::equal(table, table + 12, want));
  std::int32_t bad_key = 4;
  sori4(table, &m, &n, &bad_key, work);
  EXPECT_TRUE(std::equal(table, table + 12, want));

  const double nan = std::numeric_limits<double>::quiet_NaN();
  double v[5] = {3.0, nan, -1.0, 0.0, -0.0};
  std::int32_t count = 5;
  sorr8(v, &count);
  EXPECT_EQ(v[0], -1.0);
  EXPECT_EQ(bits(v[1]), bits(0.0));  // equal values keep their order
  EXPECT_EQ(bits(v[2]), bits(-0.0));
  EXPECT_EQ(v[3], 3.0);
  EXPECT_TRUE(std::isnan(v[4]));
}

TEST(Giufin, RecordsTheErrorHeldInGmacerOnlyForNonZeroStatus) {
  RecordedFrames rec;
  std::memcpy(gmacer, "GUMIN3  ", 8);
  EXPECT_EQ(giuope(nullptr, nullptr, nullptr, nullptr), 0);
  const std::int32_t ok = 0, singular = 104;
  EXPECT_EQ(giufin(&ok, nullptr) & 1, 0);
  EXPECT_TRUE(rec.empty());
  EXPECT_EQ(giufin(&singular, nullptr) & 1, 1);
  const std::int32_t one = 1;
  giuclo(&one);
  const std::vector<Frame> want = {{104, "GUMIN3  ", 8}};
  EXPECT_EQ(rec.frames(), want);
}
