// tools/orvq7/input.h -- the tool's one error type and the readers of typed numbers: lists
// "1,-2.5,3e-4", ranges "lo:hi", and CSV files of points.
#pragma once
#include <cstddef>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

namespace orvq7tool {

// Bad input or a failed computation, with a message of one line that names the problem.
// main() prints it after the program's name and exits with a non-zero status.
class ToolError : public std::runtime_error {
 public:
  explicit ToolError(const std::string& what) : std::runtime_error(what) {}
};

// One real written in full (no trailing characters); `what` names the value in the message.
double parse_real(std::string_view text, std::string_view what);

// Comma-separated reals, blanks allowed around each; an empty item is an error.
std::vector<double> parse_list(std::string_view text, std::string_view what);

// Comma-separated names of unknowns (letters, digits, underscore; not starting with a digit).
std::vector<std::string> parse_names(std::string_view text, std::string_view what);

// A list of `lo:hi` ranges, one per unknown, or a single range for every unknown;
// lo < hi. Returns (lower bounds, upper bounds), each of size n.
struct Ranges {
  std::vector<double> lower;
  std::vector<double> upper;
};
Ranges parse_ranges(std::string_view text, std::size_t n, std::string_view what);

// Columns of reals read from CSV text: rows of comma-separated numbers, an optional header
// line of names first, blank lines and lines starting with '#' skipped. Every data row must
// hold the same number of fields as the first.
struct CsvTable {
  std::vector<std::string> header;  // empty when the file has no header line
  std::size_t columns = 0;
  std::vector<std::vector<double>> rows;
};
CsvTable read_csv(std::string_view text, std::string_view source);
CsvTable read_csv_file(const std::string& path);

}  // namespace orvq7tool
