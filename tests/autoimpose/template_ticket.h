// Template tickets as an imposition tool writes them, and settings files.
#pragma once

#include <filesystem>
#include <string>

#include "platform/jdf/jdf.h"
#include "test_support.h"

namespace autoimpose_test {

struct TemplateShape {
    int marks = 2;     // template mark pages: Ord 0 … marks-1
    int labels = 1;    // then sheet-label pages
    int jobPages = 2;  // then the job's own pages
    int sides = 2;     // side partitions of the one sheet
    bool rendering = true;
};

// One Combined node; a document run list partitioned by Run ("Mark.tmp", "SheetLabel.tmp", the job
// PDF, in that order); a layout partitioned by SignatureName / SheetName / Side whose sides hold one
// content object per page, object o at CTM "1 0 0 1 10o side" and ClipBox "0 0 100+o 50".
inline JDF::JDFDoc buildTemplateTicket(const TemplateShape& shape = {}) {
    using namespace JDF;
    JDFDoc doc(0);
    JDFNode root = doc.GetJDFRoot();
    root.SetType(L"Combined");
    root.SetTypes(vWString(L"Imposition Interpreting Rendering DigitalPrinting"));
    if (shape.rendering) root.AppendMatchingResource(L"RenderingParams", 1).SetStatus(7);
    JDFRunList runs = root.AppendMatchingResource(L"RunList", 10);
    runs.SetStatus(7);
    if (shape.marks) runs.AddPDF(L"file:///tmp/template/Mark.tmp", 0, shape.marks - 1);
    if (shape.labels) runs.AddPDF(L"file:///tmp/template/SheetLabel.tmp", 0, shape.labels - 1);
    runs.AddPDF(L"file:///tmp/template/job.pdf", 0, shape.jobPages - 1);
    JDFLayout layout = root.AppendMatchingResource(L"Layout", 1);
    layout.SetStatus(7);
    JDFLayout sheet = layout.GetCreatePartition(33, L"Sig1").GetCreatePartition(31, L"Sheet1");
    for (int s = 0; s < shape.sides; ++s) {
        JDFLayout side = sheet.GetCreatePartition(32, s % 2 ? L"Back" : L"Front");
        for (int o = 0; o < shape.marks + shape.labels + shape.jobPages; ++o) {
            JDFContentObject object = side.AppendContentObject();
            object.SetCTM(JDFMatrix(1, 0, 0, 1, 10.0 * o, s));
            object.SetClipBox(JDFRectangle(0, 0, 100 + o, 50));
            object.SetOrd(o);
        }
    }
    return doc;
}

// Writes <AutoImposeSettings>body</AutoImposeSettings>.
inline void writeSettings(const std::filesystem::path& file, const std::string& body) {
    vorlan::test::writeFile(file, "<AutoImposeSettings>" + body + "</AutoImposeSettings>");
}

}  // namespace autoimpose_test
