#include "platform/Mutex.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <poll.h>
#include <signal.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <string>

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

    // Runs `body` in a child process that reports through a pipe; returns the child's id.
    template <typename Body>
    pid_t spawn(Body body) {
        int ends[2];
        EXPECT_EQ(pipe(ends), 0);
        const pid_t child = fork();
        if (child == 0) {
            close(ends[0]);
            body(ends[1]);
            _exit(0);
        }
        close(ends[1]);
        fromChild_ = ends[0];
        return child;
    }

    char readFromChild() {
        char c = 0;
        EXPECT_EQ(read(fromChild_, &c, 1), 1);
        return c;
    }

    bool childHasWritten() {
        pollfd waiting{fromChild_, POLLIN, 0};
        return poll(&waiting, 1, 0) == 1;
    }

    std::string folder_;
    int fromChild_ = -1;
};

void say(int fd, char c) {
    if (write(fd, &c, 1) != 1) {
        _exit(2);
    }
}

}  // namespace

TEST_F(MutexTest, TwoProcessesTakeTurns) {
    const pid_t child = spawn([](int toParent) {
        Mutex mutex("findClksMutex");
        mutex.acquire();
        say(toParent, 'A');
        usleep(300 * 1000);
        say(toParent, 'R');  // written before the release, so it precedes our acquire
        mutex.release();
    });
    ASSERT_EQ(readFromChild(), 'A');
    Mutex mutex("findClksMutex");
    EXPECT_FALSE(childHasWritten());
    mutex.acquire();
    EXPECT_TRUE(childHasWritten()) << "acquired while the other process held the lock";
    EXPECT_EQ(readFromChild(), 'R');
    mutex.release();
    int status = 0;
    waitpid(child, &status, 0);
    EXPECT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0);
}

TEST_F(MutexTest, HolderKilledWhileHoldingReleasesIt) {
    const pid_t child = spawn([](int toParent) {
        Mutex mutex("findClksMutex");
        mutex.acquire();
        say(toParent, 'A');
        pause();
    });
    ASSERT_EQ(readFromChild(), 'A');
    kill(child, SIGKILL);
    waitpid(child, nullptr, 0);
    Mutex mutex("findClksMutex");
    const Mutex::Holder holder(mutex);  // would wait for ever if the lock were kept
    SUCCEED();
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
