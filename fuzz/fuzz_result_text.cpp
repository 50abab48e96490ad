// Fuzzes how the log reads a result file: any bytes, cut at any limit.
// The input's first two bytes give the limit (0 to 65535); the rest is the file.
// Build and run: see fuzz/CMakeLists.txt.
#include "require.h"
#include "runlogic.h"

#include <QBuffer>
#include <QStringDecoder>

#include <cstdint>

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    if (size < 2)
        return 0;
    const qint64 limit = data[0] | data[1] << 8;
    QByteArray bytes(reinterpret_cast<const char *>(data + 2), qsizetype(size - 2));
    QBuffer file(&bytes);
    require(file.open(QIODevice::ReadOnly));
    const ResultText shown = readResultText(file, limit);

    require(shown.fileSize == bytes.size() && shown.whole == (bytes.size() <= limit));
    require(!shown.text.contains(QChar(0)) && shown.text.size() <= std::max<qint64>(limit, bytes.size()));
    // What the log shows is the file's text, or (where the cut leaves its byte-order mark whole) the
    // beginning of it.
    const auto bom = QStringConverter::encodingForData(bytes);
    QString whole = QStringDecoder(bom ? *bom : QStringConverter::Utf8, QStringConverter::Flag::Stateless).decode(bytes);
    whole.replace(QChar(0), QChar::ReplacementCharacter);
    if (shown.whole)
        require(shown.text == whole);
    else if (limit >= 4)
        require(whole.startsWith(shown.text));
    return 0;
}
