// An element that counts its own kind and can fail to be copied.
#pragma once

#include <gtest/gtest.h>

#include <compare>
#include <set>

struct CopyFailed {};

// Every living object is known by its address, so that one that was moved bitwise, destroyed twice or
// never constructed is noticed.
class Counted {
 public:
  static inline std::set<const Counted*> living;
  static inline long failAt = 0;  // the n-th copy from now on throws; 0: none

  explicit Counted(int value = 0) : m_value(value) { Enter(); }
  Counted(const Counted& other) : m_value(other.Get()) {
    if (failAt != 0 && --failAt == 0) throw CopyFailed();
    Enter();
  }
  Counted& operator=(const Counted& other) {
    Get();
    m_value = other.Get();
    return *this;
  }
  ~Counted() { EXPECT_EQ(living.erase(this), 1u) << "destroyed, but did not live"; }

  int Get() const {
    EXPECT_EQ(living.count(this), 1u) << "used, but does not live";
    return m_value;
  }
  friend bool operator==(const Counted& a, const Counted& b) { return a.Get() == b.Get(); }
  friend auto operator<=>(const Counted& a, const Counted& b) { return a.Get() <=> b.Get(); }

 private:
  void Enter() { EXPECT_TRUE(living.insert(this).second) << "constructed over a living one"; }
  int m_value;
};

// The same for elements that may move as bytes: living ones are known by a token each.
class Movable {
 public:
  static inline std::set<int> living;
  static inline int lastToken = 0;

  Movable(int value = 0) : m_value(value), m_token(++lastToken) { living.insert(m_token); }
  Movable(const Movable& other) : Movable(other.Get()) {}
  Movable& operator=(const Movable& other) {
    m_value = other.Get();
    return *this;
  }
  ~Movable() { EXPECT_EQ(living.erase(m_token), 1u) << "destroyed, but did not live"; }
  int Get() const {
    EXPECT_EQ(living.count(m_token), 1u) << "used, but does not live";
    return m_value;
  }
  friend bool operator==(const Movable& a, const Movable& b) { return a.Get() == b.Get(); }

 private:
  int m_value;
  int m_token;
};
