#include <windows.h>

#include <gtest/gtest.h>

#include <cstdlib>
#include <string>

#include "platform/DiscoveryInterfaces.h"
#include "platform/FindClocksTimeout.h"
#include "platform/Mutex.h"
#include "platform/WinError.h"

using qv::dsc::osdep::FindClocksTimeout;
using qv::dsc::osdep::Mutex;
using qv::dsc::osdep::WinError;

namespace {

constexpr const char* kChildVariable = "QV_MUTEX_CHILD";
constexpr DWORD kPatience = 30000;  // a generous bound for a hung child, not a timing claim

// A value of the discovery key, writable for the test; it is removed afterwards.
class tTimeoutValue {
  public:
    explicit tTimeoutValue(const wchar_t* name = L"findClocksTimeout") : name_(name) {
        EXPECT_EQ(RegCreateKeyExW(HKEY_LOCAL_MACHINE, L"Software\\Quarvel\\Corbel\\qv-1588", 0,
                                  nullptr, 0, KEY_WRITE, nullptr, &key_, nullptr),
                  ERROR_SUCCESS);
    }
    ~tTimeoutValue() {
        RegDeleteValueW(key_, name_);
        RegCloseKey(key_);
    }
    void set(DWORD type, const void* data, DWORD size) {
        ASSERT_EQ(RegSetValueExW(key_, name_, 0, type, static_cast<const BYTE*>(data), size),
                  ERROR_SUCCESS);
    }

  private:
    const wchar_t* name_;
    HKEY key_ = nullptr;
};

std::string uniqueName(const char* stem) {
    return stem + std::to_string(GetCurrentProcessId());
}

HANDLE namedEvent(const std::string& name) {
    return CreateEventA(nullptr, TRUE, FALSE, ("Global\\" + name).c_str());
}

}  // namespace

TEST(FindClocksTimeoutWin32Test, ReadsTheLow16BitsOfANumberInTheRegistry) {
    tTimeoutValue value;
    EXPECT_EQ(FindClocksTimeout::read(), 1000);  // no value yet
    const DWORD large = 70000;
    value.set(REG_DWORD, &large, sizeof(large));
    EXPECT_EQ(FindClocksTimeout::read(), 4464);
    const wchar_t text[] = L"2000";
    value.set(REG_SZ, text, sizeof(text));
    EXPECT_EQ(FindClocksTimeout::read(), 1000);  // only a number counts
}

TEST(DiscoveryInterfacesWin32Test, ReadsTheTextValueBesideTheTimeout) {
    tTimeoutValue value(L"interfaces");
    EXPECT_EQ(qv::dsc::osdep::DiscoveryInterfaces::read(), "");
    const wchar_t text[] = L"Ethernet,12";
    value.set(REG_SZ, text, sizeof(text));
    EXPECT_EQ(qv::dsc::osdep::DiscoveryInterfaces::read(), "Ethernet,12");
}

TEST(MutexWin32Test, FindMutexLivesInTheNamespaceOfAllSessions) {
    const Mutex mutex("findClksMutex");
    EXPECT_EQ(mutex.path(), "Global\\findClksMutex");
    EXPECT_THROW(Mutex("a\\b"), WinError);
}

// The child half of the test below: holds the mutex, tells so, and ends without releasing
// it once the parent says so. Does nothing in a normal run.
TEST(MutexWin32Child, HoldsTheMutexAndEndsWithoutReleasing) {
    const char* name = std::getenv(kChildVariable);
    if (name == nullptr) {
        return;
    }
    Mutex mutex(name);
    mutex.acquire();
    SetEvent(namedEvent(std::string(name) + "-held"));
    WaitForSingleObject(namedEvent(std::string(name) + "-go"), kPatience);
    ExitProcess(0);
}

TEST(MutexWin32Test, AnotherProcessExcludesUntilItEndsAndTheAbandonedMutexIsAcquired) {
    const std::string name = uniqueName("qvTestMutex");
    Mutex mutex(name);
    const HANDLE held = namedEvent(name + "-held");
    const HANDLE go = namedEvent(name + "-go");
    ASSERT_TRUE(SetEnvironmentVariableA(kChildVariable, name.c_str()));
    char program[MAX_PATH] = {};
    GetModuleFileNameA(nullptr, program, MAX_PATH);
    std::string command =
        std::string("\"") + program + "\" --gtest_filter=MutexWin32Child.* --gtest_brief=1";
    STARTUPINFOA startup{};
    startup.cb = sizeof(startup);
    PROCESS_INFORMATION child{};
    ASSERT_TRUE(CreateProcessA(nullptr, command.data(), nullptr, nullptr, FALSE, 0, nullptr,
                               nullptr, &startup, &child));
    SetEnvironmentVariableA(kChildVariable, nullptr);
    ASSERT_EQ(WaitForSingleObject(held, kPatience), WAIT_OBJECT_0);

    // Held by the child: this process cannot take it.
    const HANDLE probe = OpenMutexA(SYNCHRONIZE, FALSE, mutex.path().c_str());
    ASSERT_NE(probe, nullptr);
    EXPECT_EQ(WaitForSingleObject(probe, 0), static_cast<DWORD>(WAIT_TIMEOUT));
    CloseHandle(probe);

    SetEvent(go);
    WaitForSingleObject(child.hProcess, kPatience);
    mutex.acquire();  // abandoned by the child: acquired, no exception
    mutex.release();
    CloseHandle(child.hThread);
    CloseHandle(child.hProcess);
    CloseHandle(held);
    CloseHandle(go);
}
