// What a CSV drop did, told on the help line: worded to fit the line, and kept there while the
// pointer stays over the window it was dropped on, whose widgets' help would otherwise replace
// it at once (the pointer is still over the pad the file was dropped on).
#pragma once

#include "query/SystemSetCsv.h"

#include <QPointer>
#include <QString>
#include <vector>

class IBroadcaster;
class QObject;

class HelpLineReport {
public:
    // line: the help line (normally an InfoView), not owned.
    explicit HelpLineReport(QObject* line);

    // Shows label + rest + lines, shortened to fit the line when it is a label (the line
    // numbers first, then the middle of label, then the end), and keeps quiet's help off the
    // line until Release.
    void Show(const QString& label, const QString& rest, const QString& lines,
        std::vector<IBroadcaster*> quiet);
    // What reading found: "label: n systems from m rows", or how many rows matched nothing
    // and the lines of the first few.
    void ShowRead(
        const QString& label, const SystemSetCsvResult& total, std::vector<IBroadcaster*> quiet);
    // The pointer has left the window: its widgets' help comes back and the line is cleared.
    void Release();

    // The text last shown.
    const QString& Text() const { return fText; }

private:
    QPointer<QObject> fLine;
    QString fText;
    std::vector<IBroadcaster*> fQuiet; // widgets kept off the line; not owned
};
