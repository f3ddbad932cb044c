// The keys that work in every window of the program: Ctrl+N opens a chart, Ctrl+W closes the
// active window, Ctrl+Q ends the program, F1 shows the help window. Application-wide shortcuts
// owned by the control window, so that no other window needs to know about them; none of them
// is a key a text field types or edits with.
#pragma once

#include "controls/HelpWindow.h"

#include <QObject>
#include <QPointer>

class ControlWindow;

class ProgramKeys : public QObject {
public:
    // The shortcuts live while controls does; controls must be a visible window for them to work.
    explicit ProgramKeys(ControlWindow* controls);
    // Closes the help window if it is open.
    ~ProgramKeys() override;

    // The help window, or null while it is not open.
    HelpWindow* Help() const { return fHelp; }
    // Opens the help window, or raises it when it is open already.
    void ShowHelp();

private:
    void CloseActiveWindow();

    ControlWindow* fControls; // the parent
    QPointer<HelpWindow> fHelp; // deletes itself when closed
};
