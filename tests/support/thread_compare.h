// tests/support/thread_compare.h -- routines that keep values per thread, run on two threads
// at once with different inputs: every answer must equal the one the same call sequence gives
// on a single thread.
#pragma once
#include <atomic>
#include <cstdint>
#include <cstring>
#include <functional>
#include <initializer_list>
#include <thread>
#include <vector>

// The bit patterns of what one call sequence produced (reals, integers, results).
struct Answer {
  std::vector<std::uint64_t> words;
  Answer& reals(const double* p, int n) {
    for (int k = 0; k < n; ++k) {
      std::uint64_t u;
      std::memcpy(&u, p + k, sizeof u);
      words.push_back(u);
    }
    return *this;
  }
  Answer& ints(std::initializer_list<std::int64_t> v) {
    for (std::int64_t x : v) words.push_back(static_cast<std::uint64_t>(x));
    return *this;
  }
  bool operator==(const Answer&) const = default;
};

// One self-contained call sequence with input set `variant` (0 or 1); sequences that depend
// on kept state set that state themselves first.
using Sequence = std::function<Answer(int variant)>;

// Runs both variants on this thread for the reference answers, then variant 0 and variant 1
// on two threads at once (both start together), `rounds` times each. Returns the rounds whose
// answer differed.
inline int rounds_differing_across_threads(const Sequence& run, int rounds = 2000) {
  const Answer want[2] = {run(0), run(1)};
  int differing[2] = {0, 0};
  std::atomic<int> waiting{2};
  std::vector<std::thread> pool;
  for (int v = 0; v < 2; ++v) {
    pool.emplace_back([&, v] {
      waiting.fetch_sub(1);
      while (waiting.load() > 0) std::this_thread::yield();
      for (int r = 0; r < rounds; ++r) differing[v] += !(run(v) == want[v]);
    });
  }
  for (auto& t : pool) t.join();
  return differing[0] + differing[1];
}
