#pragma once

#include "ua/client/ConnectOptions.h"
#include "ua/types/BuiltinTypes.h"

namespace cv::ua {

// The user identity token of ActivateSession for identity, under one of the
// endpoint's user token policies.
//
// A password is encrypted with the server's certificate as the token
// policy's security policy says (the endpoint's when it names none):
// RSA-OAEP over the length (UInt32, of password and nonce), the UTF-8
// password and the server's last nonce. A policy of None would send it in
// clear text; that is refused unless the channel itself is encrypted.
Result<ExtensionObject> MakeIdentityToken(const UserIdentity& identity,
                                          const EndpointDescription& endpoint,
                                          const ByteString& serverCertificate,
                                          const ByteString& serverNonce);

// Whether a password can go to this endpoint without being readable on the
// way, and if so whether it is encrypted to the endpoint's certificate (then
// that certificate must be one the user trusts).
enum class PasswordRoute { Refused, EncryptedToCertificate, InsideEncryptedChannel };
PasswordRoute RouteOfPassword(const EndpointDescription& endpoint);

}  // namespace cv::ua
