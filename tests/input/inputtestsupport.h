#ifndef MORVEL_INPUTTESTSUPPORT_H
#define MORVEL_INPUTTESTSUPPORT_H

#include <QFile>
#include <QStringList>
#include <QTextEdit>

// The log as the user reads it: one entry per non-empty line, blanks around it removed.
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
    if (!f.open(QIODevice::ReadOnly))
        return QByteArray("<unreadable>");
    return f.readAll();
}

// The worked example: a table of two atoms and a CIF file with a third atom it does not know.
inline QByteArray exampleTable()
{
    return "Fe1 Fe3+ 3\nO1 O2- -2\n";
}

inline QByteArray exampleCif()
{
    return "data_x\n"
           "loop_\n"
           "_atom_site_label\n"
           "_atom_site_type_symbol\n"
           "_atom_site_fract_x\n"
           "Fe1   Fe  0.0 0.0 0.0\n"
           "O1    O   0.5 0.5 0.5\n"
           "Xx1   Xx  0.1 0.1 0.1\n"
           "loop_\n"
           "_atom_site_aniso_label\n";
}

inline QByteArray exampleRewritten()
{
    return "data_x\n"
           "loop_\n"
           "_atom_site_label\n"
           "_atom_site_type_symbol\n"
           "_atom_site_fract_x\n"
           "Fe1 Fe3+ 0.0 0.0 0.0\n"
           "O1 O2- 0.5 0.5 0.5\n"
           "loop_\n"
           "_atom_type_symbol\n"
           "_atom_type_oxidation_number\n"
           "Fe3+ 3\n"
           "O2- -2\n"
           "loop_\n"
           "_atom_site_aniso_label\n";
}

#endif
