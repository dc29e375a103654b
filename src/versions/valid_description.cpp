// The quick test whether a file is a version description.
#include "versions/valid_description.h"

#include "versions/xml_tree.h"

bool isVersionDescriptionFile(const char* path) {
    if (!path) return false;
    KvXmlDocumentPtr document(kvXmlCreateDocument());
    if (!document || !kvXmlFeedFile(document.get(), path)) return false;
    const _kvXmlNode* root = kvXmlRoot(document.get());
    return root && kvXmlTextEquals(root->name, "OptionalContentGroupData");
}
