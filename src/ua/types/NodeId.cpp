#include "ua/types/NodeId.h"

namespace cv::ua {

bool NodeId::IsNull() const {
    if (namespaceIndex != 0) {
        return false;
    }
    switch (IdKind()) {
        case Kind::Numeric:
            return std::get<uint32_t>(identifier) == 0;
        case Kind::String:
            return std::get<std::string>(identifier).empty();
        case Kind::Guid:
            return std::get<Guid>(identifier) == Guid{};
        case Kind::Opaque:
            return std::get<ByteString>(identifier).bytes.empty();
    }
    return false;
}

uint32_t NodeId::Numeric() const {
    const uint32_t* id = std::get_if<uint32_t>(&identifier);
    return id ? *id : 0;
}

}  // namespace cv::ua
