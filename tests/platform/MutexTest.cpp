#include "platform/Mutex.h"

#include <gtest/gtest.h>
#include <poll.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <atomic>
#include <cstdlib>
#include <filesystem>
#include <string>
#include <thread>

#include "platform/WinError.h"

using qv::dsc::osdep::Mutex;
using qv::dsc::osdep::WinError;

namespace {

// Points the lock folder at a fresh folder of the test's own.
class MutexTest : public ::testing::Test {
  protected:
    void SetUp() override {
        char pattern[] = "/tmp/qv-mutex-XXXXXX";
        ASSERT_NE(mkdtemp(pattern), nullptr);
        folder_ = pattern;
        setenv(Mutex::kFolderVariable, folder_.c_str(), 1);
    }
    void TearDown() override {
        unsetenv(Mutex::kFolderVariable);
        std::filesystem::remove_all(folder_);
    }

    std::string folder_;
};

}  // namespace

// A child process holds the lock, then says 'R' just before it releases it: whoever
// acquires after it must find the 'R' already written.
TEST_F(MutexTest, TwoProcessesTakeTurns) {
    int ends[2];
    ASSERT_EQ(pipe(ends), 0);
    const pid_t child = fork();
    if (child == 0) {
        Mutex mutex("findClksMutex");
        mutex.acquire();
        const bool said =
            write(ends[1], "A", 1) == 1 && usleep(300 * 1000) == 0 && write(ends[1], "R", 1) == 1;
        mutex.release();
        _exit(said ? 0 : 1);
    }
    char said = 0;
    ASSERT_EQ(read(ends[0], &said, 1), 1);
    Mutex mutex("findClksMutex");
    const Mutex::Holder holder(mutex);
    pollfd released{ends[0], POLLIN, 0};
    EXPECT_EQ(poll(&released, 1, 0), 1) << "acquired while the other process held the lock";
    int status = 0;
    waitpid(child, &status, 0);
    EXPECT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0);
    close(ends[0]);
    close(ends[1]);
}

TEST_F(MutexTest, ThreadsSharingOneMutexAreNeverInsideTogether) {
    Mutex mutex("threads");
    std::atomic<int> inside{0};
    std::atomic<int> overlaps{0};
    const auto work = [&] {
        for (int i = 0; i < 1000; ++i) {
            const Mutex::Holder holder(mutex);
            overlaps += inside++ != 0 ? 1 : 0;
            std::this_thread::yield();
            --inside;
        }
    };
    { std::jthread first(work), second(work), third(work); }
    EXPECT_EQ(overlaps.load(), 0);
}

TEST_F(MutexTest, LockFileIsSharedWithEveryUserWhateverTheUmask) {
    const mode_t old = umask(077);
    const Mutex mutex("findClksMutex");
    umask(old);
    struct stat info {};
    ASSERT_EQ(stat(mutex.path().c_str(), &info), 0);
    EXPECT_EQ(info.st_mode & 0777, 0666U);
    EXPECT_EQ(mutex.path(), folder_ + "/qv-1588-findClksMutex.lock");
}

// A link at the lock path is not followed (nothing appears at its target), a name that
// would leave the folder is refused, and so is something other than a file (without
// hanging on a pipe).
TEST_F(MutexTest, LinksOtherFoldersAndNonFilesAreRefused) {
    const std::string target = folder_ + "/elsewhere";
    ASSERT_EQ(symlink(target.c_str(), Mutex::pathOf("linked").c_str()), 0);
    ASSERT_EQ(mkfifo(Mutex::pathOf("piped").c_str(), 0666), 0);
    for (const char* name : {"linked", "piped", "../findClksMutex", ""}) {
        try {
            Mutex mutex(name);
            ADD_FAILURE() << "opened " << name;
        } catch (const WinError& e) {
            EXPECT_STREQ(e.file(), "Mutex");
        }
    }
    EXPECT_FALSE(std::filesystem::exists(target));
}
