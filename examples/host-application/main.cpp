// An application's side: it offers its user a menu of what a device allows, keeps the library's messages in a log
// of its own, and tells a refused request from a faulty database.
//
//     host-application DATABASE DEVICE

#include <tarvik/ConstraintsManager.h>

#include <AcdStore.h>
#include <Port_MsgManData.h>
#include <TarvikException.h>

#include <exception>
#include <iostream>
#include <string>
#include <vector>

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OP_TYPE;
using TARVIKNS::OUTPUT_TYPE;
using TARVIKNS::PROGRAM_OPTION;

namespace {

constexpr MODE_TYPE MODE = MODE_TYPE::BS;
constexpr OUTPUT_TYPE CABLE = OUTPUT_TYPE::USB2;

/// The application's log. Messages of the library go here, and not to the terminal.
class Log {
public:
    Log() {
        Port_MsgManData::setSink([this](const Port_MsgManData::Message& message) {
            if (message.channel != Port_MsgManData::Channel::DEBUG) {
                m_lines.emplace_back(message.text);
            }
        });
    }
    ~Log() { Port_MsgManData::setSink({}); }
    Log(const Log&) = delete;
    Log& operator=(const Log&) = delete;

    void print() const {
        std::cout << "Log:\n";
        for (const std::string& line : m_lines) {
            std::cout << "  " << line;
        }
    }

private:
    std::vector<std::string> m_lines;
};

/// Bit i of a mask stands for the enumeration's value i.
template <typename Value>
bool holds(int mask, Value value) {
    return (static_cast<unsigned>(mask) >> static_cast<int>(value) & 1U) != 0;
}

void printMenu(ConstraintsManager& manager, const char* device) {
    std::cout << device << " of family " << manager.getPartFamily(device).c_str() << "\nOperations:\n";
    const int operations = manager.getDeviceOperations(device, MODE, CABLE);
    for (const OP_TYPE operation : manager.getOperationOrders()) {
        if (holds(operations, operation)) {
            std::cout << "  " << ConstraintsManager::operationType2DisplayString(operation).c_str() << '\n';
        }
    }
    std::cout << "Programming options:\n";
    const int options = manager.getProgramOptions(device, MODE, CABLE, nullptr);
    for (const PROGRAM_OPTION option : manager.getProgramOptionOrders()) {
        if (holds(options, option)) {
            std::cout << "  " << ConstraintsManager::optionType2String(option).c_str() << '\n';
        }
    }
}

/// A property that a device need not have: asked for with exceptions off, so that its absence is no failure.
void printVendor(ConstraintsManager& manager, const char* device) {
    manager.setExceptions(false);
    const char* const vendor = manager.getDeviceStringProperty(device, "VENDOR");
    manager.setExceptions(true);
    std::cout << "Vendor: " << (vendor == nullptr ? "unknown" : vendor) << '\n';
}

} // namespace

int main(int argc, char** argv) try {
    if (argc != 3) {
        std::cerr << "usage: host-application DATABASE DEVICE\n";
        return 2;
    }
    const Log log;
    AcdStore::setSearchPath({argv[1]});
    ConstraintsManager* const manager = ConstraintsManager::getConstraintsManager();
    if (manager == nullptr) {
        std::cerr << "no memory\n";
        return 2;
    }
    const char* const device = argv[2];
    int status = 0;
    try {
        printMenu(*manager, device);
        printVendor(*manager, device);
        // A refusal is an answer: the reason is in the log, in the user's words.
        const bool offered = manager->checkConstraints(MODE_TYPE::DP770, CABLE, device, nullptr);
        std::cout << "In the desktop programmer: " << (offered ? "yes" : "no") << '\n';
    } catch (const DataMismatchException& fault) {
        std::cerr << "the database has a malformed record: " << fault.what() << '\n';
        status = 2;
    } catch (const OutOfRangeException& fault) {
        // Raised for a family that the base database does not list; other locations are those of words in records.
        constexpr int FAMILY_NOT_SUPPORTED = 1999;
        if (fault.line() != FAMILY_NOT_SUPPORTED) {
            std::cerr << "the database has an unknown word: " << fault.what() << '\n';
        } else if (manager->getAllDeviceIdcodes().empty()) {
            std::cerr << "there is no device database in " << argv[1] << '\n';
        } else {
            std::cerr << device << " belongs to no family that is supported: " << fault.what() << '\n';
        }
        status = 2;
    }
    log.print();
    ConstraintsManager::RemoveConstraintsManager();
    return status;
} catch (const std::exception& fault) {
    std::cerr << "host-application: " << fault.what() << '\n';
    return 2;
}
