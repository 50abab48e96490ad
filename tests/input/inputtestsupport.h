#ifndef MORVEL_INPUTTESTSUPPORT_H
#define MORVEL_INPUTTESTSUPPORT_H

#include <QFile>
#include <QStringList>
#include <QTextEdit>

// The log as the user reads it: its non-empty lines, trimmed.
inline QStringList shownLines(const QTextEdit *log)
{
    QStringList lines;
    for (const QString &line : log->toPlainText().split(QLatin1Char('\n'))) {
        if (!line.trimmed().isEmpty())
            lines.append(line.trimmed());
    }
    return lines;
}

inline QByteArray fileBytes(const QString &path)
{
    QFile f(path);
    return f.open(QIODevice::ReadOnly) ? f.readAll() : QByteArray("<unreadable>");
}

// The worked example: a table of two atoms, a CIF file with a third atom the table does not know.
const QByteArray exampleTable = "Fe1 Fe3+ 3\nO1 O2- -2\n";
const QByteArray exampleHead = "data_x\nloop_\n_atom_site_label\n_atom_site_type_symbol\n_atom_site_fract_x\n";
const QByteArray exampleCif = exampleHead
    + "Fe1   Fe  0.0 0.0 0.0\nO1    O   0.5 0.5 0.5\nXx1   Xx  0.1 0.1 0.1\nloop_\n_atom_site_aniso_label\n";
const QByteArray exampleRewritten = exampleHead
    + "Fe1 Fe3+ 0.0 0.0 0.0\nO1 O2- 0.5 0.5 0.5\nloop_\n_atom_type_symbol\n_atom_type_oxidation_number\n"
      "Fe3+ 3\nO2- -2\nloop_\n_atom_site_aniso_label\n";

#endif
