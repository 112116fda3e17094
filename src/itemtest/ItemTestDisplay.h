#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace cv {

// What the item test window shows, kept by the item test and read by the
// window whenever it changes.
struct ItemTestDisplay {
    std::string caption = "Trying to connect...";
    // Which kind of OPC server the test reached ("OPC UA", "simulated
    // plant"), kept once known; empty before that and for DDE.
    std::string backend;
    // fraTestItem's caption.
    std::string frameCaption;
    // The DDE label's text (a DDE item's value as the link last gave it).
    std::string ddeLabel;
    std::string instLabel = "Raw Instrument value :";
    std::string instValue;
    std::string timeStamp;
    std::string engValue;
    // 0x00BBGGRR.
    int32_t engColor = 0;
    std::string decimalPlaces;
    std::string testResult = "Test successful";
    // The mode values for the mode-string choice, and the one selected.
    std::vector<std::string> modes;
    int32_t modeIndex = -1;
    bool showEngValue = false;
    bool showModeSelect = false;
    bool showTestResult = false;
    bool showTimeStamp = false;
    // 0 default, 11 hourglass (the window's controls are busy).
    int16_t mousePointer = 0;
};

}  // namespace cv
