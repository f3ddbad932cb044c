// The program-wide shortcuts and what each one does.
#include "controls/ProgramKeys.h"

#include "controls/ControlWindow.h"
#include "controls/HelpWindow.h"
#include "core/MessageCodes.h"

#include <QApplication>
#include <QShortcut>

namespace {

// A shortcut heard in every window of the program while parent is shown.
template <class Slot> void AddShortcut(QWidget* parent, QKeySequence keys, Slot slot)
{
    auto* shortcut = new QShortcut(keys, parent);
    shortcut->setContext(Qt::ApplicationShortcut);
    // Held down, the key opens or closes one window, not one per auto-repeat.
    shortcut->setAutoRepeat(false);
    QObject::connect(shortcut, &QShortcut::activated, parent, slot);
}

} // namespace

ProgramKeys::ProgramKeys(ControlWindow* controls)
    : QObject(controls)
    , fControls(controls)
{
    // As the "New Nightdome" button does: the control window opens the chart when it gets to
    // the message.
    AddShortcut(controls, QKeySequence(Qt::CTRL | Qt::Key_N),
        [controls] { PostMessage(controls, Message(kNewUniverseWindow)); });
    AddShortcut(controls, QKeySequence(Qt::CTRL | Qt::Key_W), [this] { CloseActiveWindow(); });
    // Closing the control window is what ends the program.
    AddShortcut(controls, QKeySequence(Qt::CTRL | Qt::Key_Q), [controls] { controls->close(); });
    AddShortcut(controls, QKeySequence(Qt::Key_F1), [this] { ShowHelp(); });
}

ProgramKeys::~ProgramKeys()
{
    delete fHelp.data();
}

void ProgramKeys::CloseActiveWindow()
{
    if (QWidget* active = QApplication::activeWindow())
        active->close();
}

void ProgramKeys::ShowHelp()
{
    if (!fHelp)
        fHelp = new HelpWindow(BPoint(430, 60));
    fHelp->show();
    fHelp->raise();
    fHelp->activateWindow();
}
