#pragma once

#include "platform/TableView.h"
#include "platform/TextField.h"

#include <string_view>

namespace kestrum {

/// What the save screen reports to its controller.
class SaveInterfaceOwner : public TableDataSource {
public:
    virtual void savePressed() = 0;
    virtual void cancelPressed() = 0;
    virtual void backgroundTouched() = 0;     ///< anywhere outside the text field
    virtual bool textFieldShouldReturn() = 0; ///< Return was pressed in the field
};

/// The text that an empty description field shows. ASCII.
inline constexpr std::string_view kDescriptionPlaceholder = "What was seen, and where";

/// The interface "KestrumSaveViewController": a table of what is saved, a description, Save and Cancel.
class SaveInterface {
public:
    virtual ~SaveInterface() = default;
    virtual TableView& saveContentTable() = 0;
    virtual TextField& saveDescription() = 0;
    virtual void setFrame(Rect frame) = 0;
};

} // namespace kestrum
