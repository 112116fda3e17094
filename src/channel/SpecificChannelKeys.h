#pragma once

#include <cstdint>

namespace cv {

// Where a loop-specific channel keeps its item in the tuning file, and the
// names it goes by.
struct SpecificChannelKeys {
    // The read channel's key after the protocol prefix ("DDE" or "OPC").
    const char* sReadKey;
    // The key a write channel stores its item under; null for read channels.
    const char* sSendKey;
    // The item name of a PLC tuner, which addresses values by short name.
    const char* sShortName;
    const char* sDescription;
    bool bFilter;
};

// The keys of specific channel type lType (1 to 12); null for other types.
const SpecificChannelKeys* FindSpecificChannelKeys(int32_t lType);

}  // namespace cv
