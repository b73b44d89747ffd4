#include "Record.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <exception>
#include <fstream>
#include <string_view>

#include <unistd.h>

#include "EventPrinter.h"
#include "Text.h"
#include "WriteAll.h"

namespace vantelhost {

namespace {

/// Seconds without a try after one that failed: a disk that is nearly full has room for short lines
/// again and again.
constexpr double pause = 1;

/// Each is valid until the next one, or until the session ends, but for those that survive it.
constexpr std::array<std::string_view, 7> lasting{
    "loaded", "clock", "initialised", "epoch-offset", "quality", "metadata", "health"};

bool isLasting(const Event& event) {
    const bool isInvalid = event.name == "metadata" && !event.members.value("valid", false);
    return !isInvalid && std::find(lasting.begin(), lasting.end(), event.name) != lasting.end();
}

bool survives(const std::string& name) {
    return name == "loaded" || name == "clock" || name == "health";
}

bool endsWithALine(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    file.seekg(-1, std::ios::end);
    return !file || file.get() == '\n';
}

} // namespace

Record::Record(std::string path, const RecordRules& rules)
    : path_(std::move(path)),
      rules_(rules),
      file_(path_),
      rotation_(path_, rules.keep),
      rotateAt_(rules.size) {}

void Record::begin() {
    if (!rules_.append) {
        file_.begin();
    }
    size_ = file_.size();
    isCut_ = size_ > 0 && !endsWithALine(path_);
}

std::optional<Event> Record::take(const Event& event, const Moment& moment) {
    if (!std::exchange(hasBegun_, true)) {
        begin_ = beginOf(moment);
    }
    const auto line = jsonLine(event, moment) + "\n";
    std::optional<Event> news;
    if (lost_ > 0 && moment.seconds < retryAt_) {
        ++lost_;
    } else {
        news = rotateIfFull(line.size());
        if (!write((needsHead_ ? head(moment) : "") + line)) {
            news = lose(errorText(errno), moment.seconds);
        } else if (lost_ > 0) {
            news = recovered(moment.seconds);
        }
    }
    remember(event);
    return news;
}

/// A file has at least one line of this run, besides its head.
std::optional<Event> Record::rotateIfFull(std::size_t size) {
    const bool isFull = rules_.size > 0 && size_ > 0 && size_ + size > rotateAt_;
    if (!isFull || needsHead_ || !file_.isRegular()) {
        return std::nullopt;
    }
    try {
        file_ = rotation_.rotate(file_);
    } catch (const std::exception& error) {
        rotateAt_ = size_ + rules_.size;
        return std::exchange(cannotRotate_, true)
                   ? std::nullopt
                   : std::optional(failureEvent(
                         name(),
                         std::string("it grows on, as no new file can be begun: ") + error.what()));
    }
    size_ = 0;
    rotateAt_ = rules_.size;
    isCut_ = false;
    cannotRotate_ = false;
    if (!isFresh_) {
        needsHead_ = true;
        ++part_;
    }
    return std::nullopt;
}

/// Whole, or not at all.
bool Record::write(const std::string& text) {
    const std::string whole = (isCut_ ? "\n" : "") + text;
    if (!writeAll(file_.descriptor(), whole)) {
        const int reason = errno;
        isCut_ = isCut_ || (file_.isRegular() && file_.size() != size_ &&
                            ::ftruncate(file_.descriptor(), static_cast<off_t>(size_)) != 0);
        errno = reason;
        return false;
    }
    size_ += whole.size();
    isCut_ = false;
    isFresh_ = false;
    needsHead_ = false;
    return true;
}

std::string Record::head(const Moment& moment) const {
    Json before = Json::array();
    for (const auto& [name, members] : state_) {
        before.push_back(members);
        before.back()["event"] = name;
    }
    const Event event{"continued", "", {{"begin", begin_}, {"part", part_}, {"before", before}}};
    return jsonLine(event, moment) + "\n";
}

void Record::remember(const Event& event) {
    const auto forget = [this](const auto& isOver) {
        state_.erase(std::remove_if(state_.begin(), state_.end(), isOver), state_.end());
    };
    if (event.name == "restart") {
        forget([](const auto& each) { return !survives(each.first); });
    } else if (isLasting(event)) {
        forget([&](const auto& each) { return each.first == event.name; });
        state_.emplace_back(event.name, event.members);
    }
}

std::optional<Event> Record::lose(const std::string& problem, double seconds) {
    retryAt_ = seconds + pause;
    problem_ = problem;
    if (lost_++ > 0) {
        return std::nullopt;
    }
    lostSince_ = seconds;
    return failureEvent(name(), problem);
}

Event Record::recovered(double seconds) {
    return lostEvent(name(), std::exchange(lost_, 0), seconds - lostSince_, problem_);
}

} // namespace vantelhost
