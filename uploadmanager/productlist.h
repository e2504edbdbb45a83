#pragma once

/// A host product as the service knows it.
struct Product
{
    const char* name;
    /// The OAuth client identifier of the service's registration.
    const char* clientId;
    const char* schemeWord;
};

/// The products served, in the order in which URLs and descriptions are searched for them.
inline constexpr Product kProducts[] = {
    {"Plenar", "0f1e2d3c4b5a69788796a5b4c3d2e1f0", "plenar"},
    {"Zentor", "1a2b3c4d5e6f708192a3b4c5d6e7f809", "zentor"},
    {"Loomrit", "2b3c4d5e6f708192a3b4c5d6e7f8091a", "loomrit"},
    {"Fennic", "3c4d5e6f708192a3b4c5d6e7f8091a2b", "fennic"},
};

/// The product that a logout URL means where it names none.
inline constexpr const char* kDefaultLogoutProduct = "Loomrit";
