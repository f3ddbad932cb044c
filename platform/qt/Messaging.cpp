// Message posting through Qt's event queue, dispatched by one application-wide filter.
#include "platform/qt/Messaging.h"

#include <QCoreApplication>
#include <QWidget>

namespace {

// Sees every event of the application and hands message events to their handler. One filter
// on the application object instead of an event() override in every handler class.
class MessageDispatcher : public QObject {
public:
    explicit MessageDispatcher(QObject* parent)
        : QObject(parent)
    {
    }

    bool eventFilter(QObject* watched, QEvent* event) override
    {
        if (event->type() != MessageEvent::EventType())
            return false;
        if (auto* handler = dynamic_cast<BHandler*>(watched))
            handler->MessageReceived(&static_cast<MessageEvent*>(event)->message);
        return true;
    }
};

void InstallDispatcher()
{
    QCoreApplication* application = QCoreApplication::instance();
    if (!application || application->property("nightdomeMessageDispatch").toBool())
        return;
    // Owned by the application: it lives exactly as long as the event loop it serves.
    application->installEventFilter(new MessageDispatcher(application));
    application->setProperty("nightdomeMessageDispatch", true);
}

} // namespace

MessageEvent::MessageEvent(const Message& message)
    : QEvent(EventType())
    , message(message)
{
}

QEvent::Type MessageEvent::EventType()
{
    static const auto type = static_cast<QEvent::Type>(QEvent::registerEventType());
    return type;
}

bool PostMessage(QObject* target, const Message& message)
{
    if (!target || !QCoreApplication::instance())
        return false;
    InstallDispatcher();
    QCoreApplication::postEvent(target, new MessageEvent(message));
    return true;
}

bool PostMessageToView(QWidget* window, const char* viewName, const Message& message)
{
    if (!window)
        return false;
    return PostMessage(window->findChild<QWidget*>(viewName), message);
}

void DeliverPostedMessages()
{
    QCoreApplication::sendPostedEvents(nullptr, MessageEvent::EventType());
}
