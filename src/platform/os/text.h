// Text conversion and number reading shared by every layer (what the Win32 text calls did).
#pragma once

#include <cstdint>
#include <cwchar>
#include <string>

namespace vorlan::os {

// Narrow (current-locale multibyte) copy of a wide string, allocated with malloc; null for null
// or when the text cannot be converted.
char* narrowCopy(const wchar_t* text);
// Wide copy of a narrow (current-locale) string, allocated with malloc; null for null or failure.
wchar_t* wideCopy(const char* text);

std::string narrow(const wchar_t* text);    // empty for null
std::wstring widen(const char* text);        // empty for null

// UTF-8 bytes of a wide string, whatever the locale (code points above 0x10FFFF become U+FFFD).
std::string toUtf8(const wchar_t* text);
std::string toUtf8(const std::wstring& text);
// Wide string from UTF-8; malformed bytes become U+FFFD.
std::wstring fromUtf8(const std::string& bytes);

// Reads a number like the C runtime's _wtoi: leading white space, optional sign, decimal digits up
// to the first other character; 0 when there are none. Saturates instead of overflowing.
int wtoi(const wchar_t* text);
// Reads a leading integer as _wtoi does (saturating) into value; false, value unchanged, when the
// text does not start (after white space) with an optionally signed digit.
bool readLeadingInteger(const char* text, int32_t& value);
// Reads a leading decimal number ("12.5", "-3e2", "7mm" reads 7) into value, whatever the
// locale; false, value unchanged, when there is none or it is out of range or not finite.
bool readDecimal(const char* text, double& value);

// Case-insensitive comparison of wide strings (null equals only null).
bool equalsIgnoreCase(const wchar_t* a, const wchar_t* b);
// ASCII case-insensitive comparison of narrow strings, locale-independent.
bool equalsIgnoreCaseAscii(const char* a, const char* b);

// Makes sure the process has a UTF-8 capable locale for the wide/narrow conversions:
// the environment's when it is UTF-8, else C.UTF-8.
void ensureUtf8Locale();

}  // namespace vorlan::os
