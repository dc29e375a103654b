// A small generator of test PDFs on qpdf: pages with given content and resources, shared forms,
// images, patterns, boxes, rotation and an XMP packet.
#pragma once

#include <qpdf/QPDF.hh>
#include <qpdf/QPDFObjectHandle.hh>

#include <string>
#include <vector>

namespace vorlan::test {

struct TestPageOptions {
    std::string mediaBox = "[0 0 200 100]";
    std::string cropBox;  // empty: none
    std::string trimBox;  // empty: none
    int rotate = 0;       // 0: no /Rotate entry
};

class TestPdf {
public:
    TestPdf();

    using PageOptions = struct TestPageOptions;

    // Adds a page. resources is PDF syntax and may refer to objects made below ("N 0 R").
    QPDFObjectHandle addPage(const std::string& content, const std::string& resources = "<< >>",
                             const TestPageOptions& options = TestPageOptions());
    // An indirect object from PDF syntax, e.g. a colour-space array; ref() gives "N 0 R".
    QPDFObjectHandle object(const std::string& syntax);
    // An indirect stream with the given dictionary (PDF syntax) and data.
    QPDFObjectHandle stream(const std::string& dict, const std::string& data);
    // A form XObject painting content with resources.
    QPDFObjectHandle form(const std::string& content, const std::string& resources = "<< >>");
    // A 2x2 image XObject in the given colour space (PDF syntax) with `components` samples a pixel.
    QPDFObjectHandle image(const std::string& colourSpace, int components, const std::string& extra = "");
    // The catalog's /Metadata stream.
    void setXmp(const std::string& packet);
    // Writes the file (uncompressed content so tests can read it).
    void write(const std::string& path);

    QPDF& qpdf() { return pdf_; }

    static std::string ref(QPDFObjectHandle object);
    // [/Separation /name /DeviceCMYK <tint function>] as PDF syntax (name without slash, escaped).
    std::string separation(const std::string& name);
    // [/DeviceN [names] /DeviceCMYK <function> (attributes)] as PDF syntax.
    std::string deviceN(const std::vector<std::string>& names, bool nChannel = false);

private:
    QPDF pdf_;
    std::vector<QPDFObjectHandle> pages_;
};

// An XMP packet with an Esko ink list; each ink is {name, type, attribute} (empty: left out).
struct TestInk {
    std::string name, type, attribute;
};
std::string eskoXmp(const std::vector<TestInk>& inks);

// Writes a PDF whose pages each paint their inks (one list a page) in squares of their own beside
// a black CMYK square, with the XMP packet when one is given.
void writeSpotPdf(const std::string& path, const std::vector<std::vector<std::string>>& pageInks,
                  const std::string& xmp = "");
// The same inks on that many pages.
inline std::vector<std::vector<std::string>> samePages(const std::vector<std::string>& inks, int pages) {
    return std::vector<std::vector<std::string>>(static_cast<size_t>(pages), inks);
}

// A PDF name token for a decoded name (with #xx escapes where needed).
std::string pdfName(const std::string& name);

}  // namespace vorlan::test
