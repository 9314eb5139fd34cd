#pragma once

#include "query/DeviceDetails.h"

#include <functional>
#include <string>

namespace report {

/// What the manager answers about one of all devices.
struct Subject {
    DeviceSheet sheet; ///< with name and family alone when there is a fault
    std::string fault; ///< why there is no answer; empty: there is one
};

/// Asks about every device of the database, flashes included, in the order of their families.
///
/// Each answer is what `deviceSheet` gives for that device alone. Devices that share their tables are asked for
/// those once; where one question could change the answer to another, it is asked in a process of its own.
/// @param tool whose manager was asked nothing before
/// @param use gets each subject, which lives until it returns
void survey(Tool& tool, const std::function<void(const Subject&)>& use);

} // namespace report
