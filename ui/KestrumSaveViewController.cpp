#include "ui/KestrumSaveViewController.h"

#include "LogGenerator/State.h"
#include "platform/Clock.h"
#include "platform/MainQueue.h"
#include "platform/PropertyLists.h"
#include "platform/Toolkit.h"
#include "ui/NewFile.h"
#include "ui/SharedApplication.h"

#include <string>

namespace kestrum {
namespace {

constexpr std::string_view kHistoryIdentifier = "SaveHistoryContentCell";
constexpr Font kRowFont{"Helvetica", 13};

} // namespace

KestrumSaveViewController::KestrumSaveViewController(ApplicationRoles& roles, SharedApplication& application,
                                                     const Value& initWithSaveHistory)
    : _roles(roles),
      _application(application),
      _timeStamp(roles.clock.now()),
      _saveHistory(deepCopy(initWithSaveHistory)),
      _interface(roles.toolkit.loadSaveInterface(*this))
{
    viewDidLoad();
}

void KestrumSaveViewController::viewDidLoad()
{
    saveContentTable().sizeToFit();
}

void KestrumSaveViewController::viewWillAppear(bool)
{
    _interface->setFrame(_roles.toolkit.mainScreenApplicationFrame());
}

std::size_t KestrumSaveViewController::numberOfRowsInSection(TableView&, std::size_t)
{
    const auto history = _saveHistory.array();
    return history ? history->size() : 0;
}

std::shared_ptr<ReusableCell> KestrumSaveViewController::cellForRowAtIndexPath(TableView& table, IndexPath indexPath)
{
    auto reusable = table.dequeueReusableCell(kHistoryIdentifier);
    if (!reusable)
        reusable = std::make_shared<ReusableCell>(table.makeCell(CellStyle::Default), kHistoryIdentifier);

    const auto history = _saveHistory.array();
    const auto entry = history && indexPath.row < history->size() ? (*history)[indexPath.row].dictionary() : nullptr;
    const Value description = entry ? entry->at(StateKey::kDescription) : Value();
    auto& cell = reusable->cell();
    cell.textLabel().setFont(kRowFont);
    // An entry without a description is a blank row. It is saved like the others.
    cell.textLabel().setText(description.text());
    cell.setAccessory(Accessory::CheckMark);
    return reusable;
}

void KestrumSaveViewController::didSelectRowAtIndexPath(TableView&, std::optional<IndexPath>)
{
    saveDescription().resignFirstResponder();
}

void KestrumSaveViewController::savePressed()
{
    const auto text = saveDescription().text();
    const auto snapshot = makeDictionaryUntilNull({{"Timestamp", dateText(_timeStamp)},
                                                   {"Data", _saveHistory},
                                                   {StateKey::kDescription, text ? Value(*text) : Value()}});
    std::string path;
    const auto stored = storeInNewFile("KestrumSnapshot", _roles, [&](const std::string& stem) {
        path = stem + ".kestrum";
        return _roles.propertyLists.write(*snapshot, path);
    });
    if (stored == Stored::Written)
        _application.showNotice("Saved to " + path);
    else
        tellOfFailedFile("snapshot", path, _roles);
    postClose();
}

void KestrumSaveViewController::cancelPressed()
{
    postClose();
}

void KestrumSaveViewController::backgroundTouched()
{
    saveDescription().resignFirstResponder();
}

bool KestrumSaveViewController::textFieldShouldReturn()
{
    saveDescription().resignFirstResponder();
    return true;
}

void KestrumSaveViewController::postClose()
{
    // Captures the application, not this screen: after a second press the screen no longer exists.
    _roles.queue.post([&application = _application] { application.closeSaveView(); });
}

} // namespace kestrum
