#pragma once

#include <cstdint>
#include <optional>
#include <string>

class QWidget;

namespace cv {

// Routines over windows and their controls.

// Places the window in the middle of its screen, moved right and down by
// offset pixels.
void CenterForm(QWidget& form, int16_t offset);

// Enables the window's frames (QGroupBox, with everything inside) and push
// buttons when mousePointer is 0 and disables them otherwise; buttons whose
// "Tag" property is "Cancel" are left as they are. Then shows the pointer
// with that code: 0 the default one, 11 the hourglass.
void SetControlsBusy(int16_t mousePointer, QWidget& form);

// The 0-based index of the entry of a QComboBox or QListWidget that equals
// text exactly, or -1 (also for any other kind of control). Given the
// extra argument, whatever its value, the index of the first entry that in
// upper case sorts at or after text in upper case: where text belongs in a
// sorted list.
int16_t FindListEntry(const QWidget& list, const std::string& text,
                      std::optional<int32_t> extra = std::nullopt);

}  // namespace cv
