#include "jobpaths/separation_variants.h"

#include <cstdlib>

#include "platform/os/text.h"
#include "vorlan/LD_JDF.h"

namespace vorlan::jobpaths {

void setVariantPath(wchar_t*& field, const std::string& path) {
    std::free(field);
    field = vorlan::os::wideCopy(path.c_str());
    if (!field) field = static_cast<wchar_t*>(std::calloc(1, sizeof(wchar_t)));
}

std::vector<int> writeSeparationVariants(LD_JDF& worker, const wchar_t* input,
                                         const std::vector<vorlan::pdf::SeparationVariant>& variants) {
    const std::string path = vorlan::os::narrow(input);
    return vorlan::pdf::rewriteSeparationVariants(worker.zipFileSystem, path.c_str(), variants);
}

}  // namespace vorlan::jobpaths
