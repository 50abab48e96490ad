#ifndef MORVEL_RESULTFILES_H
#define MORVEL_RESULTFILES_H

#include <QByteArray>

// Result files of a given size, like the computation program's distance tables; numbered lines,
// so that no two are alike.
inline QByteArray plainResult(qint64 bytes)
{
    QByteArray out;
    out.reserve(bytes + 64);
    for (qint64 i = 0; out.size() < bytes; ++i)
        out += "  Fe1   - O2      2.0135(3)  x2   " + QByteArray::number(i) + '\n';
    out.truncate(bytes);
    return out;
}

// The same as HTML: a heading with the anchor TITLE a fifth of the way in, then paragraphs and
// preformatted blocks.
inline QByteArray richResult(qint64 bytes)
{
    QByteArray out = "<html><body>\n<p>Distances</p>\n";
    out.reserve(bytes + 64);
    bool anchored = false;
    for (qint64 i = 0; out.size() < bytes - 32; ++i) {
        if (!anchored && out.size() > bytes / 5) {
            out += "<h2><a name=\"TITLE\"></a>Bond weights</h2>\n";
            anchored = true;
        }
        if (i % 40 == 0)
            out += "<p><b>Site " + QByteArray::number(i) + "</b>   coordination &amp; weights</p>\n<pre>";
        out += "Fe1   - O2      2.0135(3)  x2   " + QByteArray::number(i) + '\n';
        if (i % 40 == 39)
            out += "</pre>\n";
    }
    out += "</pre></body></html>\n";
    return out;
}

#endif
