// Fuzzes page content: each input is the content stream of a page whose resources hold spot
// colour spaces (Separation, DeviceN, Indexed), a form, an image, a shading, a pattern and an
// optional-content group. The bytes go through the lexer, the element tree in every state-leaf
// mode, the layer conversion and both separation-rewriting modes; each edit starts from a fresh
// document and its result is parsed again.
#include <qpdf/QPDF.hh>
#include <qpdf/QPDFObjectHandle.hh>
#include <qpdf/QPDFPageDocumentHelper.hh>

#include <cstdint>
#include <string>
#include <vector>

#include "pdf/content_lexer.h"
#include "pdf/content_tree.h"
#include "pdf/separation_layers.h"
#include "pdf/separation_rewrite.h"

namespace {

using vorlan::pdf::StateLeaves;

// A document with one page whose content is `content`; every resource the content may name.
QPDFObjectHandle makePage(QPDF& pdf, const std::string& content) {
    pdf.emptyPDF();
    auto indirect = [&pdf](const std::string& syntax) {
        return pdf.makeIndirectObject(QPDFObjectHandle::parse(&pdf, syntax));
    };
    auto stream = [&pdf](const std::string& dict, const std::string& data) {
        QPDFObjectHandle s = pdf.makeIndirectObject(QPDFObjectHandle::newStream(&pdf, data));
        QPDFObjectHandle d = QPDFObjectHandle::parse(&pdf, dict);
        for (const auto& key : d.getKeys()) s.getDict().replaceKey(key, d.getKey(key));
        return s;
    };
    QPDFObjectHandle tint = indirect("<< /FunctionType 2 /Domain [0 1] /C0 [0 0 0 0] /C1 [0 1 0 0] /N 1 >>");
    QPDFObjectHandle spot = indirect("[/Separation /Spot /DeviceCMYK " + tint.unparse() + "]");
    QPDFObjectHandle both = indirect("[/DeviceN [/Spot /Gold] /DeviceCMYK " +
                                     stream("<< /FunctionType 4 /Domain [0 1 0 1] /Range [0 1 0 1 0 1 0 1] >>",
                                            "{ add 0 0 0 4 -1 roll }").unparse() +
                                     " << /Subtype /NChannel /Colorants << /Spot " + spot.unparse() + " >> >> ]");
    QPDFObjectHandle form = stream("<< /Type /XObject /Subtype /Form /BBox [0 0 50 50] /Resources << "
                                   "/ColorSpace << /CS0 " + spot.unparse() + " >> >> >>",
                                   "/CS0 cs 1 scn 0 0 10 10 re f");
    QPDFObjectHandle image = stream("<< /Type /XObject /Subtype /Image /Width 2 /Height 2 "
                                    "/BitsPerComponent 8 /ColorSpace " + spot.unparse() + " >>",
                                    std::string(4, '\x80'));
    QPDFObjectHandle shading = indirect("<< /ShadingType 2 /ColorSpace " + both.unparse() +
                                        " /Coords [0 0 1 0] /Function " + tint.unparse() + " >>");
    QPDFObjectHandle pattern = stream("<< /PatternType 1 /PaintType 1 /TilingType 1 /BBox [0 0 4 4] "
                                      "/XStep 4 /YStep 4 /Resources << /ColorSpace << /CS1 " +
                                          both.unparse() + " >> >> >>",
                                      "/CS1 cs 1 0 scn 0 0 2 2 re f");
    QPDFObjectHandle layer = indirect("<< /Type /OCG /Name (Layer) >>");
    pdf.getRoot().replaceKey("/OCProperties",
                             QPDFObjectHandle::parse(&pdf, "<< /OCGs [" + layer.unparse() + "] /D << /Order [" +
                                                               layer.unparse() + "] >> >>"));
    QPDFObjectHandle page = indirect(
        "<< /Type /Page /MediaBox [0 0 100 100] /Resources << /ColorSpace << /CS0 " + spot.unparse() +
        " /CS1 " + both.unparse() + " /CS2 [/Indexed " + spot.unparse() + " 1 <00FF>] >> /XObject << /Fm0 " +
        form.unparse() + " /Im0 " + image.unparse() + " >> /Shading << /Sh0 " + shading.unparse() +
        " >> /Pattern << /P0 " + pattern.unparse() + " >> /Properties << /MC0 " + layer.unparse() + " >> >> >>");
    page.replaceKey("/Contents", QPDFObjectHandle::newStream(&pdf, content));
    QPDFPageDocumentHelper(pdf).addPage(page, false);
    return page;
}

void parseAgain(QPDFObjectHandle page) {
    vorlan::pdf::ColourSpaceResolver::SharedCache cache;
    vorlan::pdf::parsePageContent(page, &cache);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    const std::string content(reinterpret_cast<const char*>(data), size);

    vorlan::pdf::ContentLexer lexer(content);
    for (vorlan::pdf::ContentToken token = lexer.next();
         token.kind != vorlan::pdf::ContentToken::End && token.kind != vorlan::pdf::ContentToken::Damaged;
         token = lexer.next()) {
        if (token.kind == vorlan::pdf::ContentToken::Name)
            vorlan::pdf::decodeName(content, token.begin, token.end);
        if (token.kind == vorlan::pdf::ContentToken::Keyword && content.compare(token.begin, 2, "ID") == 0 &&
            token.end - token.begin == 2)
            lexer.skipInlineImageData(token.end);
    }

    {
        QPDF pdf;
        QPDFObjectHandle page = makePage(pdf, content);
        vorlan::pdf::ColourSpaceResolver::SharedCache cache;
        vorlan::pdf::FormCache forms;
        for (StateLeaves mode : {StateLeaves::All, StateLeaves::Colour, StateLeaves::None, StateLeaves::ColourOnly})
            vorlan::pdf::parsePageContent(page, &cache, mode, mode == StateLeaves::ColourOnly ? &forms : nullptr);
    }
    {
        QPDF pdf;
        QPDFObjectHandle page = makePage(pdf, content);
        vorlan::pdf::convertDocumentSeparations(pdf, {{"Spot", "Spot", true}, {"Gold", "Gold", true}});
        parseAgain(page);
    }
    {
        QPDF pdf;
        QPDFObjectHandle page = makePage(pdf, content);
        vorlan::pdf::convertDocumentSeparations(pdf, {{"Spot", "Spot", true}, {"", "Layer", false}});
        parseAgain(page);
    }
    for (bool keepListed : {true, false}) {
        QPDF pdf;
        QPDFObjectHandle page = makePage(pdf, content);
        vorlan::pdf::rewriteDocumentSeparations(pdf, {"Spot"}, keepListed);
        parseAgain(page);
    }
    return 0;
}
