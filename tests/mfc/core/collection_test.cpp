// CArray with class elements, the lists and maps with POSITION iteration, the
// typed pointer wrappers, and CRect arithmetic.
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

// Counts live instances, to see that the array constructs and destroys each one.
struct Counted {
  static int alive;
  int value;
  Counted() : value(0) { ++alive; }
  Counted(const Counted& o) : value(o.value) { ++alive; }
  Counted& operator=(const Counted& o) { value = o.value; return *this; }
  ~Counted() { value = -1; --alive; } // a destroyed element reads as -1
};
int Counted::alive = 0;

TEST(CArrayTest, StringsInsertRemoveGrow) {
  CArray<CString, CString&> a;
  EXPECT_TRUE(a.IsEmpty());
  EXPECT_EQ(-1, a.GetUpperBound());
  CString s1("eins"), s2("zwei"), s3("drei");
  EXPECT_EQ(0, a.Add(s1));
  EXPECT_EQ(1, a.Add(s3));
  a.InsertAt(1, s2);
  EXPECT_EQ("eins|zwei|drei|", Join(a));
  CString x("x");
  a.InsertAt(5, x, 2); // beyond the end: the gap is filled with empty strings
  EXPECT_EQ(7, a.GetSize());
  EXPECT_EQ("eins|zwei|drei|||x|x|", Join(a));
  a.RemoveAt(3, 2);
  EXPECT_EQ("eins|zwei|drei|x|x|", Join(a));
  a.RemoveAt(0);
  EXPECT_EQ("zwei|drei|x|x|", Join(a));
  a.SetAt(0, s1);
  a[1] = "DREI";
  a.ElementAt(2) += "y";
  EXPECT_EQ("eins|DREI|xy|x|", Join(a));
  a.SetAtGrow(5, s3);
  EXPECT_EQ("eins|DREI|xy|x||drei|", Join(a));
  EXPECT_EQ(5, a.GetUpperBound());

  for (int i = 0; i < 2000; ++i) {
    CString v;
    v.Format("%d", i);
    a.Add(v);
  }
  EXPECT_EQ(2006, a.GetSize());
  EXPECT_EQ("1999", std::string((LPCSTR)a[2005]));
  EXPECT_EQ("eins", std::string((LPCSTR)a[0]));
  a.RemoveAll();
  EXPECT_EQ(0, a.GetSize());
}

TEST(CArrayTest, ElementsThatReferToTheArrayItself) {
  CArray<CString, CString&> a;
  CString first("a");
  a.Add(first);
  for (int i = 0; i < 100; ++i) a.Add(a[0]); // growing must not invalidate the argument
  EXPECT_EQ(101, a.GetSize());
  EXPECT_EQ("a", std::string((LPCSTR)a[100]));
  a[1] = "b";
  a.InsertAt(0, a[1]);
  EXPECT_EQ("b", std::string((LPCSTR)a[0]));
  EXPECT_EQ("a", std::string((LPCSTR)a[1]));
  a.Append(a);
  EXPECT_EQ(204, a.GetSize());
  EXPECT_EQ("b", std::string((LPCSTR)a[102]));

  CArray<Counted, const Counted&> c;
  Counted five;
  five.value = 5;
  c.Add(five);
  for (int i = 0; i < 50; ++i) c.Add(c[0]);
  for (int i = 0; i < 50; ++i) c.InsertAt(0, c[c.GetUpperBound()]);
  for (INT_PTR i = 0; i < c.GetSize(); ++i) ASSERT_EQ(5, c[i].value) << i;

  CArray<CString, CString&> b;
  CString q("q");
  b.Add(q);
  b.Add(q);
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
    Counted c;
    c.value = 7;
    a.InsertAt(1, c, 4);
    EXPECT_EQ(7 + 1, Counted::alive);
    a.RemoveAt(0, 2);
    EXPECT_EQ(5 + 1, Counted::alive);
    a.FreeExtra();
    EXPECT_EQ(5 + 1, Counted::alive);
    EXPECT_EQ(7, a[0].value);
  }
  EXPECT_EQ(0, Counted::alive);

  CArray<int, int> n;
  n.SetSize(5, 100);
  for (INT_PTR i = 0; i < n.GetSize(); ++i) EXPECT_EQ(0, n[i]);
  n[4] = 9;
  n.SetSize(2);
  n.SetSize(5);
  EXPECT_EQ(0, n[4]); // regrown elements start at zero again
}

TEST(CArrayDeathTest, IndexOutsideTheArrayIsAnAssertion) {
  GTEST_FLAG_SET(death_test_style, "threadsafe");
  CArray<int, int> a;
  a.Add(1);
  EXPECT_DEATH(a.GetAt(1), "Assertion failed");
  EXPECT_DEATH(a[-1] = 2, "Assertion failed");
}

TEST(CListTest, PositionsFindInsertRemove) {
  CStringList l;
  l.AddTail("b");
  l.AddTail(CString("c"));
  l.AddHead("a");
  EXPECT_EQ(3, l.GetCount());
  std::string all;
  for (POSITION pos = l.GetHeadPosition(); pos != NULL;) all += (LPCSTR)l.GetNext(pos);
  EXPECT_EQ("abc", all);
  all.clear();
  for (POSITION pos = l.GetTailPosition(); pos != NULL;) all += (LPCSTR)l.GetPrev(pos);
  EXPECT_EQ("cba", all);

  POSITION pb = l.Find("b");
  ASSERT_NE(nullptr, pb);
  EXPECT_EQ(nullptr, l.Find("b", pb));
  EXPECT_EQ(nullptr, l.Find("z"));
  l.InsertBefore(pb, "a2");
  l.InsertAfter(pb, "b2");
  l.RemoveAt(pb);
  all.clear();
  for (POSITION pos = l.GetHeadPosition(); pos != NULL;) all += (LPCSTR)l.GetNext(pos) + CString(",");
  EXPECT_EQ("a,a2,b2,c,", all);
  EXPECT_TRUE(l.GetAt(l.FindIndex(2)) == "b2");
  EXPECT_EQ(nullptr, l.FindIndex(4));
  EXPECT_TRUE(l.RemoveHead() == "a");
  EXPECT_TRUE(l.RemoveTail() == "c");
  EXPECT_TRUE(l.GetHead() == "a2");
  EXPECT_TRUE(l.GetTail() == "b2");
  l.RemoveAll();
  EXPECT_TRUE(l.IsEmpty());
  EXPECT_EQ(nullptr, l.GetHeadPosition());

  CPtrList p;
  int x = 1, y = 2;
  p.AddTail(&x);
  p.AddTail(&y);
  EXPECT_EQ(&y, p.GetAt(p.Find(&y)));
  CTypedPtrList<CPtrList, int*> tp;
  tp.AddTail(&y);
  EXPECT_EQ(2, *tp.GetHead());
}

TEST(CMapTest, StringToPtrLookupRemoveIterate) {
  CMapStringToPtr m;
  int values[1000];
  for (int i = 0; i < 1000; ++i) {
    CString key;
    key.Format("Schl\xfcssel%d", i);
    m.SetAt(key, &values[i]);
  }
  EXPECT_EQ(1000, m.GetCount());
  void* p = NULL;
  ASSERT_TRUE(m.Lookup("Schl\xfcssel500", p));
  EXPECT_EQ(&values[500], p);
  EXPECT_FALSE(m.Lookup("schl\xfcssel500", p)); // keys are case-sensitive
  m["Schl\xfcssel500"] = &values[0];
  EXPECT_EQ(1000, m.GetCount());
  ASSERT_TRUE(m.Lookup("Schl\xfcssel500", p));
  EXPECT_EQ(&values[0], p);
  EXPECT_TRUE(m.RemoveKey("Schl\xfcssel7"));
  EXPECT_FALSE(m.RemoveKey("Schl\xfcssel7"));
  EXPECT_FALSE(m.Lookup("Schl\xfcssel7", p));

  std::set<std::string> seen;
  CString key;
  POSITION pos = m.GetStartPosition();
  while (pos != NULL) {
    m.GetNextAssoc(pos, key, p);
    seen.insert((LPCSTR)key);
  }
  EXPECT_EQ(999u, seen.size());
  EXPECT_EQ(0u, seen.count("Schl\xfcssel7"));
  m.RemoveAll();
  EXPECT_TRUE(m.IsEmpty());
  EXPECT_EQ(nullptr, m.GetStartPosition());
}

} // namespace
