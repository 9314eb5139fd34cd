#pragma once

#include "commands/ArgumentList.h"
#include "explain/Question.h"

#include <optional>
#include <string>
#include <vector>

class Tool;

/// The arguments of a question that is answered by yes or no, as `check` and `why` take them.
struct QuestionArguments {
    std::optional<std::string> device{};
    std::optional<std::string> mode{};
    std::optional<std::string> output{};
    std::optional<std::string> package{};
    std::optional<std::string> operation{};
    std::optional<std::string> option{};
    std::optional<std::string> bsdl{};
    std::optional<std::string> operationOptions{};
    std::optional<std::string> property{};
    std::optional<std::string> value{};
    std::optional<std::string> multiboot{};
    std::optional<std::string> width{};
    bool lead = false;
    bool chain = false;
};

/// Which questions a command takes.
enum class QuestionScope {
    CHECKS, ///< those about modes, outputs, devices, packages and operations
    ALL,
};

/// A question as the manager is asked it.
struct AskedQuestion {
    explanation::Question question;
    std::string reading;              ///< how the device was read, as in `AskedDevice`
    std::vector<std::string> skipped; ///< a line for each check that the question leaves out
};

/// Reads the arguments, opens the database, and finds the device.
/// @param command is named in the message about arguments that make no question
/// @throw CommandError if there is no such question, word, device or package
[[nodiscard]] AskedQuestion readQuestion(Tool& tool, const QuestionArguments& arguments, QuestionScope scope,
                                         const char* command);

/// The arguments --type, --width, --lead and --chain of a multiboot arrangement.
/// @param isQuestion names them for `multiboot`, where they are required, otherwise for `why`
void declareMultiboot(ArgumentList& list, QuestionArguments& arguments, bool isRequired);
