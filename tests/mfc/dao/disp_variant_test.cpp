// The automation value types: text variants holding single-byte text, type
// changes, dates and currency values as oleaut32 reads and writes them.
#include "DaoTestSupport.h"

TEST(DispVariantTest, TextVariantsAndTypeChanges) {
  COleVariant bytes("Köln", VT_BSTRT);
  EXPECT_EQ(VT_BSTR, bytes.vt);
  EXPECT_EQ(4u, SysStringByteLen(bytes.bstrVal));
  EXPECT_STREQ("Köln", (LPCSTR)bytes.bstrVal);
  COleVariant wide("Köln");
  EXPECT_EQ(L'\x00F6', wide.bstrVal[1]);

  COleVariant number(" 42 ", VT_BSTRT);
  number.ChangeType(VT_I4);
  EXPECT_EQ(42, number.lVal);
  COleVariant money(COleCurrency(12, 5000));
  money.ChangeType(VT_BSTR);
  CString strMoney((LPCSTR)money.bstrVal, (int)SysStringByteLen(money.bstrVal));
  EXPECT_TRUE(strMoney == "12.5" || strMoney == "12,5") << (LPCSTR)strMoney;
  COleVariant text("kein Wert", VT_BSTRT);
  bool bRaised = false;
  try {
    text.ChangeType(VT_I4);
  } catch (CException* e) {
    bRaised = true;
    e->Delete();
  }
  EXPECT_TRUE(bRaised);
  EXPECT_EQ(VT_BSTR, text.vt);   // unchanged after the failure
}

TEST(DispVariantTest, DatesAreCheckedFormattedAndParsed) {
  const struct { int y, mo, d, h, mi, s; bool bValid; } cases[] = {
      {2024, 2, 29, 0, 0, 0, true},   {2023, 2, 29, 0, 0, 0, false}, {2026, 4, 31, 0, 0, 0, false},
      {2026, 13, 1, 0, 0, 0, false}, {2026, 1, 1, 24, 0, 0, false},
  };
  for (const auto& c : cases) {
    COleDateTime date(c.y, c.mo, c.d, c.h, c.mi, c.s);
    EXPECT_EQ(c.bValid ? COleDateTime::valid : COleDateTime::invalid, date.GetStatus()) << c.y << "-" << c.mo << "-" << c.d;
  }
  COleDateTime date(2026, 12, 6, 14, 30, 5);
  EXPECT_EQ(CString("06.12.2026 14:30:05"), date.Format("%d.%m.%Y %H:%M:%S"));
  EXPECT_DOUBLE_EQ(46362.0 + (14 * 3600 + 30 * 60 + 5) / 86400.0, date.m_dt);
  COleDateTime parsed;
  EXPECT_TRUE(parsed.ParseDateTime("2026-12-06 14:30:05"));
  EXPECT_EQ(CString("2026-12-06 14:30"), parsed.Format("%Y-%m-%d %H:%M"));
  EXPECT_FALSE(parsed.ParseDateTime("kein Datum"));
  EXPECT_EQ(COleDateTime::invalid, parsed.GetStatus());
}
