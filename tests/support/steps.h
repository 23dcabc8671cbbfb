// Bounds the steps of a loop that ends only when the code under test says so: a hang becomes a failure that has a name.
#pragma once

#include <stdexcept>

namespace test {

class Steps {
 public:
  explicit Steps(long most = 10'000'000) : m_left(most) {}
  void Take() {
    if (--m_left < 0) throw std::runtime_error("the loop does not end");
  }

 private:
  long m_left;
};

}  // namespace test
