// Text helpers of the worker: list and range attributes, blanks, "%20".
#include <cstdlib>
#include <cstring>
#include <cwchar>

#include "platform/os/text.h"
#include "vorlan/LD_JDF.h"

namespace {
// A range attribute such as "1~2000000000" must not exhaust memory: expansion stops here.
constexpr size_t kMaxRangeValues = 1u << 20;
}  // namespace

wchar_t* LD_JDF::trimExtraSpaces(wchar_t* text) {
    if (!text) return nullptr;
    while (*text == L' ') ++text;
    size_t length = std::wcslen(text);
    while (length > 0 && text[length - 1] == L' ') --length;
    text[length] = L'\0';
    return text;
}

void LD_JDF::parseStringAttributeToStringVector(wchar_t* value, std::vector<wchar_t*>& list) {
    if (!value || !*value) {
        list.clear();
        return;
    }
    for (const std::wstring& item : vorlan::os::splitList<wchar_t>(value, L",")) {
        // Each entry is its own exact-size block so that the list's owner can free() it.
        wchar_t* block = LD_CopyText(item.c_str());
        if (block) list.push_back(block);
        else lastError = LD_FAILED;
    }
}

bool LD_JDF::isRange(wchar_t* token, long& first, long& last) {
    if (!token) return false;
    const wchar_t* tilde = std::wcschr(token, L'~');
    if (!tilde) return false;
    std::wstring before(static_cast<const wchar_t*>(token), tilde);
    first = vorlan::os::wtoi(before.c_str());
    last = vorlan::os::wtoi(tilde + 1);
    return true;
}

void LD_JDF::parseRangeAttributeToIntVector(wchar_t* value, std::vector<long>& list) {
    if (!value || !*value) {
        list.clear();
        return;
    }
    for (std::wstring& item : vorlan::os::splitList<wchar_t>(value, L", ")) {
        long first = 0, last = 0;
        if (isRange(item.data(), first, last)) {
            for (long n = first; n <= last && list.size() < kMaxRangeValues; ++n) list.push_back(n);
        } else if (list.size() < kMaxRangeValues) {
            list.push_back(vorlan::os::wtoi(item.c_str()));
        }
    }
}

void LD_JDF::removePercentTwenty(wchar_t* text) {
    if (!text) return;
    wchar_t* out = text;
    for (const wchar_t* in = text; *in;) {
        if (in[0] == L'%' && in[1] == L'2' && in[2] == L'0') {
            *out++ = L' ';
            in += 3;
        } else {
            *out++ = *in++;
        }
    }
    *out = L'\0';
}

char* LD_JDF::getCharFromWChar(const wchar_t* text) { return vorlan::os::narrowCopy(text); }

wchar_t* LD_JDF::getWCharFromChar(const char* text) { return vorlan::os::wideCopy(text); }

char* LD_JDF::getHeapCopyOfConstCharPtr(const char* text) { return text ? strdup(text) : nullptr; }
