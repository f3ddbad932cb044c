// The save dialog, the all-or-nothing write and its failure message.
#include "lists/SetCsvSaver.h"

#include "lists/LongWork.h"
#include "query/SystemSetCsv.h"

#include <QDir>
#include <QFileDialog>
#include <QFileInfo>
#include <QMessageBox>
#include <QSaveFile>
#include <QStandardPaths>
#include <memory>
#include <string>

std::function<QString(QWidget*, const QString&)> SetCsvSaver::chooseFile = AskForFile;

QString SetCsvSaver::AskForFile(QWidget* parent, const QString& suggested)
{
    return QFileDialog::getSaveFileName(parent, QStringLiteral("Save Star List as CSV"), suggested,
        QStringLiteral("CSV files (*.csv);;All files (*)"));
}

std::function<void(QWidget*, const QString&)> SetCsvSaver::showError
    = [](QWidget* parent, const QString& text) {
          QMessageBox::warning(parent, QStringLiteral("Star list not saved"), text);
      };

QString SetCsvSaver::SuggestedPath()
{
    // The documents folder is named whether or not it exists; a dialog told of a folder that
    // does not exist opens in the current one instead, so it is made here when missing.
    QString folder = QStandardPaths::writableLocation(QStandardPaths::DocumentsLocation);
    if (folder.isEmpty() || !QDir().mkpath(folder))
        folder = QDir::homePath();
    return QDir(folder).filePath(QStringLiteral("stars.csv"));
}

QString SetCsvSaver::WithCsvSuffix(const QString& path)
{
    return path.endsWith(QStringLiteral(".csv"), Qt::CaseInsensitive)
        ? path
        : path + QStringLiteral(".csv");
}

bool SetCsvSaver::Write(const QString& path, const QByteArray& bytes, QString* error)
{
    QSaveFile file(path);
    if (!file.open(QIODevice::WriteOnly)) {
        *error = QStringLiteral("Could not write %1: %2").arg(path, file.errorString());
        return false;
    }
    if (file.write(bytes) != bytes.size() || !file.commit()) {
        *error = QStringLiteral("Could not write %1: %2").arg(path, file.errorString());
        file.cancelWriting();
        return false;
    }
    return true;
}

bool SetCsvSaver::Save(
    QWidget* parent, const Universe& universe, const StarSysMask& set, LongWork* work)
{
    const QString chosen = chooseFile ? chooseFile(parent, SuggestedPath()) : QString();
    if (chosen.isEmpty())
        return false;
    const QString path = WithCsvSuffix(chosen);
    // A large set takes seconds to put into words: that is done on a thread, from a copy of
    // the set, and nothing is written until it is done (a cancelled save leaves no file).
    auto copy = std::make_shared<StarSysMask>(set.GetSystemCount(), false, 0);
    *copy = set;
    auto text = std::make_shared<std::string>();
    const Universe* sky = &universe;
    auto write = [copy, text, sky] { *text = SystemSetCsv::Write(*sky, *copy); };
    if (!work)
        write();
    else if (!work->Run(QStringLiteral("Writing %1\u2026").arg(QFileInfo(path).fileName()), write))
        return false;
    QString error;
    if (Write(path, QByteArray(text->data(), qsizetype(text->size())), &error))
        return true;
    if (showError)
        showError(parent, error);
    return false;
}
