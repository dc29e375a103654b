// Release of the version-description records: each owns its texts and the records below it.
#include <cstdlib>

#include "vorlan/LD_Records.h"
#include "vorlan/XMLVersionRecords.h"

XMLContentObjectData::~XMLContentObjectData() {
    LD_FreeTextList(layerNameOn);
    LD_FreeTextList(layerNameOff);
    LD_FreeTextList(sepNameOn);
    LD_FreeTextList(sepNameOff);
}

XMLSurfaceData::~XMLSurfaceData() {
    for (XMLContentObjectData* object : contentObjects) delete object;
}

XMLVersionData::~XMLVersionData() {
    std::free(name);
    for (XMLSurfaceData* surface : surfaces) delete surface;
}

XMLLayerData::~XMLLayerData() {
    for (auto* list : {&sepOCGNames, &sepDisplayNames, &layerOCGNames, &layerDisplayNames, &nestedSepOCGNames,
                       &nestedLayerOCGNames, &defaultOnOCGNames, &defaultOffOCGNames})
        LD_FreeTextList(*list);
}
