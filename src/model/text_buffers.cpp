// Wide text blocks of the job model: fixed text buffers and exact-size copies.
#include <cstdlib>
#include <cstring>

#include "vorlan/LD_Records.h"

wchar_t* LD_NewTextBuffer() {
    return static_cast<wchar_t*>(std::calloc(LD_TEXT_BUFFER_CHARS, sizeof(wchar_t)));
}

wchar_t* LD_CopyText(const wchar_t* text) {
    if (!text) return nullptr;
    size_t length = std::wcslen(text);
    auto* copy = static_cast<wchar_t*>(std::malloc((length + 1) * sizeof(wchar_t)));
    if (copy) std::wmemcpy(copy, text, length + 1);
    return copy;
}

// Text longer than a buffer is cut at LD_TEXT_BUFFER_CHARS - 1 characters: the buffers have a
// fixed size and a ticket value must never overrun one.
void LD_SetTextBuffer(wchar_t* buffer, const wchar_t* text) {
    if (!buffer) return;
    if (!text) {
        buffer[0] = L'\0';
        return;
    }
    size_t length = std::wcslen(text);
    if (length > LD_TEXT_BUFFER_CHARS - 1) length = LD_TEXT_BUFFER_CHARS - 1;
    std::wmemcpy(buffer, text, length);
    buffer[length] = L'\0';
}

void LD_FreeTextList(std::vector<wchar_t*>& list) {
    for (wchar_t* text : list) std::free(text);
    list.clear();
}
