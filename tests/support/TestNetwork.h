#ifndef QV_TESTS_SUPPORT_TESTNETWORK_H
#define QV_TESTS_SUPPORT_TESTNETWORK_H

#include <array>
#include <cstdint>
#include <string>
#include <vector>

namespace qvtest {

// One namespace of the network that tools/testnet built: a PTP clock (ptp4l or ptpd) or a
// bare endpoint (impl "none").
struct TestClock {
    // The implementation ("ptp4l", "ptpd" or "none"), the namespace ("q1a2b01-k1"), the MAC
    // ("02:00:00:00:00:01").
    std::string impl, nameSpace, mac;
    std::array<std::uint8_t, 8> identity = {};  // EUI-64 of the MAC (FF FE inserted)
    std::uint16_t portNumber = 1;
    std::uint8_t domain = 0, priority1 = 128, priority2 = 128;
    std::string description;  // the user description that the clock reports
    std::string bridge;       // the client's bridge it is on: "br0", or "br1" (net=1)
};

// What a command printed (stdout and stderr together) and how it ended.
struct CommandResult {
    int exitStatus = -1;  // the command's exit code, -1 when it did not end normally
    std::string output;
};

// Runs a command line through /bin/sh, collecting its output.
CommandResult runCommand(const std::string& commandLine);

// A private network of real PTP clocks in network namespaces, made by tools/testnet for
// the lifetime of this object: the constructor brings it up (clock specs as the tool takes
// them, e.g. "ptp4l:domain=0:prio1=128:desc=alpha" or "ptpd:domain=2") and waits until
// every clock answers; the destructor stops every process of the run and deletes its
// namespaces, whatever happened in between. Each object has its own name prefix, so
// networks of several test programs do not collide.
class TestNetwork {
  public:
    explicit TestNetwork(const std::vector<std::string>& clockSpecs);
    ~TestNetwork() { down(); }
    TestNetwork(const TestNetwork&) = delete;
    TestNetwork& operator=(const TestNetwork&) = delete;

    // Whether the network came up; otherwise failure() says why (the tool's output).
    bool isUp() const { return up_; }
    const std::string& failure() const { return failure_; }

    const std::string& prefix() const { return prefix_; }
    // The namespace in which the process under test belongs (see NetworkNamespaceEntry).
    const std::string& clientNamespace() const { return clientNamespace_; }
    const std::string& clientAddress() const { return clientAddress_; }
    const std::vector<TestClock>& clocks() const { return clocks_; }
    // Process ids of the clocks, as started by the tool.
    const std::vector<int>& processIds() const { return processIds_; }

    // Runs a shell command line in the client namespace.
    CommandResult runInClient(const std::string& commandLine) const;
    // Stops the network now (the destructor then does nothing).
    void down();

    // Path of tools/testnet in the source tree.
    static std::string toolPath() { return std::string(QV_SOURCE_DIR) + "/tools/testnet"; }

  private:
    bool parseLayout(const std::string& layout);

    std::string prefix_, clientNamespace_, clientAddress_, failure_;
    std::vector<TestClock> clocks_;
    std::vector<int> processIds_;
    bool up_ = false, started_ = false;
};

}  // namespace qvtest

#endif
