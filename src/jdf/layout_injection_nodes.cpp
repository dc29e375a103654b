// A Layout for tickets that have none (one sheet per logical page, the page unscaled on the
// front), for the ticket read and the ticket written, and the test for a layout marked
// automated.
#include <cwchar>

#include "jdf/injected_layout.h"
#include "jdf/ticket_handles.h"
#include "jdf/ticket_writing.h"
#include "vorlan/LD_JDF.h"

namespace {

using vorlan::jdf::InjectedSheets;

JDF::WString sheetName(int k) {
    wchar_t text[32];
    std::swprintf(text, 32, L"SheetName%d", k);
    return JDF::WString(text);
}

}  // namespace

namespace vorlan::jdf {

bool injectLayout(const JDF::JDFNode& node, JDF::JDFLayout& layout, InjectedSheets kind) {
    JDF::JDFNode target = node;
    layout = target.AppendMatchingResource(L"Layout", 1);
    if (layout.isNull()) return false;
    layout.SetStatus(LD_RESOURCE_AVAILABLE);
    layout.setPartIDKeys(JDF::vWString(L"SignatureName SheetName Side"));
    layout.SetPartUsage(3);
    JDF::JDFLayout signature = layout.GetCreatePartition(33, L"SignatureName1");

    JDF::JDFResourcePool pool = node.GetResourcePool();
    JDF::JDFMedia media = pool.GetResource(L"Media");
    int pageCounter = 0;
    for (const JDF::KElement& runList : pool.GetPoolChildren(L"RunList"))
        if (!appendInjectedSheets(JDF::JDFRunList(runList), signature, pageCounter, media, kind)) return false;
    return true;
}

bool appendInjectedSheets(const JDF::JDFRunList& runList, JDF::JDFLayout& signature, int& pageCounter,
                          const JDF::JDFMedia& media, InjectedSheets kind) {
    double width = 0, height = 0;
    if (!media.isNull() && media.HasAttribute(L"Dimension")) {
        JDF::JDFXYPair dimension = media.GetDimension();
        width = dimension.GetX();
        height = dimension.GetY();
    }
    JDF::vElement parts = runList.GetChildElementVector(L"RunList", L"", JDF::JDFAttributeMap(), true, 0, false);
    for (const JDF::KElement& element : parts) {
        JDF::JDFRunList part(element);
        // A partition that is partitioned further stands for this whole level.
        if (part.HasChildElement(L"RunList")) return appendInjectedSheets(part, signature, pageCounter, media, kind);

        int pages = 1;
        if (part.HasAttribute(L"NPage")) {
            pages = part.GetNPage();
        } else if (part.HasAttribute(L"Pages")) {
            pages = part.GetPages().NElements();
        } else {
            part.SetNPage(1);
        }
        if (pages < 0) pages = 0;
        if (pages > kMaxInjectedSheets - pageCounter) return false;

        const bool written = kind == InjectedSheets::Written;
        const JDF::WString contentType = written ? part.GetAttribute(L"KAV_tkt:VersContentType") : JDF::WString();
        for (int i = 0; i < pages; ++i) {
            ++pageCounter;
            // Each sheet name is new, so the partitions are appended without searching the
            // ones made so far.
            JDF::JDFLayout sheet = signature.AddPartition(31, sheetName(pageCounter));
            sheet.SetSurfaceContentsBox(JDF::JDFRectangle(0, 0, width, height));
            sheet.SetName(L"Sheet_1");
            if (written) sheet.GetCreateMedia(0).SetDimension(JDF::JDFXYPair(width, height));
            JDF::JDFLayout side = sheet.AddPartition(32, L"Front");
            if (!contentType.empty()) setTicketAttribute(side, L"VersContentType", contentType);
            JDF::JDFContentObject object = side.GetCreateContentObject(0);
            object.SetCTM(JDF::JDFMatrix());
            object.SetOrd(pageCounter - 1);
        }
    }
    return true;
}

}  // namespace vorlan::jdf

bool LD_JDF::injectLayoutNode(const JDF::JDFNode& node, JDF::JDFLayout& layout) {
    try {
        return vorlan::jdf::injectLayout(node, layout, InjectedSheets::Read);
    } catch (const std::exception&) {
        return false;
    }
}

bool LD_JDF::parseRunList(const JDF::JDFRunList& runList, JDF::JDFLayout& signature, int& pageCounter,
                          const JDF::JDFMedia& media) {
    return vorlan::jdf::appendInjectedSheets(runList, signature, pageCounter, media, InjectedSheets::Read);
}

bool LD_JDF::CheckForLayoutNodeAutomatedTrue(const JDF::JDFNode& node) {
    JDF::JDFLayout layout = node.GetMatchingResource(L"Layout", 3);
    if (layout.isNull() || !layout.GetAutomated()) return false;

    // Relative file URLs would no longer resolve once the ticket is written elsewhere: anchor
    // them at the job's data folder.
    std::wstring folder = ticketDataPath ? ticketDataPath : L"";
    std::wstring prefix = !folder.empty() && folder[0] == L'/' ? L"file://" : L"file:///";
    for (const JDF::KElement& resource : node.GetResourcePool().GetPoolChildren(L"RunList")) {
        for (const JDF::KElement& element : resource.GetChildElementVector(L"RunList", L"", JDF::JDFAttributeMap(),
                                                                           true, 0, false)) {
            JDF::JDFRunList part(element);
            JDF::WString url = part.GetFileURL();
            if (url.compare(0, 2, L"./") == 0) part.SetFileURL(JDF::WString(prefix + folder + L"/" + url.substr(2)));
        }
    }
    return true;
}
