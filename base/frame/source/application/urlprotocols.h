#pragma once

/// Makes the protocols of URLs known, with their default ports; runs by itself when an application starts, and does
/// nothing a second time. *Main thread*.
bool registerUrlProtocols();
