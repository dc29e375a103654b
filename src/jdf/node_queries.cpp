// Queries on the ticket's nodes: status, activation, IDs and versions.
#include <chrono>

#include "jdf/ticket_handles.h"
#include "vorlan/LD_JDF.h"

namespace {

// Keeps texts for the caller until the next node query; returns pointers into them.
wchar_t* holdText(LD_JDFHandles& t, const std::wstring& text) {
    t.queryTexts.assign(1, text);
    return t.queryTexts.front().data();
}

}  // namespace

LD_Status LD_JDF::JDF_GetStatusOfNodeByType(JDFNode_Types type) {
    LD_JDFHandles& t = *ticket;
    switch (type) {
        case JDF_NODE_ROOT:
            return t.rootNode.GetStatus();
        case JDF_NODE_PROCESS:
            if (!t.processNode.isNull()) return t.processNode.GetStatus();
            lastError = LD_JDF_RESOURCE_MISSING;
            return 0;
        case JDF_NODE_LAYOUT:
            if (!t.layoutElement.isNull()) return JDF::JDFResource(t.layoutElement).GetStatus(false);
            lastError = LD_JDF_RESOURCE_MISSING;
            return 0;
        case JDF_NODE_INTERPRETING_PARAMS:
            if (!t.interpretingParamsElement.isNull()) return 0;
            lastError = LD_QUERY_TARGET_ABSENT;
            return 0;
        default:
            lastError = LD_QUERY_TARGET_ABSENT;
            return 0;
    }
}

LD_Activation LD_JDF::JDF_GetActivationOfProcessByType(JDFNode_Types type) {
    if (type == JDF_NODE_ROOT) return ticket->rootNode.GetActivation(true);
    if (type == JDF_NODE_PROCESS) return ticket->processNode.GetActivation(true);
    lastError = LD_QUERY_TARGET_ABSENT;
    return 0;
}

wchar_t* LD_JDF::JDF_GetIDofProcessByType(JDFNode_Types type) {
    if (type == JDF_NODE_ROOT) return holdText(*ticket, ticket->rootNode.GetID());
    if (type == JDF_NODE_PROCESS) return holdText(*ticket, ticket->processNode.GetID());
    lastError = LD_QUERY_TARGET_ABSENT;
    return nullptr;
}

wchar_t* LD_JDF::JDF_GetJDFVersion() { return holdText(*ticket, ticket->rootNode.GetVersion()); }

std::vector<wchar_t*> LD_JDF::JDF_GetICSVersions() {
    JDF::vWString entries = ticket->rootNode.GetICSVersions();
    ticket->queryTexts.assign(entries.begin(), entries.end());
    std::vector<wchar_t*> out;
    for (std::wstring& text : ticket->queryTexts) out.push_back(text.data());
    return out;
}

uint64_t LD_JDF::Debug_GetCurrTimeStampInMilliSeconds() {
    using namespace std::chrono;
    return static_cast<uint64_t>(duration_cast<milliseconds>(system_clock::now().time_since_epoch()).count());
}
