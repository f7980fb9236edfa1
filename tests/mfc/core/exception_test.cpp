// Exceptions thrown as pointers: Delete for heap and stack objects, the MFC
// macros, messages, cause codes, and exceptions that cross a DLL boundary.
#include <afx.h>

#include <gtest/gtest.h>

#include <string>

#include "core_testdll.h"

namespace {

class CCountedException : public CException {
public:
  static int destroyed;
  CCountedException() {}
  ~CCountedException() { ++destroyed; }
};
int CCountedException::destroyed = 0;

std::string Message(const CException& e, UINT nMax = 512) {
  char sz[512];
  memset(sz, 'x', sizeof(sz));
  BOOL bOk = e.GetErrorMessage(sz, nMax);
  return bOk ? std::string(sz) : std::string("<none:") + sz + ">";
}

TEST(ExceptionDelete, HeapExceptionsAreFreedStackOnesAreNot) {
  CCountedException::destroyed = 0;
  try {
    throw new CCountedException;
  } catch (CException* e) {
    e->Delete();
  }
  EXPECT_EQ(1, CCountedException::destroyed);

  {
    CCountedException onStack;
    onStack.Delete(); // must not free a stack object
  }
  EXPECT_EQ(2, CCountedException::destroyed);

  // The static memory exception survives any number of Delete calls.
  for (int i = 0; i < 2; ++i) {
    try {
      AfxThrowMemoryException();
    } catch (CException* e) {
      EXPECT_TRUE(e->IsKindOf(RUNTIME_CLASS(CMemoryException)));
      e->Delete();
    }
  }
}

TEST(ExceptionMacros, CatchDeletesUnlessRethrownAlsoAcrossTheDll) {
  CCountedException::destroyed = 0;
  bool bCaught = false;
  TRY {
    THROW(new CCountedException);
  }
  CATCH(CFileException, e) {
    ADD_FAILURE() << "wrong handler";
  }
  AND_CATCH(CException, e) {
    bCaught = e != NULL;
  }
  END_CATCH
  EXPECT_TRUE(bCaught);
  EXPECT_EQ(1, CCountedException::destroyed);

  CException* pOuter = NULL;
  try {
    TRY {
      AfxThrowFileException(CFileException::diskFull, ERROR_DISK_FULL, "a.txt");
    }
    CATCH_ALL(e) {
      THROW_LAST();
    }
    END_CATCH_ALL
  } catch (CException* e) {
    pOuter = e; // still alive after the inner block
  }
  ASSERT_NE(nullptr, pOuter);
  EXPECT_EQ(CFileException::diskFull, static_cast<CFileException*>(pOuter)->m_cause);
  pOuter->Delete();

  // Thrown in the DLL, caught here.
  try {
    TestDllThrowFileException("C:\\fehlt.txt");
    ADD_FAILURE() << "nothing thrown";
  } catch (CException* e) {
    ASSERT_TRUE(e->IsKindOf(RUNTIME_CLASS(CFileException)));
    EXPECT_EQ(CFileException::fileNotFound, static_cast<CFileException*>(e)->m_cause);
    e->Delete();
  }
}

TEST(ExceptionMessages, GermanTextsTruncationAndOsErrorCauses) {
  CFileException e(CFileException::fileNotFound, ERROR_FILE_NOT_FOUND, "C:\\daten\\kunden.txt");
  EXPECT_EQ("Die Datei C:\\daten\\kunden.txt wurde nicht gefunden.", Message(e));
  EXPECT_EQ("Die Datei", Message(e, 10)); // 9 characters and the NUL
  EXPECT_EQ("<none:>", Message(CUserException(FALSE)));
  // OS errors map to causes.
  EXPECT_EQ(CFileException::badPath, CFileException::OsErrorToException(ERROR_INVALID_NAME));
  EXPECT_NO_THROW(CFileException::ThrowOsError(NO_ERROR, "x"));
  try {
    CFileException::ThrowOsError(ERROR_SHARING_VIOLATION, "offen.txt");
    ADD_FAILURE() << "nothing thrown";
  } catch (CFileException* e) {
    EXPECT_EQ(CFileException::sharingViolation, e->m_cause);
    EXPECT_TRUE(e->m_strFileName == "offen.txt");
    e->Delete();
  }
}

} // namespace
