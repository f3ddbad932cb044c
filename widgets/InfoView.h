// The help line: shows the help text of whatever control the mouse is over, and nothing when
// it is over none.
#pragma once

#include "platform/BRect.h"
#include "platform/qt/Messaging.h"
#include "platform/qt/TransitView.h"
#include "widgets/IBroadcaster.h"

#include <QLabel>

class InfoView : public TransitView<QLabel>, public BHandler, public IBroadcaster {
public:
    // text is what the line shows before any help arrives.
    InfoView(BRect frame, const char* name, const char* text, QWidget* parent = nullptr);

    // 'Info' shows its "InfoString", 'CInf' blanks the line.
    void MessageReceived(Message* message) override;

protected:
    void MouseMoved(QPoint where, Transit transit) override;
    bool PassesTransitsOn() const override { return false; }
};
