#include "opc/PriorToConnect.h"

namespace cv {

void PriorToConnect(platform::ServerCallWait& cWait, const std::string& sServerID,
                    const std::string& sComputer) {
    std::string sText = "Please wait...\r\n\r\nThe OPC Server, \"" + sServerID + "\"";
    if (!sComputer.empty()) {
        sText += ", in computer \"" + sComputer + "\"";
    }
    sText += ", is still busy.";
    cWait.SetBusyTimeout(5000);
    cWait.SetBusyText(std::move(sText));
}

}  // namespace cv
