#pragma once

#include <cstddef>
#include <functional>
#include <string>
#include <vector>

/// The system calls that the database layer reads files with. Where the linker is told so (--wrap) they come by
/// here first, and can be made to go wrong.
class SystemCalls {
public:
    enum class Kind { OPEN, STAT, READ, LIST, ENTRY };

    struct Call {
        Kind kind;
        std::string path; ///< of the file or directory
    };

    /// What is done in place of a call: nothing and the call is made, else an error number.
    using Trouble = std::function<int(const Call& call)>;

    /// Counts calls from now on, and makes `trouble` at number `number`, counted from 1; at none for 0.
    static void watch(long number = 0, Trouble trouble = {});

    /// Lets the reading call that is watched give no more than so many bytes.
    static void limitRead(std::size_t size);

    /// All calls since, and no more of them.
    [[nodiscard]] static std::vector<Call> stop();
};
