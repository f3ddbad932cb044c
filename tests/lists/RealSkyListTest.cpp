// A list window over the real sky: the systems within 5 parsecs, found by the distance panel
// and dropped on "Equals", listed by name.
#include "core/MessageCodes.h"
#include "lists/DropPad.h"
#include "lists/ListWindow.h"
#include "lists/StarDragger.h"
#include "lists/StarListView.h"
#include "platform/qt/MessageDrag.h"
#include "platform/qt/RecordingHandler.h"
#include "query/panels/DistQueryView.h"
#include "query/panels/PopUpMenuButton.h"
#include "query/panels/QueryDragger.h"
#include "query/panels/TextControl.h"
#include "resources/ResourceData.h"
#include "widgets/InfoView.h"
#include "widgets/WidgetEvents.h"

#include <QCoreApplication>
#include <QDragEnterEvent>
#include <QDropEvent>
#include <QFontMetrics>
#include <QMenu>
#include <QTest>
#include <cstdlib>
#include <filesystem>
#include <gtest/gtest.h>
#include <memory>
#include <optional>
#include <string>

TEST(RealSkyList, TheSystemsWithinFiveParsecsListedByName)
{
    const std::string file = std::string(ND_APP_DIR) + "/stars.dat";
    ASSERT_TRUE(std::filesystem::exists(file)) << "run scripts/setup, then build";
    InitResources();
    Universe sky(file.c_str(), 1000000, 5000);
    RecordingHandler help;

    DistQueryView panel(BRect(10, 10, 370, 60), "Dist Query", &sky, nullptr);
    panel.modeMenu->Menu()->actions()[kQueryLessThan]->trigger();
    panel.distance->SetText("5");
    // What pressing the panel's handle drags.
    ASSERT_GT(panel.PerformQuery(), 0);
    const std::unique_ptr<Message> dragged(panel.GetDragMessage());

    ListWindow list(BPoint(140, 140), 230, 340, "Star List", &help, &sky);
    MessageMimeData data(*dragged);
    QDragEnterEvent enter(QPoint(16, 16), Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(list.Pad("Equals"), &enter);
    ASSERT_TRUE(enter.isAccepted());
    QDropEvent drop(QPointF(16, 16), Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(list.Pad("Equals"), &drop);

    int32_t within = 0;
    for (int32_t i = 0; i < sky.CountItems(); i++)
        within += sky.SystemAt(i)->position.Magnitude() < 5.0;
    EXPECT_EQ(list.Count(), within);
    EXPECT_EQ(list.countView->text(), QString("Star Systems: %1").arg(within));
    QStringList names;
    for (int row = 0; row < list.listView->model()->rowCount(); row++)
        names << list.listView->model()->index(row, 0).data().toString();
    EXPECT_EQ(names.size(), within);
    EXPECT_EQ(names.front(), "The Sun");
    EXPECT_TRUE(names.contains("Sirius"));
    EXPECT_TRUE(names.contains("Proxima Centauri"));
    EXPECT_TRUE(names.contains("Barnard's Star"));

    if (const char* shots = std::getenv("ND_SCREENSHOTS"))
        list.grab().save(QString(shots) + "/list-window.png");
}

TEST(RealSkyList, TheWholeSkyCountedInSixDigits)
{
    const std::string file = std::string(ND_APP_DIR) + "/stars.dat";
    ASSERT_TRUE(std::filesystem::exists(file)) << "run scripts/setup, then build";
    InitResources();
    Universe sky(file.c_str(), 1000000, 5000);
    ASSERT_GE(sky.CountItems(), 100000) << "the catalogue has fewer than six digits of systems";
    RecordingHandler help;
    ListWindow list(BPoint(140, 140), 230, 340, "Star List", &help, &sky);
    // The empty list's own handle dropped on its NOT pad: every system of the sky.
    std::optional<CaughtDrag> caught;
    list.starDragger->SetDragStarter(CatchDrag(caught));
    QTest::mousePress(list.starDragger, Qt::LeftButton, Qt::NoModifier, QPoint(5, 5));
    ASSERT_TRUE(caught.has_value());
    MessageMimeData data(caught->message);
    QDragEnterEvent enter(QPoint(16, 8), Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(list.Pad("NOT"), &enter);
    ASSERT_TRUE(enter.isAccepted());
    QDropEvent drop(QPointF(16, 8), Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(list.Pad("NOT"), &drop);
    EXPECT_EQ(list.Count(), sky.CountItems());
    EXPECT_EQ(list.countView->text(), QString("Star Systems: %1").arg(sky.CountItems()));
    const QFontMetrics metrics(list.countView->font());
    EXPECT_LE(metrics.horizontalAdvance(list.countView->text()), list.countView->width());
    EXPECT_EQ(list.listView->model()->rowCount(), sky.CountItems());

    if (const char* shots = std::getenv("ND_SCREENSHOTS")) {
        ASSERT_TRUE(QTest::qWaitForWindowExposed(&list));
        list.grab().save(QString(shots) + "/list-count.png");
    }
}
