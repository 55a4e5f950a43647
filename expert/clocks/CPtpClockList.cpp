#include "expert/clocks/CPtpClockList.h"

#include "expert/clocks/CPtpValueFormat.h"
#include "platform/Exception.h"

using nQVPTPMGMT000::iPTPClockProxy;

CPtpClockList::CPtpClockList() : findMutex_(kMutexName) {}

bool CPtpClockList::refresh(nQVPTPMGMT000::tPTPMgmtNode& node, std::uint16_t timeoutMs,
                            tStatus& status) {
    try {
        qv::dsc::osdep::Mutex::Holder holder(findMutex_);
        node.findClocks(timeoutMs, status);
        return status.succeeded() && copyFrom(node, status);
    } catch (const qv::dsc::exception::Exception&) {
        return false;
    }
}

bool CPtpClockList::ask(nQVPTPMGMT000::tPTPMgmtNode& node, std::u16string_view name,
                        std::uint16_t timeoutMs, iPTPClockProxy*& found, tStatus& status) {
    found = nullptr;
    const auto key = CPtpValueFormat::clockKeyOf(name);
    if (!key) {
        return true;  // no port can answer to it
    }
    try {
        qv::dsc::osdep::Mutex::Holder holder(findMutex_);
        found = node.askClock(*key, timeoutMs, status);
        return status.succeeded() && (found == nullptr || copyFrom(node, status));
    } catch (const qv::dsc::exception::Exception&) {
        return false;
    }
}

bool CPtpClockList::copyFrom(nQVPTPMGMT000::tPTPMgmtNode& node, tStatus& status) {
    std::vector<iPTPClockProxy*> found(node.clockCount());
    node.copyClockProxies(found.data(), static_cast<std::uint16_t>(found.size()), status);
    if (status.failed()) {
        return false;
    }
    std::lock_guard<std::mutex> guard(lock_);
    proxies_.swap(found);
    return true;
}

std::list<std::u16string> CPtpClockList::names() const {
    std::list<std::u16string> names;
    std::lock_guard<std::mutex> guard(lock_);
    for (const iPTPClockProxy* proxy : proxies_) {
        names.push_back(CPtpValueFormat::portIdentity(proxy->getPortIdentity()));
    }
    return names;
}

iPTPClockProxy* CPtpClockList::lookup(nQVPTPMGMT000::iPTPMgmtNode& node, std::u16string_view name) {
    const auto key = CPtpValueFormat::clockKeyOf(name);
    if (!key) {
        return nullptr;
    }
    tStatus status;
    iPTPClockProxy* proxy = node.findClock(*key, status);
    return status.succeeded() ? proxy : nullptr;
}
