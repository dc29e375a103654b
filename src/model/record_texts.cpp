// Wide texts of the job model, each allocated at the length it holds.
#include <cstdlib>
#include <cstring>

#include "vorlan/LD_Records.h"

namespace {

size_t cutLength(const wchar_t* text) {
    size_t length = text ? std::wcslen(text) : 0;
    return length > LD_TEXT_BUFFER_CHARS - 1 ? LD_TEXT_BUFFER_CHARS - 1 : length;
}

}  // namespace

wchar_t* LD_NewText(const wchar_t* text) {
    wchar_t* made = nullptr;
    LD_SetText(made, text);
    return made;
}

wchar_t* LD_CopyText(const wchar_t* text) {
    if (!text) return nullptr;
    size_t length = std::wcslen(text);
    auto* copy = static_cast<wchar_t*>(std::malloc((length + 1) * sizeof(wchar_t)));
    if (copy) std::wmemcpy(copy, text, length + 1);
    return copy;
}

// A ticket value longer than LD_TEXT_BUFFER_CHARS - 1 characters is cut there, as the fixed
// buffers of the original records did; hosts may rely on that bound.
void LD_SetText(wchar_t*& field, const wchar_t* text) {
    const size_t length = cutLength(text);
    auto* made = static_cast<wchar_t*>(std::malloc((length + 1) * sizeof(wchar_t)));
    if (!made) return;
    if (length) std::wmemcpy(made, text, length);  // before the old text goes: it may be the source
    made[length] = L'\0';
    std::free(field);
    field = made;
}

void LD_FreeTextList(std::vector<wchar_t*>& list) {
    for (wchar_t* text : list) std::free(text);
    list.clear();
}
