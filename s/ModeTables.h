#pragma once

// Which members hold what a configuration mode allows.

#include "Implementation.h"

/// The outputs and the device families of one mode.
struct ConstraintsManager::Implementation::ModeTable {
    std::set<OUTPUT_TYPE> Implementation::*outputs;
    NameSet Implementation::*devices;
};
