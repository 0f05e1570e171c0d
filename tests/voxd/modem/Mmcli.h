#pragma once

#include "qtplatform/EventLoop.h"

#include <QJsonDocument>
#include <QJsonObject>
#include <QProcess>

namespace kestrum {

/// What ModemManager's own client prints as JSON. It asks on the system bus of the environment.
inline QJsonObject mmcli(const QStringList& arguments)
{
    QProcess process;
    process.start("mmcli", QStringList{"-J"} + arguments);
    EXPECT_TRUE(eventually([&] { return process.state() == QProcess::NotRunning; }));
    EXPECT_EQ(process.exitCode(), 0) << process.readAllStandardError().toStdString();
    return QJsonDocument::fromJson(process.readAllStandardOutput()).object();
}

} // namespace kestrum
