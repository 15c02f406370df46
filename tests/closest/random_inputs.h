// tests/closest/random_inputs.h -- seeded random inputs for the closest-point tests.
#pragma once
#include <cstdint>
#include <cstdlib>
#include <iostream>
#include <random>
#include <vector>

// The seed of a random check: ORVQ7_SEED from the environment when set, else `fallback`;
// printed so that a failure can be replayed.
inline std::uint64_t test_seed(const char* check, std::uint64_t fallback) {
  std::uint64_t seed = fallback;
  if (const char* env = std::getenv("ORVQ7_SEED")) seed = std::strtoull(env, nullptr, 10);
  std::cout << check << ": seed " << seed << " (set ORVQ7_SEED to replay)\n";
  return seed;
}

inline std::vector<double> uniform(std::mt19937_64& rng, std::size_t count, double lo, double hi) {
  std::uniform_real_distribution<double> u(lo, hi);
  std::vector<double> v(count);
  for (double& x : v) x = u(rng);
  return v;
}
