// The sizes as text: "splitter 1 DPI KEEP-RATIO rows N (ideal open)... columns N (ideal open)...".

#include <limits>

#include "qxcore/ui/app/internal/scaled_pixels.h"
#include "qxcore/ui/layout/internal/state_text.h"
#include "qxcore/ui/layout/splitter.h"

namespace {

struct Line {
  int m_ideal, m_open;
};
using Lines = STableDumb<Line>;

constexpr int kMostPixels = std::numeric_limits<int>::max();

void Write(SStateWriter& writer, SStringView name, const STableDumb<SPaneInfo>& infos, const STableDumb<int>& open) {
  writer.Word(name).Number(infos.GetCount());
  for (int i = 0; i < infos.GetCount(); ++i) writer.Number(infos[i].m_ideal).Number(open[i]);
}

void Read(SStateReader& reader, SStringView name, Lines& lines) {
  int count = 0;
  reader.Word(name).Number(&count, kSMaxPanes);
  for (int i = 0; reader.IsValid() && i < count; ++i) {
    Line line = {};
    reader.Number(&line.m_ideal, kMostPixels).Number(&line.m_open, kMostPixels);
    lines.Add(line);
  }
}

}  // namespace

SString SSplitterWnd::GetState() const {
  SStateWriter writer;
  writer.Word(WTEXT("splitter")).Number(1).Number(m_dpi).Number(m_keepRatio);
  Write(writer, WTEXT("rows"), m_rows, m_openRows);
  Write(writer, WTEXT("columns"), m_columns, m_openColumns);
  return writer.Text();
}

// What must be made is made first, so that a failure loses nothing.
bool SSplitterWnd::SetGrid(int rows, int columns) {
  const bool isStatic = m_paneClass == nullptr;
  if (isStatic && (rows != m_rowCount || columns != m_columnCount)) return false;
  const int formerRows = m_rowCount;
  EndUse();
  if (!GrowTo(true, rows)) return false;
  if (!GrowTo(false, columns)) return ShrinkTo(true, formerRows), false;
  ShrinkTo(true, rows);
  ShrinkTo(false, columns);
  return true;
}

int SSplitterWnd::SetState(const SString& state) {
  int version = 0, dpi = 0, keepRatio = 0;
  Lines rows, columns;
  SStateReader reader(state);
  reader.Word(WTEXT("splitter")).Number(&version, 1).Number(&dpi, 9600).Number(&keepRatio, 1);
  Read(reader, WTEXT("rows"), rows);
  Read(reader, WTEXT("columns"), columns);
  if (m_hWnd == nullptr || !reader.IsAtEnd() || version != 1 || dpi == 0 || rows.IsEmpty() || columns.IsEmpty()) {
    return 0;
  }
  if (!SetGrid(rows.GetCount(), columns.GetCount())) return 0;

  m_keepRatio = keepRatio;
  for (const bool isRow : {true, false}) {
    const Lines& lines = isRow ? rows : columns;
    for (int i = 0; i < lines.GetCount(); ++i) {
      Table(isRow)[i].m_ideal = keepRatio ? lines[i].m_ideal : SScaledPixels(lines[i].m_ideal, m_dpi, dpi);
      OpenSizes(isRow)[i] = SScaledPixels(lines[i].m_open, m_dpi, dpi);
    }
  }
  RecalcLayout();
  return 1;
}
