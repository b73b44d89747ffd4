// Keeps docs/wire-format.md in step with what the library sends and reads.

#include <algorithm>
#include <atomic>
#include <cctype>
#include <sstream>
#include <thread>

#include <gmock/gmock.h>

#include "SessionFixture.h"
#include "support/Markdown.h"

namespace {

using testing::ElementsAre;

std::string document() {
    return readFile(VANTEL_PROJECT_FOLDER "/docs/wire-format.md");
}

std::string withoutBlanks(std::string text) {
    const auto isBlank = [](unsigned char character) { return std::isspace(character) != 0; };
    text.erase(std::remove_if(text.begin(), text.end(), isBlank), text.end());
    return text;
}

Octets octetsIn(const std::string& line) {
    Octets octets;
    std::istringstream words(line);
    for (unsigned octet = 0; words >> std::hex >> octet;) {
        octets.push_back(static_cast<std::uint8_t>(octet));
    }
    return octets;
}

/// A datagram as it is shown: a line "> NAME, N octets", or "< ...", then its octets.
struct Datagram {
    std::string title;
    Octets octets;
};

std::vector<Datagram> shown(char direction) {
    std::vector<Datagram> datagrams;
    for (const auto& block : markdown::blocks(document())) {
        bool chosen = false;
        std::istringstream lines(block.language == "hex" ? block.text : "");
        for (std::string line; std::getline(lines, line);) {
            if (line[0] == '>' || line[0] == '<') {
                chosen = line[0] == direction;
                if (chosen) {
                    datagrams.push_back({line.substr(2), {}});
                }
            } else if (chosen) {
                const Octets octets = octetsIn(line);
                datagrams.back().octets.insert(datagrams.back().octets.end(), octets.begin(),
                                               octets.end());
            }
        }
    }
    return datagrams;
}

std::string shownBlock(const std::string& beginning) {
    for (const auto& block : markdown::blocks(document())) {
        if (block.text.compare(0, beginning.size(), beginning) == 0) {
            return block.text;
        }
    }
    ADD_FAILURE() << "no block begins with " << beginning;
    return {};
}

/// Gives the answers that are shown, one for each request.
class ShownDaemon {
public:
    explicit ShownDaemon(const std::string& path) : socket_(path), thread_([this] { run(); }) {}
    ~ShownDaemon() { stop(); }
    ShownDaemon(const ShownDaemon&) = delete;
    ShownDaemon& operator=(const ShownDaemon&) = delete;

    /// @return the requests.
    std::vector<Octets> stop() {
        stopRequested_ = true;
        if (thread_.joinable()) {
            thread_.join();
        }
        return requests_;
    }

private:
    void run() {
        const auto answers = shown('<');
        while (!stopRequested_) {
            if (const auto request = socket_.receive(std::chrono::milliseconds(50))) {
                requests_.push_back(request->octets);
                const std::size_t next = (requests_.size() - 1) % answers.size();
                socket_.sendTo(request->source, answers.at(next).octets);
            }
        }
    }

    DatagramSocket socket_;
    std::vector<Octets> requests_;
    std::atomic<bool> stopRequested_{false};
    std::thread thread_;
};

class WireFormatTest : public SessionTest {
protected:
    /// The pair that the host heard first, as it is shown.
    std::string firstPair() const {
        const auto pair = host.calls(Function::adjustTime).at(0);
        return "reference " + std::to_string(pair.referenceTime) + " local " +
               std::to_string(pair.localTime) + "\n";
    }
};

void expectEqual(const std::vector<Octets>& requests, const std::vector<Datagram>& expected) {
    ASSERT_EQ(expected.size(), 6U);
    ASSERT_GE(requests.size(), 6U);
    for (std::size_t index = 0; index < 6; ++index) {
        EXPECT_EQ(requests[index], expected[index].octets) << expected[index].title;
    }
}

TEST_F(WireFormatTest, ExampleIsWhatIsSentAndUnderstood) {
    ShownDaemon shownDaemon("ptp4l.sock");
    begin("start-delay 1000000\n", R"(["bc0"])");
    ASSERT_TRUE(waitForCalls(Function::updateMetaData, 2));
    expectEqual(shownDaemon.stop(), shown('>'));
    EXPECT_EQ(metaData().at(1), withoutBlanks(shownBlock("{")));
    EXPECT_EQ(firstPair(), shownBlock("reference "));
    EXPECT_EQ(qualities().at(1), (QualityReport{"PTP role has changed.", true}));
}

TEST_F(WireFormatTest, TitlesTellTheLengths) {
    for (const char direction : {'>', '<'}) {
        for (const auto& datagram : shown(direction)) {
            EXPECT_EQ(datagram.title.substr(datagram.title.find(", ")),
                      ", " + std::to_string(datagram.octets.size()) + " octets");
        }
    }
}

int fieldOf(const Octets& octets, std::size_t at) {
    return octets.at(at) * 256 + octets.at(at + 1);
}

TEST_F(WireFormatTest, TableOfDataSetsIsThatOfTheRequests) {
    const auto rows = markdown::tables(document(), {"data set", "managementId",
                                                    "request: octets, messageLength, lengthField",
                                                    "answers", "an answer has"});
    const auto requests = shown('>');
    ASSERT_EQ(rows.size(), requests.size());
    for (std::size_t index = 0; index < rows.size(); ++index) {
        const auto& row = rows[index];
        const Octets& octets = requests[index].octets;
        const std::string size = std::to_string(octets.size());
        const std::string length = std::to_string(fieldOf(octets, 2));
        EXPECT_EQ(requests[index].title, row[0] + ", " + size + " octets");
        EXPECT_EQ(std::stoi(row[1], nullptr, 16), fieldOf(octets, 52));
        EXPECT_EQ(row[2], size + ", " + (length == size ? "" : length + " or ") + size + ", " +
                              std::to_string(fieldOf(octets, 50)));
        EXPECT_EQ(row[4], (row[3] == "1" ? "" : "at least ") + length + " octets");
    }
}

/// Where each table of fields ends that has no gap. A field of n octets ends its table.
std::vector<int> endsOf(const std::vector<markdown::Row>& rows, int begin) {
    std::vector<int> ends;
    for (const auto& row : rows) {
        const int at = std::stoi(row.at(0));
        if (at == begin) {
            ends.push_back(begin);
        }
        if (std::isdigit(static_cast<unsigned char>(row.at(1)[0])) == 0 || row[0].size() > 2) {
            continue;
        }
        EXPECT_EQ(at, ends.back()) << row.at(2);
        ends.back() = at + std::stoi(row.at(1));
    }
    return ends;
}

TEST_F(WireFormatTest, FieldsFollowEachOtherToTheEndOfTheMessage) {
    EXPECT_THAT(endsOf(markdown::tables(document(), {"at", "octets", "field", "request"}), 0),
                ElementsAre(54));
    EXPECT_THAT(endsOf(markdown::tables(document(), {"at", "octets", "field", "meaning"}), 54),
                ElementsAre(104, 86, 74, 80, 62, 67));
}

} // namespace
