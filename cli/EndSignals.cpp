// How SIGINT, SIGTERM and SIGHUP end the command, and what is undone first.
#include "cli/EndSignals.h"

#include <unistd.h>

#include <iterator>

#include "runtime/LastAct.h"

namespace cli {
namespace {

bool takenSignals[std::size(kEndSignals)] = {};

/// Every signal waits while it runs, so that no second one comes between, and no terminal stops a
/// job in the background that puts its settings back.
extern "C" void endNow(int signal) {
    runtime::runLastActs();
    _exit(128 + signal);
}

void take(int signal) {
    struct sigaction action {};
    action.sa_handler = endNow;
    sigfillset(&action.sa_mask);
    sigaction(signal, &action, nullptr);
}

}  // namespace

bool isIgnored(int signal) {
    struct sigaction now {};
    return sigaction(signal, nullptr, &now) == 0 && now.sa_handler == SIG_IGN;
}

void endOnSignals() {
    for (std::size_t i = 0; i < std::size(kEndSignals); ++i) {
        takenSignals[i] = !isIgnored(kEndSignals[i]);
    }
    retakeEndSignals();
}

void retakeEndSignals() {
    for (std::size_t i = 0; i < std::size(kEndSignals); ++i) {
        if (takenSignals[i]) take(kEndSignals[i]);
    }
}

}  // namespace cli
