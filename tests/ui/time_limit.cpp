#include <chrono>
#include <condition_variable>
#include <cstdio>
#include <cstdlib>
#include <mutex>
#include <thread>

#include "tests/ui/ui_fixture.h"

struct test::TimeLimit::State {
  explicit State(int seconds) : m_thread([this, seconds] { Watch(seconds); }) {}
  void Watch(int seconds) {
    std::unique_lock lock(m_mutex);
    if (m_ended.wait_for(lock, std::chrono::seconds(seconds), [this] { return m_hasEnded; })) return;
    std::fprintf(stderr, "the test waits for somebody\n");
    std::_Exit(3);
  }
  std::mutex m_mutex;
  std::condition_variable m_ended;
  bool m_hasEnded = false;
  std::thread m_thread;
};

test::TimeLimit::TimeLimit(int seconds) : m_state(new State(seconds)) {}

test::TimeLimit::~TimeLimit() {
  {
    const std::lock_guard lock(m_state->m_mutex);
    m_state->m_hasEnded = true;
  }
  m_state->m_ended.notify_all();
  m_state->m_thread.join();
  delete m_state;
}
