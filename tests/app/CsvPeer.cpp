// Another program for the CSV tests of the real program, standing in for a text editor or a file
// manager. "csv_peer target OUT" shows a window titled "CSV Target" that takes drops of
// text/csv or text/plain and writes what came, as text/csv to OUT and as text/plain to
// OUT.txt (each all or nothing), then says so on standard output. "csv_peer source FILE" shows
// a window titled "CSV Source" that, pressed, drags FILE as a file manager does (text/uri-list
// of a local file). Both stand at the place the last two arguments give.
#include <QApplication>
#include <QDrag>
#include <QDragEnterEvent>
#include <QDropEvent>
#include <QMimeData>
#include <QMouseEvent>
#include <QSaveFile>
#include <QUrl>
#include <QWidget>
#include <cstdio>

namespace {

bool Save(const QString& path, const QByteArray& bytes)
{
    QSaveFile file(path);
    return file.open(QIODevice::WriteOnly) && file.write(bytes) == bytes.size() && file.commit();
}

class Target : public QWidget {
public:
    explicit Target(QString out)
        : fOut(std::move(out))
    {
        setWindowTitle(QStringLiteral("CSV Target"));
        setAcceptDrops(true);
    }

protected:
    void dragEnterEvent(QDragEnterEvent* event) override
    {
        if (event->mimeData()->hasFormat(QStringLiteral("text/csv"))
            || event->mimeData()->hasText())
            event->acceptProposedAction();
    }

    void dropEvent(QDropEvent* event) override
    {
        const QMimeData* data = event->mimeData();
        // The plain text first: the CSV file's appearing is what the test waits for.
        const bool text = Save(fOut + QStringLiteral(".txt"), data->text().toUtf8());
        const bool csv = Save(fOut, data->data(QStringLiteral("text/csv")));
        event->acceptProposedAction();
        std::printf("csv_peer: dropped, %s\n", text && csv ? "saved" : "not saved");
        std::fflush(stdout);
    }

private:
    QString fOut;
};

class Source : public QWidget {
public:
    explicit Source(QString file)
        : fFile(std::move(file))
    {
        setWindowTitle(QStringLiteral("CSV Source"));
    }

protected:
    void mousePressEvent(QMouseEvent* event) override
    {
        if (event->button() != Qt::LeftButton)
            return;
        auto* drag = new QDrag(this);
        auto* data = new QMimeData;
        data->setUrls({ QUrl::fromLocalFile(fFile) });
        drag->setMimeData(data);
        const Qt::DropAction done = drag->exec(Qt::CopyAction | Qt::MoveAction, Qt::CopyAction);
        std::printf("csv_peer: drag ended, %s\n", done == Qt::CopyAction ? "copied" : "not copied");
        std::fflush(stdout);
    }

private:
    QString fFile;
};

} // namespace

int main(int argc, char** argv)
{
    QApplication application(argc, argv);
    const QStringList arguments = application.arguments();
    if (arguments.size() != 5
        || (arguments[1] != QStringLiteral("target") && arguments[1] != QStringLiteral("source"))) {
        std::fprintf(stderr, "usage: csv_peer target|source FILE X Y\n");
        return 2;
    }
    QWidget* window = arguments[1] == QStringLiteral("target")
        ? static_cast<QWidget*>(new Target(arguments[2]))
        : static_cast<QWidget*>(new Source(arguments[2]));
    window->setGeometry(arguments[3].toInt(), arguments[4].toInt(), 160, 120);
    window->show();
    const int result = application.exec();
    delete window;
    return result;
}
