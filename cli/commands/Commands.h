#pragma once

#include "commands/Command.h"

// One function for each command: it declares the command's arguments and gives what to do with them.
Action declareBatch(CLI::App& parser);
Action declareBsdl(CLI::App& parser);
Action declareCheck(CLI::App& parser);
Action declareDevices(CLI::App& parser);
Action declareDiff(CLI::App& parser);
Action declareDump(CLI::App& parser);
Action declareFamilies(CLI::App& parser);
Action declareLint(CLI::App& parser);
Action declareMultiboot(CLI::App& parser);
Action declareOperationOptions(CLI::App& parser);
Action declareOperations(CLI::App& parser);
Action declareOptions(CLI::App& parser);
Action declareProperty(CLI::App& parser);
Action declareReport(CLI::App& parser);
Action declareShow(CLI::App& parser);
Action declareSpi(CLI::App& parser);
Action declareVocabulary(CLI::App& parser);
Action declareWhich(CLI::App& parser);
Action declareWhy(CLI::App& parser);
