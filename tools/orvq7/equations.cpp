// tools/orvq7/equations.cpp -- typed equations, their derivatives by central differences, and
// the path solver's evaluation routine over them.
#include "equations.h"

#include <fmt/format.h>
#include <muParser.h>

#include <cmath>
#include <limits>
#include <numbers>

#include "input.h"

namespace orvq7tool {
namespace {

constexpr double kEps = std::numeric_limits<double>::epsilon();
// Step factors of the stencils (see the header): eps^(1/5) and eps^(1/6).
const double kFirstStep = std::pow(kEps, 1.0 / 5.0);
const double kSecondStep = std::pow(kEps, 1.0 / 6.0);
// Weights of the five-point first-derivative stencil at offsets -2, -1, +1, +2 (over 12 h).
constexpr int kOffsets[4] = {-2, -1, 1, 2};
constexpr double kWeights[4] = {1.0, -8.0, 8.0, -1.0};
constexpr std::int32_t kEvalRefused = 4715;  // the evaluation routine's failure code

// "lhs = rhs" becomes "(lhs)-(rhs)". A '=' that belongs to ==, <=, >= or != is no split;
// a second plain '=' is refused (muParser would read it as an assignment).
std::string to_residual(const std::string& text, std::size_t k) {
  std::size_t split = std::string::npos;
  for (std::size_t i = 0; i < text.size(); ++i) {
    if (text[i] != '=') continue;
    const char before = i > 0 ? text[i - 1] : ' ';
    const char after = i + 1 < text.size() ? text[i + 1] : ' ';
    if (after == '=') {
      ++i;
      continue;
    }
    if (before == '<' || before == '>' || before == '!') continue;
    if (split != std::string::npos)
      throw ToolError(fmt::format("equation {} '{}': more than one '='", k, text));
    split = i;
  }
  if (split == std::string::npos) return text;
  return "(" + text.substr(0, split) + ")-(" + text.substr(split + 1) + ")";
}

}  // namespace

EquationSystem::EquationSystem(std::vector<std::string> names,
                               const std::vector<std::string>& equations)
    : names_(std::move(names)), texts_(equations), scales_(names_.size(), 1.0) {
  const std::size_t n = names_.size();
  values_ = std::make_unique<double[]>(n == 0 ? 1 : n);
  for (std::size_t i = 0; i < n; ++i) values_[i] = 0.0;
  for (std::size_t k = 0; k < equations.size(); ++k) {
    const std::string& text = equations[k];
    auto parser = std::make_unique<mu::Parser>();
    try {
      for (std::size_t i = 0; i < n; ++i) parser->DefineVar(names_[i], &values_[i]);
      bool has_pi = false;
      for (const std::string& name : names_) has_pi = has_pi || name == "pi";
      if (!has_pi) parser->DefineConst("pi", std::numbers::pi);
      const std::string residual = to_residual(text, k + 1);
      shown_.push_back(residual == text ? text + " = 0" : text);
      parser->SetExpr(residual);
      int results = 0;
      parser->Eval(results);  // parses now, so that errors surface here
      if (results != 1)
        throw ToolError(fmt::format("equation {} '{}': gives {} values, expected one (no ',')",
                                    k + 1, text, results));
    } catch (const mu::Parser::exception_type& e) {
      throw ToolError(fmt::format("equation {} '{}': {}", k + 1, text, e.GetMsg()));
    }
    parsers_.push_back(std::move(parser));
  }
}

EquationSystem::~EquationSystem() = default;

void EquationSystem::set_scales(const std::vector<double>& scales) {
  for (std::size_t i = 0; i < scales_.size() && i < scales.size(); ++i)
    if (scales[i] > 0.0 && std::isfinite(scales[i])) scales_[i] = scales[i];
}

void EquationSystem::eval_at(const double* x, double* f) const {
  const std::size_t n = names_.size();
  for (std::size_t i = 0; i < n; ++i) values_[i] = x[i];
  for (std::size_t k = 0; k < parsers_.size(); ++k) f[k] = parsers_[k]->Eval();
  ++evaluations_;
}

// The difference step of unknown i at x: kappa max(|x|, scale), made exact.
double EquationSystem::step(std::size_t i, double x, double kappa) const {
  const double h = kappa * std::max(std::fabs(x), scales_[i]);
  const volatile double moved = x + h;  // keeps (x + h) - x from being folded to h
  return moved - x;
}

void EquationSystem::residuals(const double* x, double* f) const { eval_at(x, f); }

double EquationSystem::residual_sum(const double* x) const {
  std::vector<double> f(equations());
  eval_at(x, f.data());
  double s = 0.0;
  for (double v : f) s += v * v;
  return s;
}

void EquationSystem::jacobian(const double* x, double* jac) const {
  const std::size_t n = unknowns(), m = equations();
  std::vector<double> y(x, x + n), f(m);
  for (std::size_t i = 0; i < n; ++i) {
    const double h = step(i, x[i], kFirstStep);
    for (std::size_t k = 0; k < m; ++k) jac[k + m * i] = 0.0;
    for (int a = 0; a < 4; ++a) {
      y[i] = x[i] + kOffsets[a] * h;
      eval_at(y.data(), f.data());
      for (std::size_t k = 0; k < m; ++k) jac[k + m * i] += kWeights[a] * f[k];
    }
    y[i] = x[i];
    for (std::size_t k = 0; k < m; ++k) jac[k + m * i] /= 12.0 * h;
  }
}

void EquationSystem::hessian(const double* x, double* hes) const {
  const std::size_t n = unknowns(), m = equations();
  std::vector<double> y(x, x + n), f(m), f0(m), h(n);
  for (std::size_t i = 0; i < n; ++i) h[i] = step(i, x[i], kSecondStep);
  eval_at(x, f0.data());
  auto H = [&](std::size_t k, std::size_t i, std::size_t j) -> double& {
    return hes[k + m * (i + n * j)];
  };
  constexpr double kPure[4] = {-1.0, 16.0, 16.0, -1.0};  // offsets -2, -1, +1, +2; centre -30
  for (std::size_t i = 0; i < n; ++i) {
    for (std::size_t k = 0; k < m; ++k) H(k, i, i) = -30.0 * f0[k];
    for (int a = 0; a < 4; ++a) {
      y[i] = x[i] + kOffsets[a] * h[i];
      eval_at(y.data(), f.data());
      for (std::size_t k = 0; k < m; ++k) H(k, i, i) += kPure[a] * f[k];
    }
    y[i] = x[i];
    for (std::size_t k = 0; k < m; ++k) H(k, i, i) /= 12.0 * (h[i] * h[i]);
    for (std::size_t j = i + 1; j < n; ++j) {
      for (std::size_t k = 0; k < m; ++k) H(k, i, j) = 0.0;
      for (int a = 0; a < 4; ++a) {
        for (int b = 0; b < 4; ++b) {
          y[i] = x[i] + kOffsets[a] * h[i];
          y[j] = x[j] + kOffsets[b] * h[j];
          eval_at(y.data(), f.data());
          const double w = kWeights[a] * kWeights[b];
          for (std::size_t k = 0; k < m; ++k) H(k, i, j) += w * f[k];
        }
      }
      y[i] = x[i];
      y[j] = x[j];
      for (std::size_t k = 0; k < m; ++k) {
        H(k, i, j) /= 144.0 * (h[i] * h[j]);
        H(k, j, i) = H(k, i, j);
      }
    }
  }
}

std::int32_t evaluate_system(void* ctx, const std::int32_t* npts, const double* x,
                             const std::int32_t* req, double* out, std::int32_t* ierr) {
  auto& c = *static_cast<EvalContext*>(ctx);
  try {
    const EquationSystem& s = *c.system;
    const std::size_t n = s.unknowns(), m = s.equations();
    ++c.calls;
    if (c.max_calls != 0 && c.calls > c.max_calls) {
      c.failure = fmt::format("stopped after {} calls of the evaluation routine (--max-calls)",
                              c.max_calls);
      *ierr = kEvalRefused;
      return 1;
    }
    if (*npts < 1 || (*req & ~7) != 0 || *req == 0) {
      c.failure = fmt::format("the solver asked for req {} at {} points", *req, *npts);
      *ierr = kEvalRefused;
      return 1;
    }
    for (std::int32_t p = 0; p < *npts; ++p) {
      const double* xp = x + n * p;
      if (*req & 1) {
        s.residuals(xp, out);
        out += m;
      }
      if (*req & 2) {
        s.jacobian(xp, out);
        out += m * n;
      }
      if (*req & 4) {
        s.hessian(xp, out);
        // Second derivatives that are not finite (a stencil reaching past the edge of the
        // equations' domain) are given as 0: the step is then bounded by the maximum steps,
        // and a path running into that edge ends there instead of failing on a step length
        // that is not a number.
        for (std::size_t e = 0; e < m * n * n; ++e)
          if (!std::isfinite(out[e])) out[e] = 0.0;
        out += m * n * n;
      }
    }
    if (c.progress != nullptr && c.calls % 64 == 0) c.progress(c.progress_user, c.calls, x);
  } catch (const mu::Parser::exception_type& e) {
    c.failure = e.GetMsg();
    *ierr = kEvalRefused;
    return 1;
  } catch (const std::exception& e) {
    c.failure = e.what();
    *ierr = kEvalRefused;
    return 1;
  } catch (...) {
    c.failure = "the expressions could not be evaluated";
    *ierr = kEvalRefused;
    return 1;
  }
  *ierr = 0;
  return 0;
}

}  // namespace orvq7tool
