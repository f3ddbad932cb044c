// Star sets that come in from other programs: CSV files dropped from a file manager (local file
// URLs) and CSV text (text/csv, or plain text that starts with a usable header). Reading them
// into a set is the list window's business; this finds the CSV a drop carries.
#pragma once

#include <QByteArray>
#include <QString>
#include <cstdint>
#include <vector>

class BHandler;
class QDropEvent;
class QMimeData;
class QWidget;

class CsvDrop {
public:
    // A file larger than this is refused before it is read.
    static constexpr qint64 kMaxFileBytes = qint64(512) << 20;

    struct Table {
        QString label; // the file's name, or "Dropped CSV", as the help line calls it
        QByteArray text;
    };

    // Whether data (anything but one of this program's messages) offers CSV: one or more
    // local files, text/csv, or text/plain that starts with a header naming a name column or
    // x, y, z.
    static bool Offers(const QMimeData* data);

    // Accepts the drag or the drop as a copy, whatever it proposes, so a file dragged from a
    // file manager is never moved away; false, refusing it, when copying is not offered.
    static bool AcceptCopy(QDropEvent* event);

    // The tables data carries: every local file read whole, else the CSV text. False when a
    // file cannot be read, with errorLabel the file's name and error the reason, which
    // follows the name on the help line (": No such file or directory").
    static bool Take(
        const QMimeData* data, std::vector<Table>* tables, QString* errorLabel, QString* error);

    // Hands a drop on receiver to handler: one of this program's messages as the message
    // marked dropped, CSV as a kCsvDropMessage (handled before this returns, while the drop's
    // data lasts). Anything else is refused.
    static void Deliver(QDropEvent* event, QWidget* receiver, BHandler* handler);
};
