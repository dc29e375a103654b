// Test PDF generator.
#include "test_pdf.h"

#include <qpdf/QPDFPageDocumentHelper.hh>
#include <qpdf/QPDFWriter.hh>

#include <cstdio>

namespace vorlan::test {

TestPdf::TestPdf() { pdf_.emptyPDF(); }

std::string TestPdf::ref(QPDFObjectHandle object) {
    return std::to_string(object.getObjectID()) + " " + std::to_string(object.getGeneration()) + " R";
}

std::string pdfName(const std::string& name) {
    std::string out = "/";
    for (unsigned char c : name) {
        if (c < 0x21 || c > 0x7e || c == '#' || c == '/' || c == '(' || c == ')' || c == '<' ||
            c == '>' || c == '[' || c == ']' || c == '{' || c == '}' || c == '%') {
            char hex[4];
            std::snprintf(hex, sizeof hex, "#%02X", c);
            out += hex;
        } else {
            out += static_cast<char>(c);
        }
    }
    return out;
}

QPDFObjectHandle TestPdf::object(const std::string& syntax) {
    return pdf_.makeIndirectObject(QPDFObjectHandle::parse(&pdf_, syntax));
}

QPDFObjectHandle TestPdf::stream(const std::string& dict, const std::string& data) {
    QPDFObjectHandle s = QPDFObjectHandle::newStream(&pdf_, data);
    QPDFObjectHandle d = QPDFObjectHandle::parse(&pdf_, dict);
    for (auto& key : d.getKeys()) s.getDict().replaceKey(key, d.getKey(key));
    return s;
}

QPDFObjectHandle TestPdf::form(const std::string& content, const std::string& resources) {
    return stream("<< /Type /XObject /Subtype /Form /BBox [0 0 200 100] /Resources " + resources + " >>",
                  content);
}

QPDFObjectHandle TestPdf::image(const std::string& colourSpace, int components, const std::string& extra) {
    std::string data(static_cast<size_t>(4 * components), '\x80');
    return stream("<< /Type /XObject /Subtype /Image /Width 2 /Height 2 /BitsPerComponent 8 /ColorSpace " +
                      colourSpace + " " + extra + " >>",
                  data);
}

std::string TestPdf::separation(const std::string& name) {
    QPDFObjectHandle fn = object("<< /FunctionType 2 /Domain [0 1] /C0 [0 0 0 0] /C1 [0.1 0.6 0.9 0] /N 1 >>");
    return "[/Separation " + pdfName(name) + " /DeviceCMYK " + ref(fn) + "]";
}

std::string TestPdf::deviceN(const std::vector<std::string>& names, bool nChannel) {
    std::string list, domain, roll;
    for (const std::string& n : names) {
        list += pdfName(n) + " ";
        domain += "0 1 ";
    }
    // Sum of the tints into the black of the alternate space.
    std::string program = "{";
    for (size_t i = 1; i < names.size(); ++i) program += " add";
    program += " 0 0 0 4 -1 roll dup 1 gt {pop 1} if }";
    QPDFObjectHandle fn = stream("<< /FunctionType 4 /Domain [" + domain + "] /Range [0 1 0 1 0 1 0 1] >>", program);
    std::string attributes;
    if (nChannel) {
        std::string colorants;
        for (const std::string& n : names) colorants += pdfName(n) + " " + separation(n) + " ";
        attributes = " << /Subtype /NChannel /Colorants << " + colorants + ">> >>";
    }
    return "[/DeviceN [" + list + "] /DeviceCMYK " + ref(fn) + attributes + "]";
}

QPDFObjectHandle TestPdf::addPage(const std::string& content, const std::string& resources,
                                  const TestPageOptions& options) {
    std::string dict = "<< /Type /Page /MediaBox " + options.mediaBox + " /Resources " + resources;
    if (!options.cropBox.empty()) dict += " /CropBox " + options.cropBox;
    if (!options.trimBox.empty()) dict += " /TrimBox " + options.trimBox;
    if (options.rotate) dict += " /Rotate " + std::to_string(options.rotate);
    dict += " >>";
    QPDFObjectHandle page = pdf_.makeIndirectObject(QPDFObjectHandle::parse(&pdf_, dict));
    page.replaceKey("/Contents", QPDFObjectHandle::newStream(&pdf_, content));
    QPDFPageDocumentHelper(pdf_).addPage(page, false);
    pages_.push_back(page);
    return page;
}

void TestPdf::setXmp(const std::string& packet) {
    QPDFObjectHandle metadata = stream("<< /Type /Metadata /Subtype /XML >>", packet);
    pdf_.getRoot().replaceKey("/Metadata", metadata);
}

void TestPdf::write(const std::string& path) {
    QPDFWriter writer(pdf_, path.c_str());
    writer.setStaticID(true);
    writer.setCompressStreams(false);
    writer.write();
}

void writeSpotPdf(const std::string& path, const std::vector<std::vector<std::string>>& pageInks,
                  const std::string& xmp) {
    TestPdf pdf;
    for (const std::vector<std::string>& inks : pageInks) {
        std::string spaces, content = "0 0 0 1 k 10 10 20 20 re f\n";
        for (size_t i = 0; i < inks.size(); ++i) {
            spaces += "/S" + std::to_string(i) + " " + pdf.separation(inks[i]) + " ";
            content += "/S" + std::to_string(i) + " cs 1 sc " + std::to_string(40 + 30 * i) + " 10 20 20 re f\n";
        }
        pdf.addPage(content, "<< /ColorSpace << " + spaces + ">> >>");
    }
    if (!xmp.empty()) pdf.setXmp(xmp);
    pdf.write(path);
}

namespace {
std::string xmlText(const std::string& text) {
    std::string out;
    for (char c : text) out += c == '&' ? "&amp;" : c == '<' ? "&lt;" : std::string(1, c);
    return out;
}
}  // namespace

std::string eskoXmp(const std::vector<TestInk>& inks) {
    std::string items;
    for (const TestInk& ink : inks) {
        items += "<rdf:li rdf:parseType=\"Resource\">\n";
        if (!ink.name.empty()) items += " <egInk:name>" + xmlText(ink.name) + "</egInk:name>\n";
        if (!ink.type.empty()) items += " <egInk:type>" + ink.type + "</egInk:type>\n";
        items += " <egInk:book>PANTONE+ Solid Coated</egInk:book>\n";
        if (!ink.attribute.empty()) items += " <egInk:attribute>" + ink.attribute + "</egInk:attribute>\n";
        items += "</rdf:li>\n";
    }
    // A packet as the editor writes it, with an unrelated description before the ink list.
    return "<?xpacket begin=\"\xEF\xBB\xBF\" id=\"W5M0MpCehiHzreSzNTczkc9d\"?>\n"
           "<x:xmpmeta xmlns:x=\"adobe:ns:meta/\"><rdf:RDF xmlns:rdf=\"http://www.w3.org/1999/02/22-rdf-syntax-ns#\">\n"
           "<rdf:Description rdf:about=\"\" xmlns:dc=\"http://purl.org/dc/elements/1.1/\">"
           "<dc:format>application/pdf</dc:format></rdf:Description>\n"
           "<rdf:Description rdf:about=\"\" xmlns:egGr=\"http://ns.esko-graphics.com/grinfo/1.0/\"\n"
           " xmlns:egInk=\"http://ns.esko-graphics.com/inkinfo/1.0/\">\n"
           "<egGr:inks><rdf:Seq>\n" + items + "</rdf:Seq></egGr:inks>\n"
           "</rdf:Description></rdf:RDF></x:xmpmeta>\n"
           "<?xpacket end=\"w\"?>";
}

}  // namespace vorlan::test
