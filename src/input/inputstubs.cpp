#include "import.h"

// Input preparation is not built yet; these members do nothing so far.
void Import::getInputFile() {}
void Import::readOxidationTable() {}
void Import::addOxidationNumbers() {}
OxidationEntry Import::entryForName(const QString &) const { return OxidationEntry(); }
float Import::chargeForSymbol(const QString &) const { return 1000.0f; }
