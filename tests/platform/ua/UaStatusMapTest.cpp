#include "platform/ua/UaStatusMap.h"

#include <gtest/gtest.h>

#include "platform/opc/OpcResult.h"

namespace cv::uaopc {
namespace {

using namespace platform::OpcResult;

struct QualityCase {
    uint32_t status;
    int32_t quality;
};

TEST(UaStatusMap, StatusesBecomeQualitiesByTheTableElseBySeverityWithTheLimitBits) {
    const QualityCase cases[] = {
        {0x00000000, 0xC0},
        {0x00960000, 0xD8},
        {0x40000000, 0x40},
        {0x40900000, 0x44},
        {0x40930000, 0x50},
        {0x40940000, 0x54},
        {0x40950000, 0x58},
        {0x80000000, 0x00},
        {0x80890000, 0x04},
        {0x808A0000, 0x08},
        {0x808B0000, 0x0C},
        {0x808C0000, 0x10},
        {0x80310000, 0x18},
        {0x808D0000, 0x1C},
        {0x80320000, 0x20},
        // Other codes by their severity, bad also with the reserved top bits.
        {0x002F0000, 0xC0},
        {0x40920000, 0x40},
        {0x80340000, 0x00},
        {0xC0000000, 0x00},
        // Limit bits low, high and constant; other info bits do not count.
        {0x00000100, 0xC1},
        {0x00000200, 0xC2},
        {0x40930300, 0x53},
        {0x808C0300, 0x13},
        {0x00960400, 0xD8},
        {0x40000080, 0x40},
    };
    for (const QualityCase& c : cases) {
        EXPECT_EQ(QualityOf(ua::StatusCode{c.status}), c.quality) << std::hex << c.status;
    }
}

struct ResultCase {
    uint32_t status;
    int32_t hresult;
    bool operationError;
};

TEST(UaStatusMap, OperationStatusesBecomeResultsAndUnnamedBadCodesPassAsThemselves) {
    const ResultCase cases[] = {
        {0x80330000, OPC_E_INVALIDITEMID, true},
        {0x80340000, OPC_E_UNKNOWNITEMID, true},
        {0x803A0000, OPC_E_BADRIGHTS, true},
        {0x803B0000, OPC_E_BADRIGHTS, true},
        {0x801F0000, OPC_E_BADRIGHTS, true},
        {0x80740000, OPC_E_BADTYPE, true},
        {0x803C0000, OPC_E_RANGE, true},
        {0x80730000, OPC_E_NOTSUPPORTED, true},
        {0x803B0400, OPC_E_BADRIGHTS, true},
        {0x00000000, 0, false},
        {0x00300000, 0, false},
        {0x40930000, 0, false},
        {0x808C0000, platform::Hresult(0x808C0000), false},
        {0x80350123, platform::Hresult(0x80350000), false},
    };
    for (const ResultCase& c : cases) {
        const ua::StatusCode status{c.status};
        EXPECT_EQ(HresultOf(status), c.hresult) << std::hex << c.status;
        EXPECT_EQ(IsOperationError(status), c.operationError) << std::hex << c.status;
    }
}

TEST(UaStatusMap, AnErrorLeadsBackToTheStatusItCameFrom) {
    EXPECT_EQ(StatusOfHresult(OPC_E_UNKNOWNITEMID), (ua::StatusCode{0x80340000}));
    EXPECT_EQ(StatusOfHresult(OPC_E_BADRIGHTS), (ua::StatusCode{0x803A0000}));
    EXPECT_EQ(StatusOfHresult(platform::Hresult(0x808C0000)), (ua::StatusCode{0x808C0000}));
    // The status behind a value's quality, which GetErrorString names.
    EXPECT_EQ(StatusOfHresult(0x40930000), (ua::StatusCode{0x40930000}));
    EXPECT_EQ(StatusOfHresult(0x00960000), (ua::StatusCode{0x00960000}));
    for (const int32_t other : {0, E_FAIL, RPC_E_DISCONNECTED, OPC_E_INVALIDHANDLE, 13}) {
        EXPECT_FALSE(StatusOfHresult(other)) << std::hex << other;
    }
    EXPECT_TRUE(OwnErrorText(OPC_E_UNKNOWNPATH));
    EXPECT_FALSE(OwnErrorText(OPC_E_BADRIGHTS));
}

}  // namespace
}  // namespace cv::uaopc
