// tools/orvq7/picture.h -- an SVG picture of a traced path projected on two of its unknowns:
// the box drawn, the path with its points, start (with its direction) and end marked, and
// the closure or the face through which the path left named.
#pragma once
#include <string>
#include <vector>

namespace orvq7tool {

struct Picture {
  std::string title;
  std::vector<std::string> caption;               // lines under the title
  std::string xlabel, ylabel;                     // names of the two unknowns shown
  double xmin = 0, xmax = 1, ymin = 0, ymax = 1;  // the box on those two unknowns
  std::vector<double> xs, ys;                     // the path's points, projected
  double dir_x = 0, dir_y = 0;                    // start direction, projected (both 0: not drawn)
  bool closed = false;                            // the path closed on its start
  // Box edge through which the path left, when that face is one of the two shown:
  // -1 none, 0 x = xmin, 1 x = xmax, 2 y = ymin, 3 y = ymax.
  int exit_edge = -1;
  std::string end_label;  // text beside the end mark
};

// The picture as a complete SVG document (UTF-8, well-formed XML).
std::string render_svg(const Picture& picture);

// Escapes &, <, >, " and ' for XML text and attribute values.
std::string xml_escape(const std::string& text);

}  // namespace orvq7tool
