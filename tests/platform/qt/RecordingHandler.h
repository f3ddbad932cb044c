// A handler that keeps every message it receives, for tests.
#pragma once

#include "platform/qt/Messaging.h"

#include <QWidget>
#include <vector>

class RecordingHandler : public QWidget, public BHandler {
public:
    using QWidget::QWidget;
    void MessageReceived(Message* message) override { received.push_back(*message); }

    std::vector<Message> received;
};
