// tests/tools/output_test.cpp -- checks for tools/orvq7/input.cpp, output.cpp and
// picture.cpp: typed numbers and ranges, CSV read back to the bit, escaped pictures.
#include "output.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstring>
#include <limits>
#include <string>

#include "input.h"
#include "picture.h"

namespace {

using orvq7tool::ToolError;

std::string error_of(void (*f)()) {
  try {
    f();
  } catch (const ToolError& e) {
    return e.what();
  }
  return "";
}

TEST(Input, ListsAndRangesAcceptWhatTheyShouldAndNameWhatTheyRefuse) {
  EXPECT_EQ(orvq7tool::parse_list(" 1.5, -2e-3 ,+4", "v"), (std::vector<double>{1.5, -2e-3, 4}));
  const auto all = orvq7tool::parse_ranges("-2.5:3", 3, "box");
  EXPECT_EQ(all.lower, (std::vector<double>{-2.5, -2.5, -2.5}));
  EXPECT_EQ(all.upper, (std::vector<double>{3, 3, 3}));
  const auto each = orvq7tool::parse_ranges("0:1,-1:0.5", 2, "box");
  EXPECT_EQ(each.lower, (std::vector<double>{0, -1}));
  EXPECT_EQ(each.upper, (std::vector<double>{1, 0.5}));
  EXPECT_EQ(error_of([] { orvq7tool::parse_list("1,,2", "start"); }), "start: a number is missing");
  EXPECT_EQ(error_of([] { orvq7tool::parse_list("1,2x", "start"); }),
            "start: '2x' is not a number");
  EXPECT_EQ(error_of([] { orvq7tool::parse_list("1,nan", "start"); }),
            "start: 'nan' is not a finite number");
  EXPECT_EQ(error_of([] { orvq7tool::parse_list("1e999", "start"); }),
            "start: '1e999' is out of the range of a double");
  EXPECT_EQ(error_of([] { orvq7tool::parse_ranges("1:1", 2, "box"); }),
            "box: range '1:1' has lo >= hi");
  EXPECT_EQ(error_of([] { orvq7tool::parse_ranges("0:1,0:1", 3, "box"); }),
            "box: 2 ranges given, expected 1 or 3 (lo:hi each)");
  EXPECT_EQ(error_of([] { orvq7tool::parse_ranges("0-1", 1, "box"); }),
            "box: '0-1' is not a range lo:hi");
  EXPECT_EQ(error_of([] { orvq7tool::parse_names("x,2y", "unknowns"); }),
            "unknowns: '2y' is not a name (letters, digits, _)");
  EXPECT_EQ(error_of([] { orvq7tool::parse_names("x,y,x", "unknowns"); }),
            "unknowns: 'x' appears twice");
}

TEST(Input, CsvSkipsCommentsAndBlankLinesAndNamesTheBadLine) {
  const auto t = orvq7tool::read_csv("# points\r\nx, y, z\r\n\r\n1,2,3\r\n-4, 5e-1 ,6\r\n", "f");
  EXPECT_EQ(t.header, (std::vector<std::string>{"x", "y", "z"}));
  ASSERT_EQ(t.rows.size(), 2u);
  EXPECT_EQ(t.rows[1], (std::vector<double>{-4, 0.5, 6}));
  EXPECT_EQ(orvq7tool::read_csv("1,2\n3,4\n", "f").header.size(), 0u);
  EXPECT_EQ(error_of([] { orvq7tool::read_csv("x,y\n1,2\n3\n", "pts.csv"); }),
            "pts.csv:3: 1 fields, expected 2");
  EXPECT_EQ(error_of([] { orvq7tool::read_csv("1,2\n3,four\n", "pts.csv"); }),
            "pts.csv:2: field 2: 'four' is not a number");
}

TEST(Output, PointsReadBackFromTheCsvToTheBit) {
  orvq7tool::EquationSystem system({"u", "v"}, {"u - v"});
  orvq7tool::TraceResult r;
  r.n = 2;
  r.points = {0.1 + 0.2, -0.0, 1e-300, std::nextafter(1.0, 2.0), -123456.789e10, 5e-324};
  r.tangents = {1, 0, std::sqrt(0.5), -std::sqrt(0.5), 0, 1};
  r.phases = {0, 1, 2};
  const std::string csv = orvq7tool::points_csv(system, r);
  const auto t = orvq7tool::read_csv(csv, "csv");
  EXPECT_EQ(t.header, (std::vector<std::string>{"point", "phase", "u", "v", "t_u", "t_v"}));
  ASSERT_EQ(t.rows.size(), 3u);
  for (std::size_t j = 0; j < 3; ++j) {
    EXPECT_EQ(t.rows[j][0], static_cast<double>(j + 1));
    EXPECT_EQ(t.rows[j][1], r.phases[j]);
    for (std::size_t i = 0; i < 2; ++i) {
      EXPECT_EQ(std::memcmp(&t.rows[j][2 + i], &r.points[2 * j + i], 8), 0) << csv;
      EXPECT_EQ(std::memcmp(&t.rows[j][4 + i], &r.tangents[2 * j + i], 8), 0) << csv;
    }
  }
}

TEST(Picture, EscapesTextAndLeavesOutPointsThatAreNotNumbers) {
  orvq7tool::Picture p;
  p.title = "a<b & \"c\"";
  p.caption = {"x > 0 & y < 1"};
  p.xlabel = "x";
  p.ylabel = "y";
  p.xs = {0.25, std::numeric_limits<double>::quiet_NaN(), 0.75};
  p.ys = {0.5, 0.5, std::numeric_limits<double>::infinity()};
  p.end_label = "<end>";
  const std::string svg = orvq7tool::render_svg(p);
  EXPECT_NE(svg.find("a&lt;b &amp; &quot;c&quot;"), std::string::npos);
  EXPECT_NE(svg.find("x &gt; 0 &amp; y &lt; 1"), std::string::npos);
  EXPECT_EQ(svg.find("<end>"), std::string::npos);
  EXPECT_EQ(svg.find("nan"), std::string::npos);
  EXPECT_EQ(svg.find("inf"), std::string::npos);
  EXPECT_EQ(svg.rfind("</svg>\n"), svg.size() - 7);
}

}  // namespace
