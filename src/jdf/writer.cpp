// The versioned ticket: one Combined process node with rendering and digital-printing
// parameters, the layout rebuilt from the model, one interpreting-parameter partition and one
// content (and marks) run-list partition per ordinal, and the output component. Built from the
// job model alone and saved atomically: a failed write leaves nothing at the output path.
#include <cstdlib>
#include <new>

#include "jdf/ticket_writing.h"
#include "platform/os/text.h"

namespace vorlan::jdf {

const wchar_t* contentTypeText(ContentType type) {
    switch (type) {
        case CONTENT_UNDEFINED: return L"Content undefined";
        case CONTENT_DIE_ONLY: return L"DieOnly";
        case CONTENT_DIE_WITH_CONTENT: return L"DieWithContent";
        case CONTENT_CONTENT: return L"Content";
    }
    return nullptr;
}

JDF::JDFRunList appendFilePart(JDF::JDFRunList& runList, int32_t& next, const JDF::WString& url,
                               const wchar_t* mimeType, ContentType type) {
    JDF::JDFRunList part = runPartition(runList, next++);
    JDF::JDFFileSpec file = need(need(part.GetCreateLayoutElement()).GetCreateFileSpec());
    file.SetURL(url);
    file.SetMimeType(mimeType);
    if (const wchar_t* text = contentTypeText(type)) setTicketAttribute(part, L"VersContentType", text);
    return part;
}

void setTicketAttribute(JDF::KElement& element, const wchar_t* name, const JDF::WString& value) {
    element.SetAttribute(JDF::WString(L"KAV_tkt:") + name, value, kTicketExtensionNs);
}

void setVersionTags(JDF::KElement& element, const wchar_t* name, int32_t index, int64_t copies) {
    setTicketAttribute(element, L"VersionName", name);
    setTicketAttribute(element, L"VersionIndex", JDF::WString::valueOf(index));
    setTicketAttribute(element, L"VersionCopyCount", JDF::WString::valueOf(static_cast<unsigned int>(copies)));
}

JDF::WString pdfURL(LD_JDF& worker, LD_PDF* pdf) {
    wchar_t* url = worker.getNativeFilePath(pdf->converted ? pdf->convertedPath : pdf->nativePath);
    if (!url) throw WriteFailure{};
    JDF::WString text(url);
    std::free(url);
    return text;
}

JDF::JDFNode startCombinedNode(JDF::JDFDoc& doc, const wchar_t* types) {
    JDF::JDFNode root = need(JDF::JDFNode(doc.GetRoot()));
    root.SetActivation(6);
    root.SetStatus(LD_NODE_READY);
    root.SetType(L"Combined");
    root.SetTypes(JDF::vWString(types));
    root.SetAttribute(L"xmlns:KAV_tkt", kTicketExtensionNs);
    root.SetAttribute(L"xmlns:ADBE", kAdobeExtensionNs);

    JDF::JDFRenderingParams rendering = need(root.AppendMatchingResource(L"RenderingParams", 1));
    rendering.SetInterleaved(true);
    rendering.SetStatus(LD_RESOURCE_AVAILABLE);
    need(root.AppendMatchingResource(L"DigitalPrintingParams", 1)).SetStatus(LD_RESOURCE_AVAILABLE);
    return root;
}

LDError writeTicket(LD_JDF& w, const char* outputPath, const std::function<LDError(JDF::JDFDoc&)>& build) {
    LDError result;
    try {
        JDF::JDFDoc doc(0);
        result = build(doc);
        if (result == LD_OK && (!outputPath || !doc.Write2File(JDF::WString(vorlan::os::widen(outputPath)))))
            result = LD_JDF_WRITE_FAILED;
    } catch (const WriteFailure&) {
        result = LD_JDF_WRITE_FAILED;
    } catch (const JDF::JDFException&) {
        result = LD_JDF_WRITE_FAILED;
    } catch (const std::bad_alloc&) {
        result = LD_JDF_WRITE_FAILED;
    }
    w.lastError = result;
    return result;
}

}  // namespace vorlan::jdf

namespace {

using namespace vorlan::jdf;

// Builds the whole document; throws WriteFailure (or a JDF layer exception) on the first failure.
// Returns LD_FAILED when the output component cannot be made.
LDError buildTicket(LD_JDF& w, JDF::JDFDoc& doc) {
    JDF::JDFNode root = startCombinedNode(doc, L"Imposition Interpreting DigitalPrinting Rendering");

    bool layout = writeLayout(w, root);
    bool interpreting = writeInterpretingParams(w, root);
    // A ticket without a layout and with one die cut gets its die partitions' files copied below,
    // which walks the run lists in the tree.
    const bool copiesDieFiles = !layout && interpreting && w.m_XMLDieCuts.size() == 1;
    const PartitionWriting runs = copiesDieFiles ? PartitionWriting::InTree : PartitionWriting::Deferred;
    if (!w.contentRuns.empty()) writeContentRunList(w, root, runs);
    if (!w.markRuns.empty()) writeMarksRunList(w, root, runs);

    if (root.AppendMatchingResource(L"Component", 2).isNull()) return LD_FAILED;
    if (layout && interpreting) {
        root.SetTypes(JDF::vWString(L"Imposition Interpreting Rendering DigitalPrinting"));
    } else if (layout) {
        root.SetTypes(JDF::vWString(L"Imposition Rendering DigitalPrinting"));
    } else if (interpreting) {
        root.SetTypes(JDF::vWString(L"Interpreting Rendering DigitalPrinting"));
        if (copiesDieFiles) w.duplicateRunListFiles(root);
    }
    return LD_OK;
}

}  // namespace

LDError LD_JDF::writeJDF(char* outputPath) {
    return writeTicket(*this, outputPath, [this](JDF::JDFDoc& doc) { return buildTicket(*this, doc); });
}
