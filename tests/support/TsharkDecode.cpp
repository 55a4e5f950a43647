#include "tests/support/TsharkDecode.h"

#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <memory>
#include <stdexcept>

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

template <typename T>
void put(std::string& out, T value, bool bigEndian) {
    for (std::size_t i = 0; i < sizeof(T); ++i) {
        const std::size_t shift = 8 * (bigEndian ? sizeof(T) - 1 - i : i);
        out += static_cast<char>((value >> shift) & 0xFF);
    }
}

// A capture file of raw IPv4 packets (link type 101), host order little-endian.
std::string captureFile(const std::vector<std::vector<std::uint8_t>>& datagrams) {
    std::string file;
    for (std::uint32_t word : {0xA1B2C3D4U, 0x00040002U, 0U, 0U, 65535U, 101U}) {
        put(file, word, false);
    }
    for (const auto& datagram : datagrams) {
        const auto udpLength = static_cast<std::uint16_t>(8 + datagram.size());
        const std::uint16_t port = !datagram.empty() && (datagram[0] & 0x0F) < 8 ? 319 : 320;
        std::string packet;
        for (int half : {0x4500, udpLength + 20, 0, 0, 0x0111, 0, 0xA9FE, 0x0001, 0xE000, 0x0181,
                         int{port}, int{port}, int{udpLength}, 0}) {
            put(packet, static_cast<std::uint16_t>(half), true);
        }
        packet.append(datagram.begin(), datagram.end());
        for (std::uint32_t word : {0U, 0U, static_cast<std::uint32_t>(packet.size()),
                                   static_cast<std::uint32_t>(packet.size())}) {
            put(file, word, false);
        }
        file += packet;
    }
    return file;
}

}  // namespace

bool tsharkAvailable() {
    return std::system("command -v tshark >/dev/null 2>&1") == 0;
}

std::vector<TsharkFields> tsharkDecode(const std::vector<std::vector<std::uint8_t>>& datagrams) {
    char path[] = "/tmp/qv-tshark-XXXXXX";
    const int descriptor = mkstemp(path);
    if (descriptor < 0) {
        throw std::runtime_error("cannot create a capture file");
    }
    close(descriptor);
    std::ofstream(path, std::ios::binary) << captureFile(datagrams);
    const std::string command = std::string("tshark -r ") + path + " -T pdml 2>/dev/null";
    std::unique_ptr<FILE, int (*)(FILE*)> pipe(popen(command.c_str(), "r"), pclose);
    std::vector<TsharkFields> packets;
    std::vector<std::string> open;  // the fields that enclose the current line
    std::string line;
    for (int c = 0; pipe && (c = std::fgetc(pipe.get())) != EOF;) {
        if (c != '\n') {
            line += static_cast<char>(c);
            continue;
        }
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
        line.clear();
    }
    std::remove(path);
    return packets;
}

}  // namespace qvtest
