// Reading a parsed ticket: child look-ups, namespaces, inherited partition attributes, refs,
// node search by type and activation, resources matched by process usage, links across pools.
#include <gtest/gtest.h>

#include "platform/jdf/jdf.h"

using namespace JDF;

namespace {

const char* const kTicket = R"(<?xml version="1.0" encoding="UTF-8"?>
<JDF xmlns="http://www.CIP4.org/JDFSchema_1_1" xmlns:eg="http://www.esko-graphics.com/EGJDF/1.0"
     xmlns:ADBE="http://ns.adobe.com/jdf/1.0/" ID="root" JobPartID="root" Type="Combined"
     Types="Imposition Interpreting Rendering" Status="Ready" Version="1.3" ICSVersions="Base_L1-1.0 MIS_L1-1.0">
  <ResourcePool>
    <Media ID="m1" Class="Consumable" Status="Available" MediaType="Paper" Dimension="595.3 841.9"
           Thickness="100.5" Weight="80" DescriptiveName="A4 80g"/>
    <Media ID="m2" Class="Consumable" Status="Available" MediaUnit="Roll" GrainDirection="ShortEdge"/>
    <Media ID="m3" Class="Consumable" Status="Available" MediaUnit="Rolls" MediaType="paper"/>
    <RunList ID="rl" Class="Parameter" Status="Available" PartIDKeys="Run" NPage="4" eg:Flag="x">
      <LayoutElement><FileSpec URL="file:///shared.pdf" MimeType="application/pdf"/></LayoutElement>
      <RunList Run="0" Pages="0 ~ -1" FirstPage="2" SkipPage="1" EndOfDocument="true"/>
      <RunList Run="1" Status="Unavailable" NPage="2">
        <LayoutElement IsBlank="true"/>
      </RunList>
    </RunList>
    <RunList ID="marks" Class="Parameter" Status="Available"><LayoutElementRef rRef="le"/></RunList>
    <LayoutElement ID="le" Class="Parameter" Status="Available"><FileSpec URL="file:///marks.pdf"/></LayoutElement>
    <Layout ID="lay" Class="Parameter" Status="Available">
      <Signature Name="S1"><Sheet Name="Sh1"><MediaRef rRef="m2"/><eg:Extra/><Surface Side="Front"/></Sheet></Signature>
    </Layout>
  </ResourcePool>
  <ResourceLinkPool>
    <RunListLink rRef="rl" Usage="Input" ProcessUsage="Document"/>
    <RunListLink rRef="marks" Usage="Input" ProcessUsage="Marks"/>
    <LayoutLink rRef="lay" Usage="Input"/>
    <MediaLink rRef="m1" Usage="Input"/>
  </ResourceLinkPool>
  <JDF ID="a" Type="Imposition" Activation="Inactive"><JDF ID="a1" Type="Imposition"/></JDF>
  <JDF ID="b" Type="Imposition" Activation="Held"/>
  <JDF ID="c" Type="ProcessGroup" Types="Imposition">
    <JDF ID="c1" Type="Imposition" Activation="TestRunAndGo"/>
    <JDF ID="c2" Type="Interpreting"><ResourceLinkPool><RunListLink rRef="rl" Usage="Input" ProcessUsage="Document"/></ResourceLinkPool></JDF>
  </JDF>
  <JDF ID="d" Type="Imposition"/>
</JDF>)";

JDFNode parseTicket() {
    static JDFParser parser;
    static bool ok = parser.ParseString(kTicket);
    EXPECT_TRUE(ok) << parser.GetError();
    return JDFDoc(parser.GetDocument()).GetJDFRoot();
}

std::vector<std::wstring> ids(const vElement& v) {
    std::vector<std::wstring> out;
    for (const KElement& e : v) out.push_back(e.GetAttribute(L"ID"));
    return out;
}

}  // namespace

TEST(JdfNavigation, ChildLookUpsByNameNamespaceFilterAndDepth) {
    JDFNode root = parseTicket();
    ASSERT_FALSE(root.isNull());
    // Deep search in document order, index counts matches; direct children only without depth.
    EXPECT_EQ(root.GetChildByTagName(L"RunList", L"", 1, JDFAttributeMap(), false, true).GetAttribute(L"Run"), L"0");
    EXPECT_TRUE(root.GetChildByTagName(L"RunList", L"", 0, JDFAttributeMap(), true).isNull());
    EXPECT_EQ(root.GetChildByTagName(L"JDF", L"", 0, JDFAttributeMap(L"Type", L"Imposition"), false, true).GetAttribute(L"ID"), L"a");
    // Namespaces: "*" and "" match any; a URI must match the element's.
    EXPECT_FALSE(root.GetChildByTagName(L"Extra", L"http://www.esko-graphics.com/EGJDF/1.0", 0, JDFAttributeMap(), false).isNull());
    EXPECT_TRUE(root.GetChildByTagName(L"Extra", L"http://www.CIP4.org/JDFSchema_1_1", 0, JDFAttributeMap(), false).isNull());
    EXPECT_FALSE(root.GetChildByTagName(L"eg:Extra", L"", 0, JDFAttributeMap(), false).isNull());
    // GetChildElementVector follows refs: MediaRef becomes the Media it names.
    KElement sheet = root.GetChildByTagName(L"Sheet", L"", 0, JDFAttributeMap(), false);
    vElement resolved = JDFElement(sheet).GetChildElementVector(L"*", L"*");
    ASSERT_EQ(resolved.size(), 3u);
    EXPECT_EQ(resolved[0].GetAttribute(L"ID"), L"m2");
    EXPECT_EQ(resolved[1].GetNamespaceURI(), L"http://www.esko-graphics.com/EGJDF/1.0");
}

TEST(JdfNavigation, AttributesWithPrefixesNamespacesAndPartitionInheritance) {
    JDFNode root = parseTicket();
    JDFRunList rl = root.GetChildByTagName(L"RunList", L"", 0, JDFAttributeMap(), false);
    EXPECT_EQ(rl.GetAttribute(L"eg:Flag"), L"x");
    EXPECT_EQ(rl.GetAttribute(L"Flag", L"http://www.esko-graphics.com/EGJDF/1.0"), L"x");
    EXPECT_EQ(rl.GetAttribute(L"Flag"), L"");
    // Partitions inherit from the root (what every job's run lists rely on, checked end to end);
    // a plain KElement does not.
    JDFRunList p0 = rl.GetChildrenByTagName(L"RunList").at(0);
    EXPECT_TRUE(p0.IsResource(true));
    EXPECT_FALSE(p0.IsResource(false));
    EXPECT_EQ(p0.GetNPage(), 4);
    EXPECT_EQ(p0.GetPages().ToVInt(1000).size(), 1000u);
    EXPECT_EQ(KElement(p0).GetAttribute(L"Status"), L"");
    // JDFElement::GetStatus reads the node-status table: resource tokens read 0.
    EXPECT_EQ(JDFElement(p0).GetStatus(), 0);
    EXPECT_EQ(root.GetStatus(), 3);
    EXPECT_EQ(JDFResource(p0).GetResourceRoot(), KElement(rl));
    // LayoutElementRef is followed.
    JDFRunList marks = root.GetResourcePool().GetResource(L"RunList", 1);
    EXPECT_EQ(marks.GetFileURL(), L"file:///marks.pdf");
}

TEST(JdfNavigation, NodesByTypeAndActivation) {
    JDFNode root = parseTicket();
    EXPECT_EQ(root.GetActivation(), 6);  // missing reads Active
    // Descendants in document order, then the node itself; Inactive and Held (inherited too)
    // are filtered out, TestRunAndGo passes.
    EXPECT_EQ(ids(root.GetvJDFNode(L"Imposition", 6, false)), (std::vector<std::wstring>{L"c1", L"d"}));
    EXPECT_EQ(ids(root.GetvJDFNode(L"Imposition", 0, false)), (std::vector<std::wstring>{L"a", L"a1", L"b", L"c1", L"d"}));
    EXPECT_EQ(ids(root.GetvJDFNode(L"Combined", 6, false)), (std::vector<std::wstring>{L"root"}));
    EXPECT_EQ(ids(root.GetvJDFNode(L"", 6, true)), (std::vector<std::wstring>{L"c", L"d", L"root"}));
    JDFNode a1 = root.GetChildByTagName(L"JDF", L"", 0, JDFAttributeMap(L"ID", L"a1"), false);
    EXPECT_EQ(a1.GetActivation(false), 6);
    EXPECT_EQ(a1.GetActivation(true), 1);
    EXPECT_EQ(root.GetTypes(), (vWString{L"Imposition", L"Interpreting", L"Rendering"}));
    EXPECT_FALSE(root.GetTypes().contains(L"imposition"));
}

TEST(JdfNavigation, ResourcesAndLinksByProcessUsage) {
    JDFNode root = parseTicket();
    EXPECT_EQ(root.GetMatchingResource(L"RunList", 10).GetID(), L"rl");
    EXPECT_EQ(root.GetMatchingResource(L"RunList", 9).GetID(), L"marks");
    EXPECT_EQ(root.GetMatchingResource(L"RunList", 3, JDFAttributeMap(), 1).GetID(), L"marks");
    EXPECT_TRUE(root.GetMatchingResource(L"RunList", 2).isNull());
    EXPECT_EQ(root.GetMatchingResource(L"Layout", 3).GetID(), L"lay");
    EXPECT_EQ(root.GetMatchingResource(L"RunList", 3, JDFAttributeMap(L"Run", L"1")).GetAttribute(L"Run"), L"1");
    // A node whose types have no Document run list does not answer Document queries.
    JDFNode c2 = root.GetChildByTagName(L"JDF", L"", 0, JDFAttributeMap(L"ID", L"c2"), false);
    EXPECT_TRUE(c2.GetMatchingResource(L"RunList", 10).isNull());
    EXPECT_EQ(c2.GetMatchingResource(L"RunList", 3).GetID(), L"rl");
    // Links that point at a resource, from any node; pool children.
    JDFResource rl = root.GetMatchingResource(L"RunList", 10);
    vElement links = rl.GetLinks(L"*");
    ASSERT_EQ(links.size(), 2u);
    for (const KElement& l : links) EXPECT_EQ(JDFResourceLink(l).GetProcessUsage(), L"Document");
    EXPECT_EQ(ids(root.GetResourcePool().GetPoolChildren(L"Media")), (std::vector<std::wstring>{L"m1", L"m2", L"m3"}));
    // Enumeration tokens are case-sensitive; an unknown one reads 0.
    JDFMedia m3 = root.GetResourcePool().GetResource(L"Media", 2);
    EXPECT_EQ(m3.GetMediaUnit(), 0);
    EXPECT_EQ(m3.GetMediaType(), 0);
}

// A node's links resolve in its own pool and its ancestors' pools, the nearest first; a sibling
// node's pool is out of reach. GetLinkedResources gives each resolved resource once.
TEST(JdfNavigation, LinksResolveInTheNearestAncestorPool) {
    JDFParser parser;
    ASSERT_TRUE(parser.ParseString(R"(<JDF xmlns="http://www.CIP4.org/JDFSchema_1_1" ID="root" Type="ProcessGroup">
  <ResourcePool><RunList ID="dup" Run="far"/><Layout ID="lay"/></ResourcePool>
  <JDF ID="group" Type="ProcessGroup">
    <ResourcePool><RunList ID="dup" Run="near"/></ResourcePool>
    <JDF ID="imp" Type="Imposition"><ResourceLinkPool>
      <LayoutLink rRef="lay" Usage="Input"/>
      <RunListLink rRef="dup" Usage="Input" ProcessUsage="Document"/>
      <RunListLink rRef="dup" Usage="Input" ProcessUsage="Marks"/>
      <MediaLink rRef="sib" Usage="Input"/>
      <RunListLink rRef="gone" Usage="Input"/>
    </ResourceLinkPool></JDF>
  </JDF>
  <JDF ID="sibling" Type="Interpreting"><ResourcePool><Media ID="sib"/></ResourcePool></JDF>
</JDF>)"));
    JDFNode root = JDFDoc(parser.GetDocument()).GetJDFRoot();
    JDFNode imp = root.GetChildByTagName(L"JDF", L"", 0, JDFAttributeMap(L"ID", L"imp"), false);
    vElement linked = imp.GetLinkedResources();
    EXPECT_EQ(ids(linked), (std::vector<std::wstring>{L"lay", L"dup"}));
    ASSERT_EQ(linked.size(), 2u);
    EXPECT_EQ(linked[1].GetAttribute(L"Run"), L"near");
    EXPECT_EQ(imp.GetMatchingResource(L"RunList", 10).GetAttribute(L"Run"), L"near");
    EXPECT_TRUE(imp.GetMatchingResource(L"Media", 3).isNull());
    EXPECT_TRUE(root.GetLinkedResources().empty());
}
