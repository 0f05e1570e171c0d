#pragma once

#include "platform/Roles.h"
#include "platform/SaveInterface.h"
#include "support/Date.h"
#include "support/Value.h"

#include <memory>
#include <optional>

namespace kestrum {

class SharedApplication;

/// The save screen: lists the contents, takes a description and writes one snapshot file.
class KestrumSaveViewController final : public SaveInterfaceOwner {
public:
    /// Copies the contents: later changes of the list have no effect. Null when there is nothing to save.
    KestrumSaveViewController(ApplicationRoles& roles, SharedApplication& application,
                              const Value& initWithSaveHistory);

    SaveInterface& interface() { return *_interface; }
    TableView& saveContentTable() { return _interface->saveContentTable(); }
    TextField& saveDescription() { return _interface->saveDescription(); }

    void viewWillAppear(bool animated);

    std::size_t numberOfRowsInSection(TableView& table, std::size_t section) override;
    std::shared_ptr<ReusableCell> cellForRowAtIndexPath(TableView& table, IndexPath indexPath) override;
    void didSelectRowAtIndexPath(TableView& table, std::optional<IndexPath> indexPath) override;

    /// Both close the screen, after the call has returned.
    void savePressed() override;
    void cancelPressed() override;
    void backgroundTouched() override;
    bool textFieldShouldReturn() override;

private:
    void viewDidLoad();
    void postClose();

    ApplicationRoles& _roles;
    SharedApplication& _application;
    Date _timeStamp;    ///< when the screen was opened
    Value _saveHistory; ///< an array of dictionaries, or null
    std::unique_ptr<SaveInterface> _interface;
};

} // namespace kestrum
