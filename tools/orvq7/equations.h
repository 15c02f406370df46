// tools/orvq7/equations.h -- a system of equations typed as expressions (muParser), with its
// first and second derivatives by central differences, and the evaluation routine that hands
// it to the path solver.
//
// Derivatives. Unknown i gets its own step, proportional to s_i = max(|x_i|, scale_i), where
// scale_i is the unknown's typical size (by default min(1, width of its box range)):
//   first derivatives:  h_i = eps^(1/5) s_i (about 7.4e-4 s_i), five-point stencil
//       dF/dx_i = (F(x - 2h) - 8 F(x - h) + 8 F(x + h) - F(x + 2h)) / (12 h),
//       truncation error h^4 F'''''/30, so about 1e-12 relative for a unit-sized function;
//   second derivatives: h_i = eps^(1/6) s_i (about 2.5e-3 s_i),
//       d2F/dx_i^2 = (-F(x - 2h) + 16 F(x - h) - 30 F(x) + 16 F(x + h) - F(x + 2h)) / (12 h^2),
//       d2F/dx_i dx_j = the five-point stencil above in x_i applied to the one in x_j
//       (16 evaluations), truncation error O(h^4), about 1e-10 relative.
// Each step is made exactly representable ((x + h) - x) before it is divided by. eps is the
// spacing of doubles at 1. These exponents balance the truncation error against the rounding
// error of the function values (relative size eps), the optimum of each stencil.
#pragma once
#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace mu {
class Parser;
}

namespace orvq7tool {

class EquationSystem {
 public:
  // names: the unknowns, in order; equations: expressions in them, "lhs = rhs" meaning
  // lhs - (rhs). Throws ToolError naming the equation and the problem when an expression does
  // not parse, uses an unknown name, or gives more than one value.
  EquationSystem(std::vector<std::string> names, const std::vector<std::string>& equations);
  ~EquationSystem();
  EquationSystem(const EquationSystem&) = delete;
  EquationSystem& operator=(const EquationSystem&) = delete;

  std::size_t unknowns() const { return names_.size(); }
  std::size_t equations() const { return texts_.size(); }
  const std::vector<std::string>& names() const { return names_; }
  const std::vector<std::string>& texts() const { return texts_; }
  // Equation k as a reader expects it: "lhs = rhs" as typed, "expr" as "expr = 0".
  const std::string& shown(std::size_t k) const { return shown_[k]; }

  // Typical size of each unknown (n positive values), used for the difference steps.
  void set_scales(const std::vector<double>& scales);

  // m residuals at x.
  void residuals(const double* x, double* f) const;
  // The m by n Jacobian at x, column-major, equation index fastest.
  void jacobian(const double* x, double* jac) const;
  // The m by n by n second derivatives at x: element (k, i, j) at k + m (i + n j).
  void hessian(const double* x, double* hes) const;
  // Sum of squared residuals at x, in equation order.
  double residual_sum(const double* x) const;

  // Number of times the expressions were evaluated at a point since construction.
  std::uint64_t evaluations() const { return evaluations_; }

 private:
  void eval_at(const double* x, double* f) const;
  double step(std::size_t i, double x, double kappa) const;

  std::vector<std::string> names_;
  std::vector<std::string> texts_;
  std::vector<std::string> shown_;
  std::vector<double> scales_;
  std::unique_ptr<double[]> values_;  // the unknowns as muParser sees them (fixed address)
  std::vector<std::unique_ptr<mu::Parser>> parsers_;
  mutable std::uint64_t evaluations_ = 0;
};

// Context of the evaluation routine below: the system, and what happened during a trace.
struct EvalContext {
  const EquationSystem* system = nullptr;
  std::uint64_t calls = 0;      // calls of the evaluation routine
  std::uint64_t max_calls = 0;  // 0: no limit; else the routine fails after that many
  std::string failure;          // why the routine failed, for the message
  // Called every 64 calls with the point just evaluated (progress line); may be empty.
  void (*progress)(void* user, std::uint64_t calls, const double* x) = nullptr;
  void* progress_user = nullptr;
};

// The six-argument evaluation routine of the path solver over an EvalContext: residuals
// (req bit 1), Jacobian (bit 2), second derivatives (bit 4), per point, in that order.
// Second derivatives that are not finite are given as 0 (so a path that runs into the edge
// of the equations' domain, sqrt(1 - x^2) at x = 1, ends there by collapse of the step).
// Never throws: a failure is result 1 with ierr 4715 and the reason in ctx->failure.
std::int32_t evaluate_system(void* ctx, const std::int32_t* npts, const double* x,
                             const std::int32_t* req, double* out, std::int32_t* ierr);

}  // namespace orvq7tool
