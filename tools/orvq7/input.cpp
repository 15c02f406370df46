// tools/orvq7/input.cpp -- readers of typed numbers, names, ranges and CSV files.
#include "input.h"

#include <fmt/format.h>

#include <cctype>
#include <charconv>
#include <cmath>
#include <filesystem>
#include <fstream>
#include <sstream>

namespace orvq7tool {
namespace {

std::string_view trim(std::string_view s) {
  while (!s.empty() && std::isspace(static_cast<unsigned char>(s.front()))) s.remove_prefix(1);
  while (!s.empty() && std::isspace(static_cast<unsigned char>(s.back()))) s.remove_suffix(1);
  return s;
}

// Splits on `sep`, keeping empty items (so "1,,2" has an empty middle item).
std::vector<std::string_view> split(std::string_view s, char sep) {
  std::vector<std::string_view> items;
  std::size_t from = 0;
  for (;;) {
    const std::size_t at = s.find(sep, from);
    if (at == std::string_view::npos) {
      items.push_back(s.substr(from));
      return items;
    }
    items.push_back(s.substr(from, at - from));
    from = at + 1;
  }
}

// Shortens a quoted piece of input so that a message stays on one short line.
std::string quote(std::string_view s) {
  std::string q;
  for (char c : s.substr(0, 40)) q += (c == '\n' || c == '\r' || c == '\t') ? ' ' : c;
  if (s.size() > 40) q += "...";
  return "'" + q + "'";
}

}  // namespace

double parse_real(std::string_view text, std::string_view what) {
  std::string_view s = trim(text);
  if (s.empty()) throw ToolError(fmt::format("{}: a number is missing", what));
  if (s.front() == '+') s.remove_prefix(1);
  double value = 0.0;
  const auto [end, ec] = std::from_chars(s.data(), s.data() + s.size(), value);
  if (ec == std::errc::result_out_of_range)
    throw ToolError(fmt::format("{}: {} is out of the range of a double", what, quote(text)));
  if (ec != std::errc() || end != s.data() + s.size())
    throw ToolError(fmt::format("{}: {} is not a number", what, quote(text)));
  if (!std::isfinite(value))
    throw ToolError(fmt::format("{}: {} is not a finite number", what, quote(text)));
  return value;
}

std::vector<double> parse_list(std::string_view text, std::string_view what) {
  std::vector<double> values;
  for (std::string_view item : split(text, ',')) values.push_back(parse_real(item, what));
  return values;
}

std::vector<std::string> parse_names(std::string_view text, std::string_view what) {
  std::vector<std::string> names;
  for (std::string_view item : split(text, ',')) {
    const std::string_view name = trim(item);
    bool ok = !name.empty() && !std::isdigit(static_cast<unsigned char>(name.front()));
    for (char c : name) ok = ok && (std::isalnum(static_cast<unsigned char>(c)) || c == '_');
    if (!ok)
      throw ToolError(fmt::format("{}: {} is not a name (letters, digits, _)", what, quote(item)));
    for (const std::string& seen : names)
      if (seen == name) throw ToolError(fmt::format("{}: {} appears twice", what, quote(name)));
    names.emplace_back(name);
  }
  return names;
}

Ranges parse_ranges(std::string_view text, std::size_t n, std::string_view what) {
  const std::vector<std::string_view> items = split(text, ',');
  if (items.size() != 1 && items.size() != n)
    throw ToolError(
        fmt::format("{}: {} ranges given, expected 1 or {} (lo:hi each)", what, items.size(), n));
  Ranges r;
  for (std::size_t i = 0; i < n; ++i) {
    const std::string_view item = items.size() == 1 ? items[0] : items[i];
    const std::vector<std::string_view> ends = split(item, ':');
    if (ends.size() != 2)
      throw ToolError(fmt::format("{}: {} is not a range lo:hi", what, quote(item)));
    const double lo = parse_real(ends[0], what), hi = parse_real(ends[1], what);
    if (!(lo < hi)) throw ToolError(fmt::format("{}: range {} has lo >= hi", what, quote(item)));
    r.lower.push_back(lo);
    r.upper.push_back(hi);
  }
  return r;
}

CsvTable read_csv(std::string_view text, std::string_view source) {
  CsvTable table;
  std::size_t line_no = 0;
  for (std::string_view line : split(text, '\n')) {
    ++line_no;
    line = trim(line);
    if (line.empty() || line.front() == '#') continue;
    const std::vector<std::string_view> fields = split(line, ',');
    const bool first = table.columns == 0;
    if (first) {
      table.columns = fields.size();
      // A first line whose first field is not a number is the header.
      std::string_view f0 = trim(fields[0]);
      if (!f0.empty() && f0.front() == '+') f0.remove_prefix(1);
      double probe = 0.0;
      const auto [end, ec] = std::from_chars(f0.data(), f0.data() + f0.size(), probe);
      if (f0.empty() || ec != std::errc() || end != f0.data() + f0.size()) {
        for (std::string_view f : fields) table.header.emplace_back(trim(f));
        continue;
      }
    }
    if (fields.size() != table.columns)
      throw ToolError(fmt::format("{}:{}: {} fields, expected {}", source, line_no, fields.size(),
                                  table.columns));
    std::vector<double> row;
    for (std::size_t k = 0; k < fields.size(); ++k)
      row.push_back(parse_real(fields[k], fmt::format("{}:{}: field {}", source, line_no, k + 1)));
    table.rows.push_back(std::move(row));
  }
  return table;
}

CsvTable read_csv_file(const std::string& path) {
  std::error_code ec;
  if (std::filesystem::is_directory(path, ec))
    throw ToolError(fmt::format("{}: is a folder, not a CSV file", path));
  std::ifstream in(path, std::ios::binary);
  if (!in) throw ToolError(fmt::format("{}: cannot open the file", path));
  std::ostringstream text;
  text << in.rdbuf();
  if (in.bad()) throw ToolError(fmt::format("{}: cannot read the file", path));
  return read_csv(text.str(), path);
}

}  // namespace orvq7tool
