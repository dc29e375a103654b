// Proof pages: placed source pages as form XObjects, drawn through their CTMs and clip boxes.
#include "pdf/proof_writer.h"

#include <qpdf/QPDFPageDocumentHelper.hh>
#include <qpdf/QPDFPageObjectHelper.hh>
#include <qpdf/QUtil.hh>

#include <algorithm>
#include <cmath>
#include <exception>
#include <filesystem>
#include <map>
#include <memory>
#include <system_error>
#include <vector>

#include "pdf/hidden_content.h"
#include "pdf/pdf_document.h"
#include "pdf/pdf_save.h"
#include "platform/os/text.h"

namespace vorlan::pdf {
namespace {

constexpr double kLabelSize = 7;    // points
constexpr double kLabelMargin = 2;  // from the sheet's lower left corner

std::string number(double value) { return QUtil::double_to_string(value, 4); }

std::string matrixText(const double m[6]) {
    std::string text;
    for (int i = 0; i < 6; ++i) text += number(m[i]) + " ";
    return text;
}

// A page as it is placed: its form in the proof, and the matrix from its user space to the page
// as shown (crop box lower left at the origin, /Rotate applied), with the shown size.
struct PlacedPage {
    QPDFObjectHandle form;
    double shown[6] = {1, 0, 0, 1, 0, 0};
    double width = 0, height = 0;
};

PlacedPage shownGeometry(QPDFPageObjectHelper& page) {
    PlacedPage placed;
    QPDFObjectHandle::Rectangle box = page.getCropBox().getArrayAsRectangle();
    const double x0 = std::min(box.llx, box.urx), x1 = std::max(box.llx, box.urx);
    const double y0 = std::min(box.lly, box.ury), y1 = std::max(box.lly, box.ury);
    long long rotate = 0;
    page.getAttribute("/Rotate", false).getValueAsInt(rotate);
    rotate = ((rotate % 360) + 360) % 360;
    // The page turns clockwise by /Rotate; each row maps (x, y) of the user space onto the page
    // as shown.
    const double turns[4][6] = {{1, 0, 0, 1, -x0, -y0},
                                {0, -1, 1, 0, -y0, x1},
                                {-1, 0, 0, -1, x1, y1},
                                {0, 1, -1, 0, y1, -x0}};
    const int turn = rotate % 90 == 0 ? static_cast<int>(rotate / 90) : 0;
    std::copy(turns[turn], turns[turn] + 6, placed.shown);
    placed.width = turn % 2 ? y1 - y0 : x1 - x0;
    placed.height = turn % 2 ? x1 - x0 : y1 - y0;
    return placed;
}

// The label as a PDF string of WinAnsi text: Latin-1 letters kept, other characters '?'.
std::string labelString(const std::string& utf8) {
    std::string out = "(";
    for (wchar_t c : os::fromUtf8(utf8)) {
        unsigned code = static_cast<unsigned>(c);
        if (code < 0x20 || code == 0x7F || (code >= 0x80 && code < 0xA0) || code > 0xFF) code = '?';
        if (code == '(' || code == ')' || code == '\\') out += '\\';
        out += static_cast<char>(code);
    }
    return out + ")";
}

// Black Helvetica text in the lower left margin of the sheet, made smaller to fit a narrow sheet.
// Nothing is painted behind it: the proof shows the sheet's own marks there too.
std::string labelContent(const std::string& label, double width) {
    const double estimate = 0.56 * kLabelSize * static_cast<double>(label.size());
    const double size = std::max(2.0, std::min(kLabelSize, kLabelSize * (width - 2 * kLabelMargin) / std::max(1.0, estimate)));
    return "q 0 g BT /Lbl " + number(size) + " Tf " + number(kLabelMargin) + " " + number(kLabelMargin) + " Td " +
           labelString(label) + " Tj ET Q\n";
}

bool sameFile(const std::string& a, const std::string& b) {
    std::error_code ec;
    return std::filesystem::equivalent(a, b, ec) && !ec;
}

class ProofBuilder {
public:
    ProofBuilder() { proof_.emptyPDF(); }

    ProofFailure addPage(const ProofPage& page, std::string* message) {
        std::string content;
        QPDFObjectHandle xobjects = QPDFObjectHandle::newDictionary();
        double width = page.width, height = page.height;
        int index = 0;
        for (const ProofObject& object : page.objects) {
            PlacedPage placed;
            ProofFailure failure = place(object, placed, message);
            if (failure != ProofFailure::None) return failure;
            if (width <= 0 || height <= 0) {
                width = placed.width;
                height = placed.height;
            }
            const std::string name = "/Fx" + std::to_string(++index);
            xobjects.replaceKey(name, placed.form);
            content += "q\n";
            if (object.clipped)
                content += number(object.clip[0]) + " " + number(object.clip[1]) + " " +
                           number(object.clip[2] - object.clip[0]) + " " + number(object.clip[3] - object.clip[1]) +
                           " re W n\n";
            content += matrixText(object.ctm) + "cm\n" + matrixText(placed.shown) + "cm\n" + name + " Do\nQ\n";
        }
        if (width <= 0 || height <= 0) width = 612, height = 792;
        content += labelContent(page.label, width);
        QPDFObjectHandle resources = QPDFObjectHandle::newDictionary();
        resources.replaceKey("/XObject", xobjects);
        resources.replaceKey("/Font", QPDFObjectHandle::parse(
                                          "<< /Lbl << /Type /Font /Subtype /Type1 /BaseFont /Helvetica "
                                          "/Encoding /WinAnsiEncoding >> >>"));
        QPDFObjectHandle dict = QPDFObjectHandle::newDictionary();
        dict.replaceKey("/Type", QPDFObjectHandle::newName("/Page"));
        dict.replaceKey("/MediaBox", QPDFObjectHandle::newFromRectangle(QPDFObjectHandle::Rectangle(0, 0, width, height)));
        dict.replaceKey("/Resources", resources);
        dict.replaceKey("/Contents", QPDFObjectHandle::newStream(&proof_, content));
        QPDFPageDocumentHelper(proof_).addPage(QPDFPageObjectHelper(proof_.makeIndirectObject(dict)), false);
        return ProofFailure::None;
    }

    ProofFailure save(const std::string& path, std::string* message) {
        for (const auto& [key, source] : sources_) {
            if (sameFile(path, source.file)) {
                *message = "Unable to write " + path + ": it is a file of the job";
                return ProofFailure::CannotWrite;
            }
        }
        const std::filesystem::path target = prepareOutputPath(path);
        if (target.empty() || !saveDocument(proof_, target, false)) {
            *message = failureMessage(PdfFailure::CannotWrite, path);
            return ProofFailure::CannotWrite;
        }
        return ProofFailure::None;
    }

private:
    // An opened source file, one per file and set of switches: hidden content is taken out of
    // its forms in place.
    struct Source {
        std::string file;
        std::unique_ptr<QPDF> pdf;
        std::vector<QPDFObjectHandle> pages;
        std::unique_ptr<OptionalContentStates> states;
        std::map<int, PlacedPage> placed;
    };

    ProofFailure place(const ProofObject& object, PlacedPage& placed, std::string* message) {
        const std::string named = object.url.empty() ? object.file : object.url;
        if (object.page < 0) {
            *message = "Ordinal " + std::to_string(object.ord) + " names no page of a PDF";
            return ProofFailure::MissingPage;
        }
        if (object.file.empty()) {
            *message = "Unable to find " + named + " (ordinal " + std::to_string(object.ord) + ")";
            return ProofFailure::MissingFile;
        }
        std::string key = object.file + '\n';
        for (const auto& [group, shown] : object.groups) key += group + (shown ? "\n1\n" : "\n0\n");
        auto [it, isNew] = sources_.try_emplace(key);
        Source& source = it->second;
        if (isNew) {
            PdfFailure why = PdfFailure::None;
            source.file = object.file;
            source.pdf = openDocument(object.file.c_str(), true, &why);
            if (!source.pdf) {
                *message = failureMessage(why, object.file);
                sources_.erase(it);
                return why == PdfFailure::CannotOpen ? ProofFailure::MissingFile : ProofFailure::UnreadableFile;
            }
            source.pages = documentPages(*source.pdf);
            source.states = std::make_unique<OptionalContentStates>(*source.pdf, object.groups);
        }
        if (static_cast<size_t>(object.page) >= source.pages.size()) {
            *message = object.file + " has no page " + std::to_string(object.page + 1) + " (ordinal " +
                       std::to_string(object.ord) + ")";
            return ProofFailure::MissingPage;
        }
        auto known = source.placed.find(object.page);
        if (known != source.placed.end()) {
            placed = known->second;
            return ProofFailure::None;
        }
        QPDFPageObjectHelper page(source.pages[static_cast<size_t>(object.page)]);
        placed = shownGeometry(page);
        QPDFObjectHandle form = page.getFormXObjectForPage(false);
        form.getDict().replaceKey("/BBox", page.getCropBox().shallowCopy());
        if (form.getDict().getKey("/Group").isNull()) form.getDict().removeKey("/Group");
        if (!removeHiddenContent(*source.pdf, form, *source.states)) {
            *message = failureMessage(PdfFailure::Damaged, object.file);
            return ProofFailure::UnreadableFile;
        }
        placed.form = proof_.copyForeignObject(form);
        source.placed.emplace(object.page, placed);
        return ProofFailure::None;
    }

    // The proof refers to the sources' objects until it is written: they are destroyed after it.
    std::map<std::string, Source> sources_;
    QPDF proof_;
};

}  // namespace

ProofFailure writeProof(const ProofVersion& version, const std::string& path, std::string* message) {
    std::string ignored;
    if (!message) message = &ignored;
    message->clear();
    try {
        ProofBuilder builder;
        for (const ProofPage& page : version.pages) {
            ProofFailure failure = builder.addPage(page, message);
            if (failure != ProofFailure::None) return failure;
        }
        return builder.save(path, message);
    } catch (const std::exception& e) {
        *message = "Unable to write " + path + ": " + e.what();
        return ProofFailure::CannotWrite;
    }
}

}  // namespace vorlan::pdf
