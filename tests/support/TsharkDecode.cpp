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
    const std::pair<const char*, const char*> entities[] = {
        {"&quot;", "\""}, {"&lt;", "<"}, {"&gt;", ">"}, {"&apos;", "'"}, {"&amp;", "&"}};
    for (const auto& [entity, plain] : entities) {
        for (auto at = text.find(entity); at != std::string::npos; at = text.find(entity, at)) {
            text.replace(at, std::char_traits<char>::length(entity), plain);
            ++at;
        }
    }
    return text;
}

// A temporary folder removed with everything in it.
class TemporaryFolder {
  public:
    TemporaryFolder() {
        char pattern[] = "/tmp/qv-tshark-XXXXXX";
        if (mkdtemp(pattern) == nullptr) {
            throw std::runtime_error("cannot create a temporary folder");
        }
        path_ = pattern;
    }
    ~TemporaryFolder() { std::system(("rm -rf '" + path_ + "'").c_str()); }
    TemporaryFolder(const TemporaryFolder&) = delete;
    TemporaryFolder& operator=(const TemporaryFolder&) = delete;
    const std::string& path() const { return path_; }

  private:
    std::string path_;
};

}  // namespace

bool TsharkDecode::available() {
    return std::system(
               "command -v tshark >/dev/null 2>&1 && "
               "command -v text2pcap >/dev/null 2>&1") == 0;
}

TsharkDecode::TsharkDecode(const std::vector<std::uint8_t>& datagram, std::uint16_t port) {
    TemporaryFolder folder;
    const std::string text = folder.path() + "/datagram.txt";
    const std::string pcap = folder.path() + "/datagram.pcap";
    {
        std::ofstream out(text);
        char octet[32];
        for (std::size_t i = 0; i < datagram.size(); ++i) {
            if (i % 16 == 0) {
                std::snprintf(octet, sizeof(octet), "%s%04zx", i == 0 ? "" : "\n", i);
                out << octet;
            }
            std::snprintf(octet, sizeof(octet), " %02x", datagram[i]);
            out << octet;
        }
        out << "\n";
    }
    const std::string ports = std::to_string(port) + "," + std::to_string(port);
    const std::string command = "text2pcap -q -4 169.254.0.1,224.0.1.129 -u " + ports + " '" +
                                text + "' '" + pcap + "' 2>/dev/null && tshark -r '" + pcap +
                                "' -T pdml 2>/dev/null";
    std::unique_ptr<FILE, int (*)(FILE*)> pipe(popen(command.c_str(), "r"), pclose);
    if (!pipe) {
        throw std::runtime_error("cannot run tshark");
    }
    std::string line;
    char buffer[4096];
    while (std::fgets(buffer, sizeof(buffer), pipe.get()) != nullptr) {
        line += buffer;
        if (line.back() != '\n') {
            continue;  // a line longer than the buffer: keep reading it
        }
        if (line.find("<field name=\"ptp.") != std::string::npos) {
            fields_.push_back(
                {attribute(line, "name"), attribute(line, "show"), attribute(line, "value")});
        }
        line.clear();
    }
}

std::vector<std::string> TsharkDecode::shows(const std::string& name) const {
    std::vector<std::string> found;
    for (const Field& field : fields_) {
        if (field.name == name) {
            found.push_back(field.show);
        }
    }
    return found;
}

std::string TsharkDecode::show(const std::string& name) const {
    for (const Field& field : fields_) {
        if (field.name == name) {
            return field.show;
        }
    }
    return "<absent>";
}

std::string TsharkDecode::value(const std::string& name) const {
    for (const Field& field : fields_) {
        if (field.name == name) {
            return field.value;
        }
    }
    return "<absent>";
}

}  // namespace qvtest
