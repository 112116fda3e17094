#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "platform/NetEnumApi.h"

namespace cv {

// One resource of the network (a provider, a domain or workgroup, a
// computer, a share) as a node of the Network tree: its own copy of the
// resource record, its place in the tree, and whether its children were
// asked for.
class NetResource {
  public:
    explicit NetResource(platform::NetEnumApi& cNetEnum);
    // Closes an enumeration that is still open.
    ~NetResource();
    NetResource(const NetResource&) = delete;
    NetResource& operator=(const NetResource&) = delete;

    int32_t Parent() const { return mlParent; }
    void SetParent(int32_t lParent) { mlParent = lParent; }
    int32_t Key() const { return mlKey; }
    void SetKey(int32_t lKey) { mlKey = lKey; }
    void SetScope(int32_t lScope) { mtResource.dwScope = lScope; }
    void SetResourceType(int32_t lType) { mtResource.dwType = lType; }
    int32_t DisplayType() const { return mtResource.dwDisplayType; }
    void SetDisplayType(int32_t lDisplayType) { mtResource.dwDisplayType = lDisplayType; }
    void SetUsage(int32_t lUsage) { mtResource.dwUsage = lUsage; }
    void SetLocalName(std::string sName) { mtResource.lpLocalName = std::move(sName); }
    void SetRemoteName(std::string sName) { mtResource.lpRemoteName = std::move(sName); }
    void SetComment(std::string sComment) { mtResource.lpComment = std::move(sComment); }
    void SetProvider(std::string sProvider) { mtResource.lpProvider = std::move(sProvider); }
    bool Enumerated() const { return mbEnumerated; }
    void SetEnumerated(bool bEnumerated) { mbEnumerated = bEnumerated; }
    // How many children the last GiveBirth found.
    int32_t Children() const { return mlChildren; }
    // The result code of the last network call.
    int32_t LastReply() const { return mlLastReply; }

    // The remote name in lower case but for its first letter: \\OPCHOST1
    // reads \\Opchost1. Empty for an empty name.
    std::string RemoteNameMixedCase() const;

    // Lists the resources this one holds, one record per pair of calls (the
    // first asks how large the record is). A failure ends the list and stays
    // in LastReply; the resources found before it are kept.
    std::vector<std::unique_ptr<NetResource>> GiveBirth(int32_t lScope, int32_t lType,
                                                        int32_t lUsage);

  private:
    // Fetches the next record; false at the end of the list or on a failure.
    bool NextRecord(platform::NetResourceRecord& tRecord);
    void CloseEnumeration();

    platform::NetEnumApi& mcNetEnum;
    int32_t mlParent = 0;
    int32_t mlKey = 0;
    // This resource's record: what it is, and the container GiveBirth opens.
    platform::NetResourceRecord mtResource;
    bool mbEnumerated = false;
    int32_t mlChildren = 0;
    int32_t mlLastReply = 0;
    platform::NetEnumApi::Handle mhEnum = 0;
};

}  // namespace cv
