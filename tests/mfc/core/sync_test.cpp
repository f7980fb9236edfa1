// Events and the lock helpers over real kernel objects and threads.
#include "afxmt.h"

#include <gtest/gtest.h>

#include <thread>

namespace {

TEST(SyncTest, NamedEventIsSharedAndReleasesOneWait)
{
    CEvent first(FALSE, FALSE, "QoSyncTest.Event");
    CEvent second(FALSE, FALSE, "QoSyncTest.Event");
    ASSERT_TRUE(second.SetEvent());
    CSingleLock single(&first);
    EXPECT_TRUE(single.Lock(0));
    EXPECT_FALSE(first.Lock(0));
}

TEST(SyncTest, MultiLockWaitsForAnyOneForAllOrForQueueInput)
{
    CEvent a, b;
    CSyncObject* objects[2] = {&a, &b};
    CMultiLock lock(objects, 2);

    EXPECT_EQ((DWORD)WAIT_TIMEOUT, lock.Lock(10, FALSE));

    // Signalled by another thread while we wait.
    std::thread signaller([&] {
        ::Sleep(50);
        b.SetEvent();
    });
    EXPECT_EQ(WAIT_OBJECT_0 + 1, lock.Lock(INFINITE, FALSE, 0));
    signaller.join();
    EXPECT_FALSE(lock.IsLocked(0));
    EXPECT_TRUE(lock.IsLocked(1));
    EXPECT_TRUE(lock.Unlock());

    // Waiting for all: one signalled event is not enough, and the wait takes
    // none of them.
    a.SetEvent();
    EXPECT_EQ((DWORD)WAIT_TIMEOUT, lock.Lock(20, TRUE));
    b.SetEvent();
    EXPECT_EQ(WAIT_OBJECT_0, lock.Lock(1000, TRUE));
    EXPECT_FALSE(a.Lock(0)); // both were taken
    EXPECT_FALSE(b.Lock(0));

    // Queue input ends a wait with the wake mask, and only with it.
    CMultiLock single(objects, 1);
    MSG msg;
    ::PeekMessageA(&msg, NULL, 0, 0, PM_NOREMOVE); // this thread's queue
    ASSERT_TRUE(::PostThreadMessageA(::GetCurrentThreadId(), WM_APP, 0, 0));
    EXPECT_EQ(WAIT_OBJECT_0 + 1, single.Lock(1000, FALSE, QS_POSTMESSAGE));
    EXPECT_FALSE(single.IsLocked(0));
    EXPECT_EQ((DWORD)WAIT_TIMEOUT, single.Lock(20, FALSE, 0));
    ::PeekMessageA(&msg, NULL, WM_APP, WM_APP, PM_REMOVE);
}

} // namespace
