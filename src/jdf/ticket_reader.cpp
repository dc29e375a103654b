// Reads a JDF ticket into the job model: the process node, its resources, the run lists with
// their PDFs, the layout and the rendering parameters; then numbers the logical pages.
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <memory>
#include <set>
#include <string>
#include <vector>

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

constexpr const char* kParameterNames[] = {"InterpretingParams", "RenderingParams", "DigitalPrintingParams"};

JDF::KElement* parameterSlot(LD_JDFHandles& t, int k) {
    JDF::KElement* const slots[] = {&t.interpretingParamsElement, &t.renderingParamsElement,
                                    &t.digitalPrintingParamsElement};
    return slots[k];
}

// The parameter resource of that local name, or -1.
int parameterIndex(const char* local) {
    for (int k = 0; k < 3; ++k)
        if (*local == *kParameterNames[k] && std::strcmp(local, kParameterNames[k]) == 0) return k;
    return -1;
}

// The first InterpretingParams, RenderingParams and DigitalPrintingParams below the root, each
// as firstBelow finds it, in one walk: absent ones would otherwise cost a walk of the whole
// document each.
void findParameterResources(LD_JDFHandles& t) {
    for (int k = 0; k < 3; ++k) *parameterSlot(t, k) = JDF::KElement();
    int missing = 3;
    vorlan::jdf::forEachElementBelow(t.rootNode.node(), [&](pugi::xml_node n) {
        int k = parameterIndex(vorlan::jdf::localName(n));
        if (k >= 0 && parameterSlot(t, k)->isNull()) {
            *parameterSlot(t, k) = JDF::KElement(n, t.rootNode.document());
            --missing;
        }
        return missing > 0;
    });
}

bool endsWithRef(const char* name) {
    size_t length = std::strlen(name);
    return length >= 3 && std::memcmp(name + length - 3, "Ref", 3) == 0;
}

// What the reader asks of the whole document, gathered in one walk of it right after parsing
// (a walk costs about a fifth of the parse on a large ticket):
//  - whether any element has Automated="true": without one, no layout can be automated, and
//    the look-up that would build the document's ID index is not needed;
//  - the first parameter resources below the root, when the root is the document element;
//  - the elements that may link a resource, for the run lists' ProcessUsage.
// Valid while the document is unchanged.
struct DocumentSurvey {
    bool automatedTrue = false;
    bool parametersFound = false;  // the three slots below hold findParameterResources' answer
    JDF::KElement parameters[3];
    std::vector<vorlan::jdf::LinkCandidate> links;

    explicit DocumentSurvey(const LD_JDFHandles& t) {
        pugi::xml_node top = t.rootNode.GetDocRoot().node();
        if (!top) return;
        parametersFound = top == t.rootNode.node();
        automatedTrue = isAutomatedTrue(top);
        vorlan::jdf::forEachElementBelow(top, [&](pugi::xml_node n) {
            if (!automatedTrue) automatedTrue = isAutomatedTrue(n);
            const char* local = vorlan::jdf::localName(n);
            if (parametersFound) {
                int k = parameterIndex(local);
                if (k >= 0 && parameters[k].isNull()) parameters[k] = JDF::KElement(n, t.rootNode.document());
            }
            if (*local == 'R' && std::strcmp(local, "ResourceLinkPool") == 0) {
                for (pugi::xml_node c = n.first_child(); c; c = c.next_sibling())
                    if (c.type() == pugi::node_element) links.push_back({c, true});
            }
            if (endsWithRef(n.name())) links.push_back({n, false});
            return true;
        });
    }

private:
    static bool isAutomatedTrue(pugi::xml_node n) { return std::strcmp(n.attribute("Automated").value(), "true") == 0; }
};

// Whether a ProcessUsage value equals usage (ASCII) ignoring case, as the wide comparison
// has it; text beyond ASCII is compared in wide form.
bool sameUsage(const char* value, const char* usage) {
    if (vorlan::os::equalsIgnoreCaseAscii(value, usage)) return true;
    for (const char* c = value; *c; ++c)
        if (static_cast<unsigned char>(*c) >= 0x80)
            return vorlan::os::equalsIgnoreCase(JDF::WString(value).c_str(), JDF::WString(usage).c_str());
    return false;
}

// The links GetLinks finds for a resource: elements of a ResourceLinkPool, and
// <resource name>Ref elements, whose rRef is the resource root's ID.
class LinkMatch {
public:
    explicit LinkMatch(const JDF::JDFResource& resource) {
        if (resource.isNull()) return;
        id_ = resource.GetResourceRoot().node().attribute("ID").value();
        refName_ = std::string(resource.node().name()) + "Ref";
        prefixedRef_ = refName_.find(':') != std::string::npos;
    }
    bool possible() const { return *id_ != '\0'; }
    bool isRef(pugi::xml_node n) const {
        const char* name = prefixedRef_ ? n.name() : vorlan::jdf::localName(n);
        return *name == refName_[0] && refName_ == name;
    }
    bool links(pugi::xml_node n, const char* usage) const {
        return std::strcmp(n.attribute("rRef").value(), id_) == 0 && sameUsage(n.attribute("ProcessUsage").value(), usage);
    }

private:
    const char* id_ = "";
    std::string refName_;
    bool prefixedRef_ = false;
};

// hasLinkWithUsage by a walk of the document.
bool walkForLinkWithUsage(const JDF::JDFResource& resource, const char* usage) {
    LinkMatch match(resource);
    if (!match.possible()) return false;
    bool found = false;
    vorlan::jdf::forEachElementBelow(resource.GetDocRoot().node(), [&](pugi::xml_node n) {
        const char* local = vorlan::jdf::localName(n);
        // The pool's own children are looked at here; the walk goes on into them anyway.
        if (*local == 'R' && std::strcmp(local, "ResourceLinkPool") == 0) {
            for (pugi::xml_node link = n.first_child(); link && !found; link = link.next_sibling())
                found = link.type() == pugi::node_element && match.links(link, usage);
        }
        if (!found && match.isRef(n)) found = match.links(n, usage);
        return !found;
    });
    return found;
}

}  // namespace

bool vorlan::jdf::hasLinkWithUsage(const JDF::JDFResource& resource, const char* usage,
                                   const std::vector<LinkCandidate>& candidates) {
    LinkMatch match(resource);
    if (!match.possible()) return false;
    for (const LinkCandidate& c : candidates)
        if ((c.inPool || match.isRef(c.node)) && match.links(c.node, usage)) return true;
    return false;
}

namespace {

// After the node's own pool children: the resources it links from its ancestors' pools (MIS
// and imposition tools keep them in the root's pool), in link order, each once.
void appendLinkedResources(const JDF::JDFNode& node, JDF::vElement& resources) {
    std::set<pugi::xml_node> walked;
    for (const JDF::KElement& r : resources) walked.insert(r.node());
    for (const JDF::KElement& r : node.GetLinkedResources())
        if (walked.insert(r.node()).second) resources.push_back(r);
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

bool LD_JDF::isProcessUsageMarks(const JDF::JDFResource& resource) { return walkForLinkWithUsage(resource, "Marks"); }

bool LD_JDF::isProcessUsageDocument(const JDF::JDFResource& resource) {
    return walkForLinkWithUsage(resource, "Document");
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
    t.ticketHasLayout = t.droppedLayout = false;

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

        DocumentSurvey survey(t);
        bool changed = false;  // the document since the survey

        // An automated layout is imposed elsewhere: the ticket goes on unchanged.
        if (survey.automatedTrue && CheckForLayoutNodeAutomatedTrue(t.rootNode)) {
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
            t.ticketHasLayout = !t.layoutElement.isNull();
            if (t.layoutElement.isNull()) {
                lastError = LD_JDF_RESOURCE_MISSING;
                JDF::JDFLayout injected;
                changed = true;
                if (injectLayoutNode(t.rootNode, injected)) {
                    t.layoutElement = injected;
                    lastError = LD_OK;
                }
            }
        } else {
            t.ticketHasLayout = !firstBelow(t.rootNode, L"Layout", L"*").isNull();
            JDF::JDFLayout injected;
            changed = true;
            if (injectLayoutNode(t.rootNode, injected)) {
                t.layoutElement = injected;
                t.processNode = t.rootNode;
                lastError = LD_OK;
            }
        }

        if (survey.parametersFound && !changed) {
            for (int k = 0; k < 3; ++k) *parameterSlot(t, k) = survey.parameters[k];
        } else {
            findParameterResources(t);
        }
        for (const JDF::KElement* e : {&t.interpretingParamsElement, &t.renderingParamsElement,
                                       &t.digitalPrintingParamsElement})
            if (e->isNull()) lastError = LD_JDF_RESOURCE_MISSING;

        // The resources to walk: the process node's pool and what it links, or the one run list.
        JDF::vElement resources;
        if (t.processNode.isNull()) {
            t.runListElement = firstBelow(t.rootNode, L"RunList");
            if (t.runListElement.isNull()) lastError = LD_JDF_RESOURCE_MISSING;
            resources.push_back(t.runListElement);
        } else {
            t.runListElement = firstBelow(t.processNode, L"RunList");
            resources = t.processNode.GetResourcePool().GetPoolChildren(L"*", JDF::JDFAttributeMap(), L"*");
            appendLinkedResources(t.processNode, resources);
        }
        if (resources.empty()) lastError = LD_JDF_RESOURCE_MISSING;

        // The ticket's PDFs lie in the job's data folder, or beside a ticket read on its own.
        std::string ticketFolder = std::filesystem::path(vorlan::os::narrow(path)).parent_path().string();
        std::wstring pdfFolder = ticketDataPath ? std::wstring(ticketDataPath)
                                                : vorlan::os::widen(ticketFolder.empty() ? "." : ticketFolder.c_str());
        vorlan::jdf::RunListReading runLists(*this, pdfFolder);
        if (!changed) runLists.linkCandidates = &survey.links;
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
    // cannot be versioned and is reported as unusable. A ticket that came without a layout is
    // not versioned: it gets a ticket of its own from its run lists.
    if (jobHasTicket && t.ticketHasLayout && numberOfSurfaces > 0 && m_OrdinalTable.empty()) {
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
