// A runner for the targets that have no packaged Google Benchmark: the part of its interface that the
// benchmarks here use, and its report in JSON as far as table.py reads it.
#pragma once

#include <cstddef>
#include <cstdint>
#include <map>
#include <string>

namespace benchmark {

class State {
 public:
  explicit State(std::int64_t iterations) : m_iterations(iterations) {}

  // for (auto _ : state) runs the body the ordered number of times and takes the time around it.
  struct [[maybe_unused]] Value {};
  struct Iterator {
    State* m_state;
    std::int64_t m_left;
    Value operator*() const { return {}; }
    Iterator& operator++() { return --m_left, *this; }
    bool operator!=(const Iterator&) {
      if (m_left != 0) return true;
      m_state->Stop();
      return false;
    }
  };
  Iterator begin();
  Iterator end() { return {this, 0}; }

  std::int64_t iterations() const { return m_iterations; }
  void SetBytesProcessed(std::int64_t) {}
  void SetItemsProcessed(std::int64_t) {}
  double Seconds() const { return m_seconds; }
  // What lies between the two does not count.
  void PauseTiming();
  void ResumeTiming();

  std::map<std::string, double> counters;

 private:
  void Stop();

  std::int64_t m_iterations;
  double m_start = 0;
  double m_pauseStart = 0;
  double m_seconds = 0;
};

struct Registration {
  Registration* UseRealTime() { return this; }
  std::string m_name;
  void (*m_function)(State&);
};

Registration* RegisterBenchmark(const char* name, void (*function)(State&));

template <class T>
inline void DoNotOptimize(T&& value) {
  asm volatile("" : : "r,m"(value) : "memory");
}
inline void ClobberMemory() { asm volatile("" : : : "memory"); }

}  // namespace benchmark
