// CString: editing with arguments that point into the string itself, bounds of
// the extractors, comparison and collation of Windows-1252 text, formatting,
// buffers and resources.
#include <afx.h>

#include <gtest/gtest.h>

#include <string>

namespace {

std::string Bytes(const CString& s) { return std::string((LPCSTR)s, (size_t)s.GetLength()); }

TEST(CStringEdit, AppendingTheStringToItself) {
  CString s("ab");
  s += s;
  EXPECT_EQ("abab", Bytes(s));
  s += 'c';
  s += (LPCSTR)s + 2; // a pointer into the string itself
  EXPECT_EQ("ababcabc", Bytes(s));
  // Replace returns the count, matching left to right without overlaps or
  // searching the replacement again.
  CString t("aaa");
  EXPECT_EQ(1, t.Replace("aa", "b"));
  EXPECT_EQ("ba", Bytes(t));
  CString w("aXa");
  EXPECT_EQ(2, w.Replace("a", "aa"));
  EXPECT_EQ("aaXaa", Bytes(w));
  EXPECT_EQ(0, w.Replace("", "z"));
  EXPECT_EQ(1, w.Replace("X", NULL));
  EXPECT_EQ("aaaa", Bytes(w));
}

TEST(CStringCompare, BytesUnsignedNoCaseAndCollation) {
  EXPECT_GT(CString("\xe4").Compare("z"), 0); // 0xE4 (ä) is above 'z'
  EXPECT_EQ(0, CString("").Compare(NULL));
  EXPECT_EQ(0, CString("\xc4PFEL \xd6L \xdc" "BER").CompareNoCase("\xe4pfel \xf6l \xfc" "ber"));
  // Collation puts "Äpfel" before "Birne", unlike the byte order above.
  CString apfel("\xc4pfel");
  EXPECT_LT(apfel.Collate("Birne"), 0);
  EXPECT_EQ(0, apfel.CollateNoCase("\xe4PFEL"));
}

TEST(CStringExtract, MidLeftRightClampToTheString) {
  CString s("Hallo");
  EXPECT_EQ("Hal", Bytes(s.Mid(-1, 3)));
  EXPECT_EQ("llo", Bytes(s.Mid(2, 100)));
  EXPECT_EQ("", Bytes(s.Mid(1, -2)));
  EXPECT_EQ("", Bytes(s.Left(-5)));
  EXPECT_EQ("Hallo", Bytes(s.Right(100)));
  EXPECT_EQ("", Bytes(s.Right(-1)));
  EXPECT_EQ("", Bytes(CString("abc").SpanIncluding("0123456789")));
}

TEST(CStringFormat, LongTextNumbersAndArgumentsFromTheTarget) {
  CString s;
  s.Format("%d|%5.2f|%x|%s|%c|%lld", -42, 3.14159, 255, "Text", 'Z', 1234567890123LL);
  EXPECT_EQ("-42| 3.14|ff|Text|Z|1234567890123", Bytes(s));

  std::string big(20000, 'q');
  s.Format("<%s>%d", big.c_str(), 7);
  EXPECT_EQ("<" + big + ">7", Bytes(s));

  CString self("ab");
  self.Format("%s-%s", (LPCSTR)self, (LPCSTR)self);
  EXPECT_EQ("ab-ab", Bytes(self));
}

TEST(CStringBuffer, GetBufferReleaseBuffer) {
  CString s("abc");
  strcpy(s.GetBuffer(100), "Hallo Welt");
  s.ReleaseBuffer();
  EXPECT_EQ("Hallo Welt", Bytes(s));

  CString e;
  e.GetBuffer(0)[0] = '\0'; // an empty string still has room for the NUL
  e.ReleaseBuffer();
  EXPECT_TRUE(e.IsEmpty());

  // Embedded NULs count in the length, also in copies.
  CString n("xy");
  LPSTR pn = n.GetBufferSetLength(5);
  EXPECT_EQ('\0', pn[2]);
  pn[4] = 'z';
  CString copy = n;
  EXPECT_EQ(std::string("xy\0\0z", 5), Bytes(copy));
  EXPECT_EQ(4, copy.Find('z'));
}

TEST(CStringResource, LoadStringFromTheResourceChain) {
  CString s("vorher");
  EXPECT_TRUE(s.LoadString(103)); // longer than the first buffer
  EXPECT_EQ(900, s.GetLength());
  EXPECT_EQ("Abschnitt 059; ", Bytes(s.Right(15)));
  EXPECT_FALSE(s.LoadString(4711));
  EXPECT_TRUE(s.IsEmpty());

  CString msg;
  AfxFormatString2(msg, 101, "C:\\a.txt", "1 MB");
  EXPECT_EQ("Die Datei C:\\a.txt ist gr\xf6\xdf" "er als 1 MB.", Bytes(msg));
  AfxFormatString1(msg, 101, "x");
  EXPECT_EQ("Die Datei x ist gr\xf6\xdf" "er als %2.", Bytes(msg)); // no second text: left as it is
}

} // namespace
