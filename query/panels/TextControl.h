// A labelled text field: the label in the first `divider` pixels, the field in the rest. The
// widget carries the field's name; the text is read as it stands, with no message when it
// changes.
#pragma once

#include "platform/BRect.h"

#include <QWidget>

class QLabel;
class QLineEdit;

class TextControl : public QWidget {
public:
    TextControl(BRect frame, const char* name, const char* label, const char* text, float divider,
        QWidget* parent);

    // The text as UTF-8, valid until the text changes or Text is called again.
    const char* Text() const;
    void SetText(const char* text);

    QLineEdit* TextView() const { return fField; }
    // As high as the field wants to be.
    QSize sizeHint() const override;
    QLabel* Label() const { return fLabel; }

protected:
    void resizeEvent(QResizeEvent* event) override;
    // Keeps the field out of drags of this program's sets and systems: a list's drag also
    // offers its table as text, for other programs, which is no text for the field.
    bool eventFilter(QObject* watched, QEvent* event) override;

private:
    QLabel* fLabel; // a child; hidden when the divider is 0
    QLineEdit* fField; // a child
    int fDivider; // pixels
    mutable QByteArray fText;
};
