#pragma once

#include "commands/Command.h"

/// All commands, each defined in the file that has its name.
namespace command {

extern const Command BATCH;
extern const Command BSDL;
extern const Command CHECK;
extern const Command DEVICES;
extern const Command DIFF;
extern const Command DUMP;
extern const Command FAMILIES;
extern const Command FORMAT;
extern const Command IDENTIFY;
extern const Command INDEX;
extern const Command LINT;
extern const Command LSP;
extern const Command MULTIBOOT;
extern const Command NEW;
extern const Command OPERATION_OPTIONS;
extern const Command OPERATIONS;
extern const Command OPTIONS;
extern const Command PROPERTY;
extern const Command REMOVE;
extern const Command RENAME;
extern const Command REPORT;
extern const Command SHOW;
extern const Command SPI;
extern const Command VOCABULARY;
extern const Command WHICH;
extern const Command WHY;

} // namespace command
