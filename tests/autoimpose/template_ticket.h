// Template tickets as an imposition tool writes them, and a runner for the rewrite.
#pragma once

#include <filesystem>
#include <string>

#include "platform/jdf/jdf.h"
#include "test_support.h"
#include "vorlan/LD_JDF.h"

namespace autoimpose_test {

struct TemplateShape {
    int marks = 2;        // template mark pages: Ord 0 … marks-1
    int labels = 1;       // then sheet-label pages
    int jobPages = 2;     // then the job's own pages
    int sides = 2;        // side partitions of the one sheet
    bool rendering = true;
};

// One Combined node; a document run list partitioned by Run ("Mark.tmp", "SheetLabel.tmp", the job
// PDF, in that order); a layout partitioned by SignatureName / SheetName / Side whose sides hold one
// content object per template and job page.
inline JDF::JDFDoc buildTemplateTicket(const TemplateShape& shape = {}) {
    using namespace JDF;
    JDFDoc doc(0);
    JDFNode root = doc.GetJDFRoot();
    root.SetActivation(6);
    root.SetType(L"Combined");
    root.SetTypes(vWString(L"Imposition Interpreting Rendering DigitalPrinting"));
    if (shape.rendering) root.AppendMatchingResource(L"RenderingParams", 1).SetStatus(7);
    root.AppendMatchingResource(L"InterpretingParams", 1).SetStatus(7);
    JDFRunList runs = root.AppendMatchingResource(L"RunList", 10);
    runs.SetStatus(7);
    if (shape.marks) runs.AddPDF(L"file:///tmp/template/Mark.tmp", 0, shape.marks - 1);
    if (shape.labels) runs.AddPDF(L"file:///tmp/template/SheetLabel.tmp", 0, shape.labels - 1);
    runs.AddPDF(L"file:///tmp/template/job.pdf", 0, shape.jobPages - 1);

    JDFLayout layout = root.AppendMatchingResource(L"Layout", 1);
    layout.SetStatus(7);
    layout.SetPartUsage(3);
    JDFLayout sheet = layout.GetCreatePartition(33, L"Sig1").GetCreatePartition(31, L"Sheet1");
    sheet.SetSurfaceContentsBox(JDFRectangle(0, 0, 1000, 700));
    const int objects = shape.marks + shape.labels + shape.jobPages;
    for (int s = 0; s < shape.sides; ++s) {
        JDFLayout side = sheet.GetCreatePartition(32, s % 2 ? L"Back" : L"Front");
        for (int o = 0; o < objects; ++o) {
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

// A template written to a temporary folder, imposed through the worker, and read back.
struct Imposed {
    vorlan::test::TempDir dir;
    std::filesystem::path ticket = dir / "ticket.jdf";
    LDError result = LD_FAILED;
    JDF::JDFNode root;

    Imposed(const JDF::JDFDoc& doc, const std::string& settingsBody) {
        EXPECT_TRUE(doc.Write2File(JDF::WString(ticket.string())));
        writeSettings(dir / "settings.xml", settingsBody);
        LD_JDF worker;
        result = worker.JDF_AutoImposition((dir / "settings.xml").c_str(), ticket.c_str());
        JDF::JDFParser parser;
        EXPECT_TRUE(parser.Parse(JDF::WString(ticket.string())));
        root = JDF::JDFDoc(parser.GetDocument()).GetJDFRoot();
    }
    JDF::JDFLayout layout() const { return root.GetMatchingResource(L"Layout", 3); }
    JDF::JDFLayout side(int i) const {
        return layout().GetElement(L"Layout").GetElement(L"Layout").GetElement(L"Layout", L"", i);
    }
};

}  // namespace autoimpose_test
