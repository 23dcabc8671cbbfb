#include "bench/runner.h"

#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <regex>
#include <vector>

namespace benchmark {
namespace {

std::vector<std::unique_ptr<Registration>>& All() {
  static std::vector<std::unique_ptr<Registration>> all;
  return all;
}

double Now() { return std::chrono::duration<double>(std::chrono::steady_clock::now().time_since_epoch()).count(); }

// As many iterations as take at least the given time, found by trying.
std::int64_t FindIterations(const Registration& one, double minSeconds) {
  for (std::int64_t iterations = 1;;) {
    State state(iterations);
    one.m_function(state);
    if (state.Seconds() >= minSeconds || iterations >= 1'000'000'000) return iterations;
    double factor = state.Seconds() > minSeconds / 100 ? minSeconds * 1.2 / state.Seconds() : 10;
    iterations = static_cast<std::int64_t>(static_cast<double>(iterations) * factor) + 1;
  }
}

}  // namespace

State::Iterator State::begin() {
  m_start = Now();
  return {this, m_iterations};
}

void State::Stop() { m_seconds = Now() - m_start; }
void State::PauseTiming() { m_pauseStart = Now(); }
void State::ResumeTiming() { m_start += Now() - m_pauseStart; }

Registration* RegisterBenchmark(const char* name, void (*function)(State&)) {
  All().push_back(std::make_unique<Registration>(Registration{name, function}));
  return All().back().get();
}

}  // namespace benchmark

int main(int argc, char** argv) {
  std::string filter = ".*";
  double minSeconds = 0.2;
  int repetitions = 5;
  for (int i = 1; i < argc; ++i) {
    std::string argument = argv[i];
    auto valueOf = [&argument](const char* option) -> const char* {
      std::string prefix = std::string("--benchmark_") + option + "=";
      return argument.rfind(prefix, 0) == 0 ? argument.c_str() + prefix.size() : nullptr;
    };
    if (const char* value = valueOf("filter")) filter = value;
    if (const char* value = valueOf("min_time")) minSeconds = std::atof(value);
    if (const char* value = valueOf("repetitions")) repetitions = std::atoi(value);
  }
  std::regex wanted(filter);
  const char* separator = "";
  std::printf("{\"benchmarks\": [");
  for (const auto& one : benchmark::All()) {
    if (!std::regex_search(one->m_name, wanted)) continue;
    std::int64_t iterations = benchmark::FindIterations(*one, minSeconds);
    for (int repetition = 0; repetition < repetitions; ++repetition) {
      benchmark::State state(iterations);
      one->m_function(state);
      std::printf("%s\n{\"name\": \"%s\", \"run_type\": \"iteration\", \"time_unit\": \"ns\", \"real_time\": %.6g",
                  separator, one->m_name.c_str(), state.Seconds() * 1e9 / static_cast<double>(iterations));
      for (const auto& [name, value] : state.counters) std::printf(", \"%s\": %.6g", name.c_str(), value);
      std::printf("}");
      separator = ",";
    }
  }
  std::printf("\n]}\n");
}
