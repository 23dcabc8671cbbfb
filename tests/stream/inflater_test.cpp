// The inflater and the filter over it, against what zlib compressed.

#include <gtest/gtest.h>

#include <random>
#include <string>

#include "qxcore/core/exception.h"
#include "qxcore/core/io_exceptions.h"
#include "qxcore/stream/input_buffer.h"
#include "qxcore/stream/zip/crc32.h"
#include "qxcore/stream/zip/inflater_input_stream.h"
#include "tests/stream/zip_builder.h"
#include "tests/support/failing_allocations.h"
#include "tests/support/steps.h"
#include "tests/support/text.h"

namespace {

using test::Deflate;

// Texts of every kind of block: incompressible, repetitive, mixed.
std::string Sample(unsigned seed, std::size_t size) {
  std::mt19937 random(seed);
  std::string text;
  while (text.size() < size) {
    switch (random() % 3) {
      case 0:
        text.append(random() % 3000, static_cast<char>(random()));
        break;
      case 1:
        text += text.substr(random() % (text.size() + 1), 500);
        break;
      default:
        for (int i = 0; i < 700; ++i) text += static_cast<char>(random());
    }
  }
  text.resize(size);
  return text;
}

std::string ReadAll(SInputStream& in, unsigned seed) {
  std::mt19937 random(seed);
  std::string all;
  char block[6000];
  for (test::Steps steps;; steps.Take()) {
    const unsigned long got = in.Read(block, 1 + random() % sizeof block);
    if (got == 0) return all;
    all.append(block, got);
  }
}

template <class Operation>
SString ZipTextOf(Operation operation) {
  try {
    operation();
  } catch (const SEZipException& e) {
    return e.GetText();
  }
  return WTEXT("nothing was thrown");
}

TEST(Inflater, PiecesOfAnySizeGiveTheWhole) {
  const struct {
    int raw;
    std::string dictionary;
  } kForms[] = {{0, ""}, {1, ""}, {0, Sample(8, 500)}};
  for (const auto& [raw, dictionary] : kForms) {
    const std::string text = Sample(7, 100000);
    const std::string packed = Deflate(text, raw ? -15 : 15, dictionary);
    SInflater inflater(raw);
    std::mt19937 random(1);
    for (int round = 0; round < 3; ++round) {
      std::string all;
      std::size_t given = 0;
      char out[777];
      for (test::Steps steps; !inflater.IsFinished(); steps.Take()) {
        if (inflater.NeedsDictionary()) inflater.SetDictionary(dictionary.data(), static_cast<int>(dictionary.size()));
        ASSERT_FALSE(inflater.NeedsDictionary());
        if (inflater.GetRemaining() == 0) {
          ASSERT_LT(given, packed.size());
          const std::size_t piece = std::min<std::size_t>(1 + random() % 900, packed.size() - given);
          inflater.SetInput(packed.data() + given, static_cast<int>(piece));
          given += piece;
        }
        all.append(out, static_cast<std::size_t>(inflater.Inflate(out, 1 + static_cast<int>(random() % sizeof out))));
      }
      EXPECT_EQ(all, text);
      EXPECT_EQ(inflater.GetTotalOut(), text.size());
      EXPECT_EQ(inflater.GetTotalIn(), packed.size());
      inflater.Reset();
    }
  }
}

TEST(Inflater, DictionaryDamageAndEnd) {
  const std::string dictionary = "the quick brown fox", text = "the quick brown fox, the quick brown fox";
  const std::string packed = Deflate(text, 15, dictionary);
  SInflater inflater;
  char out[100];
  inflater.SetInput(packed.data(), static_cast<int>(packed.size()));
  EXPECT_EQ(inflater.Inflate(out, sizeof out), 0);
  EXPECT_TRUE(inflater.NeedsDictionary());
  EXPECT_EQ(ZipTextOf([&] { inflater.SetDictionary("wrong", 5); }), WTEXT("zlib error!!!"));
  inflater.SetDictionary(dictionary.data(), static_cast<int>(dictionary.size()));
  EXPECT_EQ(std::string(out, static_cast<std::size_t>(inflater.Inflate(out, sizeof out))), text);
  EXPECT_TRUE(inflater.IsFinished());

  inflater.Reset();
  EXPECT_EQ(inflater.Inflate(out, sizeof out), 0);  // no input is no error
  inflater.SetInput("no zlib data", 12);
  EXPECT_EQ(ZipTextOf([&] { inflater.Inflate(out, sizeof out); }), WTEXT("zlib error!!!"));
  EXPECT_EQ(ZipTextOf([&] { inflater.Inflate(out, sizeof out); }), WTEXT("zlib error!!!"));  // and stays so
  inflater.End();
  EXPECT_EQ(inflater.Inflate(out, sizeof out), 0);
  inflater.End();
}

TEST(Inflater, ChecksumOfPiecesIsThatOfTheWhole) {
  SCRC32 sum;
  EXPECT_EQ(sum.GetValue(), 0u);
  sum.Update("1234", 4);
  sum.Update("", 0);
  sum.Update("56789", 5);
  EXPECT_EQ(sum.GetValue(), 0xCBF43926u);  // the check value that the catalogues of checksums give
}

TEST(InflaterInputStream, GivesTheTextWhateverTheSizesAre) {
  for (std::size_t size : {0u, 1u, 511u, 70000u, 300000u}) {
    const std::string text = Sample(static_cast<unsigned>(size), size), packed = Deflate(text);
    for (unsigned long buffer : {1ul, 7ul, 512ul, 1000000ul}) {
      SInputBuffer memory(packed.data(), static_cast<unsigned long>(packed.size()));
      SInflaterInputStream in(memory, buffer);
      EXPECT_EQ(ReadAll(in, 3), text);
      EXPECT_TRUE(in.IsEOF());
      EXPECT_EQ(in.Read(), -1);
    }
    SInputBuffer memory(packed.data(), static_cast<unsigned long>(packed.size()));
    SInflaterInputStream in(memory);
    EXPECT_EQ(in.Skip(500), std::min<std::size_t>(size, 500));
    std::string rest;
    for (int byte = in.Read(); byte >= 0; byte = in.Read()) rest += static_cast<char>(byte);
    EXPECT_EQ(rest, text.substr(std::min<std::size_t>(size, 500)));
  }
}

// Throws after so many bytes.
class FailingStream : public SInputBuffer {
 public:
  FailingStream(const std::string& bytes, long fails)
      : SInputBuffer(bytes.data(), static_cast<unsigned long>(bytes.size())), m_left(fails) {}
  using SInputBuffer::Read;
  unsigned long Read(void* buffer, unsigned long count) override {
    if (m_left-- == 0) throw SEIOAbortedException();
    return SInputBuffer::Read(buffer, count);
  }

 private:
  long m_left;
};

TEST(InflaterInputStream, EveryFailureHasTheOneText) {
  const std::string text = Sample(9, 5000), packed = Deflate(text);
  const auto read = [](SInputStream& inner) {
    return ZipTextOf([&] {
      SInflaterInputStream in(inner, 64);
      ReadAll(in, 1);
    });
  };
  for (std::size_t cut = 0; cut < packed.size(); cut += 37) {
    SInputBuffer memory(packed.data(), static_cast<unsigned long>(cut));
    EXPECT_EQ(read(memory), WTEXT("Invalid ZLIB data format")) << cut;
  }
  for (long fails = 0; fails < static_cast<long>(packed.size() / 64); ++fails) {
    FailingStream failing(packed, fails);
    EXPECT_EQ(read(failing), WTEXT("Invalid ZLIB data format")) << fails;
  }
  SInputBuffer damaged("\x07\xFF\xFF\xFF", 4);  // a block of the reserved kind
  EXPECT_EQ(read(damaged), WTEXT("Invalid ZLIB data format"));
}

TEST(InflaterInputStream, MemoryOutIsSaidAsSuch) {
  const std::string text = Sample(2, 100000), packed = Deflate(text);
  std::string all;
  const int failures = WithEachAllocationFailing(
      [&] {
        SInputBuffer memory(packed.data(), static_cast<unsigned long>(packed.size()));
        SInflaterInputStream in(memory);
        all = ReadAll(in, 5);
      },
      [] {});
  EXPECT_GE(failures, 4);
  EXPECT_EQ(all, text);
}

}  // namespace
