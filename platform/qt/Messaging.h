// Posting messages between windows. A handler is any QObject that also derives from BHandler;
// a posted message is delivered later, by the event loop, to its MessageReceived.
#pragma once

#include "platform/Message.h"

#include <QEvent>
#include <QObject>
#include <QPointer>

class QWidget;

class BHandler {
public:
    virtual ~BHandler() = default;
    // Handles one message; the message is owned by the caller and lives for the call only.
    virtual void MessageReceived(Message* message) = 0;
};

// The event that carries a posted message to its handler.
class MessageEvent : public QEvent {
public:
    explicit MessageEvent(const Message& message);
    static QEvent::Type EventType();

    Message message;
};

// Posts a copy of message to target. Returns false, posting nothing, when target is null.
// A handler deleted before the event loop gets to the message never receives it. Only for the
// application's own thread, where handlers are deleted: anywhere else the pointer may die
// between the caller's check and the post.
bool PostMessage(QObject* target, const Message& message);

// The same from any thread (the render threads broadcast this way). Off the application's
// thread the message goes through the mailbox with its own guarded copy of target, which is
// looked at only on the application's thread, when the message is delivered: a handler
// deleted meanwhile is skipped instead of written to. False when target is already gone or
// there is no application.
bool PostMessage(const QPointer<QObject>& target, const Message& message);

// Posts to the view of window whose object name is viewName; false when there is none.
bool PostMessageToView(QWidget* window, const char* viewName, const Message& message);

// Delivers what is posted to this thread's objects, messages included, until nothing is
// pending: for tests and for code that must see its posted messages handled before it goes on.
// While charts run, their frames keep coming; it then stops after a bounded number of rounds,
// each of which delivers everything that was waiting when it began.
void DeliverPostedMessages();
