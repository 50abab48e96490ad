#include "import.h"

// The job run is not built yet; these members do nothing so far.
void Import::makeImport() {}
void Import::endImport(int) {}
void Import::endMorvel(int) {}
void Import::outputImport() {}
void Import::killImport() {}
void Import::checkStart() {}
void Import::checkStartMorvel() {}
void Import::processError(QProcess::ProcessError) {}
void Import::openMorvelOut() {}
void Import::writeParameterFile() {}
void Import::copyInputFile(const QString &) {}
