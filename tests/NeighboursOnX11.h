// The fixture of window tests on a real X server (run under scripts/with-xvfb; skipped
// elsewhere): the program's resources, and a small universe of the Sun, Sirius and Vega.
#pragma once

#include "query/UniverseBuilder.h"
#include "resources/ResourceData.h"

#include <QGuiApplication>
#include <gtest/gtest.h>

class NeighboursOnX11 : public ::testing::Test {
protected:
    void SetUp() override
    {
        if (QGuiApplication::platformName() != "xcb")
            GTEST_SKIP() << "needs an X server: run under scripts/with-xvfb";
        InitResources();
        stars = AddNeighbours(universe);
    }

    Universe universe { 8 };
    Neighbours stars {};
    const int32_t& sun = stars.sun;
    const int32_t& sirius = stars.sirius;
    const int32_t& vega = stars.vega;
};
