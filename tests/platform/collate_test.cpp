// Comparison by the runtime's locale outside of "C".

#include <gtest/gtest.h>

#include <clocale>
#include <string>

#include "qxcore/string/string.h"
#include "tests/support/text.h"
#include "tests/support/wine.h"

#ifndef _WIN32
#include <dlfcn.h>

// Most machines have no locale but "C": the name that the library asks for is pretended, its order is ICU's.
static const char* g_pretended = nullptr;

extern "C" char* setlocale(int category, const char* locale) noexcept {
  static auto* const real = reinterpret_cast<char* (*)(int, const char*)>(dlsym(RTLD_NEXT, "setlocale"));
  if (g_pretended != nullptr && locale == nullptr && category == LC_COLLATE) return const_cast<char*>(g_pretended);
  return real(category, locale);
}
#endif

namespace {

// The locale of the order for as long as this lives.
class Locale {
 public:
  explicit Locale([[maybe_unused]] const char* posixName, [[maybe_unused]] const char* windowsName) {
#ifdef _WIN32
    m_isThere = std::setlocale(LC_COLLATE, windowsName) != nullptr;
#else
    g_pretended = posixName;
#endif
  }
  ~Locale() {
#ifdef _WIN32
    std::setlocale(LC_COLLATE, "C");
#else
    g_pretended = nullptr;
#endif
  }
  bool IsThere() const { return m_isThere; }

 private:
  bool m_isThere = true;
};

const SString kWord = WTEXT("\u00E4pple"), kLast = WTEXT("zebra"), kFirst = WTEXT("bok");

TEST(Collation, FollowsTheLocale) {
  EXPECT_GT(kWord.Collate(kLast), 0) << "by code unit in the C locale";
  EXPECT_LT(SString(WTEXT("Z")).Collate(WTEXT("a")), 0);
  EXPECT_EQ(SString(WTEXT("ABC")).CollateNoCase(WTEXT("abc")), 0);
  EXPECT_EQ(SString(WTEXT("xab")).CollateNoCase(1, WTEXT("ABC"), 2), 0);
  {
    const Locale german("de_DE.UTF-8", "German");
    if (!german.IsThere()) GTEST_SKIP() << "no such locale";
    EXPECT_LT(kWord.Collate(kLast), 0);
    EXPECT_LT(kWord.Collate(kFirst), 0);
    EXPECT_GT(SString(WTEXT("Z")).Collate(WTEXT("a")), 0);
  }
  const Locale swedish("sv_SE.UTF-8", "Swedish");
  if (!IsWine()) {  // whose order is the same for all languages
    EXPECT_GT(kWord.Collate(kLast), 0) << "a letter of its own, behind z";
  }
  EXPECT_LT(kFirst.Collate(kWord), 0);
  EXPECT_EQ(kWord.CollateNoCase(WTEXT("\u00C4PPLE")), 0);
  EXPECT_NE(kWord.Collate(WTEXT("\u00C4PPLE")), 0);
  // The eight forms cut where they say, whatever the order.
  const SString text = WTEXT("xx\u00E4b1");
  EXPECT_EQ(text.Collate(2, WTEXT("\u00E4b1")), 0);
  EXPECT_EQ(text.Collate(WTEXT("xx\u00E4c"), 3), 0);
  EXPECT_LT(text.Collate(2, WTEXT("\u00E4c"), 2), 0);
  EXPECT_EQ(text.CollateNoCase(2, WTEXT("\u00C4B1")), 0);
  EXPECT_EQ(text.CollateNoCase(WTEXT("XX\u00C4C"), 3), 0);
  EXPECT_EQ(text.CollateNoCase(2, WTEXT("\u00C4BX"), 2), 0);
  EXPECT_EQ(text.Collate(WTEXT("xx\u00E4b1"), 99), 0);
}

}  // namespace
