// Asks the manager one question over databases that only this application's host knows.
#include <tarvik/ConstraintsManager.h>

#include <MemoryDatabases.h>

#include <cstdio>

int main() {
    memory_host::setDatabases({{"base", {"base", {{"BS", "outs,USB2:fams,fam"}}}}});
    ConstraintsManager* const manager = ConstraintsManager::getConstraintsManager();
    const bool allowed = manager->checkConstraints(TARVIKNS::MODE_TYPE::BS, TARVIKNS::OUTPUT_TYPE::USB2);
    const bool refused = !manager->checkConstraints(TARVIKNS::MODE_TYPE::BS, TARVIKNS::OUTPUT_TYPE::SVF);
    const auto messages = memory_host::takeMessages();
    const bool told =
        messages.size() == 1 && messages.front().text == "SVF is not supported in Boundary Scan mode\n";
    ConstraintsManager::RemoveConstraintsManager();
    std::puts(allowed && refused && told ? "answered" : "wrong answer");
    return allowed && refused && told ? 0 : 1;
}
