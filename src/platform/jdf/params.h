// Process parameter resources the writers fill: RenderingParams, DigitalPrintingParams,
// InterpretingParams with PDFInterpretingParams and its OCGControl switches.
#pragma once

#include "platform/jdf/jdf_resource.h"

namespace JDF {

class JDFAutoRenderingParams : public JDFResource {
public:
    JDFAutoRenderingParams() = default;
    JDFAutoRenderingParams(const KElement& e) : JDFResource(e) {}
    bool GetInterleaved() const { return GetAttribute(L"Interleaved") == L"true"; }
    void SetInterleaved(bool value) { SetAttribute(L"Interleaved", value ? L"true" : L"false"); }
};
class JDFRenderingParams : public JDFAutoRenderingParams {
public:
    using JDFAutoRenderingParams::JDFAutoRenderingParams;
};

class JDFDigitalPrintingParams : public JDFResource {
public:
    JDFDigitalPrintingParams() = default;
    JDFDigitalPrintingParams(const KElement& e) : JDFResource(e) {}
};

class JDFAutoOCGControl : public JDFElement {
public:
    JDFAutoOCGControl() = default;
    JDFAutoOCGControl(const KElement& e) : JDFElement(e) {}
    void SetIncludeOCG(bool value) { SetAttribute(L"IncludeOCG", value ? L"true" : L"false"); }
    void SetOCGName(const WString& name) { SetAttribute(L"OCGName", name); }
};
class JDFOCGControl : public JDFAutoOCGControl {
public:
    using JDFAutoOCGControl::JDFAutoOCGControl;
};

class JDFAutoPDFInterpretingParams : public JDFElement {
public:
    JDFAutoPDFInterpretingParams() = default;
    JDFAutoPDFInterpretingParams(const KElement& e) : JDFElement(e) {}
    void SetOCGDefault(int value);  // 2 FromPDF
    void SetOCGProcess(int value);  // 2 Print, 3 View
    void SetOCGIntent(const WString& intent) { SetAttribute(L"OCGIntent", intent); }
    // The i-th OCGControl child; one is appended when fewer than i+1 exist.
    JDFOCGControl GetCreateOCGControl(int i = 0) { return GetCreateElement(L"OCGControl", L"", i); }
};
class JDFPDFInterpretingParams : public JDFAutoPDFInterpretingParams {
public:
    using JDFAutoPDFInterpretingParams::JDFAutoPDFInterpretingParams;
};

class JDFAutoInterpretingParams : public JDFResource {
public:
    JDFAutoInterpretingParams() = default;
    JDFAutoInterpretingParams(const KElement& e) : JDFResource(e) {}
    // The i-th PDFInterpretingParams child; one is appended when fewer than i+1 exist.
    JDFPDFInterpretingParams GetCreatePDFInterpretingParams(int i = 0) {
        return GetCreateElement(L"PDFInterpretingParams", L"", i);
    }
};
class JDFInterpretingParams : public JDFAutoInterpretingParams {
public:
    using JDFAutoInterpretingParams::JDFAutoInterpretingParams;
};

}  // namespace JDF
