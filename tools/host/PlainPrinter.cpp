#include "PlainPrinter.h"

#include <utility>

#include <fmt/format.h>

namespace vantelhost {

bool PlainPrinter::operator()(const Event& event, const Moment& moment) {
    if (isLeftOut(event.name)) {
        return true;
    }
    if (event.name == "stopping" && !tellAllRepetitions(moment)) {
        return false;
    }
    const auto [last, isFirst] = last_.try_emplace(event.name);
    if (!isFirst && last->second.text == event.text) {
        ++last->second.repetitions;
        return true;
    }
    if (!tellRepetitions(event.name, last->second, moment)) {
        return false;
    }
    last->second.text = event.text;
    return print_(event, moment);
}

bool PlainPrinter::isLeftOut(const std::string& name) const {
    return name == "expected" ||
           (detail_ == Detail::quiet && (name == "pair" || name == "metadata"));
}

bool PlainPrinter::tellRepetitions(const std::string& name, Last& last,
                                   const Moment& moment) const {
    const auto repetitions = std::exchange(last.repetitions, 0);
    if (repetitions == 0) {
        return true;
    }
    return print_(
        {name,
         repetitions == 1 ? last.text : fmt::format("... (repeated {} times)", repetitions),
         {}},
        moment);
}

bool PlainPrinter::tellAllRepetitions(const Moment& moment) {
    for (auto& [name, last] : last_) {
        if (!tellRepetitions(name, last, moment)) {
            return false;
        }
    }
    return true;
}

} // namespace vantelhost
