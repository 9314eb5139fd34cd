#pragma once

// Which members hold what a configuration mode allows.

#include <tarvik/ConstraintsManager.h>

/// The outputs and the device families of one mode.
struct ConstraintsManager::ModeTable {
    std::set<TARVIKNS::OUTPUT_TYPE> ConstraintsManager::*outputs;
    NameSet ConstraintsManager::*devices;
};
