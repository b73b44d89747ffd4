#include "Outbox.h"

#include <algorithm>
#include <cerrno>
#include <set>
#include <system_error>

namespace simptp4l {
namespace {

constexpr std::int64_t retryInterval = 50000;
constexpr std::int64_t patience = 500000000;

} // namespace

void Outbox::add(std::int64_t due, const Octets& octets, const Address& to) {
    // From the back: nearly every answer is the latest so far.
    auto place = entries_.end();
    while (place != entries_.begin() && std::prev(place)->due > due) {
        --place;
    }
    entries_.insert(place, Entry{due, octets, to});
}

void Outbox::send(std::int64_t now, ManagementSocket& socket, Log& log) {
    std::set<std::string> full;
    for (auto entry = entries_.begin(); entry != entries_.end() && entry->due <= now;) {
        const std::string to = entry->to.text();
        if (full.count(to) == 0 && attempt(*entry, now, socket, log)) {
            entry = entries_.erase(entry);
        } else {
            full.insert(to);
            ++entry;
        }
    }
}

std::optional<std::int64_t> Outbox::next(std::int64_t now) const {
    if (entries_.empty()) {
        return std::nullopt;
    }
    return std::max(entries_.front().due, now + retryInterval);
}

bool Outbox::attempt(const Entry& entry, std::int64_t now, ManagementSocket& socket, Log& log) {
    const SendResult result = socket.send(entry.octets, entry.to);
    if (result == SendResult::full && now - entry.due < patience) {
        return false;
    }
    if (result == SendResult::sent) {
        log.answer(now, entry.octets, entry.to.text());
    } else {
        log.dropped(now, entry.octets.size(), entry.to.text(),
                    std::generic_category().message(errno));
    }
    return true;
}

} // namespace simptp4l
