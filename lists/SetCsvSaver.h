// Saving a list's systems as a CSV file: asking where (a native save dialog, the documents
// folder and "stars.csv" offered), writing all or nothing, and saying why when it fails. The
// dialog and the message box can be swapped for tests, which must not open windows that wait.
#pragma once

#include "catalog/Universe.h"
#include "query/StarSysMask.h"

#include <QString>
#include <functional>

class LongWork;
class QWidget;

class SetCsvSaver {
public:
    // Asks for the file, offered suggested; an empty answer cancels. By default a native save
    // dialog over parent.
    static std::function<QString(QWidget* parent, const QString& suggested)> chooseFile;
    // The default: a save dialog over parent, standing in suggested's folder with its file
    // name filled in.
    static QString AskForFile(QWidget* parent, const QString& suggested);
    // Tells of a failure; by default a warning box over parent.
    static std::function<void(QWidget* parent, const QString& text)> showError;

    // Asks where, then writes set (of universe) there; ".csv" is added to a name without it.
    // The table is made under work (a progress dialog and Cancel once it takes a while) when
    // given. False when cancelled or when writing failed (after saying why).
    static bool Save(QWidget* parent, const Universe& universe, const StarSysMask& set,
        LongWork* work = nullptr);

    // Writes bytes to path through a temporary file that replaces it only once complete.
    // False, with error naming the file and the reason, when that fails.
    static bool Write(const QString& path, const QByteArray& bytes, QString* error);

    // path with ".csv" appended unless it ends in it (in any case).
    static QString WithCsvSuffix(const QString& path);
    // "stars.csv" in the user's documents folder (home when there is none).
    static QString SuggestedPath();
};
