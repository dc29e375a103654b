// Reads a version description (root OptionalContentGroupData) into the worker: the OCGs of each
// PDF, the versions with their per-object switches, and the die cuts.
#include <cstdlib>
#include <memory>
#include <new>

#include "platform/os/text.h"
#include "versions/description_text.h"
#include "versions/name_lists.h"
#include "versions/xml_tree.h"
#include "vorlan/LD_JDF.h"

using vorlan::versions::appendNameList;
using vorlan::versions::attributeFlag;
using vorlan::versions::attributeNumber;
using vorlan::versions::attributeText;
using vorlan::versions::newTextCopy;

namespace {

// Hands a new record to its owner list; the record is freed if the list cannot grow.
template <typename T>
T* adopt(std::vector<T*>& owner, std::unique_ptr<T> record) {
    owner.push_back(record.get());
    return record.release();
}

// Appends a new copy of text to list.
void appendCopy(std::vector<wchar_t*>& list, const std::wstring& text) {
    wchar_t* copy = newTextCopy(text);
    try {
        list.push_back(copy);
    } catch (...) {
        std::free(copy);
        throw;
    }
}

class DescriptionReader {
public:
    DescriptionReader(LD_JDF& worker, bool hasTicket)
        : worker_(worker),
          hasTicket_(hasTicket),
          nestedLayers_(worker.layerNameList),
          nestedSeparations_(worker.nestedComponentList) {}

    // Handles the root's children in document order; 0, or 9 for a pdfIndex naming no content run.
    LDError readChildren(const _kvXmlNode* root) {
        for (const _kvXmlNode* child = kvXmlFirstChild(root); child; child = kvXmlNextSibling(child)) {
            if (kvXmlTextEquals(child->name, "OptionalLayer")) {
                LDError result = readOptionalLayer(child);
                if (result != LD_OK) return result;
            } else if (kvXmlTextEquals(child->name, "Versions")) {
                if (worker_.IsEskoTechnicalVersion(const_cast<_kvXmlNode*>(child)) || worker_.exportMode)
                    readVersions(child);
                else if (!hasTicket_)
                    readSurfaceVersions(child);
            } else if (kvXmlTextEquals(child->name, "DieCut")) {
                readDieCut(child);
            }
        }
        return LD_OK;
    }

private:
    static LD_PDF* pdfOf(const LD_Run* run) { return run ? run->pdf : nullptr; }

    // The layer record of a PDF, made empty when the PDF has none yet.
    XMLLayerData* layerRecordFor(LD_PDF* pdf) {
        auto found = worker_.layerDataMap.find(pdf);
        if (found != worker_.layerDataMap.end()) return found->second;
        auto record = std::make_unique<XMLLayerData>();
        worker_.layerDataMap.emplace(pdf, record.get());
        return record.release();
    }

    LDError readOptionalLayer(const _kvXmlNode* layer) {
        XMLLayerData* records[2] = {nullptr, nullptr};
        if (!hasTicket_) {
            records[0] = worker_.layerDataMap.empty() ? layerRecordFor(worker_.inputPDF)
                                                      : worker_.layerDataMap.begin()->second;
        } else {
            const int32_t index = attributeNumber(layer, "pdfIndex");
            if (index < 0 || static_cast<size_t>(index) >= worker_.contentRuns.size()) {
                worker_.lastError = LD_REFERENCE_OUT_OF_RANGE;
                return LD_REFERENCE_OUT_OF_RANGE;
            }
            records[0] = layerRecordFor(pdfOf(worker_.contentRuns[index]));
            // The mark run of the same index gets the same entries (once, if it shares the record).
            if (static_cast<size_t>(index) < worker_.markRuns.size()) {
                XMLLayerData* mark = layerRecordFor(pdfOf(worker_.markRuns[index]));
                if (mark != records[0]) records[1] = mark;
            }
        }

        const std::wstring ocgName = attributeText(layer, "OCGName");
        const std::wstring displayName = attributeText(layer, "displayName");
        const bool isSep = attributeFlag(layer, "isSep");
        const bool isNested = attributeFlag(layer, "isNested");
        const bool defaultOn = attributeFlag(layer, "default");
        for (XMLLayerData* record : records) {
            if (!record) continue;
            if (isNested) {
                appendCopy(isSep ? record->nestedSepOCGNames : record->nestedLayerOCGNames, ocgName);
            } else {
                appendCopy(isSep ? record->sepOCGNames : record->layerOCGNames, ocgName);
                appendCopy(isSep ? record->sepDisplayNames : record->layerDisplayNames, displayName);
                appendCopy(defaultOn ? record->defaultOnOCGNames : record->defaultOffOCGNames, ocgName);
            }
        }
        if (isNested) {
            appendCopy(isSep ? worker_.nestedComponentList : worker_.layerNameList, ocgName);
            (isSep ? nestedSeparations_ : nestedLayers_).add(ocgName.c_str());
        }
        return LD_OK;
    }

    // Versions of an export or of an Esko technical description: every Version child, with its
    // position among all children of Versions.
    void readVersions(const _kvXmlNode* versions) {
        int32_t position = 0;
        for (const _kvXmlNode* child = kvXmlFirstChild(versions); child; child = kvXmlNextSibling(child), ++position) {
            if (!kvXmlTextEquals(child->name, "Version")) continue;
            auto version = std::make_unique<XMLVersionData>();
            version->name = newTextCopy(attributeText(child, "name"));
            version->position = position;
            version->copies = attributeNumber(child, "copies");
            version->enabled = attributeFlag(child, "enable");
            XMLVersionData* record = adopt(worker_.versions, std::move(version));
            for (const _kvXmlNode* surface = kvXmlFirstChild(child); surface; surface = kvXmlNextSibling(surface)) {
                if (kvXmlTextEquals(surface->name, "Surface"))
                    readSurface(surface, attributeNumber(surface, "index"), record->surfaces);
            }
        }
    }

    // Jobs without ticket: the surfaces of the first Version or InternalVersion, numbered in order.
    void readSurfaceVersions(const _kvXmlNode* versions) {
        const _kvXmlNode* version = kvXmlFirstChild(versions);
        while (version && !kvXmlTextEquals(version->name, "Version") &&
               !kvXmlTextEquals(version->name, "InternalVersion"))
            version = kvXmlNextSibling(version);
        if (!version) return;
        int32_t number = 0;
        for (const _kvXmlNode* surface = kvXmlFirstChild(version); surface; surface = kvXmlNextSibling(surface)) {
            if (!kvXmlTextEquals(surface->name, "Surface")) continue;
            XMLSurfaceData* record = readSurface(surface, number++, worker_.surfaceVersions);
            record->pageIndex = 0;
        }
    }

    XMLSurfaceData* readSurface(const _kvXmlNode* surface, int32_t index, std::vector<XMLSurfaceData*>& owner) {
        auto created = std::make_unique<XMLSurfaceData>();
        created->index = index;
        created->pageIndex = index;
        XMLSurfaceData* record = adopt(owner, std::move(created));
        for (const _kvXmlNode* object = kvXmlFirstChild(surface); object; object = kvXmlNextSibling(object)) {
            if (kvXmlTextEquals(object->name, "ContentObject")) readContentObject(object, record->contentObjects);
        }
        return record;
    }

    // The switches of one placed object. Nested names known so far are filtered out, as
    // removeNestedComponentsFromList does against the worker's lists; the counts kept beside those
    // lists make that one pass over the switches instead of one per nested name.
    void readContentObject(const _kvXmlNode* object, std::vector<XMLContentObjectData*>& owner) {
        auto created = std::make_unique<XMLContentObjectData>();
        created->index = attributeNumber(object, "index");
        XMLContentObjectData* record = adopt(owner, std::move(created));
        appendNameList(worker_, object, "LayerNameOn", record->layerNameOn);
        nestedLayers_.removeFrom(record->layerNameOn);
        appendNameList(worker_, object, "LayerNameOff", record->layerNameOff);
        nestedLayers_.removeFrom(record->layerNameOff);
        appendNameList(worker_, object, "SepNameOn", record->sepNameOn);
        nestedSeparations_.removeFrom(record->sepNameOn);
        appendNameList(worker_, object, "SepNameOff", record->sepNameOff);
        nestedSeparations_.removeFrom(record->sepNameOff);
    }

    // A later DieCut element decides dieEnabled; every child adds one die cut.
    void readDieCut(const _kvXmlNode* dieCut) {
        worker_.dieEnabled = attributeFlag(dieCut, "enable") && worker_.printDieLine;
        for (const _kvXmlNode* child = kvXmlFirstChild(dieCut); child; child = kvXmlNextSibling(child)) {
            auto created = std::make_unique<LD_DieCut>();
            created->index = attributeNumber(child, "index");
            LD_DieCut* die = adopt(worker_.m_XMLDieCuts, std::move(created));
            appendNameList(worker_, child, "dieLayerInternalNames", die->dieLayerInternalNames);
            appendNameList(worker_, child, "dieSepInternalNames", die->dieSepInternalNames);
        }
    }

    LD_JDF& worker_;
    const bool hasTicket_;
    vorlan::versions::NameCounts nestedLayers_;       // layerNameList, counted
    vorlan::versions::NameCounts nestedSeparations_;  // nestedComponentList, counted
};

// The description's records go when reading fails: nothing downstream may use half a description.
void releaseDescription(LD_JDF& worker) {
    worker.releaseVersions();
    worker.releaseSurfaceVersions();
    worker.releaseDieCuts();
    for (auto& [pdf, layers] : worker.layerDataMap) delete layers;
    worker.layerDataMap.clear();
    LD_FreeTextList(worker.layerNameList);
    LD_FreeTextList(worker.nestedComponentList);
    worker.dieEnabled = false;
}

}  // namespace

LDError LD_JDF::parseXMLBuffer(const char* buffer, long length, bool hasTicket, const char*) {
    if (length == 0 && hasTicket) {
        lastError = LD_OK;
        return LD_OK;
    }
    // Without bytes there is no description (a negative length or a null buffer reads as none).
    if (!buffer || length < 0) return LD_OK;

    LDError result = LD_OK;
    try {
        KvXmlDocumentPtr document(kvXmlCreateDocument());
        if (!document) throw std::bad_alloc();
        if (!kvXmlFeedBuffer(document.get(), buffer, static_cast<size_t>(length))) {
            lastError = LD_FAILED;
            return LD_FAILED;
        }
        const _kvXmlNode* root = kvXmlRoot(document.get());
        if (!root || !kvXmlTextEquals(root->name, "OptionalContentGroupData")) return LD_OK;
        defaultLayerMode = attributeFlag(root, "DefaultLayerMode");
        exportMode = !attributeText(root, "export").empty();
        result = DescriptionReader(*this, hasTicket).readChildren(root);
    } catch (const std::bad_alloc&) {
        lastError = LD_FAILED;
        result = LD_FAILED;
    }
    if (result != LD_OK) releaseDescription(*this);
    return result;
}

bool LD_JDF::IsEskoTechnicalVersion(_kvXmlNode* versions) {
    const _kvXmlNode* first = kvXmlFirstChild(versions);
    if (!first || !kvXmlTextEquals(first->name, "Version")) return false;
    const _kvXmlAttribute* name = kvXmlFindAttribute(first, "name");
    return name && kvXmlTextEquals(name->value, "EskoTechnicalVersion");
}

wchar_t* LD_JDF::getAttributeValue(_kvXmlNode* node, const wchar_t* attributeName) {
    if (!node || !attributeName) {
        lastError = LD_INVALID_INPUT;
        return nullptr;
    }
    try {
        return newTextCopy(attributeText(node, vorlan::os::toUtf8(attributeName).c_str()));
    } catch (const std::bad_alloc&) {
        lastError = LD_FAILED;
        return nullptr;
    }
}
