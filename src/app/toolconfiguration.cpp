#include "toolconfiguration.h"

void applyBinariesLine(const QString &line, BinariesPaths &paths)
{
    if (line.startsWith(QLatin1String("MORVEL")))
        paths.morvel = line.mid(6).simplified();
    else if (line.startsWith(QLatin1String("PARSER")))
        paths.parser = line.mid(6).simplified();
}

QString shownVersion(const QString &versionText)
{
    return versionText.mid(10);
}
