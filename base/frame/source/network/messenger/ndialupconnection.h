#pragma once

/// Connections over a telephone line, which the system makes by itself where there still are any. *Thread-safe*.
class NDialUpConnection
{
public:
    void autoDial() {}
    void hangup() {}
};
