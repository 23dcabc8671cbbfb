// A preview: a heading with the file's name and encoding, and below it the text, decoded as far as it is shown.
#pragma once

#include "qxcore/graphics/background.h"
#include "qxcore/graphics/font.h"
#include "tools/qxworkbench/line_view.h"
#include "tools/qxworkbench/preview_text.h"

class PreviewView : public LineView {
 public:
  // Shows a file in the encoding that was detected.
  PreviewView(const SString& name, const std::string& native, Encoding detected);

  // Decodes on for a while. True while another step has something to do at once.
  bool Step();
  void Show(Encoding encoding);  // decodes anew
  // The file has other contents now, in this encoding.
  void SetDetected(Encoding detected);
  void GoToPart(int part);

  const std::string& File() const { return m_native; }
  const SString& Name() const { return m_name; }
  Encoding Detected() const { return m_detected; }
  const PreviewText& Text() const { return m_text; }

 protected:
  int RowCount() const override { return m_text.LineCount(); }
  void DrawRow(SDC* dc, int row, const SRect& rect) override;
  void DrawHead(SDC* dc, const SRect& rect) override;
  int HeadHeight() const override { return RowHeight() + Scaled(8); }
  int ContentWidth() const override { return m_widest + Scaled(8); }
  HFONT MakeFont(int dpi) override;
  bool HasScrollBars() const override { return GetScrollBarCtrl(SB_VERT) != nullptr; }

  void OnShowWindow(int show, UINT why);

  // Ctrl with the arrows goes to another part of a long text.
  void OnKeyDown(UINT key, UINT repeat, UINT flags);

  QXCORE_DECLARE_MESSAGE_MAP()

 private:
  SString Heading() const;

  SString m_name;
  std::string m_native;
  Encoding m_detected;
  PreviewText m_text;
  SFont m_fixed;
  int m_widest = 0;  // of the lines that were drawn, in pixels
  int m_rowsShown = 0;
  bool m_wasShown = false;  // since the scroll bars were set
};
