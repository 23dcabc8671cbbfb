// Unwinding to a particular catcher that announced itself by name.
//
// A SThrowTarget counts its names in a process-wide registry while it is active, so that code which
// wants to abort can ask first whether anyone listens, and otherwise handle the condition itself:
// ```cpp
// STargetedException abort(WTEXT("Scripting,DlgAbort"), text);
// if (abort.HasTarget()) throw abort;
// ```
// Names stand in comma-separated lists; empty parts are empty names. The registry is not locked:
// everything here belongs to one thread.
#pragma once

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"
#include "qxcore/string/string.h"

class SThrowTarget;

// Thrown and caught as itself, never deleted through a base: the destructor takes no virtual slot.
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wnon-virtual-dtor"
class QXCORE_API STargetedException {
 public:
  // `targets`: names separated by commas, e.g. "Scripting,DlgAbort".
  STargetedException(const SString& targets, const SString& text, std::int32_t value = 0)
      : m_targets(targets), m_text(text), m_value(value) {}
  STargetedException(const STargetedException&) = default;
  STargetedException& operator=(const STargetedException&) = default;

  virtual SString GetMessageText() const;  // the message
  virtual std::int32_t GetValue() const;   // 0 for the aborts that the library raises

  // 1 if some active SThrowTarget answers to one of the targets, else 0.
  int HasTarget() const;

  // 1 if one of the targets occurs in the catcher's list, followed by a comma or the list's end. Only
  // the end of the name is looked at, so a catcher "XAbort" answers to the target "Abort", too, on
  // purpose.
  int Match(const SThrowTarget& target) const;

  const SString& GetTargets() const { return m_targets; }  // the names, separated by commas

 private:
  SString m_targets;
  SString m_text;
  std::int32_t m_value;
};
#pragma GCC diagnostic pop

// Derive from it to become a catcher; Activate where the catching begins, Done where it ends.
class QXCORE_API SThrowTarget {
 public:
  // `names`: what the catcher answers to, separated by commas. Not active yet.
  explicit SThrowTarget(const SString& names) : m_names(names) {}
  SThrowTarget(const SThrowTarget&) = delete;
  SThrowTarget& operator=(const SThrowTarget&) = delete;
  ~SThrowTarget() { Done(); }

  // Takes the names' counts back, once; the names stay known.
  void Done() noexcept;

  const SString& GetNames() const { return m_names; }  // the names, separated by commas
  bool IsActive() const { return m_active != 0; }      // between Activate and Done

 protected:
  // Counts the names, once. On SEOutOfMemory none is counted.
  void Activate();

 private:
  SString m_names;
  std::int32_t m_active = 0;
};

static_assert(sizeof(void*) != 4 || (sizeof(STargetedException) == 16 && sizeof(SThrowTarget) == 8),
              "the layout is public");
