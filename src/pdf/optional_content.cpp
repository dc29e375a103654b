// Optional-content catalog helpers.
#include "pdf/optional_content.h"

#include <exception>

namespace vorlan::pdf {
namespace {

QPDFObjectHandle ensureDictionary(QPDFObjectHandle parent, const char* key) {
    QPDFObjectHandle dict = parent.getKey(key);
    if (!dict.isDictionary()) {
        dict = QPDFObjectHandle::newDictionary();
        parent.replaceKey(key, dict);
    }
    return dict;
}

QPDFObjectHandle ensureArray(QPDFObjectHandle parent, const char* key) {
    QPDFObjectHandle array = parent.getKey(key);
    if (!array.isArray()) {
        array = QPDFObjectHandle::newArray();
        parent.replaceKey(key, array);
    }
    return array;
}

bool contains(QPDFObjectHandle array, QPDFObjectHandle item) {
    for (QPDFObjectHandle element : array.aitems())
        if (element.isSameObjectAs(item)) return true;
    return false;
}

// Drops the null entries of an array (direct nulls and references to objects that no longer
// exist): they name no group, and some readers stop reading a group list at the first one.
void dropNulls(QPDFObjectHandle array) {
    for (int i = array.getArrayNItems() - 1; i >= 0; --i)
        if (array.getArrayItem(i).isNull()) array.eraseItem(i);
}

void removeFrom(QPDFObjectHandle array, QPDFObjectHandle item) {
    if (!array.isArray()) return;
    for (int i = array.getArrayNItems() - 1; i >= 0; --i)
        if (array.getArrayItem(i).isSameObjectAs(item)) array.eraseItem(i);
}

QPDFObjectHandle defaultConfiguration(QPDF& pdf) {
    QPDFObjectHandle properties = pdf.getRoot().getKey("/OCProperties");
    return properties.isDictionary() ? properties.getKey("/D") : QPDFObjectHandle::newNull();
}

}  // namespace

std::vector<QPDFObjectHandle> documentOCGs(QPDF& pdf) {
    std::vector<QPDFObjectHandle> groups;
    try {
        QPDFObjectHandle properties = pdf.getRoot().getKey("/OCProperties");
        QPDFObjectHandle ocgs = properties.isDictionary() ? properties.getKey("/OCGs") : QPDFObjectHandle::newNull();
        if (ocgs.isArray())
            for (QPDFObjectHandle ocg : ocgs.aitems())
                if (ocg.isIndirect() && ocg.isDictionary()) groups.push_back(ocg);
    } catch (const std::exception&) {
    }
    return groups;
}

std::string ocgName(QPDFObjectHandle ocg) {
    QPDFObjectHandle name = ocg.isDictionary() ? ocg.getKey("/Name") : QPDFObjectHandle::newNull();
    return name.isString() ? name.getUTF8Value() : std::string();
}

QPDFObjectHandle findOrCreateOCG(QPDF& pdf, const std::string& name) {
    try {
        QPDFObjectHandle ocg = QPDFObjectHandle::newNull();
        for (QPDFObjectHandle candidate : documentOCGs(pdf)) {
            if (ocgName(candidate) == name) {
                ocg = candidate;
                break;
            }
        }
        QPDFObjectHandle root = pdf.getRoot();
        QPDFObjectHandle properties = ensureDictionary(root, "/OCProperties");
        QPDFObjectHandle ocgs = properties.getKey("/OCGs");
        const bool hadGroups = ocgs.isArray();
        if (!hadGroups) ocgs = ensureArray(properties, "/OCGs");
        dropNulls(ocgs);
        QPDFObjectHandle config = ensureDictionary(properties, "/D");
        QPDFObjectHandle order = config.getKey("/Order");
        if (!order.isArray()) {  // unlisted groups would drop out of viewers' lists: list them first
            order = QPDFObjectHandle::newArray();
            if (hadGroups)
                for (QPDFObjectHandle existing : ocgs.aitems()) order.appendItem(existing);
            config.replaceKey("/Order", order);
        }
        dropNulls(order);
        if (ocg.isNull()) {
            ocg = pdf.makeIndirectObject(QPDFObjectHandle::parse("<< /Type /OCG >>"));
            ocg.replaceKey("/Name", QPDFObjectHandle::newUnicodeString(name));
            ocgs.appendItem(ocg);
        }
        ocg.replaceKey("/Intent", QPDFObjectHandle::parse("[/View /Print]"));
        removeFrom(config.getKey("/ON"), ocg);
        QPDFObjectHandle off = ensureArray(config, "/OFF");
        if (!contains(off, ocg)) off.appendItem(ocg);
        order.appendItem(ocg);  // a group that existed is listed once more, at the end
        return ocg;
    } catch (const std::exception&) {
        return QPDFObjectHandle::newNull();
    }
}

void clearDefaultOrder(QPDF& pdf) {
    try {
        QPDFObjectHandle config = defaultConfiguration(pdf);
        QPDFObjectHandle order = config.isDictionary() ? config.getKey("/Order") : QPDFObjectHandle::newNull();
        if (!order.isArray()) return;
        for (int i = order.getArrayNItems() - 1; i >= 0; --i) order.eraseItem(i);
    } catch (const std::exception&) {
    }
}

bool hasOptionalContentMembership(QPDFObjectHandle oc) {
    if (!oc.isDictionary()) return false;
    QPDFObjectHandle type = oc.getKey("/Type");
    if (type.isNameAndEquals("/OCG")) return true;
    QPDFObjectHandle groups = oc.getKey("/OCGs");
    if (groups.isDictionary()) return true;
    return groups.isArray() && groups.getArrayNItems() > 0;
}

}  // namespace vorlan::pdf
