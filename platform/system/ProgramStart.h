#pragma once

#include "platform/base/Result.h"
#include "platform/files/FileDescriptor.h"

#include <string>
#include <sys/types.h>
#include <utility>
#include <vector>

namespace platform {

/// A program to start, without a shell: it finds itself in a session of its own, with nothing to
/// read unless it is given something, no other open file of ours and the signals as the system
/// makes them.
struct ProgramStart {
    /// The program first: a path, or a name to be looked for in $PATH.
    std::vector<std::string> arguments;
    /// The folder to work in; the root where there is no such folder.
    std::string folder;
    /// Set beside what this process has.
    std::vector<std::pair<std::string, std::string>> environment = {};
    /// Descriptors of this process that become its standard input and output, in place of nothing
    /// to read and of this process's own output.
    int input = -1;
    int output = -1;
};

/// A child that runs, to be waited for, lest it stays in the table of processes.
struct StartedProgram {
    pid_t pid = 0;
    /// Readable once it has ended.
    FileDescriptor handle;

    /// Its exit status, a signal N as 128 + N; waits for the end.
    int wait() const;
};

/// An error when the program cannot be run at all; what becomes of it later it says by its end.
Result<StartedProgram> startProgram(const ProgramStart& start);

} // namespace platform
