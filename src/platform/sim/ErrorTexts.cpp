#include "platform/sim/ErrorTexts.h"

#include <map>

namespace cv::sim {

namespace {

using namespace platform::OpcResult;

const std::map<int32_t, std::string>& Texts() {
    static const std::map<int32_t, std::string> texts = {
        {S_OK, "The operation succeeded."},
        {E_NOTIMPL, "The operation is not implemented."},
        {SimResult::E_NOINTERFACE, "The server does not offer this interface."},
        {E_FAIL, "Unspecified error."},
        {E_ACCESSDENIED, "Access is denied."},
        {E_INVALIDARG, "One or more arguments are not valid."},
        {RPC_E_DISCONNECTED, "The object invoked has disconnected from its clients."},
        {RPC_S_SERVER_UNAVAILABLE, "The RPC server is unavailable."},
        {CO_E_SERVER_EXEC_FAILURE, "The server process could not be started."},
        {SimResult::CONNECT_E_CANNOTCONNECT, "The group cannot send notifications to this client."},
        {OPC_E_INVALIDHANDLE, "The handle is not valid."},
        {OPC_E_BADTYPE, "The server cannot convert the value to or from the item's data type."},
        {OPC_E_PUBLIC, "The operation is not allowed on a public group."},
        {OPC_E_BADRIGHTS, "The item's access rights do not allow the operation."},
        {OPC_E_UNKNOWNITEMID, "The item ID is not defined in the server's address space."},
        {OPC_E_INVALIDITEMID, "The item ID does not follow the server's syntax."},
        {OPC_E_UNKNOWNPATH, "The server does not know the item's access path."},
        {OPC_E_RANGE, "The value is out of range for the item."},
        {OPC_E_DUPLICATENAME, "The name is already in use."},
        {OPC_E_NOTSUPPORTED, "The server cannot write qualities or time stamps."},
    };
    return texts;
}

}  // namespace

std::optional<std::string> ErrorText(int32_t code) {
    const auto found = Texts().find(code);
    return found == Texts().end() ? std::nullopt : std::optional(found->second);
}

ErrorInfo ServerError(int32_t code) {
    return {code, ErrorText(code).value_or("Error " + std::to_string(code) + ".")};
}

}  // namespace cv::sim
