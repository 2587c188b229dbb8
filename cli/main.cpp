// The program `mrtu`: the process around the command line.
#include <fcntl.h>
#include <unistd.h>

#include <csignal>
#include <iostream>

#include "cli/Command.h"
#include "cli/EndSignals.h"

namespace {

/// A closed standard stream would lend its number to the next file that is opened, and what is
/// printed would go out on the serial line. Reading and writing the stand-in fail as they should.
void occupyStandardStreams() {
    for (int fd = 0; fd <= 2; ++fd) {
        if (fcntl(fd, F_GETFD) != -1) continue;
        if (open("/dev/null", fd == 0 ? O_WRONLY : O_RDONLY) < 0) _exit(1);
    }
}

}  // namespace

int main(int argc, char** argv) {
    occupyStandardStreams();
    // A reader that has gone is a failed write, not the end: the port is still to be put back.
    std::signal(SIGPIPE, SIG_IGN);
    cli::endOnSignals();
    return cli::runCommandLine(argc, argv, std::cout, std::cerr);
}
