// The stream that a filter, reader or writer works on: borrowed or owned.
// Threads: an object belongs to one thread at a time.
#pragma once

// Holds a stream and deletes it at the end when it owns it. Owned from the first moment on: also when the
// constructor of the object that holds it throws.
template <class Stream>
class SInnerStream {
 public:
  // None, until Set.
  SInnerStream() = default;
  // Borrowed: `stream` must stay alive.
  explicit SInnerStream(Stream& stream) : m_stream(&stream) {}
  // Owned when `owns` is set, else borrowed.
  SInnerStream(Stream* stream, bool owns) : m_stream(stream), m_owns(owns) {}
  SInnerStream(const SInnerStream&) = delete;
  SInnerStream& operator=(const SInnerStream&) = delete;
  ~SInnerStream() {
    if (m_owns) delete m_stream;
  }

  // Borrows `stream` where none was held.
  void Set(Stream& stream) { m_stream = &stream; }
  // The stream; null only where none was set.
  Stream* Get() const { return m_stream; }
  Stream* operator->() const { return m_stream; }
  Stream& operator*() const { return *m_stream; }
  explicit operator bool() const { return m_stream != nullptr; }

 private:
  Stream* m_stream = nullptr;
  bool m_owns = false;
};
