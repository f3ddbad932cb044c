// The main of a benchmark of widgets: an offscreen QApplication (unless QT_QPA_PLATFORM names
// another platform) with the program's resources loaded, around Google Benchmark's own main;
// and dropping a message on a widget as a drag does.
#pragma once

#include "platform/Message.h"
#include "platform/qt/MessageDrag.h"
#include "resources/ResourceData.h"

#include <QApplication>
#include <QDragEnterEvent>
#include <QDropEvent>
#include <QWidget>
#include <benchmark/benchmark.h>

// Drops message on the middle of target as a drag ending there would: a drag-enter event, then
// a drop event, both carrying the message as the drag's payload.
inline void DropMessage(QWidget* target, const Message& message)
{
    MessageMimeData data(message);
    const QPoint middle(target->width() / 2, target->height() / 2);
    QDragEnterEvent enter(middle, Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(target, &enter);
    QDropEvent drop(QPointF(middle), Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(target, &drop);
}

// Runs registerAll(), which registers the benchmarks made at run time, then every benchmark
// the command line selects. Answers main's exit status.
template <typename Register> int RunWidgetBenchmarks(int argc, char** argv, Register registerAll)
{
    if (qEnvironmentVariableIsEmpty("QT_QPA_PLATFORM"))
        qputenv("QT_QPA_PLATFORM", "offscreen");
    QApplication application(argc, argv);
    InitResources();
    registerAll();
    benchmark::Initialize(&argc, argv);
    if (benchmark::ReportUnrecognizedArguments(argc, argv))
        return 1;
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return 0;
}
