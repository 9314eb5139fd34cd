#include <AcdStore.h>
#include <tarvik/ConstraintsManager.h>

// Makes the manager from a database directory, and ends.

int main(int argumentCount, char** arguments) {
    AcdStore::setSearchPath({arguments[argumentCount - 1]});
    return ConstraintsManager::getConstraintsManager() == nullptr ? 1 : 0;
}
