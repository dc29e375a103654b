#include "entry/result_codes.h"

#include "vorlan/vorlan.h"

namespace vorlan {
namespace {

struct ResultText {
    int code;
    const char* name;
    const char* meaning;
};

constexpr ResultText kResults[] = {
    {-1, "OUT_OF_MEMORY", "the version description could not be loaded into memory"},
    {LD_OK, "LD_OK", "success"},
    {LD_FAILED, "LD_FAILED", "general failure (description not well-formed, expansion or die-cut failure, ...)"},
    {LD_QUERY_TARGET_ABSENT, "LD_QUERY_TARGET_ABSENT", "a query named a PDF, node type or process that does not exist"},
    {LD_JDF_UNUSABLE, "LD_JDF_UNUSABLE",
     "the JDF ticket cannot be used (unreadable, no JDF root), or its layout is automated and was copied unchanged"},
    {LD_JDF_RESOURCE_MISSING, "LD_JDF_RESOURCE_MISSING", "a queried process node or resource is absent"},
    {LD_FILE_NOT_FOUND, "LD_FILE_NOT_FOUND",
     "the data file is of no known kind, or a PDF named by the job is not in its data folder"},
    {LD_REFERENCE_OUT_OF_RANGE, "LD_REFERENCE_OUT_OF_RANGE",
     "the version description names a PDF or ordinal that does not exist"},
    {LD_PDF_CONVERSION_FAILED, "LD_PDF_CONVERSION_FAILED", "converting a PDF for the versions failed"},
    {LD_INVALID_INPUT, "LD_INVALID_INPUT", "the data file is missing or neither a folder, a compressed file nor a PDF"},
    {LD_JDF_WRITE_FAILED, "LD_JDF_WRITE_FAILED", "building or writing the new JDF ticket failed"},
};

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
