// Fitting a report to the help line and holding it there.
#include "lists/HelpLineReport.h"

#include "core/MessageCodes.h"
#include "platform/qt/Messaging.h"
#include "widgets/IBroadcaster.h"

#include <QFontMetrics>
#include <QLabel>
#include <QLocale>
#include <QStringList>

HelpLineReport::HelpLineReport(QObject* line)
    : fLine(line)
{
}

void HelpLineReport::Show(const QString& label, const QString& rest, const QString& lines,
    std::vector<IBroadcaster*> quiet)
{
    QString text = label + rest + lines;
    if (auto* line = qobject_cast<const QLabel*>(fLine.data())) {
        const QFontMetrics metrics(line->font());
        const int room = line->width();
        const int fixed = metrics.horizontalAdvance(rest);
        if (metrics.horizontalAdvance(text) > room) {
            if (metrics.horizontalAdvance(label) + fixed <= room)
                text = label + rest
                    + metrics.elidedText(
                        lines, Qt::ElideRight, room - metrics.horizontalAdvance(label) - fixed);
            else if (fixed < room)
                text = metrics.elidedText(label, Qt::ElideMiddle, room - fixed) + rest;
            else
                text = metrics.elidedText(label + rest, Qt::ElideRight, room);
        }
    }
    fText = text;
    Message info(kInfoMessage);
    info.AddString(kInfoStringField, text.toUtf8().constData());
    PostMessage(fLine, info);
    // Widgets without a target post nothing; they get the line back in Release.
    for (IBroadcaster* widget : quiet)
        widget->ISetTarget(nullptr);
    fQuiet.insert(fQuiet.end(), quiet.begin(), quiet.end());
}

void HelpLineReport::ShowRead(
    const QString& label, const SystemSetCsvResult& total, std::vector<IBroadcaster*> quiet)
{
    const size_t unmatched = total.unmatchedLines.size();
    if (unmatched == 0) {
        Show(label, QString::fromStdString(SystemSetCsv::Describe(total, "")), QString(),
            std::move(quiet));
        return;
    }
    // The rows that named no system say most; the line has room for a few of their lines.
    constexpr size_t kShown = 5;
    const QLocale english(QLocale::English);
    QString rest = QStringLiteral(": %1 %2").arg(english.toString(total.systems),
        total.systems == 1 ? QStringLiteral("system") : QStringLiteral("systems"));
    QStringList numbers;
    for (size_t i = 0; i < unmatched && i < kShown; i++)
        numbers << QString::number(total.unmatchedLines[i]);
    QString lines;
    if (unmatched <= kShown) {
        rest += unmatched == 1 ? QStringLiteral("; no match on line ")
                               : QStringLiteral("; no match on lines ");
        lines = numbers.join(QStringLiteral(", "));
    } else {
        rest += QStringLiteral("; %1 rows unmatched").arg(english.toString(qulonglong(unmatched)));
        lines = QStringLiteral(" (") + numbers.join(QStringLiteral(", "))
            + QStringLiteral(", \u2026)");
    }
    Show(label, rest, lines, std::move(quiet));
}

void HelpLineReport::Release()
{
    if (fQuiet.empty())
        return;
    for (IBroadcaster* widget : fQuiet)
        widget->ISetTarget(fLine);
    fQuiet.clear();
    PostMessage(fLine, Message(kClearInfoMessage));
}
