// Finding and reading the CSV a foreign drop carries.
#include "lists/CsvDrop.h"

#include "core/MessageCodes.h"
#include "lists/SetMimeData.h"
#include "platform/qt/MessageDrag.h"
#include "platform/qt/Messaging.h"
#include "query/SystemSetCsv.h"

#include <QDropEvent>
#include <QFile>
#include <QFileInfo>
#include <QMimeData>
#include <QUrl>

namespace {

// The local files among data's URLs; empty when any is not a local file.
QStringList LocalFiles(const QMimeData* data)
{
    QStringList files;
    if (!data->hasUrls())
        return files;
    for (const QUrl& url : data->urls()) {
        if (!url.isLocalFile())
            return {};
        files << url.toLocalFile();
    }
    return files;
}

bool IsCsvText(const QByteArray& text)
{
    return SystemSetCsv::HasUsableHeader(std::string_view(text.constData(), size_t(text.size())));
}

} // namespace

bool CsvDrop::Offers(const QMimeData* data)
{
    if (!data)
        return false;
    if (!LocalFiles(data).isEmpty() || data->hasFormat(QString::fromLatin1(kCsvMimeType)))
        return true;
    return data->hasText() && IsCsvText(data->text().toUtf8());
}

bool CsvDrop::AcceptCopy(QDropEvent* event)
{
    if (!(event->possibleActions() & Qt::CopyAction)) {
        event->ignore();
        return false;
    }
    event->setDropAction(Qt::CopyAction);
    event->accept();
    return true;
}

bool CsvDrop::Take(
    const QMimeData* data, std::vector<Table>* tables, QString* errorLabel, QString* error)
{
    tables->clear();
    const QStringList files = LocalFiles(data);
    for (const QString& path : files) {
        QFile file(path);
        const QFileInfo info(path);
        // The help line names the file; its folder would crowd out the reason.
        *errorLabel = info.fileName();
        if (info.isDir()) {
            *error = QStringLiteral(": a folder, not a CSV file");
            return false;
        }
        if (!file.open(QIODevice::ReadOnly)) {
            *error = QStringLiteral(": ") + file.errorString();
            return false;
        }
        if (file.size() > kMaxFileBytes) {
            *error = QStringLiteral(": over 512 MiB, too large for a list");
            return false;
        }
        Table table { *errorLabel, file.readAll() };
        if (file.error() != QFileDevice::NoError) {
            *error = QStringLiteral(": ") + file.errorString();
            return false;
        }
        tables->push_back(std::move(table));
    }
    if (!files.isEmpty())
        return true;
    if (data->hasFormat(QString::fromLatin1(kCsvMimeType))) {
        tables->push_back({ QStringLiteral("Dropped CSV"), data->data(kCsvMimeType) });
        return true;
    }
    if (data->hasText()) {
        const QByteArray text = data->text().toUtf8();
        if (IsCsvText(text)) {
            tables->push_back({ QStringLiteral("Dropped CSV"), text });
            return true;
        }
    }
    errorLabel->clear();
    *error = QStringLiteral("the drop holds no CSV");
    return false;
}

void CsvDrop::Deliver(QDropEvent* event, QWidget* receiver, BHandler* handler)
{
    Message message;
    if (DraggedMessage(event->mimeData())) {
        if (TakeDroppedMessage(event, receiver, &message))
            handler->MessageReceived(&message);
        return;
    }
    if (!Offers(event->mimeData()) || !AcceptCopy(event)) {
        event->ignore();
        return;
    }
    Message csv(kCsvDropMessage);
    csv.AddPointer(kCsvDataField, event->mimeData());
    handler->MessageReceived(&csv);
}
