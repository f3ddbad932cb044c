// A window holding one star map: the chart, a one-line strip under it for the data line and a
// 12 x 12 toggle for the clipping overlay in the corner. It pauses the chart while it cannot be
// seen and tells the controlling window when it becomes active or closes.
#pragma once

#include "catalog/Universe.h"
#include "platform/BPoint.h"
#include "platform/qt/Messaging.h"

#include <QPointer>
#include <QWidget>

class InfoView;
class IToggleButton;
class UniverseView;

class UniverseWindow : public QWidget, public BHandler {
public:
    // controller is the handler (a BHandler widget) that gets the help texts; its window hears
    // 'UwAc' and 'UwQm' from this one. The window shows itself.
    UniverseWindow(BPoint where, float width, float height, const char* title, QObject* controller,
        Universe* universe);
    ~UniverseWindow() override;

    UniverseView* View() const { return view; }
    void MessageReceived(Message* message) override;

    // The chart's render threads: the count set last, else the processor count, at most 8.
    static int32_t RenderThreadCount();
    // Charts opened from now on render on count threads (1 to 8); 0 goes back to the processor
    // count. Called from the GUI thread only.
    static void SetRenderThreadCount(int32_t count);

protected:
    void showEvent(QShowEvent* event) override;
    void hideEvent(QHideEvent* event) override;
    void changeEvent(QEvent* event) override;
    void closeEvent(QCloseEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;

private:
    UniverseView* view; // a child
    QPointer<QObject> controlLooper; // the controller's window; not owned
    QWidget* mainView; // the grey background, a child
    InfoView* systemName; // the strip, a child
    IToggleButton* toggle; // a child
};
