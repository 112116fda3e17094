#include "browse/NetResource.h"

#include "platform/AsciiCase.h"

namespace cv {

using namespace platform;

NetResource::NetResource(NetEnumApi& cNetEnum) : mcNetEnum(cNetEnum) {}

NetResource::~NetResource() {
    CloseEnumeration();
}

std::string NetResource::RemoteNameMixedCase() const {
    std::string sName = AsciiLower(mtResource.lpRemoteName);
    // The first letter, or failing that the last character.
    for (size_t i = 0; i < sName.size(); ++i) {
        if (static_cast<unsigned char>(sName[i]) >= 97 || i + 1 == sName.size()) {
            sName[i] = AsciiUpper(sName[i]);
            break;
        }
    }
    return sName;
}

std::vector<std::unique_ptr<NetResource>> NetResource::GiveBirth(int32_t lScope, int32_t lType,
                                                                 int32_t lUsage) {
    CloseEnumeration();
    std::vector<std::unique_ptr<NetResource>> cBorn;
    NetEnumApi::Handle hEnum = 0;
    mlLastReply = mcNetEnum.OpenEnum(lScope, lType, lUsage, mtResource, hEnum);
    mhEnum = mlLastReply == kNetSuccess ? hEnum : 0;
    if (mhEnum != 0) {
        mlLastReply = kNetSuccess;
        NetResourceRecord tRecord;
        while (NextRecord(tRecord)) {
            auto cChild = std::make_unique<NetResource>(mcNetEnum);
            cChild->mtResource = tRecord;
            cBorn.push_back(std::move(cChild));
        }
    }
    CloseEnumeration();
    mlChildren = static_cast<int32_t>(cBorn.size());
    return cBorn;
}

bool NetResource::NextRecord(NetResourceRecord& tRecord) {
    // First with no room, which tells the record's size; then with that size.
    int32_t lCount = 1;
    int32_t lBufferSize = 0;
    mlLastReply = mcNetEnum.EnumResource(mhEnum, lCount, tRecord, lBufferSize);
    if (mlLastReply == kNetErrorMoreData) {
        lCount = 1;
        mlLastReply = mcNetEnum.EnumResource(mhEnum, lCount, tRecord, lBufferSize);
    }
    return mlLastReply == kNetSuccess && lCount != 0;
}

void NetResource::CloseEnumeration() {
    if (mhEnum != 0) {
        // Closing cannot fail in a way that matters: the list is done with.
        (void)mcNetEnum.CloseEnum(mhEnum);
        mhEnum = 0;
    }
}

}  // namespace cv
