// The list drag's payload and its CSV table.
#include "lists/SetMimeData.h"

#include "query/SystemSetCsv.h"

SetMimeData::SetMimeData(const Message& message, const Universe* universe, const StarSysMask* set)
    : MessageMimeData(message)
    , fUniverse(universe)
    , fSet(set)
{
}

const QByteArray& SetMimeData::Csv() const
{
    if (!fWritten) {
        const std::string text = SystemSetCsv::Write(*fUniverse, *fSet);
        fCsv = QByteArray(text.data(), qsizetype(text.size()));
        fWritten = true;
    }
    return fCsv;
}

QStringList SetMimeData::formats() const
{
    QStringList list = MessageMimeData::formats();
    list << QString::fromLatin1(kCsvMimeType) << QStringLiteral("text/plain");
    return list;
}

bool SetMimeData::hasFormat(const QString& mimeType) const
{
    return mimeType == QLatin1String(kCsvMimeType) || mimeType == QLatin1String("text/plain")
        || MessageMimeData::hasFormat(mimeType);
}

QVariant SetMimeData::retrieveData(const QString& mimeType, QMetaType type) const
{
    if (mimeType == QLatin1String(kCsvMimeType) || mimeType == QLatin1String("text/plain")) {
        // The table is UTF-8, as the catalogue's names are.
        if (type.id() == QMetaType::QString)
            return QString::fromUtf8(Csv());
        return Csv();
    }
    return MessageMimeData::retrieveData(mimeType, type);
}
