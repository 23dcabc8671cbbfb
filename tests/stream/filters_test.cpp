// Every pair of filters over sources that give one byte at a time or throw under way.

#include <zlib.h>

#include <cerrno>
#include <functional>
#include <memory>
#include <vector>

#include "qxcore/core/io_exceptions.h"
#include "qxcore/stream/input_binary_stream.h"
#include "qxcore/stream/input_buffer.h"
#include "qxcore/stream/input_buffer_stream.h"
#include "qxcore/stream/input_pushback_stream.h"
#include "qxcore/stream/java_unicode_escape_filter_stream.h"
#include "qxcore/stream/output_binary_stream.h"
#include "qxcore/stream/zip/inflater_input_stream.h"
#include "qxcore/stream/zip/zip_input_stream.h"
#include "tests/stream/reader_fixture.h"
#include "tests/stream/zip_builder.h"
#include "tests/support/steps.h"

namespace {

std::string Deflate(const std::string& bytes) {
  z_stream stream = {};
  deflateInit2(&stream, 6, Z_DEFLATED, -15, 8, Z_DEFAULT_STRATEGY);
  std::string result(deflateBound(&stream, static_cast<uLong>(bytes.size())), 0);
  stream.next_in = reinterpret_cast<Bytef*>(const_cast<char*>(bytes.data()));
  stream.avail_in = static_cast<uInt>(bytes.size());
  stream.next_out = reinterpret_cast<Bytef*>(result.data());
  stream.avail_out = static_cast<uInt>(result.size());
  deflate(&stream, Z_FINISH);
  result.resize(stream.total_out);
  deflateEnd(&stream);
  return result;
}

// A filter over an owned stream, and what its source must hold so that it gives `bytes`.
struct Filter {
  const char* name;
  std::function<SInputStream*(SInputStream*)> make;
  std::function<std::string(const std::string&)> source;
  bool mayBeShort = false;  // reads may give less than is there
};

std::string Same(const std::string& bytes) { return bytes; }

std::string Archive(const std::string& bytes, bool deflated) {
  test::ZipBuilder zip;
  zip.parts.emplace_back("entry", bytes, deflated);
  return zip.Make();
}

SInputStream* OpenFirst(SInputStream* in) {
  auto zip = std::make_unique<SZipInputStream>(in, true);
  zip->GetNextEntry();
  return zip.release();
}

const std::vector<Filter>& Filters() {
  static const std::vector<Filter> filters = {
      {"buffer", [](SInputStream* in) { return new SInputBufferStream(in, 0, true); }, Same},
      {"small buffer", [](SInputStream* in) { return new SInputBufferStream(in, 7, true); }, Same},
      {"marked buffer",
       [](SInputStream* in) {
         auto* buffer = new SInputBufferStream(in, 16, true);
         buffer->Mark(64);
         return buffer;
       },
       Same},
      {"push-back",
       [](SInputStream* in) {
         auto pushback = std::make_unique<SInputPushbackStream>(in, 3, true);
         pushback->Unread(static_cast<unsigned char>(pushback->Read()));
         return pushback.release();
       },
       Same},
      {"inflater", [](SInputStream* in) { return new SInflaterInputStream(in, 33, true); }, Deflate, true},
      {"stored entry", OpenFirst, [](const std::string& bytes) { return Archive(bytes, false); }},
      {"deflated entry", OpenFirst, [](const std::string& bytes) { return Archive(bytes, true); }}};
  return filters;
}

std::string Payload() {
  std::string bytes;
  RandomText random(3);
  while (bytes.size() < 6000) bytes += "word " + std::to_string(random.Number(1000)) + "\n";
  return bytes;
}

TEST(PairsOfFilters, OverASourceOfSingleBytes_GiveWhatIsAskedFor) {
  const std::string bytes = Payload();
  for (const Filter& outer : Filters()) {
    for (const Filter& inner : Filters()) {
      SCOPED_TRACE(std::string(outer.name) + " over " + inner.name);
      const auto open = [&] {
        return std::unique_ptr<SInputStream>(
            outer.make(inner.make(new PiecewiseInput(inner.source(outer.source(bytes)), 1))));
      };
      for (unsigned long count : {1ul, 7ul, 300ul, 5000ul}) {
        const auto in = open();
        std::string got;
        std::vector<char> block(count);
        for (test::Steps steps; const unsigned long size = in->Read(block.data(), count); steps.Take()) {
          got.append(block.data(), size);
          if (!outer.mayBeShort && got.size() < bytes.size()) {
            ASSERT_EQ(size, count) << "short before the end";
          }
        }
        ASSERT_EQ(got, bytes);
      }
      const auto in = open();
      unsigned long skipped = 0;
      for (test::Steps steps; const unsigned long more = in->Skip(4000 - skipped); steps.Take()) skipped += more;
      ASSERT_EQ(skipped, 4000u);
      ASSERT_EQ(in->Read(), static_cast<unsigned char>(bytes[4000]));
    }
  }
}

// Has more than its type can count.
class EndlessInput : public SInputBuffer {
 public:
  using SInputBuffer::SInputBuffer;
  unsigned long Available() override { return ~0ul; }
};

TEST(Filters, WhatIsAvailable_IsWhatComes_AndNeverWraps) {
  // No escape among them, so that there is a byte for each character.
  const std::string bytes = "plain \\text with \\back\\slashes that are held back, and longer than the buffers";
  const auto size = static_cast<unsigned long>(bytes.size());
  const std::function<SInputStream*(SInputStream*)> kinds[] = {
      Filters()[1].make, Filters()[2].make, Filters()[3].make,
      [](SInputStream* in) { return new SJavaUnicodeEscapeFilterStream(in, true); }};
  for (const auto& make : kinds) {
    SCOPED_TRACE(&make - kinds);
    const std::unique_ptr<SInputStream> in(make(new SInputBuffer(bytes.data(), size)));
    for (unsigned long left = size; left > 0; --left) {
      ASSERT_EQ(in->Available(), left);
      ASSERT_EQ(in->Read(), bytes[size - left]);
    }
    EXPECT_EQ(in->Available(), 0u);
    const std::unique_ptr<SInputStream> endless(make(new EndlessInput(bytes.data(), size)));
    for (unsigned long left = size; left > 0; --left) {
      ASSERT_EQ(endless->Available(), ~0ul);
      endless->Read();
    }
  }
}

// What needs so many bytes gets them, or says that they are not there.
TEST(PairsOfFilters, BinaryTextsAndReadersOverShortReads) {
  CollectingOutput out;
  SOutputBinaryStream writer(out);
  const SString text = SString::FromUtf8(Payload());
  const SString accents = WTEXT("\u00E9\u20AC");
  for (int i = 0; i < 50; ++i) writer << accents << text;
  for (const Filter& filter : Filters()) {
    SCOPED_TRACE(filter.name);
    SInputBinaryStream in(filter.make(new PiecewiseInput(filter.source(out.bytes), 1)), true);
    for (int i = 0; i < 50; ++i) {
      SString first, second;
      in >> first >> second;
      ASSERT_EQ(first, accents);
      ASSERT_EQ(second, text);
    }
    const std::string utf8 = accents.ToUtf8() + Payload();
    const std::unique_ptr<SInputStream> source(filter.make(new PiecewiseInput(filter.source(utf8), 1)));
    EXPECT_EQ(ReadFrom(*source, Support::kUTF8 | Support::kFullDetect).text, accents + text);
    auto* again =
        new SMultiFormatReaderUnicode(filter.make(new PiecewiseInput(filter.source(utf8), 1)), Support::kUTF8, true);
    SJavaUnicodeEscapeFilterStream escaped(again, true);
    std::string all(utf8.size() + 100, 0);
    all.resize(escaped.Read(all.data(), static_cast<unsigned long>(all.size())));
    EXPECT_EQ(SJavaUnicodeEscapeFilterStream::Unescape(all.c_str(), nullptr), accents + text);
  }
}

// Throws at every n-th read.
class CancellingInput : public PiecewiseInput {
 public:
  CancellingInput(std::string bytes, unsigned long piece, int every)
      : PiecewiseInput(std::move(bytes), piece), m_every(every) {}
  unsigned long Read(void* buffer, unsigned long count) override {
    if (++m_asked % m_every == 0) throw SEIOAbortedException();
    return PiecewiseInput::Read(buffer, count);
  }
  int Read() override {
    unsigned char byte;
    return Read(&byte, 1) == 1 ? byte : -1;
  }

 private:
  int m_every;
  int m_asked = 0;
};

// Ends after so many bytes, as a source does that cannot be read on.
class BrokenInput : public PiecewiseInput {
 public:
  BrokenInput(const std::string& bytes, std::size_t good)
      : PiecewiseInput(bytes.substr(0, good), 500), m_isBroken(good < bytes.size()) {}
  int GetError() const override { return m_isBroken && const_cast<BrokenInput*>(this)->IsEOF() ? EIO : 0; }

 private:
  bool m_isBroken;
};

TEST(PairsOfFilters, AFailedReadBehindGoodBlocksIsNeverTheEnd) {
  const std::string bytes = Payload();
  for (const Filter& outer : Filters()) {
    for (const Filter& inner : Filters()) {
      SCOPED_TRACE(std::string(outer.name) + " over " + inner.name);
      const std::string all = inner.source(outer.source(bytes));
      for (std::size_t good = 1; good < all.size(); good += 1 + all.size() / 37) {
        std::string got;
        bool isTold = false;
        std::unique_ptr<SInputStream> in;
        try {
          in.reset(outer.make(inner.make(new BrokenInput(all, good))));
          char block[300];
          for (test::Steps steps; const unsigned long size = in->Read(block, sizeof block); steps.Take())
            got.append(block, size);
        } catch (const SException&) {
          isTold = true;
        }
        isTold = isTold || in->GetError() == EIO;
        ASSERT_TRUE(isTold || got.size() == bytes.size()) << "silent after " << good << " of " << all.size();
        ASSERT_EQ(got, bytes.substr(0, got.size()));
      }
    }
  }
}

TEST(PairsOfFilters, CancelledReadsLoseNothing) {
  const std::string bytes = Payload();
  for (std::size_t outer = 0; outer < 4; ++outer) {  // an archive that throws is of no more use
    for (std::size_t inner = 0; inner < 4; ++inner) {
      SCOPED_TRACE(std::string(Filters()[outer].name) + " over " + Filters()[inner].name);
      for (unsigned long count : {1ul, 50ul, 3000ul}) {
        std::unique_ptr<SInputStream> in(
            Filters()[outer].make(Filters()[inner].make(new CancellingInput(bytes, 11, 4))));
        std::string got;
        std::vector<char> block(count);
        for (int steps = 0; got.size() < bytes.size() && steps < 100000; ++steps) {
          try {
            got.append(block.data(), in->Read(block.data(), count));
          } catch (const SEIOAbortedException&) {
          }
        }
        ASSERT_EQ(got, bytes) << count;
      }
    }
  }
}

}  // namespace
