// What a control sends when it is used: its message (owned), posted to its target.
#pragma once

#include "platform/Message.h"

#include <QPointer>
#include <memory>

class Invoker {
public:
    // Takes ownership of message (may be null: the control then sends nothing).
    explicit Invoker(Message* message)
        : fMessage(message)
    {
    }
    virtual ~Invoker() = default;

    void SetMessage(Message* message) { fMessage.reset(message); }
    Message* GetMessage() const { return fMessage.get(); }
    // target must be a handler (a QObject that is also a BHandler).
    void SetTarget(QObject* target) { fTarget = target; }
    QObject* Target() const { return fTarget; }

    // Posts a copy of the message to the target; false when there is no message or target.
    bool Invoke();

private:
    std::unique_ptr<Message> fMessage;
    QPointer<QObject> fTarget;
};
