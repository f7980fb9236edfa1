// Pattern drawing of CDC: PatBlt and the halftone brush with which drag marks
// are inverted onto a window and inverted back off it.
#include "afxpriv.h"

BOOL CDC::PatBlt(int x, int y, int nWidth, int nHeight, DWORD dwRop) {
  ASSERT(m_hDC != NULL);
  return ::PatBlt(m_hDC, x, y, nWidth, nHeight, dwRop);
}

CBrush* PASCAL CDC::GetHalftoneBrush() {
  // One brush for the process, made on first use and kept to the end: every
  // caller gets a temporary wrapper of it, as with any handle it did not make.
  static const HBRUSH hbrHalftone = [] {
    WORD grayPattern[8];
    for (int i = 0; i < 8; i++) grayPattern[i] = (WORD)(0x5555 << (i & 1));
    HBRUSH hbr = NULL;
    HBITMAP hbm = ::CreateBitmap(8, 8, 1, 1, grayPattern);
    if (hbm != NULL) {
      hbr = ::CreatePatternBrush(hbm);
      ::DeleteObject(hbm);  // the brush keeps its own copy of the pattern
    }
    return hbr;
  }();
  if (hbrHalftone == NULL) AfxThrowResourceException();
  return CBrush::FromHandle(hbrHalftone);
}
