#include "qxcore/string/string_iterators.h"

#include "qxcore/platform/wide.h"

void word_iterator::ScanEnd() {
  m_end = m_start;
  while (m_end != TextEnd() && !platform::IsSpace(*m_end)) ++m_end;
}

void word_iterator::reset() {
  m_start = *m_restart;
  m_isDone = m_restart->IsEmpty();
  ScanEnd();
}

word_iterator& word_iterator::operator++() {
  while (m_end != TextEnd() && platform::IsSpace(*m_end)) ++m_end;
  if (m_end == TextEnd()) {
    Finish();
  } else {
    m_start = m_end;
    ScanEnd();
  }
  return *this;
}

void line_iterator::ScanEnd() {
  m_end = m_start;
  while (m_end != TextEnd() && *m_end != WTEXT('\r') && *m_end != WTEXT('\n')) ++m_end;
}

void line_iterator::reset() {
  m_start = *m_restart;
  m_isDone = false;
  ScanEnd();
}

line_iterator& line_iterator::operator++() {
  if (m_end != TextEnd() && *m_end == WTEXT('\r')) ++m_end;
  // Only a line feed that belongs to this line's end: behind a carriage return or at once.
  if (m_end != TextEnd() && *m_end == WTEXT('\n')) ++m_end;
  if (m_end == TextEnd()) {
    Finish();
  } else {
    m_start = m_end;
    ScanEnd();
  }
  return *this;
}

void parts_iterator::ScanEnd() {
  m_end = m_start;
  while (m_end != TextEnd() && *m_end != m_separator) ++m_end;
}

void parts_iterator::reset() {
  m_start = *m_restart;
  m_isDone = false;
  ScanEnd();
}

parts_iterator& parts_iterator::operator++() {
  if (m_end == TextEnd()) {
    Finish();
  } else {
    m_start = m_end + 1;
    ScanEnd();
  }
  return *this;
}

bool const_iterator::IsWhitespace() const { return platform::IsSpace(*m_at); }
