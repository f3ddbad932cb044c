// Push buttons and check boxes that explain themselves in the help line.
#pragma once

#include "platform/BRect.h"
#include "platform/qt/TransitView.h"
#include "widgets/IBroadcaster.h"
#include "widgets/Invoker.h"

#include <QCheckBox>
#include <QPushButton>

class IButton : public TransitView<QPushButton>, public IBroadcaster, public Invoker {
public:
    // Sends message (owned) to its target when clicked.
    IButton(BRect frame, const char* name, const char* label, Message* message,
        QWidget* parent = nullptr);

protected:
    void MouseMoved(QPoint where, Transit transit) override;
};

class ICheckBox : public TransitView<QCheckBox>, public IBroadcaster, public Invoker {
public:
    // Sends message (owned) to its target whenever it is toggled.
    ICheckBox(BRect frame, const char* name, const char* label, Message* message,
        QWidget* parent = nullptr);

protected:
    void MouseMoved(QPoint where, Transit transit) override;
};
