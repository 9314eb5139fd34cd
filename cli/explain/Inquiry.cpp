// Puts a question to a fresh manager and watches what it reads.
#include "explain/Inquiry.h"

#include <tarvik/ConstraintsManager.h>

namespace explanation {

Conclusion askFreshManager(const Question& question) {
    const ManagerFactory::Manager manager = ManagerFactory::make();
    manager->setExceptions(false);
    return ask(*manager, question);
}

Inquiry::Inquiry(const Question& question) {
    startUp.record([&] { manager = ManagerFactory::make(); });
    manager->setExceptions(false);
    reads.record([&] { verdict = ask(*manager, question); });
}

std::string Inquiry::familyOf(const std::string& name) const {
    return toStdString(manager->getPartFamily(name.c_str()));
}

} // namespace explanation
