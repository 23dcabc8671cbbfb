// Streams over memory, buffers and push-back; those over files are in file_stream_test.cpp.

#include <deque>
#include <memory>

#include "qxcore/core/io_exceptions.h"
#include "qxcore/stream/input_buffer.h"
#include "qxcore/stream/input_buffer_stream.h"
#include "qxcore/stream/input_global.h"
#include "qxcore/stream/input_pushback_stream.h"
#include "qxcore/stream/output_buffer_stream.h"
#include "qxcore/stream/output_file.h"
#include "qxcore/stream/output_global.h"
#include "qxcore/stream/output_string_stream.h"
#include "tests/stream/reader_fixture.h"
#include "tests/support/failing_allocations.h"

using namespace std::string_literals;

namespace {

TEST(ClassRecords, StreamsThatNeedNothingCanBeCreated) {
  for (SClassInfo* info : {&SOutputFile::classSOutputFile, &SOutputGlobal::classSOutputGlobal,
                           &SOutputStringStream::classSOutputStringStream}) {
    const std::unique_ptr<SObject> made(info->CreateObject());
    ASSERT_NE(made, nullptr);
    EXPECT_EQ(made->GetClassInfoW(), info);
  }
}

TEST(InputBuffer, TakesSizesOfEveryIntegerType) {
  const char bytes[] = "0123456789";
  const auto available = [&](auto size) { return SInputBuffer(bytes, size).Available(); };
  EXPECT_EQ(available(sizeof bytes), sizeof bytes);
  EXPECT_EQ(available(5), 5u);
  EXPECT_EQ(available(5u), 5u);
  EXPECT_EQ(available(5L), 5u);
  EXPECT_EQ(available(std::ptrdiff_t{-1}), 0u);
  EXPECT_EQ(available(short{3}), 3u);
}

std::string Pattern(std::size_t size) {
  std::string bytes(size, 0);
  for (std::size_t i = 0; i < size; ++i) bytes[i] = static_cast<char>(i * 7 + i / 251);
  return bytes;
}

std::string ReadRest(SInputStream& in, unsigned long piece = 1000) {
  std::string all;
  std::string block(piece, 0);
  while (unsigned long got = in.Read(block.data(), piece)) all.append(block, 0, got);
  return all;
}

TEST(MemoryStreams, Buffer_SeeksMarksAndEnds) {
  SInputBuffer in("abcdef", 6);
  EXPECT_THROW(in.Reset(), SEIOResetInvalid);
  EXPECT_EQ(in.Read(), 'a');
  in.Mark(0);
  EXPECT_EQ(in.Skip(100), 5u);
  EXPECT_TRUE(in.IsEOF());
  in.Reset();
  EXPECT_EQ(ReadRest(in), "bcdef");
  EXPECT_TRUE(in.SeekPos(7));
  EXPECT_FALSE(in.SeekPos(6));
  EXPECT_EQ(in.Available(), 0u);
  EXPECT_EQ(SInputBuffer(nullptr, 5).Read(), -1);
  EXPECT_EQ(SInputBuffer("x", -1).Read(), -1);
}

TEST(MemoryStreams, Buffer_WhatIsTakenAsAWholeIsRead) {
  const std::string bytes = Pattern(300);
  SInputBuffer in(bytes.data(), static_cast<unsigned long>(bytes.size()));
  for (unsigned long at = 0; at <= bytes.size(); at += 60) {
    ASSERT_FALSE(in.SeekPos(at));
    unsigned long size = 0;
    const void* rest = in.TakeRest(&size);
    EXPECT_EQ(std::string(static_cast<const char*>(rest), size), bytes.substr(at));
    EXPECT_EQ(in.GetPos(), bytes.size());
    EXPECT_EQ(in.Available(), 0u);
    EXPECT_TRUE(in.IsEOF());
    EXPECT_EQ(ReadRest(in), "");
  }
}

// Of what was given away nothing is left, and the stream begins anew without touching it.
TEST(MemoryStreams, Global_ThatGaveItsMemoryAwayIsEmpty) {
  const std::string bytes = Pattern(100);
  for (int way = 0; way < 3; ++way) {
    SOutputGlobal out;
    SHGlobal given;
    for (int round = 0; round < 2; ++round) {
      out.Write(bytes.data() + round * 50, 50);
      SHGlobal former = given;
      if (way == 0) {
        given.Attach(out.Detach());
      } else if (way == 1) {
        EXPECT_EQ(out.GetHGlobal(&given), 1);
      } else {
        out.Close();
      }
      EXPECT_EQ(out.UsedSize(), 0u);
      EXPECT_EQ(out.GetData(), nullptr);
      SString text;
      EXPECT_EQ(out.GetString(&text), 0);
      if (round == 0) continue;
      if (way < 2) {
        for (SHGlobal* block : {&former, &given}) {
          const auto* content = static_cast<const char*>(block->Lock());
          EXPECT_EQ(std::string(content, 50), bytes.substr(block == &former ? 0 : 50, 50));
          block->Unlock();
          block->Free();
        }
      }
    }
  }
}

TEST(MemoryStreams, Global_GrowsInStepsAndChangesHands) {
  const std::string bytes = Pattern(300000);
  SOutputGlobal out;
  EXPECT_EQ(out.Detach(), nullptr);
  for (int i = 0; i < 10000; ++i) out.Write(bytes[static_cast<std::size_t>(i)]);
  for (std::size_t at = 10000; at < bytes.size(); at += 1000) out.Write(bytes.data() + at, 1000);
  EXPECT_EQ(out.UsedSize(), 300000u);
  HGLOBAL memory = out.Detach();
  EXPECT_EQ(GlobalSize(memory), 303104u) << "the next multiple of the step, however it grew";
  SInputGlobal in(memory);
  std::string back(303104, 'x');
  EXPECT_EQ(in.Read(back.data(), 303104), 303104u);
  EXPECT_EQ(back, bytes + std::string(3104, 0));
  in.Close();
  SOutputGlobal again;
  void* handle = memory;
  again.Attach(&handle, 3);
  EXPECT_EQ(handle, nullptr);
  again.Write(0);
  EXPECT_EQ(again.UsedSize(), 4u);
  EXPECT_EQ(std::memcmp(again.GetData(), bytes.data(), 3), 0);
  again.Reset();
  const WCHAR text[] = WTEXT("text");
  again.Write(text, 8);
  SString read;
  EXPECT_EQ(again.GetString(&read), 1);
  EXPECT_EQ(read, WTEXT("text"));
  SHGlobal taken;
  EXPECT_EQ(again.GetHGlobal(&taken), 1);
  again.Attach(taken.Detach(), 1000000);
  EXPECT_EQ(again.UsedSize(), 303104u) << "no more is used than there is";
  EXPECT_EQ(again.GetHGlobal(&taken), 1);
  EXPECT_GE(taken.Size(), 8u);
  SInputGlobal(taken, true).Close();
}

TEST(MemoryStreams, GlobalThatCannotGrow_KeepsWhatWasWritten) {
  SOutputGlobal out;
  const std::string bytes = Pattern(8192);
  SMemFailAt(1);
  EXPECT_THROW(out.Write('x'), SEOutOfMemory);
  out.Write(bytes.data(), 8192);
  SMemFailAt(1);
  EXPECT_THROW(out.Write('x'), SEOutOfMemory);
  SMemFailAt(0);
  EXPECT_EQ(out.UsedSize(), 8192u);
  EXPECT_EQ(std::memcmp(out.GetData(), bytes.data(), 8192), 0);
  out.Write('y');
  EXPECT_EQ(static_cast<const char*>(out.GetData())[8192], 'y');
}

// Random reads, skips, marks and resets against the plain bytes.
TEST(BufferedInput, RandomUse_AgreesWithTheBytes) {
  RandomText random(17);
  const std::string bytes = Pattern(30000);
  for (unsigned long size : {0ul, 1ul, 13ul, 5000ul}) {
    PiecewiseInput inner(bytes, 37);
    SInputBufferStream in(inner, size);
    std::size_t at = 0;
    std::size_t mark = 0;
    std::size_t limit = 0;
    bool hasMark = false;
    while (at < bytes.size()) {
      unsigned long count = static_cast<unsigned long>(random.Number(100));
      switch (random.Number(6)) {
        case 0:
          ASSERT_EQ(in.Read(), static_cast<unsigned char>(bytes[at++]));
          break;
        case 1:
        case 2: {
          std::string block(count, 0);
          unsigned long got = 0;
          while (got < count) {  // the inner stream hands out pieces
            unsigned long more = in.Read(block.data() + got, count - got);
            if (more == 0) break;
            got += more;
          }
          ASSERT_EQ(block.substr(0, got), bytes.substr(at, got));
          at += got;
          break;
        }
        case 3:
          at += in.Skip(count);
          break;
        case 4:
          in.Mark(static_cast<unsigned long>(limit = static_cast<std::size_t>(random.Number(300) + 1)));
          mark = at;
          hasMark = true;
          break;
        default:
          if (hasMark && at - mark <= limit) {
            in.Reset();
            at = mark;
          } else if (hasMark) {
            try {  // beyond the limit the mark may be gone, but never wrong
              in.Reset();
              at = mark;
            } catch (const SEIOResetInvalid&) {
              hasMark = false;
            }
          }
      }
    }
    EXPECT_EQ(in.Read(), -1);
    EXPECT_TRUE(in.IsEOF());
  }
}

TEST(BufferedInput, DroppedMark_CannotBeResetTo) {
  PiecewiseInput inner(Pattern(10000));
  SInputBufferStream in(inner, 16);
  EXPECT_THROW(in.Reset(), SEIOResetInvalid);
  in.Mark(64);
  for (int i = 0; i < 64; ++i) in.Read();
  in.Reset();
  for (int i = 0; i < 65; ++i) in.Read();
  EXPECT_THROW(in.Reset(), SEIOResetInvalid);
}

TEST(BufferedOutput, Blocks_ArriveInOrder) {
  RandomText random(2);
  const std::string bytes = Pattern(20000);
  for (unsigned long size : {0ul, 1ul, 100ul}) {
    CollectingOutput target;
    {
      SOutputBufferStream out(target, size);
      for (std::size_t at = 0; at < bytes.size();) {
        unsigned long count = std::min<unsigned long>(static_cast<unsigned long>(random.Number(300)),
                                                      static_cast<unsigned long>(bytes.size() - at));
        EXPECT_EQ(out.Write(bytes.data() + at, count), count);
        at += count;
        if (at < bytes.size()) out.Write(bytes[at++]);
        if (random.Number(50) == 0) out.Flush();
      }
    }
    EXPECT_EQ(target.bytes, bytes);
  }
}

TEST(Pushback, BytesComeBackInOrder) {
  PiecewiseInput inner("inner");
  SInputPushbackStream in(inner, 4);
  in.Unread("cd", 2);
  in.Unread('b');
  in.Unread('a');
  EXPECT_THROW(in.Unread('x'), SEIOPushBackFull);
  EXPECT_THROW(in.Unread("xyz", 3), SEIOPushBackFull);
  EXPECT_EQ(in.Read(), 'a');
  EXPECT_EQ(ReadRest(in), "bcdinner");
  EXPECT_TRUE(in.IsEOF());
  SInputBuffer block("012345", 6);
  SInputPushbackStream marked(block, 2);
  marked.Unread("ab", 2);
  marked.Mark(100);
  EXPECT_EQ(marked.Skip(4), 4u);
  marked.Unread('z');
  marked.Reset();
  EXPECT_EQ(ReadRest(marked), "ab012345");
}

TEST(Filters, OwnedStreams_EndWithThem) {
  static int alive = 0;
  class Counted : public PiecewiseInput {
   public:
    Counted() : PiecewiseInput("x") { ++alive; }
    ~Counted() override { --alive; }
  };
  { SInputBufferStream outer(new SInputPushbackStream(new Counted, 1, true), 8, true); }
  { SMultiFormatReaderUnicode reader(new Counted, Support::kASCII, true); }
  EXPECT_EQ(alive, 0);
  Counted kept;
  { SInputBufferStream outer(&kept, 8, false); }
  EXPECT_EQ(alive, 1);
}

}  // namespace
