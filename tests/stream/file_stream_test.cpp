// Streams on real files and over sources and targets that fail.

#include <gtest/gtest.h>

#include <cerrno>
#include <fstream>
#include <random>
#include <string>
#include <vector>

#include "qxcore/core/io_exceptions.h"
#include "qxcore/stream/input_buffer_stream.h"
#include "qxcore/stream/input_file.h"
#include "qxcore/stream/input_pushback_stream.h"
#include "qxcore/stream/output_buffer_stream.h"
#include "qxcore/stream/output_file.h"
#include "qxcore/stream/seekable_input_ansi_file.h"
#include "qxcore/stream/seekable_string_input_stream.h"
#include "tests/stream/reader_fixture.h"
#include "tests/support/failing_allocations.h"
#include "tests/support/steps.h"
#include "tests/support/temp_folder.h"
#include "tests/support/text.h"

#ifndef _WIN32
#include <fcntl.h>
#include <unistd.h>
#endif

namespace {

using test::ReadAll;
using test::TempFolder;
using test::WriteAll;

SString Path(const test::Text& path) { return SString(path.c_str()); }

std::string RandomBytes(std::size_t count) {
  std::mt19937 random(static_cast<unsigned>(count));
  std::string bytes(count, '\0');
  for (char& byte : bytes) byte = static_cast<char>(random());
  return bytes;
}

// Reads to the end with a random mix of all the calls.
std::string ReadMixed(SInputStream& in, unsigned seed) {
  std::mt19937 random(seed);
  std::string all;
  char block[5000];
  for (test::Steps steps;; steps.Take()) {
    switch (random() % 3) {
      case 0: {
        const int byte = in.Read();
        if (byte < 0) return all;
        all += static_cast<char>(byte);
        break;
      }
      case 1: {
        const unsigned long wanted = random() % sizeof block;
        const unsigned long got = in.Read(block, wanted);
        all.append(block, got);
        if (got < wanted) return all;
        break;
      }
      default:
        EXPECT_EQ(in.Read(block, 0), 0u);
    }
  }
}

TEST(RealFiles, EveryMixOfReadsGivesTheFile) {
  TempFolder folder;
  for (std::size_t size : {0u, 1u, 255u, 256u, 257u, 4096u, 100000u}) {
    const std::string bytes = RandomBytes(size);
    const test::Text path = folder.File(WTEXT("data"));
    ASSERT_TRUE(WriteAll(path, bytes));
    for (unsigned seed = 0; seed < 8; ++seed) {
      SInputFile plain(Path(path));
      EXPECT_EQ(plain.Available(), size);
      EXPECT_EQ(plain.IsEOF(), size == 0);
      EXPECT_EQ(ReadMixed(plain, seed), bytes);
      EXPECT_TRUE(plain.IsEOF());
      EXPECT_EQ(plain.Available(), 0u);
      EXPECT_EQ(plain.GetError(), 0);
      SInputFile inner(Path(path));
      SInputBufferStream buffered(inner, seed == 0 ? 0 : seed * 100);
      EXPECT_EQ(buffered.Available(), size);
      EXPECT_EQ(ReadMixed(buffered, seed), bytes);
      EXPECT_TRUE(buffered.IsEOF());
      SInputPushbackStream pushback(new SInputFile(Path(path)), 16, true);
      EXPECT_EQ(ReadMixed(pushback, seed), bytes);
    }
  }
}

TEST(RealFiles, SkippingIsReading) {
  TempFolder folder;
  const std::string bytes = RandomBytes(10000);
  const test::Text path = folder.File(WTEXT("data"));
  WriteAll(path, bytes);
  SInputFile file(Path(path));
  SInputFile inner(Path(path));
  SInputBufferStream buffered(inner, 64);
  for (SInputStream* in : std::vector<SInputStream*>{&file, &buffered}) {
    EXPECT_EQ(in->Skip(0), 0u);
    EXPECT_EQ(in->Skip(10), 10u);
    EXPECT_EQ(in->Read(), static_cast<unsigned char>(bytes[10]));
    EXPECT_EQ(in->Skip(5000), 5000u);
    EXPECT_EQ(in->Read(), static_cast<unsigned char>(bytes[5011]));
    EXPECT_FALSE(in->IsEOF());
    EXPECT_EQ(in->Skip(100000), 10000u - 5012u);
    EXPECT_EQ(in->Read(), -1);
    EXPECT_TRUE(in->IsEOF());
  }
  EXPECT_FALSE(file.SeekPos(5));
  EXPECT_EQ(file.Read(), static_cast<unsigned char>(bytes[5]));
  file.Close();
  EXPECT_EQ(file.Read(), -1);
}

TEST(RealFiles, WhatCannotBeOpenedThrows) {
  TempFolder folder;
  for (const SString& path : {Path(folder.File(WTEXT("missing"))), Path(folder.Path()), SString()})
    EXPECT_THROW(SInputFile{path}, SEIOCantOpenForReading);
  EXPECT_THROW(SOutputFile(Path(folder.File(WTEXT("no\\such\\folder")))), SEIOCantOpenForWriting);
}

TEST(RealFiles, WritingAndAppending) {
  TempFolder folder;
  const test::Text path = folder.File(WTEXT("out"));
  const std::string bytes = RandomBytes(20000);
  {
    SOutputFile file;
    EXPECT_EQ(file.GetPosition(), -1);
    EXPECT_THROW(file.Write('x'), SEIOWriteFailed);  // nothing is open
    file.Init(Path(path), 0);
    SOutputBufferStream buffered(file, 100);
    std::mt19937 random(1);
    for (std::size_t at = 0; at < bytes.size();) {
      const std::size_t piece = std::min<std::size_t>(random() % 250, bytes.size() - at);
      if (piece == 1) {
        buffered.Write(bytes[at]);
      } else {
        EXPECT_EQ(buffered.Write(bytes.data() + at, static_cast<unsigned long>(piece)), piece);
      }
      at += piece;
    }
    buffered.Flush();
    EXPECT_EQ(file.GetPosition(), 20000);
    EXPECT_EQ(ReadAll(path), bytes);
    buffered.Write('!');  // the destructor hands it on
  }
  EXPECT_EQ(ReadAll(path), bytes + "!");
  SOutputFile more(Path(path), SOutputFile::kAppend);
  EXPECT_EQ(more.GetPosition(), 20001);
  more.Write(0x141);  // the low eight bits
  more.Close();
  more.Close();
  EXPECT_EQ(more.GetPosition(), -1);
  EXPECT_THROW(more.Write('x'), SEIOWriteFailed);
  EXPECT_EQ(ReadAll(path), bytes + "!A");
  SOutputFile(Path(path)).Close();
  EXPECT_EQ(ReadAll(path), "");
}

// What a file, and a filter over one, still has to give at every place.
TEST(RealFiles, WhatIsAvailableIsWhatIsLeft) {
  TempFolder folder;
  const test::Text path = folder.File(WTEXT("file"));
  const unsigned long size = 70000;
  WriteAll(path, std::string(size, 'x'));
  SInputFile plain(Path(path)), below(Path(path)), deeper(Path(path));
  SInputBufferStream buffered(below, 100);
  SInputPushbackStream pushback(deeper, 10);
  for (SInputStream* in : {static_cast<SInputStream*>(&plain), static_cast<SInputStream*>(&buffered),
                           static_cast<SInputStream*>(&pushback)}) {
    std::string block(7001, 0);
    for (unsigned long left = size; left > 0;) {
      ASSERT_EQ(in->Available(), left);
      left -= in->Read(block.data(), block.size());
      if (left == 0) break;
      ASSERT_EQ(in->Read(), 'x');
      ASSERT_EQ(in->Available(), --left);
      left -= in->Skip(13);
    }
    EXPECT_EQ(in->Read(), -1);
    EXPECT_EQ(in->Available(), 0u);
  }
}

TEST(RealFiles, LinesOfTheAnsiPage) {
  TempFolder folder;
  const test::Text path = folder.File(WTEXT("lines"));
  const std::string longLine(1000, 'x');
  WriteAll(path, "one\r\ntwo\n\n\xE9\x80\r\r\n" + longLine + "\nlast");
  SSeekableInputANSIFile file(Path(path));
  EXPECT_TRUE(file.SeekSupported());
  SSeekableStringInputStream stream(file);
  EXPECT_EQ(file.ReadLn(), SString(WTEXT("one")));
  const unsigned long second = file.GetPos();
  EXPECT_EQ(second, 5u);
  EXPECT_EQ(stream.ReadLn(), SString(WTEXT("two")));
  EXPECT_EQ(file.ReadLn(), SString());
  EXPECT_FALSE(stream.IsEOF());
  EXPECT_EQ(file.ReadLn(), SString(WTEXT("\x00E9\x20AC\r")));
  EXPECT_EQ(file.ReadLn().Length(), 1000);
  EXPECT_EQ(stream.ReadLn(), SString(WTEXT("last")));
  EXPECT_TRUE(stream.IsEOF());
  EXPECT_EQ(file.ReadLn(), SString());
  EXPECT_FALSE(stream.SeekPos(second));
  EXPECT_FALSE(file.IsEOF());
  stream.Mark(1);
  EXPECT_EQ(stream.Read(), 't');
  EXPECT_EQ(file.ReadLn(), SString(WTEXT("wo")));
  stream.Reset();
  EXPECT_EQ(file.ReadLn(), SString(WTEXT("two")));
  EXPECT_NE(file.GetFile(), nullptr);
  EXPECT_FALSE(stream.SeekPos(second));
  EXPECT_EQ(stream.Read(), 't');
  WCHAR rest[2];
  EXPECT_EQ(stream.Read(rest, 5), 4u) << "whole characters only";
  EXPECT_EQ(SStringView(rest, 2), WTEXT("wo"));
  EXPECT_EQ(stream.GetPos(), second + 3);
  const test::Text cut = folder.File(WTEXT("cut"));
  WriteAll(cut, "cut\r");
  EXPECT_EQ(SSeekableInputANSIFile(Path(cut)).ReadLn(), SString(WTEXT("cut\r")));
}

class Indicator : public SProgressIndicatorEx {
 public:
  void SetRange(std::uint64_t, std::uint64_t upper) override { range = upper; }
  void SetPos(std::uint64_t to) override {
    EXPECT_GE(to, position);
    position = to;
    ++moves;
  }
  std::uint64_t GetPos() const override { return position; }
  bool IsCancelled() override { return ++questions == cancelAt; }

  std::uint64_t range = 1, position = 0;
  int moves = 0, questions = 0, cancelAt = 0;
};

TEST(RealFiles, ProgressGoesTheSameWayAgain) {
  class Counter : public SProgressIndicatorEx {
   public:
    void SetRange(std::uint64_t, std::uint64_t) override {}
    void SetPos(std::uint64_t) override { ++moves; }
    std::uint64_t GetPos() const override { return 0; }
    bool IsCancelled() override { return false; }
    int moves = 0;
  } indicator;
  TempFolder folder;
  const test::Text path = folder.File(WTEXT("data"));
  WriteAll(path, RandomBytes(100000));
  SInputFile file(Path(path), &indicator);
  while (file.Read() >= 0) {
  }
  const int once = indicator.moves;
  EXPECT_GT(once, 50);
  EXPECT_TRUE(file.GoToPlace(0));
  while (file.Read() >= 0) {
  }
  EXPECT_GT(indicator.moves, 2 * once - 10);
}

TEST(RealFiles, ProgressAndCancelling) {
  TempFolder folder;
  const std::string bytes = RandomBytes(100000);
  const test::Text path = folder.File(WTEXT("data"));
  WriteAll(path, bytes);
  {
    Indicator indicator;
    SInputFile file(Path(path), &indicator);
    EXPECT_EQ(indicator.range, 100000u);
    EXPECT_EQ(indicator.position, 0u);
    for (test::Steps steps; file.Read() >= 0; steps.Take()) {
    }
    EXPECT_EQ(indicator.position, 100000u);
    EXPECT_GE(indicator.questions, 100);
    EXPECT_LE(indicator.questions, 102);
  }
  // A cancelled read loses nothing: going on delivers the whole file. A large piece is cancelled in its middle.
  const std::string manyBytes = RandomBytes(1000000);
  const test::Text large = folder.File(WTEXT("large"));
  WriteAll(large, manyBytes);
  for (unsigned piece : {1u, 700u, 30000u, 400000u}) {
    const bool isLarge = piece > bytes.size();
    Indicator indicator;
    indicator.cancelAt = 3;
    SInputFile file(Path(isLarge ? large : path), &indicator);
    std::string all, block(piece, '\0');
    int cancelled = 0;
    for (unsigned long got = 1; got > 0;) {
      try {
        got = file.Read(block.data(), piece);
        all.append(block, 0, got);
      } catch (const SEIOAbortedException&) {
        ++cancelled;
      }
    }
    EXPECT_EQ(cancelled, 1);
    EXPECT_TRUE(all == (isLarge ? manyBytes : bytes)) << piece;
  }
  Indicator indicator;
  SSeekableInputANSIFile file(Path(path), &indicator);
  EXPECT_FALSE(file.SeekPos(50000));
  EXPECT_EQ(file.Read(), static_cast<unsigned char>(bytes[50000]));
  EXPECT_FALSE(file.SeekPos(10));
  EXPECT_EQ(indicator.position, 50001u);  // never goes back
  EXPECT_EQ(file.Read(), static_cast<unsigned char>(bytes[10]));
  indicator.cancelAt = indicator.questions + 1;
  EXPECT_THROW(file.SeekPos(99), SEIOAbortedException);
  EXPECT_EQ(file.GetPos(), 11u);
  Indicator single;
  SInputFile bytewise(Path(path), &single);
  single.cancelAt = 3;
  const auto readAll = [&bytewise] {
    while (bytewise.Read() >= 0) {
    }
  };
  EXPECT_THROW(readAll(), SEIOAbortedException);
  single.cancelAt = single.questions + 1;
  EXPECT_THROW(bytewise.SeekPos(10), SEIOAbortedException);
  EXPECT_FALSE(bytewise.SeekPos(10));
  EXPECT_EQ(bytewise.Read(), static_cast<unsigned char>(bytes[10]));
}

TEST(RealFiles, CancelledLinesLoseNothing) {
  TempFolder folder;
  const test::Text path = folder.File(WTEXT("lines"));
  std::string bytes, got;
  for (int i = 0; i < 40; ++i) bytes += std::string(5000, static_cast<char>('a' + i % 26)) + "\n";
  WriteAll(path, bytes);
  Indicator indicator;
  SSeekableInputANSIFile file(Path(path), &indicator);
  for (int steps = 0; got.size() < bytes.size() && steps < 1000; ++steps) {
    indicator.cancelAt = steps % 3 != 0 ? indicator.questions + 1 : -1;
    try {
      const SString line = file.ReadLn();
      got += line.ToUtf8() + "\n";
    } catch (const SEIOAbortedException&) {
    }
  }
  EXPECT_TRUE(got == bytes);
}

TEST(RealFiles, AllocationFailures) {
  TempFolder folder;
  const test::Text path = folder.File(WTEXT("data"));
  WriteAll(path, std::string(3000, 'l') + "\nnext");
  const SString name = Path(path);
  const int failures = WithEachAllocationFailing(
      [&] {
        SSeekableInputANSIFile lines(name);
        EXPECT_EQ(lines.ReadLn().Length(), 3000);
        SInputFile source(name);
        SInputBufferStream buffered(source, 10);
        SInputPushbackStream pushback(buffered, 20);
        buffered.Mark(2000);
        pushback.Mark(0);
        // What fails behind something that was skipped fails the next time.
        unsigned long skipped = 0;
        for (test::Steps steps; skipped < 1500; steps.Take()) skipped += buffered.Skip(1500 - skipped);
        pushback.Reset();
        skipped = 0;
        for (test::Steps steps; const unsigned long more = pushback.Skip(10000); steps.Take()) skipped += more;
        EXPECT_EQ(skipped, 3005u);
      },
      [] {});
  EXPECT_GE(failures, 10);
}

// Fails at the n-th write.
class FailingOutput : public CollectingOutput {
 public:
  explicit FailingOutput(int failAt) : m_left(failAt) {}
  unsigned long Write(const void* buffer, unsigned long count) override {
    if (--m_left == 0) throw SEIOWriteFailed();
    return CollectingOutput::Write(buffer, count);
  }
  using CollectingOutput::Write;

 private:
  int m_left;
};

TEST(OutputBufferStream, AFailedWriteCanBeTriedAgain) {
  FailingOutput target(1);
  SOutputBufferStream out(target, 4);
  out.Write("abcd", 3);
  EXPECT_THROW(out.Flush(), SEIOWriteFailed);
  out.Flush();
  EXPECT_EQ(target.bytes, "abc");
  {
    SOutputBufferStream lost(new FailingOutput(1), 4, true);
    lost.Write('x');
  }  // a destructor never throws
}

// A source that fails gives all ones.
class BrokenInput : public SInputStream {
 public:
  int Read() override { return -1; }
  unsigned long Read(void*, unsigned long) override { return ~0ul; }
  int IsEOF() override { return 1; }
};

TEST(InputPushbackStream, AFailingSourceDoesNotSwallowWhatIsHeld) {
  BrokenInput source;
  SInputPushbackStream in(source, 4);
  char block[8];
  EXPECT_EQ(in.Read(block, 8), ~0ul);
  in.Unread("ab", 2);
  EXPECT_EQ(in.Read(block, 8), 2u);
  SInputBufferStream buffered(source, 4);
  EXPECT_EQ(buffered.Read(block, 8), 0u);
  EXPECT_EQ(buffered.Read(), -1);
}

#ifndef _WIN32
TEST(RealFilesOnLinux, FilesThatDenyTheirContentLoseNothing) {
  std::ifstream plain("/proc/self/limits", std::ios::binary);
  if (!plain) GTEST_SKIP() << "no such file system here";
  const std::string expected{std::istreambuf_iterator<char>(plain), std::istreambuf_iterator<char>()};
  SInputFile file(SString(WTEXT("C:\\proc\\self\\limits")));
  EXPECT_EQ(file.GetFileSize(), 0u);
  EXPECT_EQ(file.Available(), 1u);
  std::string all, block(1000, '\0');
  while (const unsigned long got = file.Read(block.data(), 1000)) all.append(block, 0, got);
  EXPECT_EQ(all, expected);
}

TEST(RealFilesOnLinux, AFullDiskIsReported) {
  const SString full(WTEXT("C:\\dev\\full"));
  if (GetFileAttributesW(full) == INVALID_FILE_ATTRIBUTES) GTEST_SKIP() << "no such device here";
  const std::string bytes = RandomBytes(200000);
  SOutputFile file(full);
  EXPECT_THROW(file.Write(bytes.data(), 200000), SEIODiskFullException);
  EXPECT_THROW(file.Close(), SEIOException);
  SOutputFile buffered(full);
  buffered.Write('x');
  EXPECT_THROW(buffered.Flush(), SEIODiskFullException);
  SOutputFile closing(full);
  closing.Write('x');
  EXPECT_THROW(closing.Close(), SEIODiskFullException);
  EXPECT_NO_THROW({
    SOutputFile destroyed(full);
    destroyed.Write('x');
  });
  SOutputFile inner(full);
  SOutputBufferStream outer(inner, 16);
  outer.Write("waiting", 7);
  EXPECT_THROW(outer.Close(), SEIODiskFullException);
}

// A read that fails is no end of the data: /proc/self/mem cannot be read at its start.
TEST(RealFilesOnLinux, ReadErrorsAreRemembered) {
  SInputFile file(SString(WTEXT("C:\\proc\\self\\mem")));
  char block[16];
  EXPECT_EQ(file.Read(block, 16), 0u);
  EXPECT_EQ(file.GetError(), EIO);
  EXPECT_TRUE(file.IsEOF());
  SInputBufferStream buffered(file);
  EXPECT_EQ(buffered.GetError(), EIO);
}

// A line that no string can hold is told, and can still be read in other ways.
TEST(RealFilesOnLinux, ALineThatIsTooLongStaysWhereItIs) {
  TempFolder folder;
  const test::Text path = folder.File(WTEXT("sparse"));
  ASSERT_TRUE(WriteAll(path, "first\n"));
  const HANDLE sparse = CreateFileW(path.c_str(), GENERIC_WRITE, 0, nullptr, OPEN_EXISTING, 0, nullptr);
  LARGE_INTEGER size;
  size.QuadPart = 0x40000000;
  EXPECT_TRUE(SetFilePointerEx(sparse, size, nullptr, FILE_BEGIN) && SetEndOfFile(sparse));
  CloseHandle(sparse);
  SSeekableInputANSIFile file{Path(path)};
  EXPECT_EQ(file.ReadLn(), WTEXT("first"));
  EXPECT_THROW(file.ReadLn(), SEOutOfMemory);
  EXPECT_EQ(file.GetPos(), 6u);
  EXPECT_EQ(file.Read(), 0);
}

// Behind a good block the file's descriptor is made one that cannot be read.
TEST(RealFilesOnLinux, AReadThatFailsBehindAGoodBlockIsRemembered) {
  TempFolder folder;
  const test::Text path = folder.File(WTEXT("data"));
  const std::string bytes = RandomBytes(200000);
  WriteAll(path, bytes);
  for (const bool byByte : {false, true}) {
    const int next = open("/dev/null", O_WRONLY);
    close(next);
    SInputFile file{Path(path)};
    std::string got(bytes.size(), 0);
    ASSERT_EQ(file.Read(got.data(), 10), 10u);
    const int unreadable = open("/dev/null", O_WRONLY);
    ASSERT_EQ(dup2(unreadable, next), next);
    close(unreadable);
    std::size_t count = 10;
    if (byByte) {
      for (int byte; (byte = file.Read()) >= 0;) got[count++] = static_cast<char>(byte);
    } else {
      count += file.Read(got.data() + 10, static_cast<unsigned long>(got.size() - 10));
    }
    EXPECT_GT(count, 10u);
    EXPECT_LT(count, bytes.size());
    EXPECT_EQ(got.substr(0, count), bytes.substr(0, count));
    EXPECT_EQ(file.GetError(), EBADF);
    EXPECT_TRUE(file.IsEOF());
    std::uint64_t place = 0;
    EXPECT_FALSE(file.GetPlace(&place)) << "what is there cannot be read again";
    EXPECT_EQ(file.Read(), -1);
  }
}

// A file that is deleted while it is read stays readable; one that is cut ends where it was cut.
TEST(RealFilesOnLinux, VanishingFiles) {
  TempFolder folder;
  const test::Text path = folder.File(WTEXT("data"));
  WriteAll(path, RandomBytes(50000));
  SInputFile file{Path(path)};
  EXPECT_EQ(file.Skip(100), 100u);
  EXPECT_TRUE(DeleteFileW(path.c_str()));
  EXPECT_EQ(file.Skip(100000), 49900u);
  EXPECT_EQ(file.GetError(), 0);
}

TEST(RealFilesOnLinux, LargePositionsAreNotWrapped) {
  TempFolder folder;
  const test::Text path = folder.File(WTEXT("sparse"));
  const HANDLE sparse = CreateFileW(path.c_str(), GENERIC_WRITE, 0, nullptr, CREATE_NEW, 0, nullptr);
  LARGE_INTEGER size;
  size.QuadPart = 0x100000005;
  SetFilePointerEx(sparse, size, nullptr, FILE_BEGIN);
  SetEndOfFile(sparse);
  CloseHandle(sparse);
  SInputFile file{Path(path)};
  EXPECT_EQ(file.Available(), 0x100000005ul);
  EXPECT_FALSE(file.SeekPos(0x100000004));
  EXPECT_EQ(file.Read(), 0);
  EXPECT_EQ(file.Read(), -1);
  EXPECT_EQ(file.GetPos(), 0x100000005u);
}
#endif

// What a long detection does: look on, and go back to the next byte that was not delivered.
TEST(RealFiles, PlacesLeadBackToTheNextByte) {
  TempFolder folder;
  const std::string bytes = RandomBytes(50000);
  const test::Text path = folder.File(WTEXT("data"));
  ASSERT_TRUE(WriteAll(path, bytes));
  std::mt19937 random(2);
  for (int round = 0; round < 60; ++round) {
    SInputFile plain(Path(path)), inner(Path(path));
    SInputBufferStream buffered(inner, 1 + random() % 3000);
    for (SInputStream* in : std::vector<SInputStream*>{&plain, &buffered}) {
      const unsigned long first = random() % 20000;
      EXPECT_EQ(in->Skip(first), first);
      EXPECT_EQ(in->Read(), static_cast<unsigned char>(bytes[first]));
      std::uint64_t place = 0;
      ASSERT_TRUE(in->GetPlace(&place));
      in->Skip(random() % 40000);
      ASSERT_TRUE(in->GoToPlace(place));
      EXPECT_EQ(ReadMixed(*in, random()), bytes.substr(first + 1));
    }
  }
}

// Throws once, at the n-th read.
class OnceCancelled : public PiecewiseInput {
 public:
  OnceCancelled(const std::string& bytes, int at) : PiecewiseInput(bytes, 30), m_left(at) {}
  using PiecewiseInput::Read;
  unsigned long Read(void* buffer, unsigned long count) override {
    if (--m_left == 0) throw SEIOAbortedException();
    return PiecewiseInput::Read(buffer, count);
  }

 private:
  int m_left;
};

TEST(PushbackStreams, AResetForgetsTheFailureThatWaits) {
  const std::string bytes = RandomBytes(1000);
  OnceCancelled source(bytes, 4);
  SInputBufferStream buffered(source, 64);
  SInputPushbackStream pushback(buffered, 8);
  pushback.Mark(2000);
  char block[500];
  const unsigned long before = pushback.Read(block, sizeof block);
  EXPECT_LT(before, sizeof block);
  pushback.Reset();
  std::string all(1000, '\0');
  EXPECT_EQ(pushback.Read(all.data(), 1000), 1000u);
  EXPECT_EQ(all, bytes);
}

}  // namespace
