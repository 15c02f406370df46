// tests/frame/frame_test.cpp -- checks for frame/: registration at load, the exported items,
// cbkver's use of the workspace and its traceback frame, the tolerance accessor.
#include <gtest/gtest.h>

#include "companions/data/data_api.h"
#include "companions/framework/framework_api.h"
#include "frame/frame_api.h"
#include "frame/tolerances.h"
#include "support/recording_services.h"

TEST(Load, RegistersOnceWithItsIdentifierAndExportsItsItems) {
  EXPECT_EQ(orvzel_loading_count(ORVQ7_LIBRARY_ID), 1);
  EXPECT_EQ(orvzel_loading_count(18), 0);
  EXPECT_EQ(OrvZelLibrary, 1);
  EXPECT_EQ(OrvZelInternalOrvQ7Maths(), 1);
}

TEST(Cbkver, TakesAndReleasesOneBlockAndRecordsNoFrame) {
  RecordedFrames rec;
  WorkspaceWatch ws;
  orvq7sys_msg_clear();
  EXPECT_EQ(cbkver(), 0);
  EXPECT_EQ(ws.requests(), 1);
  EXPECT_EQ(ws.outstanding(), 0);
  EXPECT_TRUE(rec.empty());
  EXPECT_EQ(orvq7sys_msg_count(), 1);  // the version record
}

TEST(Cbkver, RefusedBlockGivesOneFrameWith1036) {
  RecordedFrames rec;
  WorkspaceWatch ws;
  ws.refuse_next(1);
  EXPECT_EQ(cbkver(), 1);
  EXPECT_EQ(ws.outstanding(), 0);
  const std::vector<Frame> want = {{1036, "CBKVER  ", 8}};
  EXPECT_EQ(rec.frames(), want);
}

TEST(Tolerances, ReadFromTheCurrentSetAtEveryCall) {
  const std::int64_t shift = decale[4];
  EXPECT_EQ(impl::tol(4), 1e-10);  // the default set
  EXPECT_EQ(impl::tol(12), 1e-8);
  toler[40 + 11] = 0.125;          // a host's own set at shift 40
  decale[4] = 40;
  EXPECT_EQ(impl::tol(12), 0.125);
  decale[4] = shift;
  toler[40 + 11] = 0.0;
  EXPECT_EQ(impl::tol(12), 1e-8);
}
