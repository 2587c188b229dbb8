#include <fcntl.h>
#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <sstream>
#include <stdexcept>

#include "OtherSlaves.h"

namespace peers {

namespace {

// Debian's own interpreter: it is the one that sees Debian's python3-pymodbus.
constexpr const char* kPython = "/usr/bin/python3";

std::vector<int> numbersOf(const std::string& line) {
    std::istringstream words(line);
    std::string title;
    words >> title;
    std::vector<int> numbers;
    for (int number = 0; words >> number;)
        numbers.push_back(number);
    return numbers;
}

}  // namespace

PymodbusSlave::PymodbusSlave(const std::string& mode, int node) {
    std::array<int, 2> in{};
    std::array<int, 2> out{};
    if (pipe2(in.data(), O_CLOEXEC) != 0 || pipe2(out.data(), O_CLOEXEC) != 0)
        throw std::runtime_error("no pipes");
    const std::string address = std::to_string(node);
    process_ = fork();
    if (process_ == 0) {
        dup2(in[0], STDIN_FILENO);
        dup2(out[1], STDOUT_FILENO);
        execl(kPython, kPython, PEERS_DIRECTORY "/pymodbus_slave.py", mode.c_str(),
              line_.right().c_str(), address.c_str(), nullptr);
        _exit(127);
    }
    close(in[0]);
    close(out[1]);
    input_ = in[1];
    output_ = out[0];
    if (readLine() != "ready") throw std::runtime_error("pymodbus does not run");
}

PymodbusSlave::~PymodbusSlave() {
    if (input_ >= 0) close(input_);
    close(output_);
    kill(process_, SIGKILL);
    waitpid(process_, nullptr, 0);
}

std::string PymodbusSlave::readLine() const {
    std::string line;
    for (char letter = 0; read(output_, &letter, 1) == 1 && letter != '\n';)
        line += letter;
    return line;
}

Written PymodbusSlave::end() {
    close(input_);
    input_ = -1;
    const std::string coils = readLine();
    const std::string registers = readLine();
    return {numbersOf(coils), numbersOf(registers)};
}

}  // namespace peers
