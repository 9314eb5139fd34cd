#include "ManagerFactory.h"

ManagerFactory::Manager ManagerFactory::make() { return Manager(new ConstraintsManager); }

void ManagerFactory::Deleter::operator()(ConstraintsManager* manager) const noexcept { delete manager; }
