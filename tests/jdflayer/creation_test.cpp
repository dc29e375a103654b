// Building documents: the edges the ticket writers rely on (IDs, bounded resource slots, links
// and copies across documents, references, deletion while walking) and atomic writing. What the
// writers build is validated against the schema through the jobs that write it.
#include <cstdlib>
#include <filesystem>

#include <gtest/gtest.h>

#include "platform/jdf/jdf.h"
#include "test_support.h"

namespace fs = std::filesystem;
using namespace JDF;

namespace {

// Fixes the creation timestamp, so documents built twice write the same bytes.
struct FixedTime {
    FixedTime() { setenv("SOURCE_DATE_EPOCH", "1700000000", 1); }
    ~FixedTime() { unsetenv("SOURCE_DATE_EPOCH"); }
};

}  // namespace

TEST(JdfCreate, ResourceSlotsIdsAndLinks) {
    EXPECT_THROW(JDFDoc(1), JDFException);
    JDFDoc doc(0);
    JDFNode root = doc.GetJDFRoot();
    root.SetType(L"Combined");
    root.SetTypes(vWString(L"Imposition Interpreting DigitalPrinting Rendering"));
    root.SetAttribute(L"U", 4000000000u);
    root.SetAttribute(L"D", 612.0);
    EXPECT_EQ(root.GetAttribute(L"U"), L"4000000000");
    EXPECT_EQ(root.GetAttribute(L"D"), L"612");
    // The only RenderingParams slot is taken; Media slots are unbounded.
    root.AppendMatchingResource(L"RenderingParams", 1);
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

    // A resource copied from another document keeps its ID and namespaces; a second copy gets a
    // fresh ID; an identical link is refused unless asked for.
    JDFRunList rl = root.AppendMatchingResource(L"RunList", 10);
    JDFRunList a = rl.AddPDF(L"file:///a.pdf", 0, -1);
    ASSERT_TRUE(p.ParseString("<JDF xmlns='http://www.CIP4.org/JDFSchema_1_1' xmlns:eg='urn:eg'><ResourcePool>"
                              "<Media ID='M1' eg:x='1' Dimension='1 2'/></ResourcePool></JDF>"));
    JDFMedia foreign = JDFDoc(p.GetDocument()).GetJDFRoot().GetResourcePool().GetResource(L"Media");
    JDFResource copy = root.GetResourcePool().CopyResource(foreign);
    EXPECT_EQ(copy.GetID(), L"M1");
    EXPECT_EQ(copy.GetNamespaceURIFromPrefix(L"eg"), L"urn:eg");
    EXPECT_NE(root.GetResourcePool().AppendResource(foreign).GetID(), L"M1");
    JDFResourceLinkPool links = root.GetResourceLinkPool();
    ASSERT_FALSE(links.AppendResource(copy, true).isNull());
    EXPECT_TRUE(links.AppendResource(copy, true).isNull());
    EXPECT_FALSE(links.AppendResource(copy, false).isNull());
    JDFResourceLink partLink = links.AppendResource(a, true);
    EXPECT_EQ(partLink.GetElement(L"Part").GetAttribute(L"Run"), L"0");
    EXPECT_EQ(partLink.GetTarget(), KElement(a));

    // Deleting while walking by index: the next element moves into the same index.
    JDFLayout layout = root.AppendMatchingResource(L"Layout", 1);
    JDFSurface surface = layout.GetCreateSignature(0).GetCreateSheet(0).GetCreateFrontSurface();
    for (int ord : {0, 1}) surface.GetCreateContentObject(ord).SetOrd(ord);
    JDFContentObject first = surface.GetContentObject(0);
    first.DeleteNode();
    EXPECT_TRUE(first.isNull());
    EXPECT_EQ(surface.GetContentObject(0).GetOrd(), 1);
    EXPECT_TRUE(surface.GetContentObject(1).isNull());
}

TEST(JdfWrite, Write2FileReplacesAtomicallyAndReportsFailure) {
    vorlan::test::TempDir tmp;
    JDFDoc doc(0);
    JDFRunList runs = doc.GetJDFRoot().AppendMatchingResource(L"RunList", 10);
    runs.AddPDF(L"file:///tmp/job/in.pdf", 0, -1);
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
