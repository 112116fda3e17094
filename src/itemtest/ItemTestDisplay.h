#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace cv {

// What the item test window shows, kept by the item test and read by the
// window whenever it changes.
struct ItemTestDisplay {
    // Colours of the quality (0x00BBGGRR): green only for a good value.
    static constexpr int32_t kGoodColor = 0x008000;
    static constexpr int32_t kUncertainColor = 0x0070D0;
    static constexpr int32_t kBadColor = 0x0000C0;

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
    // The server's time stamp of the value and, where the server sends one,
    // the time stamp of its source; both to the millisecond.
    std::string timeStamp;
    std::string sourceTimeStamp;
    std::string engValue;
    // 0x00BBGGRR.
    int32_t engColor = 0;
    std::string decimalPlaces;
    std::string testResult = "Test successful";
    // The quality of the value in words, with the server's own name for its
    // status where it has one ("uncertain, sensor not accurate
    // (Uncertain_SensorNotAccurate)"); empty for DDE.
    std::string quality;
    int32_t qualityColor = kGoodColor;
    // Set while the engineering value lies outside the engineering range,
    // which the mark names.
    bool outOfRange = false;
    std::string rangeMark;
    // While the test waits and tries again: what the server answered last.
    std::string serverAnswer;
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
