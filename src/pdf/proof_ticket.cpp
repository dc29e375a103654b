// Proof plan: surfaces and their placed objects from the job model, version tags and switches
// from the ticket's own elements.
#include "pdf/proof_ticket.h"

#include <algorithm>
#include <cctype>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <map>
#include <memory>
#include <system_error>

#include "jdf/element_walk.h"
#include "jdf/ticket_handles.h"
#include "platform/os/text.h"
#include "vorlan/LD_JDF.h"

namespace vorlan::pdf {
namespace {

namespace fs = std::filesystem;

struct VersionTags {
    std::string name;
    std::string copies;
    std::string contentType;
};

// Tags of a resource element, each inherited from enclosing partitions.
VersionTags tagsOf(const JDF::KElement& element) {
    VersionTags tags;
    if (element.isNull()) return tags;
    JDF::JDFResource resource(element);
    tags.name = os::toUtf8(resource.GetAttribute(L"KAV_tkt:VersionName"));
    tags.copies = os::toUtf8(resource.GetAttribute(L"KAV_tkt:VersionCopyCount"));
    tags.contentType = os::toUtf8(resource.GetAttribute(L"KAV_tkt:VersContentType"));
    return tags;
}

std::string percentDecoded(const std::string& text) {
    std::string out;
    for (size_t i = 0; i < text.size(); ++i) {
        if (text[i] == '%' && i + 2 < text.size() && std::isxdigit(static_cast<unsigned char>(text[i + 1])) &&
            std::isxdigit(static_cast<unsigned char>(text[i + 2]))) {
            out += static_cast<char>(std::strtol(text.substr(i + 1, 2).c_str(), nullptr, 16));
            i += 2;
        } else {
            out += text[i];
        }
    }
    return out;
}

bool isFile(const fs::path& path) {
    std::error_code ec;
    return !path.empty() && fs::is_regular_file(path, ec);
}

// The ticket's elements the model does not keep, by the Run partition key.
class TicketElements {
public:
    explicit TicketElements(const JDF::JDFNode& root) : root_(root) {
        if (root.isNull()) return;
        jdf::forEachElementBelow(root.node(), [&](pugi::xml_node n) {
            const char* local = jdf::localName(n);
            pugi::xml_attribute run = n.attribute("Run");
            if (run && std::strcmp(local, "RunList") == 0) runLists_.try_emplace(run.value(), n);
            else if (run && std::strcmp(local, "InterpretingParams") == 0) interpreting_.try_emplace(run.value(), n);
            return true;
        });
    }

    // The run-list partition of that Run value (null handle when there is none).
    JDF::KElement runList(const std::string& run) const { return element(runLists_, run); }

    // The OCGControl switches of the InterpretingParams partition of that Run value.
    std::map<std::string, bool> switches(const std::string& run) const {
        std::map<std::string, bool> groups;
        auto it = interpreting_.find(run);
        if (it == interpreting_.end()) return groups;
        for (pugi::xml_node params = it->second.first_child(); params; params = params.next_sibling()) {
            if (std::strcmp(jdf::localName(params), "PDFInterpretingParams") != 0) continue;
            for (pugi::xml_node control = params.first_child(); control; control = control.next_sibling()) {
                if (std::strcmp(jdf::localName(control), "OCGControl") != 0) continue;
                const char* name = control.attribute("OCGName").value();
                if (*name) groups[name] = os::equalsIgnoreCaseAscii(control.attribute("IncludeOCG").value(), "true");
            }
        }
        return groups;
    }

private:
    JDF::KElement element(const std::map<std::string, pugi::xml_node>& map, const std::string& run) const {
        auto it = map.find(run);
        return it == map.end() ? JDF::KElement() : JDF::KElement(it->second, root_.document());
    }

    JDF::JDFNode root_;
    std::map<std::string, pugi::xml_node> runLists_, interpreting_;
};

class PlanReader {
public:
    PlanReader(LD_JDF& worker, fs::path folder)
        : w_(worker), folder_(std::move(folder)), elements_(worker.ticket->rootNode) {}

    void read(std::vector<ProofVersion>& versions) {
        std::map<std::string, size_t> byName;
        for (LD_Sheet* sheet : w_.sheets) {
            for (LD_Surface* surface : {sheet->front, sheet->back}) {
                if (!surface || (surface->contentObjects.empty() && surface->markObjects.empty())) continue;
                VersionTags tags = surfaceTags(*surface);
                if (tags.name.empty()) tags.name = "Default";
                auto [it, isNew] = byName.try_emplace(tags.name, versions.size());
                if (isNew) versions.push_back({tags.name, safeFileName(tags.name) + ".pdf", {}});
                versions[it->second].pages.push_back(page(*sheet, *surface, tags));
            }
        }
    }

private:
    // The surface's own tags, else those of its first content object's run-list partition.
    VersionTags surfaceTags(const LD_Surface& surface) {
        const auto& elements = w_.ticket->surfaceElements;
        VersionTags tags;
        if (surface.index >= 0 && static_cast<size_t>(surface.index) < elements.size())
            tags = tagsOf(elements[static_cast<size_t>(surface.index)]);
        if (tags.name.empty() && !surface.contentObjects.empty()) {
            LD_OrdinalTableElement* row = w_.getOrdinalElementByOrdNum(surface.contentObjects.front()->Ord);
            if (row && row->content && row->content->run) {
                VersionTags run = tagsOf(elements_.runList(os::toUtf8(row->content->run->runName)));
                if (!run.name.empty()) tags = run;
            }
        }
        if (tags.contentType.empty()) tags.contentType = "Content";
        return tags;
    }

    // The Dimension of the Media nearest the surface: a Media or MediaRef child of the surface
    // element or of an element enclosing it (sheet, signature, layout partitions). The reader's
    // media records hold only media typed as paper, so the ticket's own elements are asked.
    bool mediaSize(const LD_Surface& surface, double& width, double& height) {
        const auto& elements = w_.ticket->surfaceElements;
        if (surface.index < 0 || static_cast<size_t>(surface.index) >= elements.size()) return false;
        const JDF::KElement& element = elements[static_cast<size_t>(surface.index)];
        for (pugi::xml_node n = element.node(); n; n = n.parent()) {
            const std::pair<double, double>& size = childMediaSize(n, element);
            if (size.first > 0) {
                width = size.first;
                height = size.second;
                return true;
            }
        }
        return false;
    }

    // The Dimension of the first Media (or MediaRef target) among n's children that has one;
    // (0, 0) when none does. Remembered per element, since every surface of a sheet, signature
    // or layout asks the same enclosing elements.
    const std::pair<double, double>& childMediaSize(pugi::xml_node n, const JDF::KElement& element) {
        auto [it, isNew] = childMedia_.try_emplace(n.internal_object(), 0.0, 0.0);
        if (!isNew) return it->second;
        for (pugi::xml_node child = n.first_child(); child; child = child.next_sibling()) {
            const char* local = jdf::localName(child);
            JDF::KElement media(child, element.document());
            if (std::strcmp(local, "MediaRef") == 0) media = JDF::JDFElement(media).GetTarget();
            else if (std::strcmp(local, "Media") != 0) continue;
            if (media.isNull() || !media.HasAttribute(L"Dimension")) continue;
            const JDF::JDFXYPair dimension = JDF::JDFMedia(media).GetDimension();
            if (dimension.GetX() > 0 && dimension.GetY() > 0) {
                it->second = {dimension.GetX(), dimension.GetY()};
                break;
            }
        }
        return it->second;
    }

    ProofPage page(const LD_Sheet& sheet, const LD_Surface& surface, const VersionTags& tags) {
        ProofPage page;
        const LD_Box* box = surface.SurfaceContentsBox;
        if (!mediaSize(surface, page.width, page.height) && box && box->upperRight.x > 0 && box->upperRight.y > 0) {
            page.width = box->upperRight.x;
            page.height = box->upperRight.y;
        }
        const std::string sheetName = os::toUtf8(sheet.name);
        page.label = tags.name + " | copies " + (tags.copies.empty() ? "-" : tags.copies) + " | sheet " +
                     std::to_string(sheet.index + 1) + (sheetName.empty() ? "" : " " + sheetName) + " | " +
                     (surface.isFront ? "Front" : "Back") + " | " + tags.contentType;
        // Placed objects are drawn in the order the surface lists them.
        size_t c = 0, m = 0;
        while (c < surface.contentObjects.size() || m < surface.markObjects.size()) {
            const bool content =
                m >= surface.markObjects.size() ||
                (c < surface.contentObjects.size() &&
                 surface.contentObjects[c]->objectIndex < surface.markObjects[m]->objectIndex);
            if (content) {
                const LD_ContentObject* o = surface.contentObjects[c++];
                page.objects.push_back(object(o->Ord, *o->CTM, o->ClipBox, false));
            } else {
                const LD_MarkObject* o = surface.markObjects[m++];
                page.objects.push_back(object(o->Ord, *o->CTM, o->ClipBox, true));
            }
        }
        return page;
    }

    ProofObject object(int32_t ord, const LD_CTM& ctm, const LD_Box* clip, bool mark) {
        ProofObject object;
        object.ord = ord;
        const double matrix[6] = {ctm.a, ctm.b, ctm.c, ctm.d, ctm.e, ctm.f};
        std::copy(matrix, matrix + 6, object.ctm);
        if (clip) {
            object.clipped = true;
            object.clip[0] = clip->lowerLeft.x;
            object.clip[1] = clip->lowerLeft.y;
            object.clip[2] = clip->upperRight.x;
            object.clip[3] = clip->upperRight.y;
        }
        LD_OrdinalTableElement* row = w_.getOrdinalElementByOrdNum(ord);
        const LD_PDF* pdf = nullptr;
        const LD_Run* run = nullptr;
        int32_t page = -1;
        if (row && mark && row->mark) pdf = row->mark->pdf, run = row->mark->run, page = row->mark->page;
        if (row && !mark && row->content) pdf = row->content->pdf, run = row->content->run, page = row->content->page;
        if (!pdf) return object;
        object.page = page;
        object.url = os::toUtf8(pdf->url);
        object.file = localPath(pdf->url);
        if (run) object.groups = elements_.switches(os::toUtf8(run->runName));
        return object;
    }

    // The local file a ticket URL names (see readProofPlan); empty when none is found.
    std::string localPath(const wchar_t* url) {
        if (!url || !*url) return {};
        auto known = paths_.find(url);
        if (known != paths_.end()) return known->second;
        const std::string text = percentDecoded(os::narrow(url));
        fs::path direct;
        if (text.rfind("file://", 0) == 0) direct = text.substr(7);
        else if (text.find("://") == std::string::npos) direct = folder_ / text;
        std::string found;
        if (isFile(direct)) {
            found = direct.string();
        } else {
            std::wstring folder = folder_.wstring();
            std::unique_ptr<wchar_t, decltype(&std::free)> inFolder(w_.findTicketFileInDir(folder.data(), url),
                                                                    &std::free);
            if (inFolder) found = os::narrow(inFolder.get());
        }
        paths_.emplace(url, found);
        return found;
    }

    LD_JDF& w_;
    fs::path folder_;
    TicketElements elements_;
    std::map<std::wstring, std::string> paths_;
    std::map<const void*, std::pair<double, double>> childMedia_;  // see childMediaSize
};

}  // namespace

std::string safeFileName(const std::string& name) {
    std::string out;
    for (char c : name) {
        const unsigned char u = static_cast<unsigned char>(c);
        const bool awkward = u < 0x20 || u == 0x7F || std::strchr("/\\:*?\"<>|", c) != nullptr;
        out += awkward ? '_' : c;
    }
    for (char& c : out) {
        if (c != '.') break;
        c = '_';
    }
    // Room for a number and ".pdf" within the usual 255-byte limit of a file name; a cut never
    // splits a UTF-8 sequence.
    constexpr size_t kMaxName = 200;
    if (out.size() > kMaxName) {
        size_t cut = kMaxName;
        while (cut > 0 && (static_cast<unsigned char>(out[cut]) & 0xC0) == 0x80) --cut;
        out.resize(cut);
    }
    return out.empty() ? "Default" : out;
}

LDError readProofPlan(const char* ticketPath, std::vector<ProofVersion>& versions) {
    versions.clear();
    if (!ticketPath || !*ticketPath) return LD_INVALID_INPUT;
    LD_JDF worker(nullptr, nullptr, nullptr);
    const LDError read = worker.JDF_InitializeAndParseJDF(ticketPath);
    if (read != LD_OK) return read;
    if (!worker.ticket) return LD_JDF_UNUSABLE;
    std::error_code ec;
    fs::path folder = fs::absolute(fs::path(ticketPath), ec).parent_path();
    PlanReader(worker, folder).read(versions);
    return versions.empty() ? LD_JDF_RESOURCE_MISSING : LD_OK;
}

}  // namespace vorlan::pdf
