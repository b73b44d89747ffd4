/// @file
/// A management client that knows octets only.
#pragma once

#include <string>
#include <vector>

/// What a polling client sends, as hexadecimal text.
namespace requests {

/// The 48 octets before the TLV: GET to every port of every clock, from clock 0 port 1.
/// @param length the messageLength, four hexadecimal digits
std::string head(const std::string& length, const std::string& sequence = "0000",
                 const std::string& target = "ffffffffffffffffffff");

std::string timeStatus(const std::string& sequence = "0000");
std::string parentDataSet();
std::string defaultDataSet();
std::string portDataSet(const std::string& target = "ffffffffffffffffffff");
std::string portDataSetNp();

/// 68 octets, whose messageLength leaves out the padding octet.
std::string portProperties(const std::string& length = "0043");

} // namespace requests

/// Datagrams from and to a socket of its own.
class Client {
public:
    /// Binds `path` and talks to `daemon`.
    Client(const std::string& path, const std::string& daemon);
    ~Client();
    Client(const Client&) = delete;
    Client& operator=(const Client&) = delete;

    /// @param hex the datagram
    /// @return false when the daemon cannot be reached
    bool send(const std::string& hex) const;

    /// The next datagram as hexadecimal text; "none" when none comes within ten seconds.
    std::string receive() const;

    std::vector<std::string> receive(unsigned count) const;

    /// True when no datagram waits.
    bool isQuiet() const;

    std::string ask(const std::string& hex) const;

private:
    std::string path_;
    std::string daemon_;
    int descriptor_;
};
