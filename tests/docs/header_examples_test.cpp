// The examples of the headers, each in the setting that it speaks of. header_examples.py takes them out.

#include <gtest/gtest.h>

#include <cerrno>
#include <cstring>
#include <string>

#include "qxcore/qxcore.h"
#include "tests/stream/zip_builder.h"
#include "tests/support/temp_folder.h"

namespace {

std::string g_shown;
void Show(const char* text) { (g_shown += text) += '\n'; }
void Show(const SString& text) { Show(text.ToUtf8().c_str()); }
void Show(const SZipEntry& entry) { Show(entry.GetName()); }
template <class First, class Second>
void Show(const First& first, const Second& second) {
  Show(first);
  Show(second);
}

class HeaderExamples : public ::testing::Test {
 protected:
  HeaderExamples() { g_shown.clear(); }
  SString Write(const WCHAR* name, const std::string& bytes) const {
    EXPECT_TRUE(test::WriteAll(m_folder.File(name), bytes));
    return SString(m_folder.File(name).c_str());
  }

  const test::TempFolder m_folder;
  const SString folder{m_folder.Path().c_str()};
};

TEST_F(HeaderExamples, AnAbortNeedsACatcher) {
  const auto example = [text = SString(WTEXT("stopped"))] {
#include "core_throw_target.inc"
  };
  EXPECT_NO_THROW(example());
  struct Catcher : SThrowTarget {
    Catcher() : SThrowTarget(WTEXT("DlgAbort")) { Activate(); }
  } catcher;
  EXPECT_THROW(example(), STargetedException);
}

TEST_F(HeaderExamples, TheCauseOfAFailure) {
  try {
    SInputFile missing(folder + WTEXT("\\missing"));
  }
#include "core_error_cause.inc"
  EXPECT_NE(g_shown.find(std::strerror(ENOENT)), std::string::npos) << g_shown;
}

TEST_F(HeaderExamples, WordsOfAText) {
  const SString text(WTEXT("two words"));
#include "string_string_iterators.inc"
  EXPECT_EQ(g_shown, "two\nwords\n");
}

TEST_F(HeaderExamples, BinaryStreams) {
  const SString path = folder + WTEXT("\\document");
  {
    const SString title(WTEXT("Title"));
    const SStringTable names = {SString(WTEXT("one")), SString(WTEXT("two"))};
    SStringMap settings;
    settings.Add(SString(WTEXT("key")), SString(WTEXT("value")));
#include "stream_output_binary_stream.inc"
    file.Close();
  }
  SString title;
  SStringTable names;
  SStringMap settings;
#include "stream_input_binary_stream.inc"
  EXPECT_EQ(title, WTEXT("Title"));
  EXPECT_EQ(names.GetCount(), 2);
  EXPECT_EQ(settings.GetCount(), 1);
}

TEST_F(HeaderExamples, LinesOfATextFile) {
  const SString path = Write(WTEXT("text"), "one\r\ntwo");
#include "stream_encoding_multi_format_reader_unicode.inc"
  EXPECT_EQ(g_shown.substr(0, 8), "one\ntwo\n");
}

TEST_F(HeaderExamples, EntriesOfAnArchive) {
  test::ZipBuilder zip;
  zip.parts = {{"a", "x"}, {"b/c", "y"}};
  const SString path = Write(WTEXT("archive"), zip.Make());
#include "stream_zip_zip_file.inc"
  EXPECT_EQ(g_shown, "a\nb/c\n");
}

TEST_F(HeaderExamples, FilesOfATree) {
  Write(WTEXT("one.txt"), "");
  ASSERT_TRUE(CreateDirectoryW((folder + WTEXT("\\sub")), nullptr));
  Write(WTEXT("sub\\two.txt"), "");
  Write(WTEXT("sub\\three.doc"), "");
#include "system_file_recurse_find.inc"
  EXPECT_NE(g_shown.find("one.txt\n"), std::string::npos) << g_shown;
  EXPECT_NE(g_shown.find("two.txt\n"), std::string::npos) << g_shown;
  EXPECT_EQ(g_shown.find("three"), std::string::npos) << g_shown;
}

TEST_F(HeaderExamples, TheStartOfAMappedFile) {
  const SString path = Write(WTEXT("mapped"), "mapped");
  char buffer[3];
#include "system_file_mapped_file.inc"
  EXPECT_EQ(status, S_OK);
  EXPECT_EQ(std::string(buffer, count), "map");
}

TEST_F(HeaderExamples, AFolderForAWhile) {
  Write(WTEXT("settings.ini"), "");
  const SString before = SFile::GetCurrentDirectoryW();
  {
#include "system_file_current_directory.inc"
    EXPECT_EQ(settings.Open(), SFile::kOk);
  }
  EXPECT_EQ(SFile::GetCurrentDirectoryW(), before);
}

int Keep(int, void*, unsigned long data) { return static_cast<int>(g_shown.append(data, 'x').size()); }

TEST_F(HeaderExamples, ASinkOfNotifications) {
  {
#include "system_notification_sink.inc"
    SNotificationManager::Notify(SNotificationManager::NotificationKind(WTEXT("TitleChanged")), nullptr, 3);
  }
  SNotificationManager::Notify(SNotificationManager::NotificationKind(WTEXT("TitleChanged")), nullptr, 3);
  EXPECT_EQ(g_shown, "xxx") << "a sink that is gone is not called";
}

}  // namespace
