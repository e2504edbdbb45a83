#pragma once

/// Encodings of 8-bit text by their code-page numbers. Any other number means ASCII.
inline constexpr unsigned kEncodingDefault = 0;
inline constexpr unsigned kEncodingMacRoman = 2;
inline constexpr unsigned kEncodingDosJapanese = 932;
inline constexpr unsigned kEncodingWindowsLatin1 = 1252;
inline constexpr unsigned kEncodingMacCentralEurope = 10029;
inline constexpr unsigned kEncodingUtf8 = 65001;

/// What the number 0 stands for in this process: Mac OS Roman until it is set. 0 sets it back.
/// It is set once, during start-up, when the system's language becomes known.
void setDefaultEncoding(unsigned encoding);
unsigned getDefaultEncoding();
