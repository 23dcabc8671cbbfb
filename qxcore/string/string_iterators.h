// Iterators over an SString's words, lines, separated parts and characters.
//
// They refer to the string, which must stay alive and unchanged meanwhile. The token iterators yield
// each token as a new SString and are false once they stand behind the last one:
// ```cpp
// for (word_iterator word(text); word; ++word) Show(*word);
// ```
// A token that begins at the very end of the text still counts where a separator stands before it
// (parts: "a," has two), or where it is the first token of an empty text (parts and lines: one, empty).
// A trailing line end adds no line; trailing white space adds no word.
// Threads: an iterator belongs to one thread at a time, as the text does that it walks.
#pragma once

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"
#include "qxcore/string/string.h"

// What the three token iterators share; only they differ in where a token ends and the next begins.
class QXCORE_API STokenIterator {
 public:
  // The current token; empty when it has no characters or the iterator stands behind the last one.
  SString operator*() const { return SString(SStringView(m_start, static_cast<std::size_t>(m_end - m_start))); }
  const WCHAR* GetPointer() const { return m_start; }  // first character of the current token
  SStringView View() const { return SStringView(m_start, static_cast<std::size_t>(m_end - m_start)); }
  explicit operator bool() const { return !m_isDone; }
  bool operator==(const STokenIterator& other) const {
    return m_text == other.m_text && m_start == other.m_start && m_isDone == other.m_isDone;
  }

 protected:
  // The iterator keeps the string's address: the string must outlive it and stay as it is.
  explicit STokenIterator(const SString& text) : m_text(&text), m_start(text), m_restart(&text), m_end(m_start) {}
  const WCHAR* TextEnd() const { return m_text->end(); }  // behind the last character
  // Stands behind the last token from now on.
  void Finish() {
    m_start = m_end = TextEnd();
    m_isDone = true;
  }

  const SString* m_text;     // the string that is walked
  const WCHAR* m_start;      // the current token's first character
  const SString* m_restart;  // the string that reset goes back to
  const WCHAR* m_end;        // behind the current token's last character
  bool m_isDone = false;     // stands behind the last token
};

// Runs of characters that are not white space. The first token begins at the beginning of the string,
// and is empty when the string begins with white space, on purpose.
class QXCORE_API word_iterator : public STokenIterator {
 public:
  // Stands at the first token of the string, which must outlive the iterator.
  explicit word_iterator(const SString& text) : STokenIterator(text) { reset(); }
  explicit word_iterator(SString&&) = delete;  // it would not outlive the statement
  word_iterator& operator++();
  word_iterator operator++(int) {
    word_iterator before = *this;
    ++*this;
    return before;
  }
  void reset();  // back to the first token

 private:
  void ScanEnd();
};

// Lines; carriage return, line feed, or one after the other end a line.
class QXCORE_API line_iterator : public STokenIterator {
 public:
  // Stands at the first line of the string, which must outlive the iterator.
  explicit line_iterator(const SString& text) : STokenIterator(text) { reset(); }
  explicit line_iterator(SString&&) = delete;  // it would not outlive the statement
  line_iterator& operator++();
  line_iterator operator++(int) {
    line_iterator before = *this;
    ++*this;
    return before;
  }
  void reset();  // back to the first token

 private:
  void ScanEnd();
};

// Parts between separators; two adjacent separators hold an empty part, one at the end is followed by one.
class QXCORE_API parts_iterator : public STokenIterator {
 public:
  // Stands at the first part of the string, which must outlive the iterator.
  parts_iterator(const SString& text, WCHAR separator) : STokenIterator(text), m_separator(separator) { reset(); }
  parts_iterator(SString&&, WCHAR) = delete;
  parts_iterator& operator++();
  parts_iterator operator++(int) {
    parts_iterator before = *this;
    ++*this;
    return before;
  }
  void reset();  // back to the first token

 private:
  void ScanEnd();

  WCHAR m_separator;
};

// Walks characters. Reading at the end returns the terminator.
class QXCORE_API const_iterator {
 public:
  // Stands at index `start`, from 0 to the length, of the string, which must outlive the iterator.
  explicit const_iterator(const SString& text, int start = 0) : m_text(&text), m_at(text.GetPointerAt(start)) {}
  WCHAR operator*() const { return *m_at; }
  const_iterator& operator++() {
    ++m_at;
    return *this;
  }
  const_iterator operator++(int) {
    const_iterator before = *this;
    ++m_at;
    return before;
  }
  // Moves by n characters; both ends are the caller's care.
  const_iterator& operator+=(int n) {
    m_at += n;
    return *this;
  }
  auto operator<=>(const const_iterator& other) const { return m_at <=> other.m_at; }
  bool operator==(const const_iterator& other) const { return m_at == other.m_at; }
  explicit operator bool() const { return m_at < m_text->end(); }
  const WCHAR* GetPointer() const { return m_at; }  // the current character's address
  // What the current character is: a line end, white space.
  bool IsEoln() const { return *m_at == WTEXT('\r') || *m_at == WTEXT('\n'); }
  bool IsWhitespace() const;
  void SaveState() { m_saved = m_at; }                                 // remembers the place for RestoreState
  void RestoreState() { m_at = m_saved != nullptr ? m_saved : m_at; }  // nothing where none was saved
  void reset() { m_at = *m_text; }                                     // back to the first character

 private:
  const SString* m_text;  // the string that is walked
  const WCHAR* m_at;
  const WCHAR* m_saved = nullptr;
};
