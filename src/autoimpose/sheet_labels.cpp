// Sheet-label format and template texts.
#include "autoimpose/sheet_labels.h"

namespace vorlan::autoimpose {
namespace {

struct SheetNumberCase {
    const wchar_t* format;
    const char* reverseTemplate;  // every "%d" stands for TotalCount
    const char* forwardTemplate;
};

const SheetNumberCase kVariableDataSheet = {
    L"Sheet %d/%s", "%d - SheetIndex,  Side", "SheetIndex+1, Side"};
const SheetNumberCase kVariableDataImposedSet = {
    L"output-sheet= %d; output-set= %d; id= %d.%d /%s",
    "%d - SheetIndex, ImposedSheetSetIndex+1, ImposedSheetSetIndex+1, (%d-SheetIndex)/(ImposedSheetSetIndex+1), Side",
    "SheetIndex+1, ImposedSheetSetIndex+1, ImposedSheetSetIndex+1, (SheetIndex+1)/(ImposedSheetSetIndex+1), Side"};
const SheetNumberCase kVariableDataSet = {
    L"output-sheet= %d; output-set= %d; id= %d.%d /%s",
    "%d-SheetIndex, SetIndex+1, SetIndex+1, TotalSheetsInCollect - SheetCount + 1, Side",
    "SheetIndex+1, SetIndex+1, SetIndex+1, SheetCount, Side"};
const SheetNumberCase kDocumentSheet = {L"Sheet %d/%s", "%d - SheetCount + 1, Side", "SheetCount, Side"};

const SheetNumberCase& sheetNumberCase(const AutoImpositionSettings& s) {
    if (!s.variableData()) return kDocumentSheet;
    if (s.BindingType == 17) return kVariableDataSheet;
    if (s.BindingType == 12) return kVariableDataImposedSet;
    return kVariableDataSet;
}

// text with every "%d" replaced by number.
std::string withNumber(const char* text, int number) {
    std::string out = text;
    const std::string digits = std::to_string(number);
    for (size_t at = out.find("%d"); at != std::string::npos; at = out.find("%d", at + digits.size()))
        out.replace(at, 2, digits);
    return out;
}

}  // namespace

SheetLabelText sheetLabelText(const AutoImpositionSettings& s) {
    SheetLabelText text;
    if (s.JobNamePrint) text.format = s.JobNameString;
    if (s.SurfaceNumberPrint) {
        if (!text.format.empty()) text.format += L' ';
        const SheetNumberCase& c = sheetNumberCase(s);
        text.format += c.format;
        text.jobTemplate = s.reverseDelivery() ? withNumber(c.reverseTemplate, s.TotalCount) : c.forwardTemplate;
    }
    if (s.DateAndTimePrint) {
        if (!text.format.empty()) text.format += L' ';
        text.format += L"%s %s";
        if (!text.jobTemplate.empty()) text.jobTemplate += ", ";
        text.jobTemplate += "Date, Time";
    }
    return text;
}

}  // namespace vorlan::autoimpose
