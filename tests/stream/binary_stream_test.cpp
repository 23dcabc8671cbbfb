// The binary format: the bytes themselves, a file that another program made, round trips, and bad input.

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "qxcore/core/io_exceptions.h"
#include "qxcore/stream/input_binary_stream.h"
#include "qxcore/stream/input_buffer.h"
#include "qxcore/stream/input_file.h"
#include "qxcore/stream/output_binary_stream.h"
#include "qxcore/stream/output_global.h"
#include "tests/support/failing_allocations.h"
#include "tests/support/text.h"

namespace {

template <class... Values>
std::string BytesOf(const Values&... values) {
  SOutputGlobal memory;
  SOutputBinaryStream out(memory);
  (out << ... << values);
  return std::string(static_cast<const char*>(memory.GetData()), memory.UsedSize());
}

template <class... Values>
void ReadFrom(const std::string& bytes, Values&... values) {
  SInputBuffer memory(bytes.data(), static_cast<unsigned long>(bytes.size()));
  SInputBinaryStream in(memory);
  (in >> ... >> values);
}

SString Repeated(WCHAR character, int count) {
  return SString(SStringView(WideString(static_cast<std::size_t>(count), character)));
}

TEST(BinaryStream, StringPrefixes_GrowAtTheirLimits) {
  EXPECT_EQ(BytesOf(SString()), std::string("\x01\x00", 2));
  EXPECT_EQ(BytesOf(SString(WTEXT("AB"))), std::string("\x03\x41\x42\x00", 4));
  struct Case {
    int bytes;
    std::string prefix;
  };
  for (const Case& one :
       {Case{253, "\xFE"}, Case{254, std::string("\xFF\xFF\x00", 3)}, Case{65533, std::string("\xFF\xFE\xFF", 3)},
        Case{65534, std::string("\xFF\xFF\xFF\xFF\xFF\x00\x00", 7)}}) {
    const SString text = Repeated('x', one.bytes);
    const std::string bytes = BytesOf(text);
    EXPECT_EQ(bytes, one.prefix + std::string(static_cast<std::size_t>(one.bytes), 'x') + '\0') << one.bytes;
    SString back;
    ReadFrom(bytes, back);
    EXPECT_EQ(back, text) << one.bytes;
  }
}

TEST(BinaryStream, Counts_AreSignedAndLittleEndian) {
  for (const std::int32_t count : {0, 1, -1, 0x01020304, INT32_MIN, INT32_MAX}) {
    SOutputGlobal memory;
    SOutputBinaryStream out(memory);
    SWriteCount(out, count);
    ASSERT_EQ(memory.UsedSize(), 4u);
    const auto* bytes = static_cast<const unsigned char*>(memory.GetData());
    EXPECT_EQ(bytes[0], count & 0xFF);
    SInputBuffer whole(bytes, 4), cut(bytes, 3);
    SInputBinaryStream in(whole), short_(cut);
    EXPECT_EQ(SReadCount(in), count);
    EXPECT_THROW(SReadCount(short_), SEEOFException);
  }
}

TEST(BinaryStream, FileOfAnotherProgram_IsReadAndWrittenToTheByte) {
  const SStringTable strings{WTEXT(""),           WTEXT("AB"),        WTEXT("\x00E9\x20AC\xD83D\xDE00"),
                             Repeated('x', 253),  Repeated('y', 254), Repeated(0xFC, 32767) + WTEXT("z"),
                             Repeated('w', 65534)};
  SStringUnsortedMap unsorted{
      {WTEXT("b"), WTEXT("2")}, {WTEXT("B"), WTEXT("two")}, {WTEXT("a"), WTEXT("1")}, {WTEXT(""), WTEXT("nothing")}};
  SStringUnsortedMapNoCase unsortedNoCase;
  SStringMap sorted;
  SStringMapNoCase sortedNoCase;
  unsortedNoCase += unsorted;
  sorted += unsorted;
  sortedNoCase += unsorted;
  const std::string written = BytesOf(strings, sorted, sortedNoCase, unsorted, unsortedNoCase);

  SInputFile file(SString(QXCORE_SOURCE_DIR "/tests/stream/golden/binary_format.bin"));
  std::string golden(1 << 20, '\0');
  golden.resize(file.Read(golden.data(), static_cast<unsigned long>(golden.size())));
  EXPECT_TRUE(written == golden) << written.size() << " bytes, not " << golden.size();

  SStringTable backStrings{WTEXT("former")};
  SStringMap backSorted;
  SStringMapNoCase backSortedNoCase;
  SStringUnsortedMap backUnsorted;
  SStringUnsortedMapNoCase backUnsortedNoCase;
  ReadFrom(golden, backStrings, backSorted, backSortedNoCase, backUnsorted, backUnsortedNoCase);
  EXPECT_TRUE(backStrings == strings);
  EXPECT_TRUE(backSorted == sorted && backSortedNoCase == sortedNoCase && backUnsorted == unsorted &&
              backUnsortedNoCase == unsortedNoCase);
  EXPECT_EQ(BytesOf(backStrings, backSorted, backSortedNoCase, backUnsorted, backUnsortedNoCase), golden);
}

TEST(BinaryStream, AnyText_ComesBack) {
  RandomText random(7);
  SString reused, holder;
  for (int round = 0; round < 3000; ++round) {
    WideString text = random.Make(100, WTEXT("ab\x7F\x80\x7FF\x800\xD800\xDFFF\xFFFF"));
    if (round % 100 == 0) text.resize(40'000, text.empty() ? 'x' : text[0]);  // beyond the working buffer
    SString back;
    ReadFrom(BytesOf(SString(SStringView(text))), back);
    ASSERT_EQ(back.View(), SStringView(text)) << "round " << round;
    // The same into a string with a buffer, which others may share.
    const WideString before(reused.GetSafePointer());
    if (round % 3 == 0) holder = reused;
    ReadFrom(BytesOf(back), reused);
    ASSERT_EQ(reused.View(), SStringView(text)) << "round " << round;
    if (round % 3 == 0) {
      ASSERT_EQ(holder.View(), SStringView(before)) << "round " << round;
    }
    ASSERT_LT(reused.GetAllocLength(), 4 * reused.Length() + 600) << "a short text holds a large buffer";
  }
}

TEST(BinaryStream, ZeroBytesEndATextEarly) {
  SString text;
  ReadFrom(std::string("\x04"
                       "a\0b\0",
                       5),
           text);
  EXPECT_EQ(text, WTEXT("a"));
  ReadFrom(std::string("\x03\0bc", 4), text);
  EXPECT_EQ(text, SString::null);
  ReadFrom(std::string("\x05"
                       "a\xC0\x80"
                       "b\0",
                       6),
           text);
  EXPECT_EQ(text, WTEXT("a"));
  text = WTEXT("former");
  ReadFrom(std::string(1, '\0'), text);
  EXPECT_EQ(text, SString::null);
  EXPECT_EQ(BytesOf(SString(SStringView(WTEXT("a\0b"), 3))), std::string("\x02"
                                                                         "a\0",
                                                                         3));
}

// The name of the exception that reading one value throws; empty for none.
template <class Value>
SString FailureOf(const std::string& bytes, Value& value) {
  try {
    ReadFrom(bytes, value);
  } catch (const SEIOException& e) {
    return e.GetText();
  }
  return SString();
}

TEST(BinaryStream, BadInput_IsTold) {
  const SString end = WTEXT("Unexpected end of file."), invalid = WTEXT("Invalid string in binary stream");
  SString text = WTEXT("former");
  EXPECT_EQ(FailureOf("", text), end);
  EXPECT_EQ(FailureOf("\xFF\x01", text), end);
  EXPECT_EQ(FailureOf(std::string("\xFF\xFF\xFF\x01\x00\x00", 6), text), end);
  EXPECT_EQ(FailureOf("\xFF\xFF\xFF\xFF\xFF\xFF\xFF", text), invalid) << "negative";
  EXPECT_EQ(FailureOf(std::string("\xFF\xFF\xFF\x01\x00\x30\x00xxx", 10), text), invalid) << "one above the limit";
  EXPECT_EQ(text, WTEXT("former"));
  EXPECT_EQ(FailureOf(std::string("\xFF\xFF\xFF\x00\x00\x30\x00xxx", 10), text), SString::null) << "the limit itself";
  EXPECT_EQ(text, WTEXT("xxx")) << "cut, and not told";
  const SString large = Repeated('l', 0x300000);
  EXPECT_EQ(FailureOf(BytesOf(large), text), SString::null) << "the stream has them all";
  EXPECT_EQ(text, large);

  SStringTable table{WTEXT("former")};
  EXPECT_EQ(FailureOf(std::string("\xFF\xFF\xFF\x7F\x02"
                                  "a\0\x02"
                                  "b\0",
                                  10),
                      table),
            end)
      << "a count of two thousand million";
  EXPECT_EQ(table.GetCount(), 2);
  EXPECT_EQ(FailureOf("\xFE\xFF\xFF\xFF", table), SString::null);
  EXPECT_TRUE(table.IsEmpty()) << "a negative count";
  SStringMap map{{WTEXT("former"), WTEXT("")}};
  EXPECT_EQ(FailureOf(std::string("\x01\x00\x00\x00\x02"
                                  "a\0",
                                  7),
                      map),
            end)
      << "a key without a value";
  EXPECT_TRUE(map.IsEmpty());
}

TEST(BinaryStream, EveryCut_IsToldOrShortensTheLastText) {
  const SStringTable table{WTEXT("one"), Repeated('2', 300), WTEXT("three")};
  const std::string whole = BytesOf(table);
  for (std::size_t size = 0; size < whole.size(); ++size) {
    SStringTable back;
    const SString failure = FailureOf(whole.substr(0, size), back);
    if (back.GetCount() < 3) {
      ASSERT_EQ(failure, WTEXT("Unexpected end of file.")) << size;
    }
    for (int i = 0; i < back.GetCount(); ++i) ASSERT_EQ(table[i].Compare(back[i], back[i].Length()), 0);
  }
}

TEST(BinaryStream, OwnedStreams_AreDeleted) {
  class Owned : public SInputBuffer {
   public:
    explicit Owned(bool& gone) : SInputBuffer("\x02z", 3), m_gone(gone) {}
    ~Owned() override { m_gone = true; }

   private:
    bool& m_gone;
  };
  bool gone = false;
  {
    SInputBinaryStream in(new Owned(gone), true);
    SString text;
    in >> text;
    EXPECT_EQ(text, WTEXT("z"));
    EXPECT_FALSE(gone);
  }
  EXPECT_TRUE(gone);
}

TEST(BinaryStream, FailedAllocation_KeepsTheText) {
  for (const SString& written : {Repeated('x', 200'000), Repeated(0x20AC, 60'000)}) {
    const std::string bytes = BytesOf(written);
    SString text = WTEXT("former");
    const int failures = WithEachAllocationFailing([&] { ReadFrom(bytes, text = WTEXT("former")); },
                                                   [&] { EXPECT_EQ(text, WTEXT("former")); });
    EXPECT_GE(failures, 2);
  }
}

}  // namespace
