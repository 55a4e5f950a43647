#include "tests/support/TsharkDecode.h"

#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <sstream>
#include <stdexcept>

#include "tests/support/Hex.h"
#include "tests/support/TestNetwork.h"

namespace qvtest {

namespace {

std::string attribute(const std::string& line, const std::string& name) {
    const std::string key = " " + name + "=\"";
    const auto start = line.find(key);
    if (start == std::string::npos) {
        return "";
    }
    const auto from = start + key.size();
    std::string text = line.substr(from, line.find('"', from) - from);
    const std::pair<std::string, std::string> entities[] = {
        {"&quot;", "\""}, {"&lt;", "<"}, {"&gt;", ">"}, {"&apos;", "'"}, {"&amp;", "&"}};
    for (const auto& [entity, plain] : entities) {
        for (auto at = text.find(entity); at != std::string::npos; at = text.find(entity, at + 1)) {
            text.replace(at, entity.size(), plain);
        }
    }
    return text;
}

}  // namespace

bool tsharkAvailable() {
    return std::system("(command -v tshark && command -v text2pcap) >/dev/null 2>&1") == 0;
}

std::vector<TsharkFields> tsharkDecode(const std::vector<std::vector<std::uint8_t>>& datagrams) {
    char path[] = "/tmp/qv-tshark-XXXXXX";
    const int descriptor = mkstemp(path);
    if (descriptor < 0) {
        throw std::runtime_error("cannot create a capture file");
    }
    close(descriptor);
    const std::string capture = std::string(path) + ".pcap";
    {
        std::ofstream dump(path);  // a hex dump for text2pcap: one datagram per line
        for (const auto& datagram : datagrams) {
            dump << "000000 " << hexText(datagram) << "\n";
        }
    }
    std::istringstream pdml(
        runCommand(std::string("text2pcap -q -4 169.254.0.1,224.0.1.129 -u 320,320 ") + path + " " +
                   capture + " && tshark -r " + capture + " -T pdml")
            .output);
    std::remove(path);
    std::remove(capture.c_str());
    std::vector<TsharkFields> packets;
    std::vector<std::string> open;  // the fields that enclose the current line
    for (std::string line; std::getline(pdml, line);) {
        const std::string name = attribute(line, "name");
        if (line.find("<packet>") != std::string::npos) {
            packets.emplace_back();
        } else if (line.find("</field>") != std::string::npos && !open.empty()) {
            open.pop_back();
        } else if (line.find("<field ") != std::string::npos) {
            // A text shows again inside itself, under its length: keep it once.
            const bool repeated = !open.empty() && open.back() == name;
            const bool wanted = name.starts_with("ptp.") || name == "_ws.malformed";
            if (wanted && !repeated && !packets.empty()) {
                packets.back().emplace_back(name, attribute(line, "show"));
            }
            if (!line.ends_with("/>")) {
                open.push_back(name);
            }
        }
    }
    return packets;
}

}  // namespace qvtest
