// What dragging a list away carries: the message for this program's own views, and the list's
// systems as a CSV table (text/csv and text/plain) for file managers, text editors and
// spreadsheets. The table is written only when another program asks for it.
#pragma once

#include "catalog/Universe.h"
#include "platform/qt/MessageDrag.h"
#include "query/StarSysMask.h"

#include <QByteArray>
#include <QStringList>

inline constexpr char kCsvMimeType[] = "text/csv";

class SetMimeData : public MessageMimeData {
public:
    // The systems of set over universe (neither owned; both outlive the drag) go out as CSV.
    SetMimeData(const Message& message, const Universe* universe, const StarSysMask* set);

    // The table, written on the first call.
    const QByteArray& Csv() const;

    QStringList formats() const override;
    bool hasFormat(const QString& mimeType) const override;

protected:
    QVariant retrieveData(const QString& mimeType, QMetaType type) const override;

private:
    const Universe* fUniverse; // not owned
    const StarSysMask* fSet; // not owned
    mutable QByteArray fCsv;
    mutable bool fWritten = false;
};
