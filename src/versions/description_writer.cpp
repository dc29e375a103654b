// Version description text for descriptions made from inks.
#include "versions/description_writer.h"

#include "platform/os/file_system.h"

namespace {

constexpr const char* kEol = "\r\n";

void appendJoined(std::string& out, const std::vector<std::string>& names) {
    for (size_t i = 0; i < names.size(); ++i) {
        if (i) out += ',';
        out += escapeXmlAttribute(names[i]);
    }
}

void appendLine(std::string& out, const char* text) {
    out += text;
    out += kEol;
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

std::string formatInkDescription(const InkDescription& d) {
    std::string out;
    appendLine(out, "<?xml version=\"1.0\" encoding=\"UTF-8\" standalone=\"no\" ?>");
    appendLine(out, "<OptionalContentGroupData>");
    for (const InkDescription::Layer& layer : d.layers) {
        const std::string name = escapeXmlAttribute(layer.ink);
        out += "<OptionalLayer pdfIndex=\"" + std::to_string(layer.pdfIndex) + "\" OCGName=\"" + name +
               "\" displayName=\"" + name + "\" isSep=\"true\"/>" + kEol;
    }
    appendLine(out, "<Versions>");
    out += "<Version enable=\"true\" name=\"" + escapeXmlAttribute(d.versionName) + "\">" + kEol;
    for (size_t s = 0; s < d.surfaces.size(); ++s) {
        out += "<Surface index=\" " + std::to_string(s) + " \">" + kEol;
        for (const InkDescription::ContentObject& object : d.surfaces[s]) {
            out += "<ContentObject index=\"" + std::to_string(object.index) + "\" SepNameOff=\"";
            if (object.sepNameOff) appendJoined(out, *object.sepNameOff);
            out += "\"/>";
            out += kEol;
        }
        appendLine(out, "</Surface>");
    }
    appendLine(out, "</Version>");
    appendLine(out, "</Versions>");
    if (d.writeDieCut) {
        appendLine(out, "<DieCut enable=\"true\" name=\"AutoDie\">");
        out += "<Surface index=\"0\" dieSepInternalNames=\"";
        appendJoined(out, d.dieInks);
        out += "\"/>";
        out += kEol;
        appendLine(out, "</DieCut>");
    }
    appendLine(out, "</OptionalContentGroupData>");
    return out;
}

bool writeInkDescription(const char* path, const InkDescription& description) {
    if (!path || !*path) return false;
    return vorlan::os::writeFileAtomically(path, formatInkDescription(description));
}
