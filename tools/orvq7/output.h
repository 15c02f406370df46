// tools/orvq7/output.h -- what the tool writes: the points of a trace as CSV or JSON, its
// picture, its report, and the files and folders they go into.
#pragma once
#include <cstddef>
#include <filesystem>
#include <string>

#include "equations.h"
#include "picture.h"
#include "tracer.h"

namespace orvq7tool {

// One row per point: point (from 1), phase, the unknowns, then the tangent components
// ("t_<name>"). Reals in their shortest form that reads back to the same double.
std::string points_csv(const EquationSystem& system, const TraceResult& result);

// The unknowns, equations, box, start, direction, ending and points (with tangents) as JSON.
std::string points_json(const EquationSystem& system, const TracePlan& plan,
                        const TraceResult& result);

// The picture of a trace on unknowns ax and ay (from 0).
Picture trace_picture(const EquationSystem& system, const TracePlan& plan,
                      const TraceResult& result, std::size_t ax, std::size_t ay);

// Lines of text describing a trace (equations, start, box, ending, points, length, effort).
std::string trace_report(const EquationSystem& system, const TracePlan& plan,
                         const TraceResult& result);

// Creates the folder (and its parents) when missing; throws ToolError when that fails or
// the path names a file.
std::filesystem::path prepare_folder(const std::string& folder);

// Writes the file whole; throws ToolError naming the file when that fails.
void write_file(const std::filesystem::path& path, const std::string& content);

}  // namespace orvq7tool
