#pragma once

class QWidget;

namespace cv {

class LoopClass;

namespace platform {
class Locale;
}

// Shows the loop's current P, I, D and filter settings in four controls,
// each through its "text" property (a QLineEdit's text, a QLabel's caption).
// P and I read "N/A" when exactly 0; every other value is the shortest text
// of at least 4 significant digits in the user's regional style. A null
// control is skipped.
void ShowCurrentPIDF(const LoopClass& cLoop, const platform::Locale& locale, QWidget* p, QWidget* i,
                     QWidget* d, QWidget* f);

// Empties a QComboBox or QListWidget and lists the filter-unit names, so
// that an entry's position is its code. Other controls are left alone.
void FillFilterUnitsCombo(QWidget& combo);

}  // namespace cv
