// A drop pad of the list window: a picture that lights up while something is over it and
// stamps what is dropped on it with its tag, the set operation it stands for, before handing
// it to its window. It takes this program's sets and systems, and CSV tables from others.
#pragma once

#include "platform/BPoint.h"
#include "platform/qt/Messaging.h"
#include "platform/qt/TransitView.h"
#include "render/RBitmap8.h"
#include "widgets/IBroadcaster.h"

#include <QWidget>
#include <memory>

class DropPad : public TransitView<QWidget>, public BHandler, public IBroadcaster {
public:
    // width x height at where, its two pictures (normal, then highlighted) from 'Dzon'
    // pictureId. Drops go on to handler (the list window).
    DropPad(BPoint where, float width, float height, const char* name, int32_t pictureId,
        BHandler* handler, QWidget* parent);
    ~DropPad() override;

    // Dropped messages get the 32-bit field name = value.
    void SetTag(const char* name, int32_t value);
    const char* TagName() const { return tagName; }
    int32_t TagValue() const { return tagValue; }

    // Adds the tag, then hands the message to the window.
    void MessageReceived(Message* message) override;

    bool IsHighlighted() const { return fHighlighted; }
    const RBitmap8* NormalImage() const { return normalImage.get(); }
    const RBitmap8* HighlightImage() const { return highlightImage.get(); }

protected:
    void MouseMoved(QPoint where, Transit transit) override;
    bool PassesTransitsOn() const override { return false; }
    void paintEvent(QPaintEvent* event) override;
    void dragEnterEvent(QDragEnterEvent* event) override;
    void dragMoveEvent(QDragMoveEvent* event) override;
    void dragLeaveEvent(QDragLeaveEvent* event) override;
    void dropEvent(QDropEvent* event) override;

private:
    void Highlight(bool on);

    std::unique_ptr<RBitmap8> normalImage;
    std::unique_ptr<RBitmap8> highlightImage;
    char* tagName; // owned, from malloc; null for none
    int32_t tagValue;
    BHandler* fHandler; // not owned
    bool fHighlighted = false;
    bool fCsvDrag = false; // the drag over the pad offers CSV (so it is taken as a copy)
};
