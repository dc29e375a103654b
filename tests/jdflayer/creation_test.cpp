// Building documents: new-document skeleton, resources with links, partitions, get-or-create
// children, run lists, copies across documents, and atomic writing.
#include <filesystem>
#include <cstdlib>

#include <gtest/gtest.h>

#include "platform/jdf/jdf.h"
#include "test_support.h"
#include "ticket_builders.h"

namespace fs = std::filesystem;
using namespace JDF;

namespace {

struct FixedTime {
    FixedTime() { setenv("SOURCE_DATE_EPOCH", "1700000000", 1); }
    ~FixedTime() { unsetenv("SOURCE_DATE_EPOCH"); }
};

}  // namespace

TEST(JdfCreate, NewDocumentSkeleton) {
    FixedTime fixed;
    JDFDoc doc(0);
    JDFNode root = doc.GetJDFRoot();
    ASSERT_FALSE(root.isNull());
    EXPECT_EQ(doc.GetRoot(), KElement(root));
    EXPECT_EQ(root.GetNamespaceURI(), L"http://www.CIP4.org/JDFSchema_1_1");
    EXPECT_EQ(root.GetVersion(), L"1.3");
    EXPECT_EQ(root.GetID(), root.GetJobPartID());
    EXPECT_EQ(root.GetID()[0], L'n');
    KElement created = root.GetAuditPool().GetElement(L"Created");
    EXPECT_EQ(created.GetAttribute(L"TimeStamp"), L"2023-11-14T22:13:20+00:00");
    EXPECT_FALSE(root.GetResourcePool().isNull());
    EXPECT_FALSE(root.GetResourceLinkPool().isNull());
    vElement kids = root.GetChildrenByTagName();
    ASSERT_EQ(kids.size(), 3u);
    EXPECT_EQ(kids[0].GetNodeName(), L"AuditPool");
    EXPECT_EQ(kids[1].GetNodeName(), L"ResourcePool");
    EXPECT_EQ(kids[2].GetNodeName(), L"ResourceLinkPool");
    EXPECT_THROW(JDFDoc(1), JDFException);
    // The same construction writes the same bytes.
    EXPECT_EQ(jdflayer_test::buildVersionedTicket().ToString(), jdflayer_test::buildVersionedTicket().ToString());
}

TEST(JdfCreate, NodeSettersWriteTheTokensOfTheirNumbers) {
    JDFDoc doc(0);
    JDFNode root = doc.GetJDFRoot();
    root.SetActivation(6);
    root.SetStatus(3);
    root.SetType(L"Combined");
    root.SetTypes(vWString(L" Imposition  Interpreting\tDigitalPrinting Rendering "));
    EXPECT_EQ(root.GetAttribute(L"Activation"), L"Active");
    EXPECT_EQ(root.GetAttribute(L"Status"), L"Ready");
    EXPECT_EQ(root.GetAttribute(L"xsi:type"), L"Combined");
    EXPECT_EQ(root.GetNamespaceURIFromPrefix(L"xsi"), L"http://www.w3.org/2001/XMLSchema-instance");
    EXPECT_EQ(root.GetAttribute(L"Types"), L"Imposition Interpreting DigitalPrinting Rendering");
    JDFNode(root).SetType(L"Imposition");
    EXPECT_FALSE(root.HasAttribute(L"xsi:type"));
    root.SetType(L"Combined");
    EXPECT_THROW(root.SetActivation(0), JDFException);
    EXPECT_THROW(root.SetStatus(15), JDFException);
    root.SetAttribute(L"N", 5);
    root.SetAttribute(L"U", 4000000000u);
    root.SetAttribute(L"D", 612.0);
    root.SetAttribute(L"KAV_tkt:VersionName", L"V", L"http://www.vorlan.org/JDF/ticket/1.0");
    EXPECT_EQ(root.GetAttribute(L"N"), L"5");
    EXPECT_EQ(root.GetAttribute(L"U"), L"4000000000");
    EXPECT_EQ(root.GetAttribute(L"D"), L"612");
    EXPECT_EQ(root.GetAttribute(L"xmlns:KAV_tkt"), L"http://www.vorlan.org/JDF/ticket/1.0");
    root.RemoveAttribute(L"N");
    EXPECT_FALSE(root.HasAttribute(L"N"));
}

TEST(JdfCreate, AppendMatchingResourceCreatesResourceAndLink) {
    JDFDoc doc(0);
    JDFNode root = jdflayer_test::newCombinedRoot(doc, L"Imposition Interpreting DigitalPrinting Rendering");
    JDFResource rp = root.AppendMatchingResource(L"RenderingParams", 1);
    JDFResource doc10 = root.AppendMatchingResource(L"RunList", 10);
    JDFResource marks = root.AppendMatchingResource(L"RunList", 9);
    JDFResource media = root.AppendMatchingResource(L"Media", 10);
    JDFResource out = root.AppendMatchingResource(L"Component", 2);
    EXPECT_EQ(rp.GetAttribute(L"Status"), L"Unavailable");
    EXPECT_EQ(rp.GetClass(), L"Parameter");
    EXPECT_EQ(rp.GetID()[0], L'r');
    EXPECT_EQ(media.GetClass(), L"Consumable");
    EXPECT_EQ(out.GetClass(), L"Quantity");
    EXPECT_EQ(rp.GetParentNode(), KElement(root.GetResourcePool()));
    JDFResourceLink l = root.GetLink(rp);
    EXPECT_EQ(l.GetNodeName(), L"RenderingParamsLink");
    EXPECT_EQ(l.GetUsage(), 1);
    EXPECT_FALSE(l.HasAttribute(L"ProcessUsage"));
    EXPECT_EQ(root.GetLink(doc10).GetProcessUsage(), L"Document");
    EXPECT_EQ(root.GetLink(marks).GetProcessUsage(), L"Marks");
    EXPECT_EQ(root.GetLink(media).GetProcessUsage(), L"Document");
    EXPECT_EQ(root.GetLink(out).GetAttribute(L"Usage"), L"Output");
    EXPECT_EQ(root.GetMatchingResource(L"RunList", 9), KElement(marks));
    // The only RenderingParams slot is taken; Media slots are unbounded.
    EXPECT_THROW(root.AppendMatchingResource(L"RenderingParams", 1), JDFException);
    EXPECT_NO_THROW(root.AppendMatchingResource(L"Media", 1));
    EXPECT_NO_THROW(root.AppendMatchingResource(L"Media", 1));
    // Unknown process types fall back to the usage number alone.
    JDFDoc other(0);
    JDFNode n = other.GetJDFRoot();
    n.SetType(L"Stripping");
    EXPECT_EQ(n.GetLink(n.AppendMatchingResource(L"RunList", 9)).GetProcessUsage(), L"Marks");
    EXPECT_EQ(n.GetLink(n.AppendMatchingResource(L"RunList", 2)).GetUsage(), 2);
    // IDs stay unique in a parsed document that already uses the counter's values.
    JDFParser p;
    ASSERT_TRUE(p.ParseString("<JDF xmlns='http://www.CIP4.org/JDFSchema_1_1' ID='n' Type='Imposition'>"
                              "<ResourcePool><Layout ID='r000001'/></ResourcePool></JDF>"));
    JDFNode parsed = JDFDoc(p.GetDocument()).GetJDFRoot();
    EXPECT_EQ(parsed.AppendMatchingResource(L"RunList", 10).GetID(), L"r000002");
    EXPECT_FALSE(parsed.GetResourceLinkPool().isNull());
}

TEST(JdfCreate, PartitionsAndGetCreateChildren) {
    JDFDoc doc(0);
    JDFNode root = jdflayer_test::newCombinedRoot(doc, L"Imposition");
    JDFLayout layout = root.AppendMatchingResource(L"Layout", 1);
    layout.SetStatus(7);
    layout.setPartIDKeys(vWString(L"SignatureName SheetName Side"));
    layout.SetPartUsage(3);
    JDFLayout sig = layout.GetCreatePartition(33, L"SignatureName1");
    EXPECT_EQ(layout.GetCreatePartition(33, L"SignatureName1"), KElement(sig));
    JDFLayout sheet = sig.GetCreatePartition(31, L"SheetName1");
    JDFLayout side = sheet.GetCreatePartition(32, L"Front");
    EXPECT_EQ(layout.GetAttribute(L"PartIDKeys"), L"SignatureName SheetName Side");
    EXPECT_EQ(sheet.GetAttributeMap(), JDFAttributeMap(L"SheetName", L"SheetName1"));
    EXPECT_EQ(side.GetPartMap().size(), 3u);
    EXPECT_EQ(side.GetStatus(), 7);
    EXPECT_EQ(side.GetPartUsage(), 3);
    EXPECT_EQ(layout.GetPartition(JDFAttributeMap(L"Side", L"Front")), KElement(side));
    // A key not yet listed joins PartIDKeys of the root.
    JDFRunList rl = root.AppendMatchingResource(L"RunList", 10);
    rl.GetCreatePartition(20, L"0");
    rl.GetCreatePartition(20, L"1");
    EXPECT_EQ(rl.GetAttribute(L"PartIDKeys"), L"Run");
    EXPECT_EQ(rl.NumChildElements(L"RunList"), 2);
    // GetCreate…(i) appends one element when fewer than i+1 exist.
    JDFInterpretingParams ip = root.AppendMatchingResource(L"InterpretingParams", 1);
    JDFInterpretingParams part = ip.GetCreatePartition(20, L"5");
    JDFPDFInterpretingParams pdf = part.GetCreatePDFInterpretingParams(5);
    EXPECT_EQ(part.NumChildElements(L"PDFInterpretingParams"), 1);
    EXPECT_EQ(part.GetCreatePDFInterpretingParams(0), KElement(pdf));
    pdf.GetCreateOCGControl(0).SetOCGName(L"A");
    pdf.GetCreateOCGControl(1).SetOCGName(L"B");
    EXPECT_EQ(pdf.GetCreateOCGControl(1).GetAttribute(L"OCGName"), L"B");
    EXPECT_EQ(pdf.NumChildElements(L"OCGControl"), 2);
    // Nested layout: surfaces by side, sheets by position.
    JDFLayout nested = root.GetResourcePool().AppendResource(L"Layout");
    JDFSheet sh = nested.GetCreateSignature(0).GetCreateSheet(2);
    JDFSurface back = sh.GetCreateBackSurface();
    EXPECT_EQ(back.GetAttribute(L"Side"), L"Back");
    EXPECT_EQ(sh.GetCreateBackSurface(), KElement(back));
    EXPECT_NE(sh.GetCreateFrontSurface(), KElement(back));
    JDFMedia m = root.AppendMatchingResource(L"Media", 1);
    KElement ref = sh.RefMedia(m);
    EXPECT_EQ(ref.GetAttribute(L"rRef"), m.GetID());
    EXPECT_EQ(JDFElement(ref).GetTarget(), KElement(m));
}

TEST(JdfCreate, RunListsAndLinkPools) {
    JDFDoc doc(0);
    JDFNode root = jdflayer_test::newCombinedRoot(doc, L"Interpreting Rendering DigitalPrinting");
    JDFRunList rl = root.AppendMatchingResource(L"RunList", 10);
    JDFRunList a = rl.AddPDF(L"file:///a.pdf", 0, -1);
    JDFRunList b = rl.AddPDF(L"file:///b.pdf", 3, 3);
    JDFRunList c = rl.AddRun(L"file:///c.ps", 1, 4);
    EXPECT_EQ(a.GetRun(), L"0");
    EXPECT_EQ(b.GetRun(), L"1");
    EXPECT_EQ(a.GetAttribute(L"Pages"), L"0 ~ -1");
    EXPECT_EQ(b.GetAttribute(L"Pages"), L"3");
    EXPECT_EQ(a.GetFileURL(), L"file:///a.pdf");
    EXPECT_EQ(a.GetLayoutElement().GetFileSpec().GetMimeType(), L"application/pdf");
    EXPECT_EQ(c.GetLayoutElement().GetFileSpec().GetMimeType(), L"");
    c.SetFileURL(L"file:///d.ps");
    EXPECT_EQ(c.GetFileURL(), L"file:///d.ps");
    EXPECT_EQ(rl.GetAttribute(L"PartIDKeys"), L"Run");
    // Direct linking through the link pool; an identical link is refused.
    JDFParser p;
    ASSERT_TRUE(p.ParseString("<JDF xmlns='http://www.CIP4.org/JDFSchema_1_1' xmlns:eg='urn:eg'><ResourcePool>"
                              "<Media ID='M1' eg:x='1' Dimension='1 2'/></ResourcePool></JDF>"));
    JDFMedia foreign = JDFDoc(p.GetDocument()).GetJDFRoot().GetResourcePool().GetResource(L"Media");
    JDFResource copy = root.GetResourcePool().CopyResource(foreign);
    EXPECT_EQ(copy.GetID(), L"M1");
    EXPECT_EQ(copy.GetNamespaceURIFromPrefix(L"eg"), L"urn:eg");
    JDFResourceLinkPool links = root.GetResourceLinkPool();
    JDFResourceLink link = links.AppendResource(copy, true);
    ASSERT_FALSE(link.isNull());
    EXPECT_EQ(link.GetAttributeMap().size(), 2u);
    EXPECT_TRUE(links.AppendResource(copy, true).isNull());
    EXPECT_FALSE(links.AppendResource(copy, false).isNull());
    JDFResourceLink partLink = links.AppendResource(a, true);
    EXPECT_EQ(partLink.GetElement(L"Part").GetAttribute(L"Run"), L"0");
    EXPECT_EQ(partLink.GetTarget(), KElement(a));
    // A second copy of the same resource gets a fresh ID.
    EXPECT_NE(root.GetResourcePool().AppendResource(foreign).GetID(), L"M1");
}

TEST(JdfCreate, DeleteCopyAndElementEdits) {
    JDFDoc doc = jdflayer_test::buildAutoImposedTicket(true);
    JDFNode root = doc.GetJDFRoot();
    JDFLayout layout = root.GetMatchingResource(L"Layout", 3);
    EXPECT_TRUE(layout.GetAutomated());
    EXPECT_EQ(layout.GetAttribute(L"BaseOrdReset"), L"PagePoolList");
    EXPECT_EQ(layout.GetAttribute(L"PartIDKeys"), L"RunTags SheetName Side");
    JDFLayout side = layout.GetElement(L"Layout").GetElement(L"Layout").GetElement(L"Layout");
    EXPECT_EQ(side.GetAttribute(L"Side"), L"Back");
    JDFContentObject co = side.GetContentObject(0);
    EXPECT_EQ(co.GetElement(L"FitPolicy").GetAttribute(L"RotatePolicy"), L"RotateCounterClockwise");
    EXPECT_EQ(co.GetElement(L"FitPolicy").GetAttribute(L"SizePolicy"), L"FitToPage");
    EXPECT_THROW(co.GetCreateFitPolicy().SetSizePolicy(0), JDFException);
    EXPECT_EQ(co.GetCTM(), JDFMatrix());
    EXPECT_EQ(side.GetMarkObject(0).GetElement(L"DeviceMark").GetAttribute(L"FontSize"), L"9");
    KElement delivery = root.GetMatchingResource(L"RunList", 10).GetElement(L"KAV:OrvelDeliveryOptions");
    EXPECT_EQ(delivery.GetNamespaceURI(), L"http://www.vorlan.org/JDF/delivery/1.0");
    JDFRunList run = root.GetMatchingResource(L"RunList", 10).GetElement(L"RunList");
    KElement mm = run.GetElement(L"MetadataMap");
    EXPECT_EQ(mm.GetAttribute(L"DataType"), L"PartIDKeys");
    EXPECT_EQ(mm.GetAttribute(L"Context"), L"Document");
    EXPECT_EQ(mm.GetElement(L"Expr").GetAttribute(L"Value"), L"PDFVT_Job");
    // Deleting while walking by index: the next element moves into the same index.
    co.DeleteNode();
    EXPECT_TRUE(co.isNull());
    EXPECT_TRUE(side.GetContentObject(0).isNull());
    EXPECT_EQ(side.NumChildElements(L"MarkObject"), 1);
    // The output run list carries its SheetIndex parts on the link.
    JDFResourceLink outLink = root.GetMatchingLink(L"RunList", 2);
    EXPECT_EQ(outLink.NumChildElements(L"Part"), 2);
    EXPECT_EQ(outLink.GetElement(L"Part", L"", 1).GetAttribute(L"SheetIndex"), L"3");
}

TEST(JdfWrite, Write2FileReplacesAtomicallyAndReportsFailure) {
    vorlan::test::TempDir tmp;
    JDFDoc doc = jdflayer_test::buildInjectedLayoutTicket(1);
    fs::path target = tmp / "out.jdf";
    vorlan::test::writeFile(target, "old contents");
    fs::permissions(target, fs::perms::owner_read | fs::perms::owner_write | fs::perms::group_read);
    ASSERT_TRUE(doc.Write2File(WString(target.string())));
    EXPECT_EQ(vorlan::test::readFile(target), doc.ToString());
    EXPECT_EQ(fs::status(target).permissions() & fs::perms::all,
              fs::perms::owner_read | fs::perms::owner_write | fs::perms::group_read);
    // No temporary file stays behind.
    EXPECT_EQ(std::distance(fs::directory_iterator(tmp.path()), fs::directory_iterator()), 1);
    // A folder that does not exist, a target that is a folder, an empty name, a null document.
    EXPECT_FALSE(doc.Write2File(WString((tmp / "missing" / "out.jdf").string())));
    fs::create_directory(tmp / "dir.jdf");
    EXPECT_FALSE(doc.Write2File(WString((tmp / "dir.jdf").string())));
    EXPECT_FALSE(doc.Write2File(WString()));
    EXPECT_FALSE(XMLDoc().Write2File(WString(target.string())));
    EXPECT_EQ(vorlan::test::readFile(target), doc.ToString());
    EXPECT_EQ(std::distance(fs::directory_iterator(tmp.path()), fs::directory_iterator()), 2);
}

TEST(JdfCreate, ReferencesFollowIdChangesCopiesAndDeletions) {
    JDFDoc doc(0);
    JDFNode root = doc.GetJDFRoot();
    JDFMedia m = root.AppendMatchingResource(L"Media", 1);
    JDFLayout layout = root.AppendMatchingResource(L"Layout", 1);
    JDFElement ref = layout.RefMedia(m);
    EXPECT_EQ(ref.GetTarget(), KElement(m));
    EXPECT_EQ(layout.GetChildElementVector(L"Media").size(), 1u);
    // Renaming the ID: the old reference no longer resolves, a new one does.
    m.KElement::SetAttribute(L"ID", L"MediaX");
    EXPECT_TRUE(ref.GetTarget().isNull());
    ref.SetAttribute(L"rRef", L"MediaX");
    EXPECT_EQ(ref.GetTarget(), KElement(m));
    // A copied resource with the same ID: the first in document order answers.
    KElement copy = root.GetResourcePool().CopyElement(m);
    EXPECT_EQ(ref.GetTarget(), KElement(m));
    // Deleting the target leaves the reference dangling, not crashing.
    KElement(m).DeleteNode();
    EXPECT_EQ(ref.GetTarget(), copy);
    copy.DeleteNode();
    EXPECT_TRUE(ref.GetTarget().isNull());
    EXPECT_TRUE(root.GetMatchingResource(L"Media", 3).isNull());
    EXPECT_FALSE(root.IsValid(5));
    EXPECT_TRUE(root.IsValid(0));
}

TEST(JdfCreate, AttributeOrderAndDeclaredLists) {
    JDFDoc doc(0);
    EXPECT_EQ(doc.GetRoot().GetAttributeNames(),
              (vWString{L"xmlns", L"Version", L"ID", L"JobPartID", L"Status"}));
    EXPECT_EQ(doc.GetRoot().NumAttributes(), 5);
    ElementInfo jdf = GetElementInfo(L"JDF");
    EXPECT_TRUE(vWString(jdf.requiredAttributes, L",").contains(L"Type"));
    EXPECT_TRUE(vWString(jdf.optionalAttributes, L",").contains(L"Activation"));
    EXPECT_TRUE(vWString(jdf.optionalElements, L",").contains(L"ResourcePool"));
    EXPECT_TRUE(jdf.partAttributes.empty());
    ElementInfo media = GetElementInfo(L"Media");
    EXPECT_TRUE(vWString(media.optionalAttributes, L",").contains(L"Dimension"));
    EXPECT_TRUE(vWString(media.partAttributes, L",").contains(L"SheetName"));
    EXPECT_TRUE(vWString(GetElementInfo(L"ContentObject").requiredAttributes, L",").contains(L"CTM"));
    EXPECT_TRUE(GetElementInfo(L"Surface").optionalAttributes.empty());
}

// Children deferred to the save are written byte for byte as the same children held in the tree:
// indented and (past 100 levels) raw, in batches that cross the serialiser's buffer, with
// namespaced attributes whose prefix the root declares. A maker that throws fails the write and
// leaves the target as it was.
TEST(JdfWrite, DeferredChildrenAreWrittenAsIfHeldInTheTree) {
    FixedTime fixed;
    auto addPartition = [](KElement& parent, int k) {
        JDFResource part = JDFResource(parent).AddPartition(20, WString::valueOf(k));
        part.SetAttribute(L"KAV_tkt:VersionName", L"Version <" + WString::valueOf(k % 3) + L">",
                          L"http://www.vorlan.org/JDF/ticket/1.0");
        part.AppendElement(L"LayoutElement").SetAttribute(L"IsTrapped", L"false");
    };
    auto build = [&](int partitions, int nesting, bool deferred) {
        JDFDoc doc(0);
        JDFNode root = doc.GetJDFRoot();
        root.SetAttribute(L"xmlns:KAV_tkt", L"http://www.vorlan.org/JDF/ticket/1.0");
        KElement parent = root.GetResourcePool();
        for (int i = 0; i < nesting; ++i) parent = parent.AppendElement(L"Nest");
        JDFResource list = root.AppendMatchingResource(L"RunList", 10);
        if (nesting > 0) list = JDFResource(parent.CopyElement(list));
        list.AddPartIDKey(20);
        if (!deferred) {
            for (int k = 0; k < partitions; ++k) addPartition(list, k);
        } else {
            list.DeferChildren([=, next = 0](KElement& scratch) mutable {
                for (int end = std::min(partitions, next + 100); next < end; ++next) addPartition(scratch, next);
                return next < partitions;
            });
        }
        root.AppendMatchingResource(L"Component", 2);
        return doc;
    };
    for (auto [partitions, nesting] : {std::pair{1, 0}, {250, 0}, {3000, 0}, {40, 101}}) {
        SCOPED_TRACE(testing::Message() << partitions << " partitions at nesting " << nesting);
        const std::string expected = build(partitions, nesting, false).ToString();
        EXPECT_EQ(build(partitions, nesting, true).ToString(), expected);
        vorlan::test::TempDir tmp;
        ASSERT_TRUE(build(partitions, nesting, true).Write2File(WString((tmp / "out.jdf").string())));
        EXPECT_EQ(vorlan::test::readFile(tmp / "out.jdf"), expected);
    }

    vorlan::test::TempDir tmp;
    vorlan::test::writeFile(tmp / "out.jdf", "old contents");
    JDFDoc failing(0);
    failing.GetJDFRoot().GetResourcePool().AppendElement(L"RunList").DeferChildren(
        [](KElement&) -> bool { throw JDFException("no more"); });
    EXPECT_FALSE(failing.Write2File(WString((tmp / "out.jdf").string())));
    EXPECT_EQ(vorlan::test::readFile(tmp / "out.jdf"), "old contents");
    EXPECT_EQ(std::distance(fs::directory_iterator(tmp.path()), fs::directory_iterator()), 1);
}
