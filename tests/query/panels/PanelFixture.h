// What the query panel tests share: a small universe built in code, the resources the panels'
// pictures come from, and a panel's handle pressed with what it would drag caught.
#pragma once

#include "query/UniverseBuilder.h"

#include "core/MessageCodes.h"
#include "platform/Message.h"
#include "query/panels/QueryDragger.h"
#include "query/panels/StarQueryView.h"
#include "render/RBitmap8.h"
#include "resources/ResourceData.h"
#include "widgets/WidgetEvents.h"

#include <QCoreApplication>
#include <QMouseEvent>
#include <cstring>
#include <gtest/gtest.h>
#include <memory>
#include <optional>

// Presses the handle of panel with the left button, catching the drag it would start.
inline std::optional<CaughtDrag> PressHandle(StarQueryView* panel)
{
    std::optional<CaughtDrag> caught;
    QueryDragger* handle = panel->Dragger();
    handle->SetDragStarter(CatchDrag(caught));
    QMouseEvent press(QEvent::MouseButtonPress, QPointF(5, 5), handle->mapToGlobal(QPointF(5, 5)),
        Qt::LeftButton, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(handle, &press);
    return caught;
}

// A universe of a few systems: the Sun, two single stars and a pair, a nameless system.
class PanelTest : public ::testing::Test {
protected:
    static void SetUpTestSuite() { InitResources(); }

    void SetUp() override
    {
        sun = AddTestSystem(universe, 0, 0, 0, { { "The Sun", "G2V", 4.83 } });
        sirius = AddTestSystem(universe, -0.494, -0.759, 2.477,
            { { "Sirius A", "A1V", 1.43 }, { "Sirius B", "DA2", 11.3 } });
        tauCeti = AddTestSystem(universe, 3.2, -0.9, 0.4, { { "Tau Ceti", "G8V", 5.69 } });
        altair = AddTestSystem(universe, 2.54, 0.87, -4.31, { { "Altair", "A7V", 2.2 } });
        south = AddTestSystem(universe, 0.0, -10.0, 0.5, { { "Far South", "G0V", 4.5 } });
    }

    Universe universe { 20 };
    int32_t sun = 0, sirius = 0, tauCeti = 0, altair = 0, south = 0;
};
