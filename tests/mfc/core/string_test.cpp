// CString: construction, editing, searching, comparison and collation of
// Windows-1252 text, formatting, buffers and resources.
#include <afx.h>

#include <gtest/gtest.h>

#include <map>
#include <string>

namespace {

std::string Bytes(const CString& s) { return std::string((LPCSTR)s, (size_t)s.GetLength()); }

TEST(CStringBasics, ConcatenationIncludingSelfReference) {
  CString s("ab");
  s += s;
  EXPECT_EQ("abab", Bytes(s));
  s += 'c';
  s += (LPCSTR)s + 2; // a pointer into the string itself
  EXPECT_EQ("ababcabc", Bytes(s));
  s = s.Mid(2, 3);
  EXPECT_EQ("abc", Bytes(s));

  CString x("x");
  EXPECT_EQ("xy", Bytes(x + "y"));
  EXPECT_EQ("yx", Bytes("y" + x));
  EXPECT_EQ("x!", Bytes(x + '!'));
  EXPECT_EQ("!x", Bytes('!' + x));
  EXPECT_EQ("xx", Bytes(x + x));

  CString grow;
  for (int i = 0; i < 10000; ++i) grow += 'z';
  EXPECT_EQ(10000, grow.GetLength());
  EXPECT_EQ(std::string(10000, 'z'), Bytes(grow));
}

TEST(CStringCompare, OperatorsBothSidesAndByteOrder) {
  CString s("Bern");
  EXPECT_TRUE(s == "Bern");
  EXPECT_TRUE("Bern" == s);
  EXPECT_TRUE(s != "bern");
  EXPECT_TRUE("Aachen" < s);
  EXPECT_TRUE(s < "Zug");
  EXPECT_TRUE(s <= CString("Bern"));
  EXPECT_TRUE(s >= "Bern");
  EXPECT_TRUE("Zug" > s);
  // Bytes compare unsigned: 0xE4 (ä) is above 'z'.
  EXPECT_GT(CString("\xe4").Compare("z"), 0);
  EXPECT_LT(CString("abc").Compare("abd"), 0);
  EXPECT_EQ(0, CString("").Compare(NULL));

  std::map<CString, int> m;
  m[CString("b")] = 2;
  m[CString("a")] = 1;
  m[CString("c")] = 3;
  EXPECT_EQ("a", Bytes(m.begin()->first));
}

TEST(CStringCompare, NoCaseFoldsGermanLetters) {
  EXPECT_EQ(0, CString("\xc4PFEL \xd6L \xdc" "BER").CompareNoCase("\xe4pfel \xf6l \xfc" "ber"));
  EXPECT_LT(CString("abc").CompareNoCase("ABD"), 0);
  EXPECT_GT(CString("ABD").CompareNoCase("abc"), 0);
  EXPECT_NE(0, CString("\xe4").CompareNoCase("a"));
}

TEST(CStringCompare, CollationSortsUmlautsWithTheirLetter) {
  // Byte order puts "Äpfel" after "Birne"; collation puts it before.
  CString apfel("\xc4pfel");
  EXPECT_GT(apfel.Compare("Birne"), 0);
  EXPECT_LT(apfel.Collate("Birne"), 0);
  EXPECT_LT(CString("\xe4" "b").Collate("ac"), 0);
  EXPECT_GT(CString("M\xfcller").Collate("Muller"), 0);
  EXPECT_LT(CString("M\xfcller").Collate("Mz"), 0);
  EXPECT_EQ(0, CString("Stra\xdf" "e").Collate("Stra\xdf" "e"));
  EXPECT_NE(0, apfel.Collate("\xe4pfel"));
  EXPECT_EQ(0, apfel.CollateNoCase("\xe4PFEL"));
  EXPECT_LT(apfel.CollateNoCase("birne"), 0);
}

TEST(CStringExtract, MidLeftRightClampToTheString) {
  CString s("Hallo");
  EXPECT_EQ("all", Bytes(s.Mid(1, 3)));
  EXPECT_EQ("llo", Bytes(s.Mid(2)));
  EXPECT_EQ("Hal", Bytes(s.Mid(-1, 3)));
  EXPECT_EQ("llo", Bytes(s.Mid(2, 100)));
  EXPECT_EQ("", Bytes(s.Mid(10)));
  EXPECT_EQ("", Bytes(s.Mid(10, 2)));
  EXPECT_EQ("", Bytes(s.Mid(1, -2)));
  EXPECT_EQ("Ha", Bytes(s.Left(2)));
  EXPECT_EQ("", Bytes(s.Left(-5)));
  EXPECT_EQ("Hallo", Bytes(s.Left(100)));
  EXPECT_EQ("lo", Bytes(s.Right(2)));
  EXPECT_EQ("Hallo", Bytes(s.Right(100)));
  EXPECT_EQ("", Bytes(s.Right(-1)));

  EXPECT_EQ("123", Bytes(CString("123abc").SpanIncluding("0123456789")));
  EXPECT_EQ("", Bytes(CString("abc").SpanIncluding("0123456789")));
  EXPECT_EQ("Name", Bytes(CString("Name=Wert").SpanExcluding("=;")));
  EXPECT_EQ("Name", Bytes(CString("Name").SpanExcluding("=;")));
}

TEST(CStringEdit, ReplaceReturnsTheCount) {
  CString s("a.b.c");
  EXPECT_EQ(2, s.Replace('.', ','));
  EXPECT_EQ("a,b,c", Bytes(s));
  EXPECT_EQ(0, s.Replace(',', ','));
  EXPECT_EQ(0, s.Replace('x', 'y'));

  CString t("aaa");
  EXPECT_EQ(1, t.Replace("aa", "b")); // left to right, not overlapping
  EXPECT_EQ("ba", Bytes(t));
  CString u("abcabc");
  EXPECT_EQ(2, u.Replace("bc", ""));
  EXPECT_EQ("aa", Bytes(u));
  CString v("x;y");
  EXPECT_EQ(1, v.Replace(";", "\r\n"));
  EXPECT_EQ("x\r\ny", Bytes(v));
  EXPECT_EQ(0, v.Replace("", "z"));
  EXPECT_EQ(1, v.Replace("x", NULL));
  EXPECT_EQ("\r\ny", Bytes(v));
  CString w("aXa");
  EXPECT_EQ(2, w.Replace("a", "aa")); // the replacement is not searched again
  EXPECT_EQ("aaXaa", Bytes(w));
}

TEST(CStringFormat, LongTextAndNumbers) {
  CString s;
  s.Format("%d|%5.2f|%x|%s|%c|%lld", -42, 3.14159, 255, "Text", 'Z', 1234567890123LL);
  EXPECT_EQ("-42| 3.14|ff|Text|Z|1234567890123", Bytes(s));

  std::string big(20000, 'q');
  s.Format("<%s>%d", big.c_str(), 7);
  EXPECT_EQ("<" + big + ">7", Bytes(s));

  CString self("ab");
  self.Format("%s-%s", (LPCSTR)self, (LPCSTR)self); // the arguments live in the target
  EXPECT_EQ("ab-ab", Bytes(self));

  CString a("Zeilen: ");
  a.AppendFormat("%d von %d", 3, 10);
  EXPECT_EQ("Zeilen: 3 von 10", Bytes(a));
  a.AppendFormat("%s", big.c_str());
  EXPECT_EQ(16 + 20000, a.GetLength());
}

TEST(CStringBuffer, GetBufferReleaseBuffer) {
  CString s("abc");
  LPSTR p = s.GetBuffer(100);
  strcpy(p, "Hallo Welt");
  s.ReleaseBuffer();
  EXPECT_EQ("Hallo Welt", Bytes(s));

  p = s.GetBuffer(0);
  p[5] = '\0';
  s.ReleaseBuffer();
  EXPECT_EQ("Hallo", Bytes(s));
  s.GetBuffer(10);
  s.ReleaseBuffer(2);
  EXPECT_EQ("Ha", Bytes(s));

  CString e;
  LPSTR pe = e.GetBuffer(0);
  ASSERT_NE(nullptr, pe);
  pe[0] = '\0';
  e.ReleaseBuffer();
  EXPECT_TRUE(e.IsEmpty());

  CString n("xy");
  LPSTR pn = n.GetBufferSetLength(5);
  EXPECT_EQ(5, n.GetLength());
  EXPECT_EQ('\0', pn[2]);
  pn[4] = 'z';
  EXPECT_EQ(std::string("xy\0\0z", 5), Bytes(n));
  EXPECT_EQ(4, n.Find('z'));
  CString copy = n;
  EXPECT_EQ(5, copy.GetLength());
  n.GetBufferSetLength(1);
  EXPECT_EQ("x", Bytes(n));

  CString f("frei");
  f.Preallocate(1000);
  EXPECT_GE(f.GetAllocLength(), 1000);
  f.FreeExtra();
  EXPECT_EQ(4, f.GetAllocLength());
  EXPECT_EQ("frei", Bytes(f));
}

TEST(CStringResource, LoadStringFromTheResourceChain) {
  CString s("vorher");
  EXPECT_TRUE(s.LoadString(100));
  EXPECT_EQ("Gr\xf6\xdf" "e der Datei", Bytes(s));

  EXPECT_TRUE(s.LoadString(103)); // longer than the first buffer
  EXPECT_EQ(900, s.GetLength());
  EXPECT_EQ("Abschnitt 000; ", Bytes(s.Left(15)));
  EXPECT_EQ("Abschnitt 059; ", Bytes(s.Right(15)));

  EXPECT_FALSE(s.LoadString(4711));
  EXPECT_TRUE(s.IsEmpty());

  CString fromId((LPCSTR)MAKEINTRESOURCE(100));
  EXPECT_EQ("Gr\xf6\xdf" "e der Datei", Bytes(fromId));

  CString msg;
  AfxFormatString2(msg, 101, "C:\\a.txt", "1 MB");
  EXPECT_EQ("Die Datei C:\\a.txt ist gr\xf6\xdf" "er als 1 MB.", Bytes(msg));
  AfxFormatString1(msg, 101, "x");
  EXPECT_EQ("Die Datei x ist gr\xf6\xdf" "er als %2.", Bytes(msg)); // no second text: left as it is

  CString fmt;
  fmt.Format(102, 12);
  EXPECT_EQ("Zeile mit Format: 12 Datens\xe4tze", Bytes(fmt));
}

} // namespace
