// Version description text for the ink scan.
#include "pdf/description_writer.h"

#include "platform/os/file_system.h"

namespace {

std::string joined(const std::vector<std::string>& names) {
    std::string out;
    for (size_t i = 0; i < names.size(); ++i) {
        if (i) out += ',';
        out += escapeXmlAttribute(names[i]);
    }
    return out;
}

}  // namespace

std::string escapeXmlAttribute(const std::string& value) {
    std::string out;
    out.reserve(value.size());
    for (char c : value) {
        switch (c) {
            case '&': out += "&amp;"; break;
            case '<': out += "&lt;"; break;
            case '>': out += "&gt;"; break;
            case '"': out += "&quot;"; break;
            case '\t': out += "&#9;"; break;
            case '\n': out += "&#10;"; break;
            case '\r': out += "&#13;"; break;
            default: out += c; break;
        }
    }
    return out;
}

std::string formatScanDescription(const ScanDescription& d) {
    const char* eol = "\r\n";
    std::string out;
    out += "<?xml version=\"1.0\" encoding=\"UTF-8\" standalone=\"no\" ?>";
    out += eol;
    out += "<OptionalContentGroupData>";
    out += eol;
    for (const std::string& ink : d.layerInks) {
        const std::string name = escapeXmlAttribute(ink);
        out += "<OptionalLayer pdfIndex=\"0\" OCGName=\"" + name + "\" displayName=\"" + name +
               "\" isSep=\"true\"/>" + eol;
    }
    out += "<Versions>";
    out += eol;
    out += "<Version enable=\"true\" name=\"" + escapeXmlAttribute(d.versionName) + "\">" + eol;
    const std::string off = joined(d.offInks);
    for (int n = 0; n < d.pageCount; ++n) {
        out += "<Surface index=\" " + std::to_string(n) + " \">" + eol;
        out += "<ContentObject index=\"0\" SepNameOff=\"" + off + "\"/>" + eol;
        out += "</Surface>";
        out += eol;
    }
    out += "</Version>";
    out += eol;
    out += "</Versions>";
    out += eol;
    if (d.writeDieCut) {
        out += "<DieCut enable=\"true\" name=\"AutoDie\">";
        out += eol;
        out += "<Surface index=\"0\" dieSepInternalNames=\"" + joined(d.dieInks) + "\"/>" + eol;
        out += "</DieCut>";
        out += eol;
    }
    out += "</OptionalContentGroupData>";
    out += eol;
    return out;
}

bool writeScanDescription(const char* path, const ScanDescription& description) {
    if (!path || !*path) return false;
    return vorlan::os::writeFileAtomically(path, formatScanDescription(description));
}
