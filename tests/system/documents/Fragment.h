#pragma once

// What an application has around the fragments of code in the documents.

#include <tarvik/ConstraintsManager.h>

#include <AcdStore.h>
#include <Port_MsgManData.h>
#include <TarvikException.h>

#include <mutex>
#include <string>
#include <string_view>

/// The application's log.
struct ApplicationLog {
    void write(std::string_view text);
};

extern ApplicationLog applicationLog;
extern ConstraintsManager& manager;
extern const std::string baseText;
extern const std::string kestrelText;
