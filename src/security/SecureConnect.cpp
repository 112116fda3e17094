#include "security/SecureConnect.h"

namespace cv::security {

SecureConnect::SecureConnect(ua::Client& client, ConnectServices services)
    : client_(client), builder_(services) {}

void SecureConnect::Connect(const std::string& endpointUrl, Done done) {
    if (!builder_.NeedsEndpoints(endpointUrl)) {
        client_.Connect(endpointUrl, {}, std::move(done));
        return;
    }
    std::weak_ptr<int> alive = life_;
    client_.GetEndpoints(endpointUrl, [this, alive, endpointUrl, done](
                                          ua::Result<std::vector<ua::EndpointDescription>> found) {
        if (alive.expired()) {
            return;
        }
        if (!found) {
            done(ua::Error{found.Failure().status, "The program could not ask \"" + endpointUrl +
                                                       "\" for its endpoints. " +
                                                       found.Failure().text});
            return;
        }
        OnEndpoints(endpointUrl, found.Value(), done);
    });
}

void SecureConnect::OnEndpoints(const std::string& endpointUrl,
                                const std::vector<ua::EndpointDescription>& endpoints, Done done) {
    auto connect = builder_.Build(endpointUrl, endpoints);
    if (!connect) {
        done(connect.Failure());
        return;
    }
    std::weak_ptr<int> alive = life_;
    client_.Connect(endpointUrl, connect.Value(),
                    [this, alive, endpointUrl, connect = connect.Value(),
                     done](ua::Result<ua::SessionInfo> session) {
                        if (!alive.expired()) {
                            done(builder_.Settle(endpointUrl, connect, std::move(session)));
                        }
                    });
}

}  // namespace cv::security
