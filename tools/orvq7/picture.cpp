// tools/orvq7/picture.cpp -- SVG rendering of a projected path.
#include "picture.h"

#include <fmt/format.h>

#include <algorithm>
#include <cmath>

namespace orvq7tool {
namespace {

constexpr double kWidth = 640.0;
constexpr double kPlotLeft = 80.0, kPlotRight = 40.0, kPlotBottom = 60.0;
constexpr double kLine = 18.0;         // height of a line of text
constexpr double kMaxRatio = 4.0;      // beyond this ratio the axes get separate scales
constexpr std::size_t kMaxDots = 400;  // more points than this: the line alone
constexpr double kArrow = 36.0;        // length of the start-direction arrow, pixels

// Numbers of the picture, short and without a trailing ".0".
std::string num(double v) { return fmt::format("{:.6g}", v); }
std::string px(double v) { return fmt::format("{:.1f}", v); }

}  // namespace

std::string xml_escape(const std::string& text) {
  std::string out;
  for (char c : text) {
    switch (c) {
      case '&':
        out += "&amp;";
        break;
      case '<':
        out += "&lt;";
        break;
      case '>':
        out += "&gt;";
        break;
      case '"':
        out += "&quot;";
        break;
      case '\'':
        out += "&apos;";
        break;
      default:
        // Control characters are not allowed in XML 1.0 text.
        out += (static_cast<unsigned char>(c) < 0x20 && c != '\n' && c != '\t') ? ' ' : c;
    }
  }
  return out;
}

std::string render_svg(const Picture& p) {
  // Layout: title and caption at the top, then a square-ish plot area.
  const double top = 30.0 + kLine * (1.0 + static_cast<double>(p.caption.size())) + 10.0;
  const double plot_w = kWidth - kPlotLeft - kPlotRight;
  const double plot_h = 440.0;
  const double height = top + plot_h + kPlotBottom;

  // Scale: the box with a 4% margin; equal scales unless the box is very elongated.
  double rx = p.xmax - p.xmin, ry = p.ymax - p.ymin;
  if (!(rx > 0.0) || !std::isfinite(rx)) rx = 1.0;
  if (!(ry > 0.0) || !std::isfinite(ry)) ry = 1.0;
  double sx = plot_w / (1.08 * rx), sy = plot_h / (1.08 * ry);
  if (rx / ry <= kMaxRatio && ry / rx <= kMaxRatio) sx = sy = std::min(sx, sy);
  const double cx = kPlotLeft + plot_w / 2.0, cy = top + plot_h / 2.0;
  const double mx = (p.xmin + p.xmax) / 2.0, my = (p.ymin + p.ymax) / 2.0;
  auto X = [&](double x) { return cx + (x - mx) * sx; };
  auto Y = [&](double y) { return cy - (y - my) * sy; };
  const double bx0 = X(p.xmin), bx1 = X(p.xmax), by0 = Y(p.ymax), by1 = Y(p.ymin);

  std::string s;
  s += "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n";
  s += fmt::format(
      "<svg xmlns=\"http://www.w3.org/2000/svg\" width=\"{0}\" height=\"{1}\" "
      "viewBox=\"0 0 {0} {1}\" font-family=\"DejaVu Sans, Arial, sans-serif\" "
      "font-size=\"13\">\n",
      px(kWidth), px(height));
  s += fmt::format("<title>{}</title>\n", xml_escape(p.title));
  s += "<defs><marker id=\"arrow\" viewBox=\"0 0 10 10\" refX=\"9\" refY=\"5\" "
       "markerWidth=\"7\" markerHeight=\"7\" orient=\"auto\"><path d=\"M0,0 L10,5 L0,10 z\" "
       "fill=\"#2e8b3e\"/></marker></defs>\n";
  s += fmt::format("<rect width=\"{}\" height=\"{}\" fill=\"#ffffff\"/>\n", px(kWidth), px(height));
  s += fmt::format("<text x=\"20\" y=\"30\" font-size=\"17\" font-weight=\"bold\">{}</text>\n",
                   xml_escape(p.title));
  for (std::size_t i = 0; i < p.caption.size(); ++i)
    s += fmt::format("<text x=\"20\" y=\"{}\" fill=\"#333333\">{}</text>\n",
                     px(30.0 + kLine * static_cast<double>(i + 1)), xml_escape(p.caption[i]));

  // The box, its bounds and the names of the two unknowns.
  s += fmt::format(
      "<rect x=\"{}\" y=\"{}\" width=\"{}\" height=\"{}\" fill=\"#f3f5f9\" stroke=\"#555555\" "
      "stroke-width=\"1.2\"/>\n",
      px(bx0), px(by0), px(bx1 - bx0), px(by1 - by0));
  s += fmt::format("<text x=\"{}\" y=\"{}\" text-anchor=\"middle\">{}</text>\n", px(bx0),
                   px(by1 + 18), num(p.xmin));
  s += fmt::format("<text x=\"{}\" y=\"{}\" text-anchor=\"middle\">{}</text>\n", px(bx1),
                   px(by1 + 18), num(p.xmax));
  s += fmt::format("<text x=\"{}\" y=\"{}\" text-anchor=\"end\">{}</text>\n", px(bx0 - 6),
                   px(by1 + 4), num(p.ymin));
  s += fmt::format("<text x=\"{}\" y=\"{}\" text-anchor=\"end\">{}</text>\n", px(bx0 - 6),
                   px(by0 + 4), num(p.ymax));
  s += fmt::format(
      "<text x=\"{}\" y=\"{}\" text-anchor=\"middle\" font-style=\"italic\">{}</text>\n",
      px((bx0 + bx1) / 2), px(by1 + 36), xml_escape(p.xlabel));
  s += fmt::format("<text x=\"{}\" y=\"{}\" text-anchor=\"end\" font-style=\"italic\">{}</text>\n",
                   px(bx0 - 6), px((by0 + by1) / 2), xml_escape(p.ylabel));

  // The face through which the path left, when it is one of the four edges shown.
  if (p.exit_edge >= 0 && p.exit_edge <= 3) {
    const double e[4][4] = {
        {bx0, by0, bx0, by1}, {bx1, by0, bx1, by1}, {bx0, by1, bx1, by1}, {bx0, by0, bx1, by0}};
    const double* q = e[p.exit_edge];
    s += fmt::format(
        "<line x1=\"{}\" y1=\"{}\" x2=\"{}\" y2=\"{}\" stroke=\"#d62728\" stroke-width=\"4\"/>\n",
        px(q[0]), px(q[1]), px(q[2]), px(q[3]));
  }

  // The path: a line through the points, and the points themselves when not too many.
  const std::size_t count = std::min(p.xs.size(), p.ys.size());
  std::string line;
  for (std::size_t i = 0; i < count; ++i) {
    if (!std::isfinite(p.xs[i]) || !std::isfinite(p.ys[i])) continue;
    line += fmt::format("{}{},{}", line.empty() ? "" : " ", px(X(p.xs[i])), px(Y(p.ys[i])));
  }
  if (!line.empty())
    s += fmt::format(
        "<polyline points=\"{}\" fill=\"none\" stroke=\"#1f5fbf\" stroke-width=\"2\" "
        "stroke-linejoin=\"round\"/>\n",
        line);
  if (count <= kMaxDots) {
    s += "<g fill=\"#1f5fbf\">";
    for (std::size_t i = 0; i < count; ++i)
      if (std::isfinite(p.xs[i]) && std::isfinite(p.ys[i]))
        s += fmt::format("<circle cx=\"{}\" cy=\"{}\" r=\"1.6\"/>", px(X(p.xs[i])), px(Y(p.ys[i])));
    s += "</g>\n";
  }

  // Start (with its direction) and end.
  if (count > 0 && std::isfinite(p.xs[0]) && std::isfinite(p.ys[0])) {
    const double x0 = X(p.xs[0]), y0 = Y(p.ys[0]);
    const double dx = p.dir_x * sx, dy = -p.dir_y * sy;
    const double len = std::sqrt(dx * dx + dy * dy);
    const bool arrow = len > 0.0 && std::isfinite(len);
    // The label goes behind the start, away from the arrow: (ux, uy) points to it.
    const double ux = arrow ? -dx / len : 0.7, uy = arrow ? -dy / len : 0.7;
    if (arrow)
      s += fmt::format(
          "<line x1=\"{}\" y1=\"{}\" x2=\"{}\" y2=\"{}\" stroke=\"#2e8b3e\" stroke-width=\"2\" "
          "marker-end=\"url(#arrow)\"/>\n",
          px(x0), px(y0), px(x0 + kArrow * dx / len), px(y0 + kArrow * dy / len));
    s += fmt::format(
        "<circle cx=\"{}\" cy=\"{}\" r=\"6\" fill=\"#2e8b3e\" stroke=\"#ffffff\" "
        "stroke-width=\"1.5\"/>\n",
        px(x0), px(y0));
    s += fmt::format("<text x=\"{}\" y=\"{}\" fill=\"#2e8b3e\" text-anchor=\"{}\">start</text>\n",
                     px(x0 + 14 * ux), px(y0 + 14 * uy + 4 + 6 * std::fabs(uy)),
                     ux > 0.3    ? "start"
                     : ux < -0.3 ? "end"
                                 : "middle");
  }
  if (count > 0) {
    const double xe = X(p.xs[count - 1]), ye = Y(p.ys[count - 1]);
    if (std::isfinite(xe) && std::isfinite(ye)) {
      if (p.closed)
        s += fmt::format(
            "<circle cx=\"{}\" cy=\"{}\" r=\"11\" fill=\"none\" stroke=\"#d62728\" "
            "stroke-width=\"2.5\"/>\n",
            px(xe), px(ye));
      else
        s += fmt::format(
            "<rect x=\"{}\" y=\"{}\" width=\"11\" height=\"11\" fill=\"#d62728\" "
            "stroke=\"#ffffff\" stroke-width=\"1.5\"/>\n",
            px(xe - 5.5), px(ye - 5.5));
      const bool right_half = xe > cx;
      s += fmt::format("<text x=\"{}\" y=\"{}\" fill=\"#d62728\" text-anchor=\"{}\">{}</text>\n",
                       px(right_half ? xe - 14 : xe + 14), px(ye - 12),
                       right_half ? "end" : "start", xml_escape(p.end_label));
    }
  }
  s += "</svg>\n";
  return s;
}

}  // namespace orvq7tool
