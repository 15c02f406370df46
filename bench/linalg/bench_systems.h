// bench/linalg/bench_systems.h -- the systems every solver in a comparison runs on: a pool
// of random dense matrices and right-hand sides from a fixed seed, cycled through so that no
// solver sees the same pivot sequence twice in a row.
#pragma once
#include <cstdint>
#include <random>
#include <vector>

constexpr int kPool = 64;

struct SystemPool {
  std::int32_t n;
  std::vector<std::vector<double>> a;  // column-major, order n
  std::vector<std::vector<double>> b;
};

inline SystemPool make_pool(std::int32_t n) {
  std::mt19937_64 rng(20261122u + static_cast<unsigned>(n));
  std::uniform_real_distribution<double> u(-1.0, 1.0);
  SystemPool p{n, {}, {}};
  for (int s = 0; s < kPool; ++s) {
    std::vector<double> a(static_cast<std::size_t>(n) * n), b(static_cast<std::size_t>(n));
    for (double& v : a) v = u(rng);
    for (double& v : b) v = u(rng);
    p.a.push_back(std::move(a));
    p.b.push_back(std::move(b));
  }
  return p;
}
