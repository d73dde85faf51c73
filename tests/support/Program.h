#pragma once

#include <optional>
#include <string>
#include <sys/types.h>
#include <vector>

namespace test {

/// A program that runs beside the test. Killed and waited for with the object.
class Program {
public:
    struct Start {
        std::vector<std::string> arguments; // the program's path first
        /// The whole environment; none takes over the test's own.
        std::optional<std::vector<std::string>> environment = {};
        /// This process and what it starts, so that all can be ended together.
        bool ownGroup = false;
    };
    explicit Program(Start start);
    ~Program();
    Program(const Program&) = delete;
    Program& operator=(const Program&) = delete;

    pid_t pid() const { return pid_; }
    /// The next line of its standard output, without the line's end; none at the end of the output.
    std::optional<std::string> readLine();
    /// All that is left of its standard output.
    std::string readAll();
    void writeLine(const std::string& line) const;
    void closeInput();
    void kill(int signal) const;
    /// Stops it, and answers once the kernel has: a signal alone leaves its threads running a
    /// while.
    void stop() const;
    /// Waits for its end; a signal N counts as 128 + N.
    int wait();

private:
    pid_t pid_ = -1;
    bool group_ = false;
    int input_ = -1;
    int output_ = -1;
    std::string unread_;
    std::optional<int> status_;
};

/// The same for a program of which only the end matters: its exit status and its output.
struct Outcome {
    int status = -1;
    std::string output;
};
Outcome run(Program::Start start);

} // namespace test
