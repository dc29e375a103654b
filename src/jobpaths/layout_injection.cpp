#include "jobpaths/layout_injection.h"

#include <cstdlib>
#include <cwctype>

#include "jdf/injected_layout.h"
#include "jdf/page_selection.h"
#include "jdf/ticket_reading.h"
#include "pdf/page_geometry.h"
#include "platform/os/text.h"

namespace {

// Esko's mark of die pages: "Die" (die only) or "Die Content" (die with content), case ignored.
ContentType contentTypeOf(const JDF::JDFRunList& element) {
    const JDF::WString value = element.GetAttribute(L"eg:DieContent");
    if (vorlan::os::equalsIgnoreCase(value.c_str(), L"Die")) return CONTENT_DIE_ONLY;
    if (vorlan::os::equalsIgnoreCase(value.c_str(), L"Die Content")) return CONTENT_DIE_WITH_CONTENT;
    return CONTENT_CONTENT;
}

// Whether the URL begins with a scheme ("file:", "http:", ...); a drive letter is not one.
bool hasScheme(const std::wstring& url) {
    size_t colon = url.find(L':');
    if (colon == std::wstring::npos || colon < 2 || !std::iswalpha(static_cast<wint_t>(url[0]))) return false;
    for (size_t i = 1; i < colon; ++i) {
        wchar_t c = url[i];
        if (!std::iswalnum(static_cast<wint_t>(c)) && c != L'+' && c != L'-' && c != L'.') return false;
    }
    return true;
}

}  // namespace

LayoutInjectionProcessingJdf::LayoutInjectionProcessingJdf(const wchar_t* jdfPath, const wchar_t* dataPath,
                                                           const char* outputPath, LD_JDF* worker)
    : jdfPath_(jdfPath ? jdfPath : L""), dataPath_(dataPath ? dataPath : L""),
      outputPath_(outputPath ? outputPath : ""), worker_(worker) {}

LayoutInjectionProcessingJdf::~LayoutInjectionProcessingJdf() = default;

bool LayoutInjectionProcessingJdf::parseTicket() {
    if (jdfPath_.empty()) return false;
    JDF::JDFParser parser;
    if (!parser.Parse(JDF::WString(jdfPath_), true, true, true, nullptr, JDF::WString(), 0, 42)) return false;
    root_ = JDF::JDFDoc(parser.GetDocument()).GetJDFRoot();
    if (root_.isNull()) return false;
    // The Media the root links (inputs first).
    media_ = root_.GetMatchingResource(L"Media", 3);
    return true;
}

void LayoutInjectionProcessingJdf::collectRuns() {
    // Open-ended Pages ranges count the pages of the PDF as the pipeline finds it in the job.
    vorlan::jdf::PdfPageCounts pageCounts(*worker_, dataPath_);
    int32_t position = 0;
    for (const JDF::KElement& resource : root_.GetResourcePool().GetPoolChildren(L"RunList")) {
        for (const JDF::KElement& element :
             resource.GetChildElementVector(L"RunList", L"", JDF::JDFAttributeMap(), true, 0, false)) {
            JDF::JDFRunList partition(element);
            auto part = std::make_unique<Part>();
            part->run = vorlan::jdf::makeRun(partition, position, false, &pageCounts);
            part->run->contentType = contentTypeOf(partition);

            locateFile(*part, partition.GetFileURL());
            if (part->run->NPage == 0 && part->run->pages.empty()) part->run->NPage = countPages(*part);

            Part* p = part.get();
            parts_.push_back(std::move(part));
            switch (p->run->contentType) {
                case CONTENT_DIE_ONLY: dieOnly_.push_back(p); break;
                case CONTENT_DIE_WITH_CONTENT: dieWithContent_.push_back(p); break;
                default: content_.push_back(p); break;
            }
        }
        ++position;
    }
}

void LayoutInjectionProcessingJdf::locateFile(Part& part, std::wstring url) const {
    std::wstring path;
    if (!hasScheme(url)) {
        if (url.compare(0, 2, L"./") == 0) url.erase(0, 2);
        path = dataPath_ + L"/" + url;
    } else if (vorlan::os::equalsIgnoreCase(url.substr(0, 7).c_str(), L"file://")) {
        // A file URL of a path on this machine ("file:///a/b.pdf") or on a drive
        // ("file://H:\a\b.pdf"); one naming another host stays as it is.
        std::wstring rest = url.substr(7);
        bool drive = rest.size() >= 2 && std::iswalpha(static_cast<wint_t>(rest[0])) && rest[1] == L':';
        if (drive || (!rest.empty() && rest[0] == L'/')) path = rest;
    }
    if (path.empty()) {
        part.url = url;
        return;
    }
    part.localPath = vorlan::os::narrow(path.c_str());
    wchar_t* native = worker_->getNativeFilePath(path.data());
    part.url = native ? native : path.c_str();
    std::free(native);
}

int32_t LayoutInjectionProcessingJdf::countPages(const Part& part) {
    if (part.localPath.empty()) return part.run->NPage;
    auto known = pageCounts_.find(part.localPath);
    if (known != pageCounts_.end()) return known->second;
    int32_t pages = getPDFPageCount(worker_->zipFileSystem, part.localPath.c_str());
    pageCounts_.emplace(part.localPath, pages);
    return pages;
}

bool LayoutInjectionProcessingJdf::buildRows() {
    const size_t limit = vorlan::jdf::kMaxInjectedSheets;
    for (Part* p : content_) {
        LD_Run& run = *p->run;
        if (run.pages.empty()) {
            if (run.NPage < 1) run.NPage = countPages(*p);
            const int64_t step = run.SkipPage < 1 ? 1 : run.SkipPage;
            for (int64_t page = run.FirstPage; page < run.NPage; page += step) {
                if (rows_.size() + run.pages.size() >= limit) return false;
                run.pages.push_back(static_cast<int32_t>(page));
            }
        }
        for (int32_t page : run.pages) {
            if (rows_.size() >= limit) return false;
            rows_.push_back({p, page});
        }
    }
    selected_ = selectPositions(*worker_, rows_.size());
    return true;
}

LDError LayoutInjectionProcessingJdf::run() {
    LD_JDF& w = *worker_;
    if (!parseTicket()) return w.lastError = LD_JDF_UNUSABLE;
    collectRuns();
    if (w.pageRangeMode != PAGE_RANGE_ALL && !buildRows()) return w.lastError = LD_JDF_UNUSABLE;
    if (w.printDieLine && (!dieOnly_.empty() || !dieWithContent_.empty())) {
        w.AddDieInfoFile("KVDieDefined", 1);
        w.setJobAttribute("KVDieDefined", "True");
    }
    return writeTicket();
}
