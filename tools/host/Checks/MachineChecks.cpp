#include "Checks/MachineChecks.h"

#include <array>
#include <cstdlib>
#include <fstream>
#include <map>

#include <fmt/format.h>
#include <linux/capability.h>
#include <sys/xattr.h>

#include "Numbers.h"

namespace vantelhost {

namespace {

constexpr std::uint64_t capability(unsigned number) {
    return std::uint64_t{1} << number;
}

/// The fields of a status file of the kernel, by name.
std::map<std::string, std::string> fieldsOf(const std::string& path) {
    std::map<std::string, std::string> fields;
    std::ifstream file(path);
    for (std::string line; std::getline(file, line);) {
        const auto colon = line.find(":\t");
        if (colon != std::string::npos) {
            fields[line.substr(0, colon)] = line.substr(colon + 2);
        }
    }
    return fields;
}

std::string attributeOf(const std::string& file) {
    std::array<char, 64> octets{};
    const ssize_t size =
        ::getxattr(file.c_str(), "security.capability", octets.data(), octets.size());
    return size < 0 ? "" : std::string(octets.data(), static_cast<std::size_t>(size));
}

/// The second number of "Uid": real, effective, saved, of the file system.
bool isRoot(const std::string& uids) {
    const auto tab = uids.find('\t');
    return tab != std::string::npos && uids.compare(tab + 1, 2, "0\t") == 0;
}

std::uint64_t hexadecimal(const std::string& text) {
    return std::strtoull(text.c_str(), nullptr, 16);
}

/// What a program has that this process executes: capabilities(7).
std::uint64_t inherited(std::map<std::string, std::string>& fields, const std::string& program) {
    if (isRoot(fields["Uid"])) {
        return hexadecimal(fields["CapEff"]);
    }
    const auto allowed = hexadecimal(fields["CapBnd"]);
    return hexadecimal(fields["CapAmb"]) | (capabilitiesOf(attributeOf(program)) & allowed);
}

// Not CAP_SYS_TIME: the plug-in's file says free_running, ptp4l sets no clock.
std::string missingFrom(std::uint64_t capabilities, const Subject& subject) {
    const auto transport = setting(subject, "networkTransport").value_or("UDPv4RAW");
    const bool isUdp = transport.compare(0, 3, "UDP") == 0;
    const bool isRaw = transport != "UDPv4" && transport != "UDPv6";
    const struct {
        bool isNeeded;
        unsigned number;
        const char* name;
    } rows[] = {
        {!subject.software, CAP_NET_ADMIN, "CAP_NET_ADMIN (time stamps in hardware)"},
        {isUdp, CAP_NET_BIND_SERVICE, "CAP_NET_BIND_SERVICE (ports 319 and 320)"},
        {isRaw, CAP_NET_RAW, "CAP_NET_RAW (raw sockets)"},
    };
    std::string missing;
    for (const auto& row : rows) {
        if (row.isNeeded && (capabilities & capability(row.number)) == 0) {
            missing += (missing.empty() ? "" : ", ") + std::string(row.name);
        }
    }
    return missing;
}

} // namespace

std::uint64_t capabilitiesOf(const std::string& attribute) {
    // Little-endian words of 32 bits: version and flags, then permitted and inheritable, the lower
    // halves first.
    const auto word = [&](std::size_t index) {
        std::uint64_t value = 0;
        for (std::size_t i = 0; i < 4; ++i) {
            const auto octet = static_cast<unsigned char>(attribute[4 * index + i]);
            value |= std::uint64_t{octet} << (8 * i);
        }
        return value;
    };
    if (attribute.size() < 20 || (word(0) & VFS_CAP_FLAGS_EFFECTIVE) == 0) {
        return 0;
    }
    return word(1) | word(3) << 32;
}

Finding checkCapabilities(const Subject& subject) {
    auto fields = fieldsOf(subject.proc + "/self/status");
    if (fields.count("CapEff") == 0) {
        return skipped(subject.proc + "/self/status does not tell");
    }
    const std::string missing = missingFrom(inherited(fields, subject.daemon), subject);
    if (missing.empty()) {
        return good("ptp4l has those that it needs");
    }
    return bad("ptp4l would lack " + missing,
               fmt::format("start the host as root with these, or with them as ambient ones "
                           "(systemd: AmbientCapabilities=); or setcap "
                           "cap_net_admin,cap_net_bind_service,cap_net_raw+ep on {} (the file, "
                           "not a link)",
                           subject.daemon));
}

Finding checkDatagramQueue(const Subject& subject) {
    const std::string path = subject.proc + "/sys/net/unix/max_dgram_qlen";
    std::string text;
    std::getline(std::ifstream(path) >> std::ws, text);
    const auto length = parseInteger(text);
    if (!length) {
        return skipped(path + " does not tell");
    }
    const auto ports = static_cast<std::int64_t>(subject.interfaces.size());
    if (*length < ports - 1) {
        return doubtful(
            fmt::format("net.unix.max_dgram_qlen is {}, less than {} ports need: a host "
                        "that is stopped can hold ptp4l up",
                        *length, ports),
            fmt::format("sysctl -w net.unix.max_dgram_qlen={}, before the host starts", ports - 1));
    }
    return good(fmt::format("net.unix.max_dgram_qlen is {}", *length));
}

} // namespace vantelhost
