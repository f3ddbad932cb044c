// Reads a line of text of the real program's windows off the screen: the line is matched against
// this process's own rendering of each text it may show, drawn by a label of the same size and
// the same font on the windows' grey (or the toolkit's window colour).
#pragma once

#include "ChartReaders.h"

#include "widgets/WidgetGeometry.h"

#include <QLabel>
#include <QStringList>
#include <QTest>
#include <QWidget>
#include <vector>

class LabelReader {
public:
    // area: where the line stands in its window's inside; texts: everything it may show;
    // grey: whether the line stands on the windows' grey rather than the toolkit's own window
    // colour (the control window's help line does).
    LabelReader(QRect area, const QStringList& texts, bool grey = true)
        : fArea(area)
    {
        QWidget back;
        if (grey)
            PaintWindowGrey(&back);
        back.resize(area.size());
        QLabel line(&back);
        line.setGeometry(QRect(QPoint(0, 0), area.size()));
        back.ensurePolished();
        line.ensurePolished();
        for (const QString& text : texts) {
            line.setText(text);
            fLines.push_back(back.grab().toImage().convertToFormat(QImage::Format_RGB32));
        }
    }

    // Which of the texts the line of the window whose inside's top-left is at `window` shows;
    // -1 when it shows none of them.
    int Read(QPoint window) const
    {
        const QImage shown = Grab(fArea.translated(window));
        for (size_t i = 0; i < fLines.size(); i++) {
            if (fLines[i] == shown)
                return int(i);
        }
        return -1;
    }

    // How many pixels of that line are not those of text `index`.
    int Difference(QPoint window, int index) const
    {
        return DifferentPixels(Grab(fArea.translated(window)), fLines[size_t(index)]);
    }

    // The text read once the line comes to show text `expected`, or whatever it shows after
    // `timeout` (-1 for none of them).
    int WaitFor(QPoint window, int expected, int timeout = 10000) const
    {
        int read = -1;
        (void)QTest::qWaitFor([&] { return (read = Read(window)) == expected; }, timeout);
        return read;
    }

private:
    QRect fArea;
    std::vector<QImage> fLines;
};
