#include "opc/CvOpcAutoClient.h"

#include <string>

#include "channel/Channel.h"
#include "opc/ClientErrors.h"
#include "platform/AsciiCase.h"
#include "platform/Platform.h"
#include "util/TextToNumber.h"

namespace cv {

using platform::OneBased;

namespace {

// A value as the trace shows it: Booleans in words, the rest as text.
std::string TraceText(const Variant& vValue, const platform::Locale& locale) {
    if (vValue.VarType() == VT_BOOL) {
        return vValue.AsBool() ? "True" : "False";
    }
    return TextOf(vValue, locale);
}

}  // namespace

std::string CvOpcAutoClient::SendValue(Channel& cChannel, const std::string& sValue,
                                       ErrorInfo& error) {
    error = {};
    const Watch watch = Watching();
    const ServedChannels::Entry* found = mcChannels.FindEntry(cChannel);
    if (found == nullptr) {
        error = ClientErrors::NotServed();
        return {};
    }
    const ServedChannels::Entry entry = *found;
    int16_t iVarType = KnownItemType(cChannel);
    if (iVarType == 0) {
        error = SingleShotReadOneItem(cChannel);
        if (watch.Ended()) {
            error = ClientErrors::Disconnected();
            return {};
        }
        if (entry.Get() == nullptr) {
            return {};  // the channel went while it was read: nothing to write for
        }
        iVarType = cChannel.OpcRawValueVarType();
    }
    const Variant vValue = ValueToWrite(sValue, iVarType);
    Trace(std::string(entry.group == 2 ? "Group2" : "Group") +
          ".SyncWrite , Items=1, Value(1) = " + TraceText(vValue, mPlatform.locale));
    const GroupPtr group = Group(entry.group);
    if (!group) {
        error = ClientErrors::NoObject();
        return {};
    }
    OneBased<int32_t> errors;
    const ErrorInfo call = group->SyncWrite(1, OneBased<int32_t>{entry.serverHandle},
                                            OneBased<Variant>({vValue}), errors);
    if (watch.Ended() || call) {
        error = watch.Ended() ? ClientErrors::Disconnected() : call;
        return {};
    }
    if (errors.Count() < 1) {
        error = ClientErrors::IncompleteAnswer();
        return {};
    }
    return errors(1) == 0 ? std::string() : ServerMessage(errors(1), error, watch);
}

// The item's type as the first served channel of the same item knows it
// from its last value; 0 when none knows it.
int16_t CvOpcAutoClient::KnownItemType(const Channel& cChannel) const {
    for (const ServedChannels::Entry& entry : mcChannels.InOrder()) {
        const Channel* cServed = entry.Get();
        if (cServed != nullptr && cServed->ItemName() == cChannel.ItemName() &&
            cServed->OpcAccessPath() == cChannel.OpcAccessPath() &&
            cServed->OpcRawValueVarType() != 0) {
            return cServed->OpcRawValueVarType();
        }
    }
    return 0;
}

// The text as the item's type wants it. Numbers are read as single
// precision; integers round halves to even, and one out of their range is
// written in single precision instead.
Variant CvOpcAutoClient::ValueToWrite(const std::string& sValue, int16_t iVarType) const {
    const float sngNumber = TextToSingle(mPlatform, sValue, true);
    const Variant vSingle = Variant::R4(sngNumber);
    switch (iVarType) {
        case VT_I2:
        case VT_I4: {
            Variant vInteger;
            const ErrorInfo failed =
                ChangeType(vInteger, vSingle, static_cast<uint16_t>(iVarType), mPlatform.locale);
            return failed ? vSingle : vInteger;
        }
        case VT_R8:
            return Variant::R8(sngNumber);
        case VT_BSTR:
            return Variant::Str(sValue);
        case VT_BOOL:
            return Variant::Bool(sngNumber != 0 || EqualsIgnoringCase(sValue, "true"));
        default:
            return vSingle;
    }
}

// The server's own words for an item's error. When it has none, the error
// becomes the item's and the message stays empty.
std::string CvOpcAutoClient::ServerMessage(int32_t lItemError, ErrorInfo& error,
                                           const Watch& watch) {
    const auto server = mcOpcServer;
    std::string sText;
    const ErrorInfo failed =
        server ? server->GetErrorString(lItemError, sText) : ClientErrors::NoObject();
    if (watch.Ended() || failed) {
        error = ClientErrors::ItemError(lItemError);
        return {};
    }
    return "Error message from OPC Server: \"" + sText + "\".";
}

ErrorInfo CvOpcAutoClient::ServerErrorString(int32_t lCode, std::string& sText) {
    const Watch watch = Watching();
    const auto server = mcOpcServer;
    if (!server) {
        return ClientErrors::NoObject();
    }
    const ErrorInfo error = server->GetErrorString(lCode, sText);
    return watch.Ended() ? ClientErrors::Disconnected() : error;
}

}  // namespace cv
