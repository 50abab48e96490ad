#ifndef MORVEL_NUMBERTEXT_H
#define MORVEL_NUMBERTEXT_H

#include <QString>

// A real number as the job files and the log show it: C locale (QString::number never follows the
// desktop's), the 'g' form with six significant digits, trailing zeros dropped as printf's %g does.
inline QString realText(float value)
{
    return QString::number(double(value), 'g', 6);
}

#endif
