// Asks one manager a given number of mixed questions about a fixed set of names, and fails when the memory in use
// grows once everything has been asked about.
#include <AcdStore.h>
#include <Port_MsgManData.h>
#include <TarvikException.h>
#include <tarvik/ConstraintsManager.h>

#include <cstdlib>
#include <fstream>
#include <iostream>
#include <malloc.h>
#include <random>
#include <string>
#include <unistd.h>

namespace {

using namespace TARVIKNS;

const std::map<std::string, std::string> DATABASES{
    {"base.acd", "DEVICE_SUPPORTED = finch,swift,spi\nPROGRAM_OPTION_PACKAGE = FN10_PQ,finch,spi\n"
                 "BS = outputs,PARALLEL,USB2:families,finch,swift\nSPI = outputs,USB2:families,spi\n"},
    {"finch.acd", "OPERATION = PROGRAM,Bscan,USB2\nPROPERTIES = PROGRAM,1,BS:OP_PROGRAM,2,VERIFY,ERASE\n"
                  "[FN10]\nPROGRAM_OPTION = VERIFY,Bscan,USB2\nPROPERTY = PINS,44\n"},
    {"swift.acd", "OPERATION = VERIFY,Bscan,X\nPROPERTY = PINS\n[SW10]\n"},
    {"spi.acd",
     "DEVICE_FAMILY = NV\nNV_DEVICES = FLA\nFLA_PROPERTY = SIZE,16\nTYPE_MB_SPI_NONE_LEAD = FLA\n"}};

const char* const NAMES[] = {"FN10", "fn10", "FN10_PQ", "finch",  "SW10", "swift",
                             "FLA",  "spi",  "base",    "nobody", ""};
const char* const KEYS[] = {"PINS", "PROGRAM", "OP_PROGRAM", "SIZE", "NONE", ""};

class Soak {
public:
    explicit Soak(ConstraintsManager& manager) : m_manager(manager) {}

    void ask(long calls) {
        for (long call = 0; call < calls; ++call) {
            try {
                askOnce();
            } catch (const TarvikException&) {
                ++m_raised;
            }
        }
    }

    [[nodiscard]] long raised() const noexcept { return m_raised; }

private:
    int below(int count) { return static_cast<int>(m_random() % static_cast<unsigned>(count)); }
    template <std::size_t Count>
    const char* from(const char* const (&texts)[Count]) {
        return texts[below(static_cast<int>(Count))];
    }
    template <typename Enumeration>
    Enumeration value(int count) {
        return static_cast<Enumeration>(below(count + 1));
    }

    void askOnce() {
        const char* const name = from(NAMES);
        const auto mode = value<MODE_TYPE>(9);
        const auto output = value<OUTPUT_TYPE>(10);
        const auto operation = value<OP_TYPE>(32);
        switch (below(19)) {
        case 0:
            m_manager.setExceptions(below(2) == 0);
            break;
        case 1:
            static_cast<void>(m_manager.checkConstraints(mode, output));
            break;
        case 2:
            static_cast<void>(m_manager.checkConstraints(mode, name, "PQ"));
            break;
        case 3:
            static_cast<void>(m_manager.checkConstraints(mode, output, name, nullptr));
            break;
        case 4:
            static_cast<void>(m_manager.checkConstraints(mode, output, name, operation, nullptr));
            break;
        case 5:
            static_cast<void>(m_manager.checkConstraints(name, mode, operation, nullptr));
            break;
        case 6:
            static_cast<void>(m_manager.getDeviceOperations(name, mode, output));
            break;
        case 7:
            static_cast<void>(m_manager.getProgramOptions(name, mode, output, "_PQ"));
            break;
        case 8:
            static_cast<void>(m_manager.getBsdlOperations(name, output));
            break;
        case 9:
            static_cast<void>(m_manager.getDeviceOperationOptions(name, from(KEYS), mode));
            break;
        case 10:
            static_cast<void>(m_manager.getDeviceStringProperties(name, from(KEYS)));
            break;
        case 11:
            static_cast<void>(m_manager.getDeviceStringProperty(name, from(KEYS)));
            break;
        case 12:
            static_cast<void>(m_manager.getDeviceLongProperty(name, from(KEYS)));
            break;
        case 13:
            static_cast<void>(m_manager.getPartFamily(name));
            break;
        case 14:
            m_manager.addCachedDeviceFamily(name, "finch");
            break;
        case 15:
            static_cast<void>(m_manager.isSpiDevice(name));
            break;
        case 16:
            static_cast<void>(m_manager.getSpiDeviceStringProperty(name, from(KEYS)));
            break;
        case 17:
            static_cast<void>(m_manager.isMbBpiSpiSupport(name, "TYPE_MB_SPI", "NONE", below(2) == 0));
            break;
        default:
            static_cast<void>(ConstraintsManager::operationString2Type(from(KEYS)));
        }
    }

    ConstraintsManager& m_manager;
    std::mt19937 m_random{1}; // NOLINT(cert-msc*): the same questions each time
    long m_raised = 0;
};

/// Bytes that the process has allocated, or nothing where the allocator does not tell (the sanitizers').
std::size_t allocated() { return mallinfo2().uordblks; }

/// KiB of the process that are in memory.
long resident() {
    long pages = 0;
    std::ifstream("/proc/self/statm") >> pages >> pages;
    return pages * (sysconf(_SC_PAGESIZE) / 1024);
}

} // namespace

int main(int argc, char** argv) {
    const long calls = argc == 2 ? std::atol(argv[1]) : 0;
    if (calls <= 0) {
        std::cerr << "usage: soak CALLS\n";
        return 2;
    }
    Port_MsgManData::setSink([](const Port_MsgManData::Message&) {});
    AcdStore::setMemoryFiles(DATABASES);
    Soak soak(*ConstraintsManager::getConstraintsManager());
    soak.ask(20'000);
    const long residentBefore = resident(); // first, as looking takes memory itself
    const std::size_t allocatedBefore = allocated();
    soak.ask(calls);
    const std::size_t allocatedAfter = allocated();
    std::cout << calls << " calls, " << soak.raised() << " of them raised; allocated " << allocatedBefore
              << " to " << allocatedAfter << " bytes, resident " << residentBefore << " to " << resident()
              << " KiB\n";
    return allocatedAfter > allocatedBefore ? 1 : 0;
}
