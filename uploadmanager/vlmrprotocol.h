#pragma once

// The program's URL scheme, by which the service hands a login back. Main thread.

/// The scheme, without the colon.
inline constexpr const char* kVlmrScheme = "vlmr";
/// What follows the product's scheme word in its redirect URI.
inline constexpr const char* kRedirectPath = "/successfullLogin";

/// Makes this process hear of opened URLs of the scheme; each goes to `PUploadManagerApplication::handleRedirect`.
void registerVlmrProtocol();
/// Takes that back; does nothing where nothing is registered.
void cleanupProtocolHandler();
