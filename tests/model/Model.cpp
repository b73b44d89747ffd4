#include "Model.h"

std::string Script::text() const {
    std::string text = "offset 7\nsync-interval 0.001\n";
    text += grandmaster == Grandmaster::absent ? "gm absent\n" : "";
    text += grandmaster == Grandmaster::comesAndGoes
                ? "on TIME_STATUS_NP after 3 times 1 do gm off\n"
                  "on TIME_STATUS_NP after 6 times 1 do gm on\n"
                : "";
    text += life == Life::exitsAtOnce ? "exit-at-once 3\n" : "";
    text += life == Life::exitsLater ? "at 0.03 do exit 0\n" : "";
    text += ignoresSigterm ? "ignore SIGTERM\n" : "";
    text += strictPadding ? "padding strict\n" : "";
    text += losesSocket ? "on any after 4 times 1 do unbind\n" : "";
    for (const std::string& fault : faults) {
        text += fault + '\n';
    }
    return text;
}

Refusal Model::refusalOfStart() const {
    const Refusal first =
        refusalOf(answers.at(static_cast<std::size_t>(Event::What::updateMetaData)));
    return first.code < 0
               ? first
               : refusalOf(answers.at(static_cast<std::size_t>(Event::What::setTRQuality)));
}

bool Model::pollsSucceed() const {
    return phase == Phase::running && !daemonIsFrozen && !ownPathIsTaken && !session.daemonEnds() &&
           !session.script.losesSocket;
}

bool Model::pollsFail() const {
    return phase == Phase::running &&
           (daemonIsFrozen || ownPathIsTaken || session.daemonEnds() || session.script.losesSocket);
}

// Those behind a role that is not taken are not told.
bool Model::pairsCome() const {
    return pollsSucceed() && hasFifo && answersWell(Event::What::getTime) &&
           answersWell(Event::What::setTRQuality) &&
           session.script.grandmaster == Script::Grandmaster::present;
}

bool Model::deathIsTold() const {
    return phase == Phase::running && session.daemonEnds() && !daemonIsFrozen;
}

bool Model::answersWell(Event::What function) const {
    return refusalOf(answers.at(static_cast<std::size_t>(function))).code == 0;
}
