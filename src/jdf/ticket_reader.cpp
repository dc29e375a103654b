// Reads a JDF ticket into the job model: the process node, its resources, the run lists with
// their PDFs, the layout and the rendering parameters; then numbers the logical pages.
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <string>

#include "jdf/element_walk.h"
#include "jdf/ticket_handles.h"
#include "jdf/ticket_reading.h"
#include "platform/os/text.h"
#include "vorlan/LD_JDF.h"

namespace {

// The first element of that name anywhere below `from` (flags as the reader passes them).
JDF::KElement firstBelow(const JDF::KElement& from, const wchar_t* name, const wchar_t* nameSpace = L"") {
    return from.GetChildByTagName(name, nameSpace, 0, JDF::JDFAttributeMap(), false, true);
}

// The first InterpretingParams, RenderingParams and DigitalPrintingParams below the root, each
// as firstBelow finds it, in one walk: absent ones would otherwise cost a walk of the whole
// document each.
void findParameterResources(LD_JDFHandles& t) {
    static const char* const names[] = {"InterpretingParams", "RenderingParams", "DigitalPrintingParams"};
    JDF::KElement* const slots[] = {&t.interpretingParamsElement, &t.renderingParamsElement,
                                    &t.digitalPrintingParamsElement};
    for (JDF::KElement* slot : slots) *slot = JDF::KElement();
    int missing = 3;
    vorlan::jdf::forEachElementBelow(t.rootNode.node(), [&](pugi::xml_node n) {
        const char* local = vorlan::jdf::localName(n);
        for (int k = 0; k < 3; ++k) {
            if (slots[k]->isNull() && std::strcmp(local, names[k]) == 0) {
                *slots[k] = JDF::KElement(n, t.rootNode.document());
                --missing;
            }
        }
        return missing > 0;
    });
}

// Whether a ProcessUsage value equals usage (ASCII) ignoring case, as the wide comparison
// has it; text beyond ASCII is compared in wide form.
bool sameUsage(const char* value, const char* usage) {
    if (vorlan::os::equalsIgnoreCaseAscii(value, usage)) return true;
    for (const char* c = value; *c; ++c)
        if (static_cast<unsigned char>(*c) >= 0x80)
            return vorlan::os::equalsIgnoreCase(JDF::WString(value).c_str(), JDF::WString(usage).c_str());
    return false;
}

// Whether a link to the resource has that ProcessUsage: an element of a ResourceLinkPool, or a
// <resource name>Ref element, whose rRef is the resource root's ID (the links GetLinks finds),
// looked for in one walk of the document.
bool hasLinkWithUsage(const JDF::JDFResource& resource, const char* usage) {
    if (resource.isNull()) return false;
    JDF::JDFResource root = resource.GetResourceRoot();
    pugi::xml_attribute idAttribute = root.node().attribute("ID");
    const char* id = idAttribute.value();
    if (!*id) return false;
    std::string refName = std::string(resource.node().name()) + "Ref";
    bool prefixedRef = refName.find(':') != std::string::npos;
    auto refersHere = [&](pugi::xml_node link) {
        return std::strcmp(link.attribute("rRef").value(), id) == 0 &&
               sameUsage(link.attribute("ProcessUsage").value(), usage);
    };
    bool found = false;
    vorlan::jdf::forEachElementBelow(resource.GetDocRoot().node(), [&](pugi::xml_node n) {
        const char* local = vorlan::jdf::localName(n);
        // The pool's own children are looked at here; the walk goes on into them anyway.
        if (*local == 'R' && std::strcmp(local, "ResourceLinkPool") == 0) {
            for (pugi::xml_node link = n.first_child(); link && !found; link = link.next_sibling())
                found = link.type() == pugi::node_element && refersHere(link);
        }
        const char* name = prefixedRef ? n.name() : local;
        if (!found && *name == refName[0] && refName == name) found = refersHere(n);
        return !found;
    });
    return found;
}

bool isImposition(const JDF::JDFNode& node) {
    return vorlan::os::equalsIgnoreCase(node.GetType().c_str(), L"Imposition") ||
           node.GetTypes().contains(L"Imposition");
}

}  // namespace

int LD_JDF::IncludesType(const JDF::JDFNode& node, const char* type) {
    if (node.isNull() || !type) return 0;
    JDF::WString wanted(type);
    JDF::WString nodeType = node.GetType();
    if (nodeType == wanted) return 1;
    if (nodeType == L"Combined" || nodeType == L"ProcessGroup") return node.GetTypes().contains(wanted) ? 1 : 0;
    return 0;
}

int LD_JDF::FindImpositionNode(JDF::JDFNode& root, JDF::JDFNode& out) {
    out = JDF::JDFNode();
    if (root.isNull()) return 1;
    JDF::WString type = root.GetType();
    if (type == L"Imposition" || (type == L"Combined" && IncludesType(root, "Imposition"))) {
        out = root;
        return 0;
    }
    JDF::vElement impositions = root.GetvJDFNode(L"Imposition", 6, false);
    if (!impositions.empty()) {
        out = impositions.front();
        return 0;
    }
    for (const JDF::KElement& combined : root.GetvJDFNode(L"Combined", 6, false)) {
        if (IncludesType(JDF::JDFNode(combined), "Imposition")) {
            out = combined;
            return 0;
        }
    }
    return 1;
}

bool LD_JDF::isProcessUsageMarks(const JDF::JDFResource& resource) { return hasLinkWithUsage(resource, "Marks"); }

bool LD_JDF::isProcessUsageDocument(const JDF::JDFResource& resource) {
    return hasLinkWithUsage(resource, "Document");
}

LDError LD_JDF::JDF_InitializeAndParseJDF(wchar_t* path) {
    uint64_t started = Debug_GetCurrTimeStampInMilliSeconds();
    try {
        JDF::PlatformUtils::Initialize();
    } catch (...) {
        lastError = LD_FAILED;
        return LD_FAILED;
    }
    if (!path) {
        lastError = LD_JDF_UNUSABLE;
        return LD_JDF_UNUSABLE;
    }
    if (!*path) {
        lastError = LD_FAILED;
        return LD_FAILED;
    }

    LD_JDFHandles& t = *ticket;
    // The parser lives while the ticket is read; the document stays with the handles.
    struct ParserScope {
        LD_JDFHandles& t;
        ~ParserScope() { t.parser.reset(); }
    } parserScope{t};
    t.rootNode = JDF::JDFNode();
    t.processNode = JDF::JDFNode();
    t.layoutElement = t.interpretingParamsElement = t.renderingParamsElement = JDF::KElement();
    t.digitalPrintingParamsElement = t.runListElement = JDF::KElement();

    try {
        t.parser = std::make_unique<JDF::JDFParser>();
        if (!t.parser->Parse(JDF::WString(path), true, true, true, nullptr, JDF::WString(), 0, 42)) {
            lastError = LD_JDF_UNUSABLE;
            return LD_JDF_UNUSABLE;
        }
        JDF::JDFDoc doc(t.parser->GetDocument());
        if (doc.isNull() || (t.rootNode = doc.GetJDFRoot()).isNull()) {
            lastError = LD_JDF_UNUSABLE;
            return LD_JDF_UNUSABLE;
        }

        // An automated layout is imposed elsewhere: the ticket goes on unchanged.
        if (CheckForLayoutNodeAutomatedTrue(t.rootNode)) {
            if (outputJdfPath) doc.Write2File(JDF::WString(vorlan::os::widen(outputJdfPath)));
            return LD_JDF_UNUSABLE;
        }

        // The process node: the imposition node, else the first Imposition JDF below the root,
        // else the root itself when it is (or combines) an imposition.
        if (FindImpositionNode(t.rootNode, t.processNode) != 0) {
            t.processNode = t.rootNode.GetChildByTagName(L"JDF", L"", 0, JDF::JDFAttributeMap(L"Type", L"Imposition"),
                                                         false, true);
            if (t.processNode.isNull()) {
                if (isImposition(t.rootNode)) t.processNode = t.rootNode;
                else lastError = LD_JDF_RESOURCE_MISSING;
            }
        }

        // The layout, or one injected from the run lists.
        if (!t.processNode.isNull()) {
            t.layoutElement = firstBelow(t.rootNode, L"Layout", L"*");
            if (t.layoutElement.isNull()) {
                lastError = LD_JDF_RESOURCE_MISSING;
                JDF::JDFLayout injected;
                if (injectLayoutNode(t.rootNode, injected)) {
                    t.layoutElement = injected;
                    lastError = LD_OK;
                }
            }
        } else {
            JDF::JDFLayout injected;
            if (injectLayoutNode(t.rootNode, injected)) {
                t.layoutElement = injected;
                t.processNode = t.rootNode;
                lastError = LD_OK;
            }
        }

        findParameterResources(t);
        for (const JDF::KElement* e : {&t.interpretingParamsElement, &t.renderingParamsElement,
                                       &t.digitalPrintingParamsElement})
            if (e->isNull()) lastError = LD_JDF_RESOURCE_MISSING;

        // The resources to walk: the process node's pool, or the one run list.
        JDF::vElement resources;
        if (t.processNode.isNull()) {
            t.runListElement = firstBelow(t.rootNode, L"RunList");
            if (t.runListElement.isNull()) lastError = LD_JDF_RESOURCE_MISSING;
            resources.push_back(t.runListElement);
        } else {
            t.runListElement = firstBelow(t.processNode, L"RunList");
            resources = t.processNode.GetResourcePool().GetPoolChildren(L"*", JDF::JDFAttributeMap(), L"*");
        }
        if (resources.empty()) lastError = LD_JDF_RESOURCE_MISSING;

        vorlan::jdf::RunListReading runLists(*this);
        for (const JDF::KElement& element : resources) {
            JDF::JDFResource resource(element);
            if (resource.isNull() || !resource.IsResource(true) || resource.JDFElement::GetStatus() == 3) continue;
            if (vorlan::os::equalsIgnoreCase(resource.GetLocalName().c_str(), L"RunList")) {
                vorlan::jdf::readRunListResource(runLists, resource);
            } else if (vorlan::os::equalsIgnoreCase(resource.GetLocalName().c_str(), L"Layout")) {
                if (vorlan::jdf::readLayoutResource(*this, resource) != LD_OK) return LD_FAILED;
            }
        }

        if (!t.renderingParamsElement.isNull()) {
            JDF::JDFRenderingParams rendering(t.renderingParamsElement);
            LD_Status status = rendering.GetStatus();
            if (status != 3) {
                renderingParams.status = status;
                renderingParams.Interleaved = rendering.KElement::GetAttribute(L"Interleaved") == L"true";
                (void)rendering.GetAttribute(L"Class");
            }
        }

        constructOrdinalTable();
    } catch (const std::exception&) {
        // A failure of the JDF layer or of memory while reading: the ticket is not usable.
        lastError = LD_FAILED;
        return LD_FAILED;
    }

    initializationTime = Debug_GetCurrTimeStampInMilliSeconds() - started;
    std::printf("Total initialization time taken: %llu milliseconds\n",
                static_cast<unsigned long long>(initializationTime));

    // A layout with surfaces needs content pages to place on them; without any, the job
    // cannot be versioned and is reported as unusable.
    if (jobHasTicket && numberOfSurfaces > 0 && m_OrdinalTable.empty()) {
        lastError = LD_JDF_UNUSABLE;
        return LD_JDF_UNUSABLE;
    }
    lastError = LD_OK;
    return LD_OK;
}

LDError LD_JDF::JDF_InitializeAndParseJDF(const char* path) {
    if (!path) return JDF_InitializeAndParseJDF(static_cast<wchar_t*>(nullptr));
    wchar_t* wide = vorlan::os::wideCopy(path);
    if (!wide) {
        lastError = LD_FAILED;
        return LD_FAILED;
    }
    LDError result = JDF_InitializeAndParseJDF(wide);
    std::free(wide);  // the reader keeps its own copies
    return result;
}
