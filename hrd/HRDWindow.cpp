// The H-R diagram window's layout, and its subscription to a chart's selection.
#include "hrd/HRDWindow.h"

#include "core/MessageCodes.h"
#include "hrd/HRDView.h"
#include "platform/qt/Messaging.h"
#include "widgets/IPictureButton.h"
#include "widgets/InfoView.h"
#include "widgets/WidgetGeometry.h"

#include <QPointer>

namespace {

constexpr int kWidth = 300, kHeight = 308; // the diagram and the 12-pixel strip below it
constexpr int32_t kClearButtonId = 4; // 'IPCL': the 12 x 12 clear button

} // namespace

HRDWindow::HRDWindow(BPoint where, const char* title, QObject* infoTarget)
{
    setAttribute(Qt::WA_DeleteOnClose);
    setWindowTitle(QString::fromUtf8(title));
    // Flags first: changing them later would place the window anew.
    setWindowFlag(Qt::WindowMaximizeButtonHint, false);
    setGeometry(int(where.x), int(where.y), kWidth, kHeight);
    setFixedSize(kWidth, kHeight);

    auto* mainView = new QWidget(this);
    mainView->setObjectName("mainview");
    PaintWindowGrey(mainView);
    mainView->setGeometry(rect());
    const float right = kWidth - 1, bottom = kHeight - 1;

    fPlotName = new InfoView(BRect(0, bottom - 11, right - 12, bottom), "Plot Name", "", mainView);
    fPlotName->ISetTarget(infoTarget);
    fPlotName->ISetInfo("Plot name");

    fView = new HRDView(BPoint(0, 0), "HRView", mainView);
    fView->ISetTarget(infoTarget);
    fView->SetPlotNameTarget(fPlotName);

    fClearButton = new IPictureButton(BRect(right - 11, bottom - 11, right, bottom), "Clear Button",
        "", kClearButtonId, new Message(kHRDClear), mainView);
    fClearButton->SetTarget(fView);
    fClearButton->ISetTarget(infoTarget);
    fClearButton->ISetInfo("Clear H-R Diagram");
    show();
}

void HRDWindow::FollowSelection(QObject* chartView)
{
    // The subscription names the diagram by pointer. It waits in the chart's queue, and this
    // window may close meanwhile: only a guard travels, and the pointer is written into the
    // message when it is delivered, if the diagram is still there.
    if (!chartView)
        return;
    QMetaObject::invokeMethod(
        chartView,
        [chart = QPointer<QObject>(chartView), view = QPointer<HRDView>(fView)] {
            auto* handler = dynamic_cast<BHandler*>(chart.data());
            if (!handler || !view)
                return;
            Message subscribe(kStarInfoSubscribe);
            subscribe.AddPointer(kSIHandlerPtrString, static_cast<QObject*>(view.data()));
            subscribe.AddInt32(kSIFlagsString, kSISelectionChanged | kSIWithSelection);
            handler->MessageReceived(&subscribe);
        },
        Qt::QueuedConnection);
}
