// Message posting through Qt's event queue, dispatched by one application-wide filter, and
// through the mailbox from other threads.
#include "platform/qt/Messaging.h"

#include "platform/qt/ThreadMailbox.h"

#include <QCoreApplication>
#include <QThread>
#include <QWidget>
#include <atomic>

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

// Installs the dispatcher once for the running application. The filter must live in the
// application's thread; a first post from another thread (a render thread, say) queues the
// installation there, ahead of its own message, so the message still finds the filter.
void InstallDispatcher()
{
    static std::atomic<QCoreApplication*> installedFor { nullptr };
    QCoreApplication* application = QCoreApplication::instance();
    QCoreApplication* previous = installedFor.load();
    if (!application || previous == application
        || !installedFor.compare_exchange_strong(previous, application))
        return;
    auto install = [application] {
        // Owned by the application: it lives exactly as long as the event loop it serves.
        application->installEventFilter(new MessageDispatcher(application));
    };
    if (QThread::currentThread() == application->thread())
        install();
    else
        QMetaObject::invokeMethod(application, install, Qt::QueuedConnection);
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

bool PostMessage(const QPointer<QObject>& target, const Message& message)
{
    if (target.isNull() || !QCoreApplication::instance())
        return false;
    ThreadMailbox& mailbox = ThreadMailbox::Instance();
    // On the application's thread the target cannot die before the post: post it as usual.
    if (mailbox.OnApplicationThread())
        return PostMessage(target.data(), message);
    // Elsewhere only the guard travels; it is read where handlers are deleted.
    mailbox.Post([target, message] {
        if (auto* handler = dynamic_cast<BHandler*>(target.data())) {
            Message delivered = message;
            handler->MessageReceived(&delivered);
        }
    });
    return true;
}

bool PostMessageToView(QWidget* window, const char* viewName, const Message& message)
{
    if (!window)
        return false;
    return PostMessage(window->findChild<QWidget*>(viewName), message);
}

// Rounds of Qt's posted events and the mailbox's work: enough for any chain of hand-overs
// between the two, few enough to end while charts keep handing over frames.
constexpr int kDeliveryRounds = 8;

void DeliverPostedMessages()
{
    // Everything posted, in order: a dispatcher whose installation was queued from another
    // thread must be in place before the messages behind it. Work from the mailbox may post in
    // turn, and the other way round.
    ThreadMailbox& mailbox = ThreadMailbox::Instance();
    for (int round = 0; round < kDeliveryRounds; round++) {
        QCoreApplication::sendPostedEvents();
        if (mailbox.Deliver() == 0)
            return;
    }
    QCoreApplication::sendPostedEvents();
}
