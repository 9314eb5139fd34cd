// What is the same for the processes of every system.
#include "term/Subprocess.h"

#include "term/ExitCode.h"

Subprocess::~Subprocess() {
    if (m_process != -1) {
        static_cast<void>(wait());
    }
}

std::string Subprocess::output() {
    std::string text;
    if (!succeeds(text)) {
        throw CommandError(ExitCode::FAULT, "a process that reads a database failed");
    }
    return text;
}
