#include "frontends/qt/QtToolkit.h"
#include "platform/Toolkit.h"
#include "platform/qt/LinuxDevice.h"
#include "ui/KestrumApp.h"

int main()
{
    using namespace kestrum;
    const auto toolkit = makeQtToolkit();
    LinuxDevice device("kestrum");
    auto roles = device.applicationRoles(*toolkit);
    const auto application = KestrumApp::make(roles);
    const int status = toolkit->run(*application);
    device.dropQueued();
    return status;
}
