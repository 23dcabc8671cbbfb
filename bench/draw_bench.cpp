// Drawing: gradients, texts and their extents on a bitmap, the same font file on both sides, anti-aliased.

#include <cstring>
#include <string>
#include <vector>

#include "bench/bench.h"
#if BENCH_PEERS
#include "bench/qt_application.h"
#endif
#include "qxcore/graphics/bitmap.h"
#include "qxcore/graphics/dc.h"
#include "qxcore/graphics/font.h"
#include "qxcore/graphics/gradient.h"

#if BENCH_PEERS
#include <QFontDatabase>
#include <QFontMetrics>
#include <QImage>
#include <QPainter>
#endif

namespace {

constexpr int kSide = 1000, kTexts = 10000, kExtents = 100000, kPixels = 13;
constexpr unsigned long kFrom = 0xC08040, kTo = 0x20F0FF;

struct Canvas {
  Canvas() {
    bitmap.CreatePixels(kSide, kSide);
    former = dc.SelectObject(bitmap);
  }
  ~Canvas() { dc.SelectObject(former); }
  SBitmap bitmap;
  SMemoryDC dc;
  HGDIOBJ former;
};

void Gradient(benchmark::State& state, int mode) {
  Canvas canvas;
  SDrawGradient gradient;
  gradient.SetGradient(mode, kFrom, kTo, SRect(0, 0, kSide, kSide));
  for (auto _ : state) {
    gradient.DrawGradient(canvas.dc);
    benchmark::DoNotOptimize(canvas.bitmap.GetBits());
  }
}

// Short texts as lists and panes show them.
std::vector<std::string> Texts() {
  std::vector<std::string> texts;
  for (int i = 0; i < 50; ++i) texts.push_back("Item " + std::to_string(i * 7919 % 1000) + ".txt");
  return texts;
}

std::vector<SString> OurTexts() {
  std::vector<SString> texts;
  for (const std::string& text : Texts()) texts.push_back(SString(text.c_str()));
  return texts;
}

HFONT OurFont() {
  LOGFONTW font{};
  font.lfHeight = -kPixels;
  const WCHAR* name = WTEXT("Liberation Sans");
  for (int i = 0; name[i]; ++i) font.lfFaceName[i] = name[i];
  return CreateFontIndirectW(&font);
}

}  // namespace

BENCH("horizontal gradient/ours") { Gradient(state, SDrawGradient::HORZ); }
BENCH("vertical gradient/ours") { Gradient(state, SDrawGradient::VERT); }

BENCH("10,000 texts drawn/ours") {
  Canvas canvas;
  SFontOld font(OurFont());
  SSelectObject select(canvas.dc, font);
  canvas.dc.SetBkMode(TRANSPARENT);
  const std::vector<SString> texts = OurTexts();
  for (auto _ : state) {
    for (int i = 0; i < kTexts; ++i)
      canvas.dc.TextOutW(i % 9 * 100, i % 60 * 16, texts[static_cast<std::size_t>(i) % texts.size()]);
  }
}

BENCH("100,000 text extents/ours") {
  Canvas canvas;
  SFontOld font(OurFont());
  SSelectObject select(canvas.dc, font);
  const std::vector<SString> texts = OurTexts();
  for (auto _ : state) {
    int sum = 0;
    for (int i = 0; i < kExtents; ++i)
      sum += canvas.dc.GetTextExtent(texts[static_cast<std::size_t>(i) % texts.size()]).cx;
    benchmark::DoNotOptimize(sum);
  }
}

#if BENCH_PEERS
namespace {

QFont TheirFont() {
  StartQt();
  static const int id =
      QFontDatabase::addApplicationFont("/usr/share/fonts/truetype/liberation2/LiberationSans-Regular.ttf");
  QFont font(QFontDatabase::applicationFontFamilies(id).at(0));
  font.setPixelSize(kPixels);
  font.setStyleStrategy(QFont::PreferAntialias);
  return font;
}

QColor TheirColor(unsigned long color) {
  return QColor(static_cast<int>(color & 255), static_cast<int>(color >> 8 & 255), static_cast<int>(color >> 16 & 255));
}

void TheirGradient(benchmark::State& state, QPointF to) {
  QImage image(kSide, kSide, QImage::Format_RGB32);
  QLinearGradient gradient(QPointF(0, 0), to);
  gradient.setColorAt(0, TheirColor(kFrom));
  gradient.setColorAt(1, TheirColor(kTo));
  for (auto _ : state) {
    QPainter painter(&image);
    painter.fillRect(image.rect(), gradient);
    painter.end();
    benchmark::DoNotOptimize(image.bits());
  }
}

std::vector<QString> TheirTexts() {
  std::vector<QString> texts;
  for (const std::string& text : Texts()) texts.push_back(QString::fromStdString(text));
  return texts;
}

}  // namespace

BENCH("horizontal gradient/memset") {
  std::vector<std::uint32_t> surface(kSide * kSide);
  for (auto _ : state) {
    std::memset(surface.data(), 0x5A, surface.size() * 4);
    benchmark::ClobberMemory();
  }
}

BENCH("horizontal gradient/QPainter") { TheirGradient(state, QPointF(0, kSide)); }
BENCH("vertical gradient/QPainter") { TheirGradient(state, QPointF(kSide, 0)); }

BENCH("10,000 texts drawn/QPainter") {
  const QFont font = TheirFont();
  const std::vector<QString> texts = TheirTexts();
  QImage image(kSide, kSide, QImage::Format_RGB32);
  QPainter painter(&image);
  painter.setFont(font);
  painter.setRenderHint(QPainter::TextAntialiasing);
  for (auto _ : state) {
    for (int i = 0; i < kTexts; ++i)
      painter.drawText(i % 9 * 100, i % 60 * 16 + kPixels, texts[static_cast<std::size_t>(i) % texts.size()]);
  }
}

BENCH("100,000 text extents/QFontMetrics") {
  const QFontMetrics metrics(TheirFont());
  const std::vector<QString> texts = TheirTexts();
  for (auto _ : state) {
    int sum = 0;
    for (int i = 0; i < kExtents; ++i)
      sum += metrics.horizontalAdvance(texts[static_cast<std::size_t>(i) % texts.size()]);
    benchmark::DoNotOptimize(sum);
  }
}
#endif
