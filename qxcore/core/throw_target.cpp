#include "qxcore/core/throw_target.h"

#include <new>

#include "qxcore/container/map.h"
#include "qxcore/string/internal/text_search.h"
#include "qxcore/string/string_iterators.h"

namespace {

using Registry = SMap<SString, std::int32_t, SAscStrCas>;

// Lives as long as the process: targets of other modules may end after everything here.
Registry& TheRegistry() {
  alignas(Registry) static unsigned char storage[sizeof(Registry)];
  static Registry* registry = new (storage) Registry;
  return *registry;
}

}  // namespace

SString STargetedException::GetMessageText() const { return m_text; }
std::int32_t STargetedException::GetValue() const { return m_value; }

int STargetedException::HasTarget() const {
  for (parts_iterator name(m_targets, WTEXT(',')); name; ++name) {
    const std::int32_t* count = TheRegistry().Retrieve(*name);
    if (count != nullptr && *count > 0) return 1;
  }
  return 0;
}

int STargetedException::Match(const SThrowTarget& target) const {
  SStringView names = target.GetNames().View();
  for (parts_iterator name(m_targets, WTEXT(',')); name; ++name) {
    SStringView wanted = name.View();
    for (std::size_t at = names.find(wanted); at != SStringView::npos; at = names.find(wanted, at + 1)) {
      std::size_t end = at + wanted.size();
      if (end == names.size() || names[end] == WTEXT(',')) return 1;
    }
  }
  return 0;
}

// Adds to the counts of the names, as often as each stands in the list. Takes no memory.
static void Count(SStringView names, int step) noexcept {
  for (auto& [known, count] : TheRegistry()) {
    SStringView rest = names;
    for (bool isLast = false; !isLast;) {
      const std::size_t end = rest.find(WTEXT(','));
      isLast = end == SStringView::npos;
      if (rest.substr(0, end) == known.View()) count += step;
      if (!isLast) rest.remove_prefix(end + 1);
    }
  }
}

void SThrowTarget::Activate() {
  if (m_active != 0) return;
  // All names are made known before one is counted, so that a failure counts none.
  for (parts_iterator name(m_names, WTEXT(',')); name; ++name) TheRegistry()[*name];
  m_active = 1;
  Count(m_names.View(), 1);
}

void SThrowTarget::Done() noexcept {
  if (m_active == 0) return;
  m_active = 0;
  Count(m_names.View(), -1);
}
