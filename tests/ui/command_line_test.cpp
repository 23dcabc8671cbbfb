// Command lines: the rules of quoting, switches and files.

#include "tests/ui/ui_fixture.h"

namespace {

std::string Joined(const SStringTable& table) {
  std::string text;
  for (int i = 0; i < table.GetCount(); ++i) text += "[" + SString(table[i].View()).ToUtf8() + "]";
  return text;
}

TEST(CommandLine, Words_AreSplitByThePlatformsRules) {
  struct Row {
    const WCHAR* line;
    const char* words;
  };
  // The rules and the first examples are those of the published documentation of the runtime.
  const Row rows[] = {
      {WTEXT("p \"abc\" d e"), "[abc][d][e]"},
      {WTEXT("p a\\\\b d\"e f\"g h"), "[a\\\\b][de fg][h]"},
      {WTEXT("p a\\\\\\\"b c d"), "[a\\\"b][c][d]"},
      {WTEXT("p a\\\\\\\\\"b c\" d e"), "[a\\\\b c][d][e]"},
      {WTEXT("p a\"b\"\" c d"), "[ab\" c d]"},
      {WTEXT("p \t \"\" \"a b"), "[][a b]"},
      {WTEXT("p C:\\dir\\ \"C:\\my dir\\\\\""), "[C:\\dir\\][C:\\my dir\\]"},
      {WTEXT("p"), ""},
      {WTEXT(""), ""},
  };
  for (const Row& row : rows)
    EXPECT_EQ(Joined(SCommandLine(row.line).GetWords()), row.words) << SString(row.line).ToUtf8();
  EXPECT_EQ(SCommandLine(WTEXT("\"C:\\my tools\\p.exe\" x")).GetProgram(), SString(WTEXT("C:\\my tools\\p.exe")));
  EXPECT_EQ(SCommandLine(WTEXT("C:\\a\\\"b c\" x")).GetProgram(), SString(WTEXT("C:\\a\\b c")));
}

TEST(CommandLine, SwitchesAndFiles_AreToldApart) {
  const SCommandLine line(WTEXT("p -a /mode:fast one.txt --Level=3 - -mode:slow -- -file \"two words\""));
  EXPECT_EQ(Joined(line.GetSwitches()), "[a][mode:fast][Level=3][mode:slow]");
  EXPECT_EQ(Joined(line.GetFiles()), "[one.txt][-][-file][two words]");
  EXPECT_TRUE(line.HasSwitch(WTEXT("A")));
  EXPECT_FALSE(line.HasSwitch(WTEXT("file")));
  EXPECT_EQ(line.GetSwitchValue(WTEXT("mode")), SString(WTEXT("slow")));
  EXPECT_EQ(line.GetSwitchValue(WTEXT("level")), SString(WTEXT("3")));
  EXPECT_EQ(line.GetSwitchValue(WTEXT("a")), SString());
}

TEST(CommandLine, Application_KnowsItsProgram) {
  SWinApp app;
  char words[] = "-q \"a file.txt\"";
  EXPECT_TRUE(app.Init(nullptr, nullptr, words, SW_HIDE));
  EXPECT_EQ(SGetApp(), &app);
  EXPECT_EQ(app.GetExeName(), SString(WTEXT("test_ui")));
  EXPECT_EQ(app.GetAppName(), app.GetExeName());
  EXPECT_TRUE(SFile::Exists(app.GetExeFullFileName()));
  EXPECT_EQ(app.GetExeFullFileName().View().substr(app.GetExeFullFileName().Length() - app.GetExeFileName().Length()),
            app.GetExeFileName().View());
  EXPECT_TRUE(app.GetCommmandLine().HasSwitch(WTEXT("q")));
  EXPECT_EQ(Joined(app.GetCommmandLine().GetFiles()), "[a file.txt]");
  EXPECT_TRUE(app.Init(nullptr, nullptr, nullptr, SW_HIDE));
  EXPECT_EQ(SCommandLine(::GetCommandLineW()).GetWords().GetCount(), app.GetCommmandLine().GetWords().GetCount());
  EXPECT_EQ(app.GetPrinterDeviceDefaults(nullptr), 0);
  EXPECT_EQ(app.DoPrintDialog(nullptr), IDCANCEL);
  EXPECT_EQ(app.OnDDECommand(nullptr), 0);
}

}  // namespace
