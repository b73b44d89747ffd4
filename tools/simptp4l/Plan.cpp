#include "Plan.h"

#include "DataSets.h"

#include <algorithm>

namespace simptp4l {
namespace {

constexpr std::uint16_t wrongLength = 3;
constexpr std::uint16_t noSuchId = 2;
constexpr std::uint16_t wrongValue = 4;
constexpr std::uint16_t notSupported = 6;
constexpr std::uint16_t anyPort = 0xFFFF;

/// More than any client can take in; keeps rules that multiply each other bounded.
constexpr std::size_t maxAnswers = 20000;

Answer errorFrom(unsigned port, std::uint16_t code) {
    Answer answer;
    answer.port = port;
    answer.error = code;
    return answer;
}

/// The ports that a request is for; empty when it names one that does not exist.
std::vector<unsigned> portsOf(const Request& request, unsigned numberPorts) {
    std::vector<unsigned> ports;
    const unsigned target = request.target.portNumber;
    for (unsigned port = 1; port <= numberPorts; ++port) {
        if (target == anyPort || target == port) {
            ports.push_back(port);
        }
    }
    return ports;
}

std::vector<Answer> clockAnswers(const Request& request) {
    if (request.action != RequestAction::get) {
        return {errorFrom(0, notSupported)};
    }
    return {Answer{}};
}

std::vector<Answer> portAnswers(const Request& request, const std::vector<unsigned>& ports) {
    std::vector<Answer> answers;
    for (unsigned port : ports) {
        Answer answer;
        answer.port = port;
        if (request.action != RequestAction::get) {
            answer.error = notSupported;
        }
        answers.push_back(answer);
    }
    return answers;
}

std::vector<Answer> answersFor(const Request& request, unsigned numberPorts) {
    if (request.action == RequestAction::set && request.dataSize == 0) {
        return {errorFrom(0, wrongLength)};
    }
    const DataSet* known = findDataSet(request.managementId);
    if (known != nullptr && !known->perPort) {
        return clockAnswers(request);
    }
    const std::vector<unsigned> ports = portsOf(request, numberPorts);
    if (ports.empty() && request.target.portNumber != anyPort) {
        return {errorFrom(0, wrongValue)};
    }
    if (known == nullptr) {
        return {errorFrom(ports.empty() ? 0 : ports.front(), noSuchId)};
    }
    return portAnswers(request, ports);
}

/// Further answers come from ports that follow the last one; the clock repeats itself.
void setCount(std::vector<Answer>& answers, std::int64_t count) {
    const std::int64_t bounded = std::clamp<std::int64_t>(count, 0, maxAnswers);
    while (static_cast<std::int64_t>(answers.size()) < bounded) {
        Answer next = answers.empty() ? Answer{} : answers.back();
        if (next.port != 0) {
            ++next.port;
        }
        answers.push_back(next);
    }
    answers.resize(static_cast<std::size_t>(bounded));
}

/// @param index counted from 1; 0: every answer
void repeat(std::vector<Answer>& answers, std::int64_t index, std::int64_t count) {
    std::vector<Answer> repeated;
    std::int64_t position = 0;
    for (const Answer& answer : answers) {
        const bool chosen = ++position == index || index == 0;
        for (std::int64_t copy = 0; copy < (chosen ? count : 1); ++copy) {
            if (repeated.size() < maxAnswers) {
                repeated.push_back(answer);
            }
        }
    }
    answers = repeated;
}

void setLength(Answer& answer, const Action& action) {
    if (action.relative) {
        answer.lengthChange += action.value;
    } else {
        answer.exactLength = action.value;
    }
}

void dropAt(std::vector<Answer>& answers, std::int64_t index) {
    if (index == 0) {
        answers.clear();
    } else if (index <= static_cast<std::int64_t>(answers.size())) {
        answers.erase(answers.begin() + static_cast<std::ptrdiff_t>(index - 1));
    }
}

void applyToEach(const Action& action, std::vector<Answer>& answers) {
    for (Answer& answer : answers) {
        if (action.kind == ActionKind::length) {
            setLength(answer, action);
        } else if (action.kind == ActionKind::garbage) {
            answer.garbage = action.value;
        } else if (action.kind == ActionKind::error) {
            answer.error = static_cast<std::uint16_t>(action.value);
        } else if (action.kind == ActionKind::otherPort) {
            answer.otherPort = true;
        }
    }
}

} // namespace

Plan planFor(const Request& request, unsigned numberPorts) {
    Plan plan;
    plan.answers = answersFor(request, numberPorts);
    return plan;
}

void apply(const Action& action, Plan& plan) {
    std::vector<Answer>& answers = plan.answers;
    switch (action.kind) {
    case ActionKind::silence:
        answers.clear();
        break;
    case ActionKind::delay:
        plan.delay += action.value;
        break;
    case ActionKind::late:
        plan.late = true;
        break;
    case ActionKind::drop:
        dropAt(answers, action.value);
        break;
    case ActionKind::duplicate:
        repeat(answers, action.value, 2);
        break;
    case ActionKind::flood:
        repeat(answers, 0, action.value);
        break;
    case ActionKind::reorder:
        std::reverse(answers.begin(), answers.end());
        break;
    case ActionKind::answers:
        setCount(answers, action.relative ? static_cast<std::int64_t>(answers.size()) + action.value
                                          : action.value);
        break;
    default:
        applyToEach(action, answers);
    }
}

} // namespace simptp4l
