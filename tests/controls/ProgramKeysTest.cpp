// The keys of every window: Ctrl+N, Ctrl+W, Ctrl+Q and F1 from the program's windows, and text
// fields that still type everything they did.
#include "ControlsOnTwoStars.h"

#include "chart/UniverseView.h"
#include "chart/UniverseWindow.h"
#include "controls/HelpWindow.h"
#include "hrd/HRDWindow.h"
#include "info/StarInfoWindow.h"
#include "lists/ListWindow.h"
#include "query/panels/FindWindow.h"
#include "query/panels/TextControl.h"

#include <QApplication>
#include <QLabel>
#include <QLineEdit>
#include <QPointer>
#include <QTest>
#include <cstdlib>
#include <gtest/gtest.h>

namespace {

class ProgramKeysTest : public ::testing::Test, protected ControlsOnTwoStars {
protected:
    void TearDown() override
    {
        QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    }

    // Makes window the active one and types keys on it, as the window system hands them over.
    static void Type(QWidget* window, Qt::Key key, Qt::KeyboardModifiers modifiers)
    {
        window->activateWindow();
        ASSERT_TRUE(QTest::qWaitForWindowActive(window));
        QTest::keyClick(window->windowHandle(), key, modifiers);
        DeliverPostedMessages();
    }

    // The shown windows titled "Nightdome Help".
    static QList<QWidget*> HelpWindows()
    {
        QList<QWidget*> shown;
        for (QWidget* window : QApplication::topLevelWidgets()) {
            if (window->isVisible() && window->windowTitle() == "Nightdome Help")
                shown.append(window);
        }
        return shown;
    }

    qsizetype Charts() const { return controls.UniverseWindows().size(); }
};

} // namespace

TEST_F(ProgramKeysTest, CtrlNOpensAChartFromEveryKindOfWindow)
{
    auto* list = Open<ListWindow>("New List Window Button");
    auto* diagram = Open<HRDWindow>("Show H-R Window Button");
    auto* info = Open<StarInfoWindow>("Show Info Window Button");
    ASSERT_TRUE(list && diagram && info);
    QWidget* chart = controls.UniverseWindows()[0];
    qsizetype expected = Charts();
    for (QWidget* window : { static_cast<QWidget*>(list), static_cast<QWidget*>(diagram),
             static_cast<QWidget*>(info), chart, static_cast<QWidget*>(&controls) }) {
        Type(window, Qt::Key_N, Qt::ControlModifier);
        EXPECT_EQ(Charts(), ++expected) << window->windowTitle().toStdString();
    }
    // The new charts are charts of the program: each is in the list and drawn.
    UniverseView* newest = controls.UniverseWindows().back()->View();
    EXPECT_TRUE(QTest::qWaitFor([&] { return newest->FramesRendered() >= 2; }, 5000));
}

TEST_F(ProgramKeysTest, CtrlWClosesExactlyTheActiveWindow)
{
    QPointer<ListWindow> list = Open<ListWindow>("New List Window Button");
    QPointer<HRDWindow> diagram = Open<HRDWindow>("Show H-R Window Button");
    ASSERT_TRUE(list && diagram);
    Type(&controls, Qt::Key_N, Qt::ControlModifier);
    ASSERT_EQ(Charts(), 2);
    QPointer<UniverseWindow> first = controls.UniverseWindows()[0].data();
    QPointer<UniverseWindow> second = controls.UniverseWindows()[1].data();

    Type(diagram, Qt::Key_W, Qt::ControlModifier);
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    EXPECT_TRUE(diagram.isNull());
    EXPECT_FALSE(list.isNull());
    EXPECT_EQ(Charts(), 2);

    Type(first, Qt::Key_W, Qt::ControlModifier);
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    EXPECT_TRUE(first.isNull());
    ASSERT_EQ(Charts(), 1);
    EXPECT_EQ(controls.UniverseWindows()[0], second);
    EXPECT_FALSE(list.isNull());
    EXPECT_TRUE(list->isVisible());
    EXPECT_TRUE(second->isVisible());
    EXPECT_TRUE(controls.isVisible());

    // The control window's own Ctrl+W closes it, which is how the program ends.
    Type(&controls, Qt::Key_W, Qt::ControlModifier);
    EXPECT_FALSE(controls.isVisible());
    EXPECT_FALSE(list.isNull());
}

TEST_F(ProgramKeysTest, CtrlQClosesTheControlWindowFromAnyWindow)
{
    QPointer<ListWindow> list = Open<ListWindow>("New List Window Button");
    ASSERT_TRUE(list);
    Type(list, Qt::Key_Q, Qt::ControlModifier);
    EXPECT_FALSE(controls.isVisible());
}

TEST_F(ProgramKeysTest, F1OpensOneHelpWindowAndRaisesIt)
{
    ASSERT_TRUE(HelpWindows().isEmpty());
    Type(controls.UniverseWindows()[0], Qt::Key_F1, Qt::NoModifier);
    ASSERT_EQ(HelpWindows().size(), 1);
    QPointer<QWidget> help = HelpWindows()[0];
    EXPECT_TRUE(dynamic_cast<HelpWindow*>(help.data()));
    ASSERT_TRUE(QTest::qWaitForWindowActive(help));

    // Again, from another window: still the one window, brought back to the front.
    Type(&controls, Qt::Key_F1, Qt::NoModifier);
    ASSERT_EQ(HelpWindows().size(), 1);
    EXPECT_EQ(HelpWindows()[0], help);
    EXPECT_TRUE(QTest::qWaitForWindowActive(help));

    // It names every key and every window's mouse gestures.
    auto* page = help->findChild<QLabel*>("Help Text");
    ASSERT_NE(page, nullptr);
    const QString text = page->text();
    for (const char* word :
        { "Trackball", "Camera distance", "Sliders", "Chart: click", "Chart: drag", "Chart: drop",
            "Ctrl held", "Find", "Star list", "H-R diagram", "Star info", "&larr;", "&uarr;",
            "wheel", "Space, Esc", "Home", "Ctrl+N", "Ctrl+W", "Ctrl+Q", "Ctrl+S", "F1" })
        EXPECT_TRUE(text.contains(word)) << word;

    // A picture of it for the documentation, when ND_SCREENSHOTS names a folder.
    if (const char* shots = std::getenv("ND_SCREENSHOTS")) {
        EXPECT_TRUE(help->grab().save(QString(shots) + "/help-window.png"));
    }

    // Ctrl+W closes it like any other window; F1 opens a new one.
    Type(help, Qt::Key_W, Qt::ControlModifier);
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    EXPECT_TRUE(help.isNull());
    EXPECT_TRUE(HelpWindows().isEmpty());
    Type(&controls, Qt::Key_F1, Qt::NoModifier);
    EXPECT_EQ(HelpWindows().size(), 1);
}

TEST_F(ProgramKeysTest, TheFindWindowsFieldsStillTypeLettersSpacesAndArrows)
{
    auto* find = Open<FindWindow>("Show Find Window Button");
    ASSERT_NE(find, nullptr);
    auto* name = find->findChild<TextControl*>("Star Name");
    ASSERT_NE(name, nullptr);
    QLineEdit* field = name->TextView();
    UniverseView* chart = controls.UniverseWindows()[0]->View();
    const double spin = chart->GetRadialVelocityY()->load();

    find->activateWindow();
    ASSERT_TRUE(QTest::qWaitForWindowActive(find));
    field->setFocus();
    ASSERT_TRUE(field->hasFocus());
    field->clear();
    QTest::keyClicks(field, "ab c");
    QTest::keyClick(field, Qt::Key_Left);
    QTest::keyClick(field, Qt::Key_Left);
    QTest::keyClicks(field, "x");
    QTest::keyClick(field, Qt::Key_Home);
    QTest::keyClicks(field, "y");
    QTest::keyClick(field, Qt::Key_End);
    QTest::keyClick(field, Qt::Key_Plus);
    QTest::keyClick(field, Qt::Key_Minus);
    QTest::keyClick(field, Qt::Key_Space);
    EXPECT_EQ(field->text(), "yabx c+- ");
    // None of it reached the chart: its steady turn is as it was.
    EXPECT_EQ(chart->GetRadialVelocityY()->load(), spin);

    // The program's keys still work from the field, and leave its text alone.
    const qsizetype charts = Charts();
    QTest::keyClick(field, Qt::Key_N, Qt::ControlModifier);
    DeliverPostedMessages();
    EXPECT_EQ(Charts(), charts + 1);
    EXPECT_EQ(field->text(), "yabx c+- ");
}
