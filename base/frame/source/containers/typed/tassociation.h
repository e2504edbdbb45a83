#pragma once

/// A key with its value; equality looks at the key alone.
template <class Key, class Value>
struct TAssociation
{
    bool operator==(const TAssociation& other) const { return key == other.key; }

    Key key{};
    Value value{};
};
