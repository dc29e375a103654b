// Enumeration setters of PDFInterpretingParams.
#include "platform/jdf/params.h"

#include "platform/jdf/enum_tables.h"

namespace JDF {

void JDFAutoPDFInterpretingParams::SetOCGDefault(int value) {
    SetEnumAttribute(L"OCGDefault", value, Tables::OCGDefault);
}

void JDFAutoPDFInterpretingParams::SetOCGProcess(int value) {
    SetEnumAttribute(L"OCGProcess", value, Tables::OCGProcess);
}

}  // namespace JDF
