#include "entry/result_codes.h"

#include "vorlan/vorlan.h"

namespace vorlan {
namespace {

struct ResultText {
    int code;
    const char* name;
    const char* meaning;
};

#define VORLAN_RESULT_TEXT(name, value, meaning) {value, #name, meaning},
constexpr ResultText kResults[] = {
    {-1, "OUT_OF_MEMORY", "the version description could not be loaded into memory"},
    VORLAN_RESULT_CODES(VORLAN_RESULT_TEXT)
};
#undef VORLAN_RESULT_TEXT

const ResultText* find(int code) {
    for (const ResultText& entry : kResults)
        if (entry.code == code) return &entry;
    return nullptr;
}

}  // namespace

const char* resultName(int code) {
    const ResultText* entry = find(code);
    return entry ? entry->name : "unknown";
}

const char* resultMeaning(int code) {
    const ResultText* entry = find(code);
    return entry ? entry->meaning : "not a result code of this library";
}

}  // namespace vorlan
