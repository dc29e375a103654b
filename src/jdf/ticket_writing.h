// The pieces of the versioned-ticket writer (writer.cpp drives them).
//
// Every piece builds elements through the JDF layer and throws WriteFailure when the layer hands
// back a null element, so the first failure ends the write before anything is saved.
#pragma once

#include <algorithm>
#include <functional>

#include "platform/jdf/jdf.h"
#include "vorlan/LD_JDF.h"

namespace vorlan::jdf {

// Namespaces of the ticket extensions the writer uses.
inline const wchar_t* const kTicketExtensionNs = L"http://www.vorlan.org/JDF/ticket/1.0";
inline const wchar_t* const kAdobeExtensionNs = L"http://ns.adobe.com/jdf/1.0/";

struct WriteFailure {};

// The element, or WriteFailure when the layer gave none.
template <typename Element>
Element need(Element element) {
    if (element.isNull()) throw WriteFailure{};
    return element;
}

// The Run partition of one ordinal. Each is made once, in ordinal order, so it can be appended
// outright (the element GetCreatePartition would make, without searching the ones made so far).
template <typename Resource>
Resource runPartition(Resource& resource, int32_t ordinal) {
    return need(Resource(resource.AddPartition(20, JDF::WString::valueOf(ordinal))));
}

// How a resource's per-ordinal partitions are written: into the tree, or made batch by batch
// while the ticket is saved (the document then never holds them all; see KElement::DeferChildren).
// Deferred partitions are out of reach of anything that walks the tree before the save.
enum class PartitionWriting { InTree, Deferred };
inline constexpr int32_t kDeferredPartitionBatch = 512;

// Makes the Run partitions of ordinals 0 to count - 1 with makeOne(parent, k), which appends the
// partition of ordinal k (or none) to parent. Deferred, makeOne runs during the save, so it and
// what it refers to must outlive the save; what it throws fails the save.
template <typename Resource, typename MakeOne>
void writeRunPartitions(Resource& resource, int32_t count, PartitionWriting writing, MakeOne makeOne) {
    if (count <= 0) return;
    if (writing == PartitionWriting::InTree) {
        for (int32_t k = 0; k < count; ++k) makeOne(resource, k);
        return;
    }
    resource.AddPartIDKey(20);  // what the first partition would have added to the resource
    resource.DeferChildren([count, next = int32_t{0}, makeOne](JDF::KElement& scratch) mutable {
        Resource parent(scratch);
        for (const int32_t end = next + std::min(count - next, kDeferredPartitionBatch); next < end; ++next)
            makeOne(parent, next);
        return next < count;
    });
}

// Appends the next Run partition (numbered by `next`, which moves on) for a file: a
// LayoutElement / FileSpec with the URL and MIME type, and the KAV_tkt:VersContentType of the type.
JDF::JDFRunList appendFilePart(JDF::JDFRunList& runList, int32_t& next, const JDF::WString& url,
                               const wchar_t* mimeType, ContentType type);

// The KAV_tkt:VersContentType text of a content type; null for a value that has none.
const wchar_t* contentTypeText(ContentType type);

// Sets a KAV_tkt: attribute.
void setTicketAttribute(JDF::KElement& element, const wchar_t* name, const JDF::WString& value);

// KAV_tkt:VersionName, VersionIndex and VersionCopyCount (the count as an unsigned 32-bit value).
void setVersionTags(JDF::KElement& element, const wchar_t* name, int32_t index, int64_t copies);

// The file URL of a PDF: of its converted copy when there is one, else of the file itself.
JDF::WString pdfURL(LD_JDF& worker, LD_PDF* pdf);

// The root of a new ticket as one Combined node: activation, status, Type, Types, the extension
// namespaces, RenderingParams (Interleaved) and DigitalPrintingParams.
JDF::JDFNode startCombinedNode(JDF::JDFDoc& doc, const wchar_t* types);

// Builds a new ticket with `build` and saves it atomically to outputPath. LD_JDF_WRITE_FAILED when
// building throws (WriteFailure, a JDF layer exception, out of memory) or the save fails: nothing
// new is then left at the path. Otherwise the result of `build` (the ticket is saved only when it
// is LD_OK). Sets the worker's last error.
LDError writeTicket(LD_JDF& worker, const char* outputPath, const std::function<LDError(JDF::JDFDoc&)>& build);

// The ordinal-table row with ordinal k (at position k unless rows were moved); null when none.
LD_OrdinalTableElement* rowOf(LD_JDF& worker, int32_t k);
// Pages = the one page.
void setSinglePage(JDF::JDFRunList& part, int32_t page);

// The Layout resource rebuilt from the model; false when the model has no signature.
bool writeLayout(LD_JDF& worker, JDF::JDFNode& root);
// The InterpretingParams resource (one Run partition per ordinal, deferred); false when the
// ordinal table is empty.
bool writeInterpretingParams(LD_JDF& worker, JDF::JDFNode& root);
// The content and marks run lists, one Run partition per ordinal.
void writeContentRunList(LD_JDF& worker, JDF::JDFNode& root, PartitionWriting writing);
void writeMarksRunList(LD_JDF& worker, JDF::JDFNode& root, PartitionWriting writing);

}  // namespace vorlan::jdf
