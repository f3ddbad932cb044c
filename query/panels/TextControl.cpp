// The labelled text field: its two parts and where they stand.
#include "query/panels/TextControl.h"

#include "platform/qt/MessageDrag.h"
#include "widgets/WidgetGeometry.h"

#include <QDropEvent>
#include <QLabel>
#include <QLineEdit>

TextControl::TextControl(BRect frame, const char* name, const char* label, const char* text,
    float divider, QWidget* parent)
    : QWidget(parent)
    , fLabel(new QLabel(QString::fromUtf8(label), this))
    , fField(new QLineEdit(QString::fromUtf8(text), this))
    , fDivider(int(divider))
{
    PlaceWidget(this, frame, name);
    fLabel->setBuddy(fField);
    fLabel->setVisible(fDivider > 0);
    setFocusProxy(fField);
    fField->installEventFilter(this);
    resizeEvent(nullptr);
}

bool TextControl::eventFilter(QObject* watched, QEvent* event)
{
    const QEvent::Type type = event->type();
    if (watched == fField
        && (type == QEvent::DragEnter || type == QEvent::DragMove || type == QEvent::Drop)
        && DraggedMessage(static_cast<QDropEvent*>(event)->mimeData())) {
        // Refused here, the drag goes on to the field's parents.
        event->ignore();
        return true;
    }
    return QWidget::eventFilter(watched, event);
}

const char* TextControl::Text() const
{
    fText = fField->text().toUtf8();
    return fText.constData();
}

void TextControl::SetText(const char* text)
{
    fField->setText(QString::fromUtf8(text));
}

QSize TextControl::sizeHint() const
{
    return QSize(width(), fField->sizeHint().height());
}

void TextControl::resizeEvent(QResizeEvent*)
{
    // A labelled field keeps two pixels from its label, which fills its part of a narrow row.
    const int gap = fDivider > 0 ? 2 : 0;
    fLabel->setGeometry(0, 0, fDivider, height());
    fField->setGeometry(fDivider + gap, 0, width() - fDivider - gap, height());
}
