#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <atomic>
#include <cstdlib>
#include <filesystem>
#include <thread>
#include <vector>

#include "platform/Mutex.h"

using qv::dsc::osdep::Mutex;

namespace {

class MutexThreads : public ::testing::Test {
  protected:
    void SetUp() override {
        char pattern[] = "/tmp/qv-mutex-XXXXXX";
        ASSERT_NE(mkdtemp(pattern), nullptr);
        folder_ = pattern;
        chmod(folder_.c_str(), 0755);
        setenv(Mutex::kFolderVariable, folder_.c_str(), 1);
    }
    void TearDown() override {
        unsetenv(Mutex::kFolderVariable);
        std::filesystem::remove_all(folder_);
    }
    std::string folder_;
};

TEST_F(MutexThreads, ThreadsSharingOneMutexAreNeverInsideTogether) {
    Mutex mutex("findClksMutex");
    std::atomic<int> inside{0};
    std::atomic<int> overlaps{0};
    std::vector<std::thread> threads;
    for (int t = 0; t < 4; ++t) {
        threads.emplace_back([&] {
            for (int i = 0; i < 500; ++i) {
                const Mutex::Holder holder(mutex);
                overlaps += inside.fetch_add(1) != 0 ? 1 : 0;
                std::this_thread::yield();
                inside.fetch_sub(1);
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    EXPECT_EQ(overlaps.load(), 0);
}

// Another user's lock file: readable is enough to lock; unreadable is an error.
TEST_F(MutexThreads, AnotherUsersLockFileLocksWhenReadable) {
    const struct {
        mode_t mode;
        int exitCode;
    } cases[] = {{0644, 0}, {0600, 1}};
    for (const auto& c : cases) {
        const std::string path = Mutex::pathOf("findClksMutex");
        std::filesystem::remove(path);
        const int fd = open(path.c_str(), O_CREAT | O_WRONLY, c.mode);
        ASSERT_GE(fd, 0);
        fchmod(fd, c.mode);
        close(fd);
        const pid_t child = fork();
        if (child == 0) {
            if (setuid(65534) != 0) {  // nobody
                _exit(2);
            }
            try {
                Mutex mutex("findClksMutex");
                const Mutex::Holder holder(mutex);
            } catch (...) {
                _exit(1);
            }
            _exit(0);
        }
        int status = 0;
        waitpid(child, &status, 0);
        EXPECT_TRUE(WIFEXITED(status));
        EXPECT_EQ(WEXITSTATUS(status), c.exitCode) << "mode " << std::oct << c.mode;
    }
}

}  // namespace
