// A Layout for tickets that have none (one sheet per logical page, the page unscaled on the
// front), and the test for a layout marked automated.
#include <cwchar>

#include "jdf/ticket_handles.h"
#include "vorlan/LD_JDF.h"

namespace {

// More sheets than this are not injected: a ticket claiming billions of pages would otherwise
// exhaust memory. Injection then fails, as for any other unusable ticket.
constexpr int kMaxInjectedSheets = 1'000'000;

JDF::WString sheetName(int k) {
    wchar_t text[32];
    std::swprintf(text, 32, L"SheetName%d", k);
    return JDF::WString(text);
}

}  // namespace

bool LD_JDF::injectLayoutNode(const JDF::JDFNode& node, JDF::JDFLayout& layout) {
    try {
        JDF::JDFNode target = node;
        layout = target.AppendMatchingResource(L"Layout", 1);
        if (layout.isNull()) return false;
        layout.SetStatus(7);
        layout.setPartIDKeys(JDF::vWString(L"SignatureName SheetName Side"));
        layout.SetPartUsage(3);
        JDF::JDFLayout signature = layout.GetCreatePartition(33, L"SignatureName1");

        JDF::JDFResourcePool pool = node.GetResourcePool();
        JDF::JDFMedia media = pool.GetResource(L"Media");
        int pageCounter = 0;
        for (const JDF::KElement& runList : pool.GetPoolChildren(L"RunList"))
            if (!parseRunList(JDF::JDFRunList(runList), signature, pageCounter, media)) return false;
        return true;
    } catch (const std::exception&) {
        return false;
    }
}

bool LD_JDF::parseRunList(const JDF::JDFRunList& runList, JDF::JDFLayout& signature, int& pageCounter,
                          const JDF::JDFMedia& media) {
    JDF::vElement parts = runList.GetChildElementVector(L"RunList", L"", JDF::JDFAttributeMap(), true, 0, false);
    for (const JDF::KElement& element : parts) {
        JDF::JDFRunList part(element);
        // A partition that is partitioned further stands for this whole level.
        if (part.HasChildElement(L"RunList")) return parseRunList(part, signature, pageCounter, media);

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

        double width = 0, height = 0;
        if (!media.isNull() && media.HasAttribute(L"Dimension")) {
            JDF::JDFXYPair dimension = media.GetDimension();
            width = dimension.GetX();
            height = dimension.GetY();
        }
        for (int i = 0; i < pages; ++i) {
            ++pageCounter;
            JDF::JDFLayout sheet = signature.GetCreatePartition(31, sheetName(pageCounter));
            sheet.SetSurfaceContentsBox(JDF::JDFRectangle(0, 0, width, height));
            sheet.SetName(L"Sheet_1");
            JDF::JDFLayout side = sheet.GetCreatePartition(32, L"Front");
            JDF::JDFContentObject object = side.GetCreateContentObject(0);
            object.SetCTM(JDF::JDFMatrix());
            object.SetOrd(pageCounter - 1);
        }
    }
    return true;
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
