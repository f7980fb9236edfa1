// CArray with class elements and arguments taken from the array itself, the
// list with POSITION editing, and the string map.
#include <afx.h>
#include <afxtempl.h>

#include <gtest/gtest.h>

#include <set>
#include <string>

namespace {

std::string Join(const CArray<CString, CString&>& a) {
  std::string s;
  for (INT_PTR i = 0; i < a.GetSize(); ++i) s += std::string((LPCSTR)a[i]) + "|";
  return s;
}

// Counts live instances.
struct Counted {
  static int alive;
  Counted() { ++alive; }
  Counted(const Counted&) { ++alive; }
  Counted& operator=(const Counted&) = default;
  ~Counted() { --alive; }
};
int Counted::alive = 0;

TEST(CArrayTest, InsertBeyondTheEndRemoveSetAtGrowAndArgumentsFromTheArray) {
  CArray<CString, CString&> a;
  CString s1("eins"), s3("drei"), x("x");
  a.Add(s1);
  a.InsertAt(3, x, 2); // beyond the end: the gap is filled with empty strings
  EXPECT_EQ("eins|||x|x|", Join(a));
  a.RemoveAt(1, 2);
  EXPECT_EQ("eins|x|x|", Join(a));
  a.SetAtGrow(4, s3);
  EXPECT_EQ("eins|x|x||drei|", Join(a));

  // Arguments that refer to the array itself.
  CString first("a");
  a.RemoveAll();
  a.Add(first);
  for (int i = 0; i < 100; ++i) a.Add(a[0]); // growing must not invalidate the argument
  a.Append(a);
  EXPECT_EQ(202, a.GetSize());
  EXPECT_EQ("a", std::string((LPCSTR)a[201]));

  CArray<CString, CString&> b;
  b.Add(first);
  b.Add(first);
  b.InsertAt(1, &b);
  EXPECT_EQ(4, b.GetSize());
}

TEST(CArrayTest, SizeConstructsAndDestroysEveryElement) {
  {
    CArray<Counted, const Counted&> a;
    a.SetSize(10);
    EXPECT_EQ(10, Counted::alive);
    a.SetSize(3);
    EXPECT_EQ(3, Counted::alive);
  }
  EXPECT_EQ(0, Counted::alive);

  CArray<int, int> n;
  n.SetSize(5);
  n[4] = 9;
  n.SetSize(2);
  n.SetSize(5);
  EXPECT_EQ(0, n[4]); // regrown elements start at zero again
}

TEST(CListTest, PositionsFindInsertRemove) {
  CStringList l;
  l.AddTail("b");
  l.AddTail("c");
  l.AddHead("a");
  POSITION pb = l.Find("b");
  ASSERT_NE(nullptr, pb);
  l.InsertBefore(pb, "a2");
  l.InsertAfter(pb, "b2");
  l.RemoveAt(pb);
  std::string all;
  for (POSITION pos = l.GetTailPosition(); pos != NULL;) all += (LPCSTR)l.GetPrev(pos) + CString(",");
  EXPECT_EQ("c,b2,a2,a,", all);
}

TEST(CMapTest, StringToPtrLookupRemoveIterate) {
  CMapStringToPtr m;
  int values[20];
  for (int i = 0; i < 20; ++i) {
    CString key;
    key.Format("Schl\xfcssel%d", i);
    m.SetAt(key, &values[i]);
  }
  void* p = NULL;
  EXPECT_FALSE(m.Lookup("schl\xfcssel15", p)); // keys are case-sensitive
  m["Schl\xfcssel15"] = &values[0];
  EXPECT_EQ(20, m.GetCount());
  ASSERT_TRUE(m.Lookup("Schl\xfcssel15", p));
  EXPECT_EQ(&values[0], p);
  EXPECT_TRUE(m.RemoveKey("Schl\xfcssel7"));
  EXPECT_FALSE(m.RemoveKey("Schl\xfcssel7"));

  std::set<std::string> seen;
  CString key;
  for (POSITION pos = m.GetStartPosition(); pos != NULL;) {
    m.GetNextAssoc(pos, key, p);
    seen.insert((LPCSTR)key);
  }
  EXPECT_EQ(19u, seen.size());
  EXPECT_EQ(0u, seen.count("Schl\xfcssel7"));
}

} // namespace
