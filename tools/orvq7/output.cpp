// tools/orvq7/output.cpp -- CSV, JSON, pictures and reports of traces; files and folders.
#include "output.h"

#include <fmt/format.h>

#include <fstream>
#include <system_error>

#include "input.h"

namespace orvq7tool {
namespace {

std::string json_string(const std::string& s) {
  std::string out = "\"";
  for (char c : s) {
    if (c == '"' || c == '\\') {
      out += '\\';
      out += c;
    } else if (static_cast<unsigned char>(c) < 0x20) {
      out += fmt::format("\\u{:04x}", static_cast<unsigned char>(c));
    } else {
      out += c;
    }
  }
  return out + "\"";
}

template <typename Range>
std::string json_list(const Range& values) {
  std::string out = "[";
  for (const auto& v : values) out += (out.size() > 1 ? ", " : "") + fmt::format("{}", v);
  return out + "]";
}

std::string json_strings(const std::vector<std::string>& values) {
  std::string out = "[";
  for (const auto& v : values) out += (out.size() > 1 ? ", " : "") + json_string(v);
  return out + "]";
}

std::string ending_word(Ending e) {
  switch (e) {
    case Ending::kClosed:
      return "closed";
    case Ending::kLeftBox:
      return "left_box";
    case Ending::kInside:
      return "inside";
    case Ending::kFailed:
      break;
  }
  return "failed";
}

std::string point_text(const std::vector<std::string>& names, const double* x, std::size_t n) {
  std::string s = "(";
  for (std::size_t i = 0; i < n; ++i)
    s += fmt::format("{}{} = {:.10g}", i == 0 ? "" : ", ", names[i], x[i] + 0.0);  // no -0
  return s + ")";
}

}  // namespace

std::string points_csv(const EquationSystem& system, const TraceResult& r) {
  const std::size_t n = r.n;
  std::string s = "point,phase";
  for (const std::string& name : system.names()) s += "," + name;
  for (const std::string& name : system.names()) s += ",t_" + name;
  s += "\n";
  for (std::size_t j = 0; j < r.count(); ++j) {
    s += fmt::format("{},{}", j + 1, r.phases[j]);
    for (std::size_t i = 0; i < n; ++i) s += fmt::format(",{}", r.points[j * n + i]);
    for (std::size_t i = 0; i < n; ++i) s += fmt::format(",{}", r.tangents[j * n + i]);
    s += "\n";
  }
  return s;
}

std::string points_json(const EquationSystem& system, const TracePlan& plan, const TraceResult& r) {
  const std::size_t n = r.n;
  std::string s = "{\n";
  s += fmt::format("  \"unknowns\": {},\n", json_strings(system.names()));
  s += fmt::format("  \"equations\": {},\n", json_strings(system.texts()));
  s += fmt::format("  \"box\": {{\"lower\": {}, \"upper\": {}}},\n", json_list(plan.lower),
                   json_list(plan.upper));
  s += fmt::format("  \"start\": {},\n  \"direction\": {},\n", json_list(plan.start),
                   json_list(r.direction));
  s += fmt::format("  \"ending\": {{\"kind\": {}, \"text\": {}, \"code\": {}",
                   json_string(ending_word(r.ending)), json_string(r.ending_text), r.code);
  if (r.ending == Ending::kLeftBox)
    s += fmt::format(", \"face\": {{\"unknown\": {}, \"bound\": {}}}",
                     json_string(system.names()[r.face_unknown]),
                     json_string(r.face_upper ? "upper" : "lower"));
  s += "},\n";
  s += fmt::format("  \"length\": {},\n  \"points\": [", r.length);
  for (std::size_t j = 0; j < r.count(); ++j) {
    const std::vector<double> x(r.points.begin() + j * n, r.points.begin() + (j + 1) * n);
    const std::vector<double> t(r.tangents.begin() + j * n, r.tangents.begin() + (j + 1) * n);
    s += fmt::format("{}\n    {{\"phase\": {}, \"x\": {}, \"t\": {}}}", j == 0 ? "" : ",",
                     r.phases[j], json_list(x), json_list(t));
  }
  s += "\n  ]\n}\n";
  return s;
}

Picture trace_picture(const EquationSystem& system, const TracePlan& plan, const TraceResult& r,
                      std::size_t ax, std::size_t ay) {
  const std::size_t n = r.n;
  const auto& names = system.names();
  Picture p;
  p.title = plan.title;
  std::string eqs;
  for (std::size_t k = 0; k < system.equations(); ++k)
    eqs += (eqs.empty() ? "" : ";  ") + system.shown(k);
  p.caption.push_back(eqs);
  p.caption.push_back(
      fmt::format("{} points, length {:.6g}; {}", r.count(), r.length, r.ending_text));
  if (n > 2)
    p.caption.push_back(
        fmt::format("projection on ({}, {}) of {} unknowns", names[ax], names[ay], n));
  p.xlabel = names[ax];
  p.ylabel = names[ay];
  p.xmin = plan.lower[ax];
  p.xmax = plan.upper[ax];
  p.ymin = plan.lower[ay];
  p.ymax = plan.upper[ay];
  for (std::size_t j = 0; j < r.count(); ++j) {
    p.xs.push_back(r.points[j * n + ax]);
    p.ys.push_back(r.points[j * n + ay]);
  }
  if (r.direction.size() == n) {
    p.dir_x = r.direction[ax];
    p.dir_y = r.direction[ay];
  }
  p.closed = r.ending == Ending::kClosed;
  if (r.ending == Ending::kClosed) p.end_label = "closed";
  if (r.ending == Ending::kLeftBox) {
    const double bound = r.face_upper ? plan.upper[r.face_unknown] : plan.lower[r.face_unknown];
    p.end_label = fmt::format("left through {} = {}", names[r.face_unknown], bound);
    if (r.face_unknown == ax) p.exit_edge = r.face_upper ? 1 : 0;
    if (r.face_unknown == ay) p.exit_edge = r.face_upper ? 3 : 2;
  }
  if (r.ending == Ending::kInside) p.end_label = "end";
  return p;
}

std::string trace_report(const EquationSystem& system, const TracePlan& plan,
                         const TraceResult& r) {
  const std::size_t n = system.unknowns();
  const auto& names = system.names();
  std::string s;
  s += fmt::format("{}\n", plan.title);
  for (std::size_t k = 0; k < system.equations(); ++k)
    s += fmt::format("  equation   {}\n", system.shown(k));
  std::string box;
  for (std::size_t i = 0; i < n; ++i)
    box +=
        fmt::format("{}{} in [{}, {}]", i == 0 ? "" : ", ", names[i], plan.lower[i], plan.upper[i]);
  s += fmt::format("  box        {}\n", box);
  s += fmt::format(
      "  start      {}{}\n", point_text(names, plan.start.data(), n),
      plan.snapped > 0.0 ? fmt::format(", moved {:.3g} onto the curve", plan.snapped) : "");
  if (r.direction.size() == n)
    s += fmt::format("  direction  {}\n", point_text(names, r.direction.data(), n));
  s += fmt::format("  path kind  {}, tolerance {}{}\n", plan.kind, fmt::join(plan.tol, ", "),
                   plan.order2 ? ", curvature from the tangents" : "");
  s += fmt::format("  ending     {}\n", r.ending_text);
  if (r.ending != Ending::kFailed) {
    s += fmt::format("  points     {}, length {:.10g}\n", r.count(), r.length);
    s += fmt::format("  end        {}\n", point_text(names, &r.points[(r.count() - 1) * n], n));
    double worst = 0.0;
    for (std::size_t j = 0; j < r.count(); ++j)
      worst = std::max(worst, system.residual_sum(&r.points[j * n]));
    s += fmt::format("  residuals  largest sum of squares {:.3g} (eps {:.3g})\n", worst, plan.eps);
  }
  s += fmt::format("  effort     {} calls of the evaluation routine, {} evaluations, {:.3f} s\n",
                   r.calls, r.evaluations, r.seconds);
  return s;
}

std::filesystem::path prepare_folder(const std::string& folder) {
  const std::filesystem::path path(folder.empty() ? "." : folder);
  std::error_code ec;
  if (std::filesystem::exists(path, ec) && !std::filesystem::is_directory(path, ec))
    throw ToolError(fmt::format("{}: exists and is not a folder", path.string()));
  std::filesystem::create_directories(path, ec);
  if (ec)
    throw ToolError(fmt::format("{}: cannot create the folder ({})", path.string(), ec.message()));
  return path;
}

void write_file(const std::filesystem::path& path, const std::string& content) {
  std::ofstream out(path, std::ios::binary | std::ios::trunc);
  out << content;
  out.close();
  if (!out) throw ToolError(fmt::format("{}: cannot write the file", path.string()));
}

}  // namespace orvq7tool
