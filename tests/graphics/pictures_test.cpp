// The same drawing program on both targets: its pictures equal the expected ones, which were drawn by Windows calls
// (./dev pictures). Also PNG there and back.
#include "qxcore/graphics/picture.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <random>

#include "tests/graphics/drawing_program.h"
#include "tests/support/file_size_limit.h"
#include "tests/support/temp_folder.h"
#include "tests/support/text.h"

#ifndef _WIN32
#include <sys/stat.h>
#endif

namespace {

SString ExpectedFile(const char* name) {
  return SString(QXCORE_SOURCE_DIR "/tests/graphics/expected/") + SString(name) + WTEXT(".png");
}

int Luminance(std::uint32_t pixel) {
  return static_cast<int>(((pixel >> 16 & 255) * 30 + (pixel >> 8 & 255) * 59 + (pixel & 255) * 11) / 100);
}

// The largest difference of mean luminance between cells of 16 x 16 pixels: glyphs of two rasterizers that stand at the
// same places have about the same weight.
int GlyphDistance(const SBitmap& a, const SBitmap& b) {
  constexpr int kCell = 16;
  int largest = 0;
  for (int top = 0; top + kCell <= drawing::kHeight; top += kCell) {
    for (int left = 0; left + kCell <= drawing::kWidth; left += kCell) {
      int difference = 0;
      for (int i = 0; i < kCell * kCell; ++i) {
        int at = (top + i / kCell) * drawing::kWidth + left + i % kCell;
        difference += Luminance(a.GetBits()[at]) - Luminance(b.GetBits()[at]);
      }
      largest = std::max(largest, std::abs(difference) / (kCell * kCell));
    }
  }
  return largest;
}

class Pictures : public testing::TestWithParam<drawing::Picture> {};

TEST_P(Pictures, AreTheExpectedOnes) {
  constexpr int kGlyphDistance = 20;  // of 255; measured: 14
  SBitmap drawn, expected;
  drawing::Draw(GetParam(), drawn);
  if (std::getenv("QXCORE_WRITE_EXPECTED")) {
    ASSERT_EQ(SWritePicture(ExpectedFile(GetParam().name), drawn), S_OK);
  }
  ASSERT_EQ(SReadPicture(ExpectedFile(GetParam().name), &expected), S_OK);
  ASSERT_EQ(expected.GetSize(), drawn.GetSize());
  if (GetParam().hasText) {
    EXPECT_LE(GlyphDistance(drawn, expected), kGlyphDistance);
    return;
  }
  int different = 0, first = -1;
  for (int i = 0; i < drawing::kWidth * drawing::kHeight; ++i) {
    if ((drawn.GetBits()[i] & 0xFFFFFF) == expected.GetBits()[i]) continue;
    if (different++ == 0) first = i;
  }
  EXPECT_EQ(different, 0) << "first at " << first % drawing::kWidth << ", " << first / drawing::kWidth;
}

std::string NameOf(const testing::TestParamInfo<drawing::Picture>& picture) {
  std::string name = picture.param.name;
  std::erase(name, '-');
  return name;
}

INSTANTIATE_TEST_SUITE_P(All, Pictures, testing::ValuesIn(drawing::Pictures()), NameOf);

TEST(PictureFiles, KeepEveryPixel) {
  test::TempFolder folder;
  SString file = SString(folder.Path().c_str()) + WTEXT("\\picture.png");
  std::mt19937 random(1);
  for (SSize size : {SSize(1, 1), SSize(3, 7), SSize(200, 120), SSize(31, 64), SSize(17, 129)}) {
    SBitmap bitmap, again;
    ASSERT_TRUE(bitmap.CreatePixels(size.cx, size.cy));
    for (int i = 0; i < size.cx * size.cy; ++i) bitmap.GetBits()[i] = random() & 0xFFFFFF;
    const auto holds = [&](const SRect& area) {
      if (SReadPicture(file, &again) != S_OK || again.GetSize() != area.Size()) return false;
      for (int y = 0; y < area.Height(); ++y) {
        const std::uint32_t *row = again.GetBits() + y * area.Width(),
                            *of = bitmap.GetBits() + (area.top + y) * size.cx + area.left;
        if (!std::equal(row, row + area.Width(), of)) return false;
      }
      return true;
    };
    const SRect whole(SPoint(), size), part(size.cx / 3, size.cy / 4, size.cx, size.cy);
    ASSERT_EQ(SWritePicture(file, bitmap), S_OK);
    EXPECT_TRUE(holds(whole)) << size.cy;
    SMemoryDC dc;
    const SSelectObject selected(dc, bitmap);
    for (const SRect& area : {part, whole}) {
      ASSERT_EQ(SWritePicture(file, dc, area), S_OK);
      EXPECT_TRUE(holds(area)) << size.cy;
    }
    EXPECT_EQ(SWritePicture(file, dc, SRect(3, 3, 3, 9)), E_INVALIDARG);
    EXPECT_TRUE(holds(whole)) << "as it was";
  }
}

TEST(PictureFiles, RefuseWhatIsNoPicture) {
  test::TempFolder folder;
  SString file = SString(folder.Path().c_str()) + WTEXT("\\picture.png");
  SBitmap bitmap, kept;
  kept.CreatePixels(2, 2);
  HGDIOBJ handle = kept.GetSafeHandle();
  EXPECT_EQ(SReadPicture(file, &kept), static_cast<HRESULT>(0x80070002)) << "missing";
  EXPECT_EQ(SWritePicture(file, nullptr), E_INVALIDARG);
  EXPECT_NE(SWritePicture(SString(folder.Path().c_str()) + WTEXT("\\none\\picture.png"), kept), S_OK);
  bitmap.CreatePixels(40, 40);
  ASSERT_EQ(SWritePicture(file, bitmap), S_OK);
  HANDLE open = CreateFileW(file, GENERIC_WRITE, 0, nullptr, OPEN_EXISTING, 0, nullptr);
  ASSERT_NE(open, INVALID_HANDLE_VALUE);
  DWORD written;
  WriteFile(open, "not a picture", 13, &written, nullptr);
  CloseHandle(open);
  EXPECT_EQ(SReadPicture(file, &kept), static_cast<HRESULT>(0x8007000D));
  EXPECT_EQ(kept.GetSafeHandle(), handle) << "as it was";
}

#ifndef _WIN32

TEST(PictureFiles, KeepTheFormerFileWhereTheNewOneIsCut) {
  test::TempFolder folder;
  SString file = SString(folder.Path().c_str()) + WTEXT("\\picture.png");
  SBitmap small, noise, again;
  small.CreatePixels(3, 3);
  noise.CreatePixels(200, 200);
  std::mt19937 random(2);
  for (int i = 0; i < 200 * 200; ++i) noise.GetBits()[i] = random() & 0xFFFFFF;
  std::string native = test::Narrow(folder.Path()).substr(2);
  std::replace(native.begin(), native.end(), '\\', '/');
  const std::string name = native + "/picture.png";
  auto entries = [&] {
    return std::distance(std::filesystem::directory_iterator(native), std::filesystem::directory_iterator());
  };
  {
    test::FileSizeLimit limit(4096);
    EXPECT_NE(SWritePicture(file, noise), S_OK);
    EXPECT_EQ(entries(), 0) << "half a picture";
    ASSERT_EQ(SWritePicture(file, small), S_OK);
    ASSERT_EQ(chmod(name.c_str(), 0640), 0);
    EXPECT_NE(SWritePicture(file, noise), S_OK);
  }
  EXPECT_EQ(SReadPicture(file, &again), S_OK);
  EXPECT_EQ(again.GetSize(), SSize(3, 3));
  EXPECT_EQ(SWritePicture(file, noise), S_OK);
  EXPECT_EQ(entries(), 1);
  struct stat info;
  ASSERT_EQ(stat(name.c_str(), &info), 0);
  EXPECT_EQ(info.st_mode & 07777, 0640u);
}

#endif

}  // namespace
