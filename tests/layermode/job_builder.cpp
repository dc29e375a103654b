// Generated layer-mode jobs (see job_builder.h).
#include "job_builder.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <map>
#include <sstream>

#include <pugixml.hpp>

#include "test_support.h"
#include "vorlan/LD_JDF.h"
#include "vorlan/vorlan.h"

namespace fs = std::filesystem;

namespace layermode_test {

namespace {

std::string runPartitions(const std::string& pdf, int pages, bool perPage) {
    std::ostringstream x;
    auto partition = [&](int run, const std::string& range) {
        x << "      <RunList Run=\"" << run << "\" Pages=\"" << range << "\">\n"
          << "        <LayoutElement><FileSpec URL=\"" << pdf << "\" MimeType=\"application/pdf\"/></LayoutElement>\n"
          << "      </RunList>\n";
    };
    if (perPage)
        for (int p = 0; p < pages; ++p) partition(p, std::to_string(p));
    else
        partition(0, pages > 1 ? "0 ~ " + std::to_string(pages - 1) : "0");
    return x.str();
}

}  // namespace

int newPdfPath(char* buffer, int size, void* hostFolder) {
    auto* host = static_cast<HostFolder*>(hostFolder);
    std::snprintf(buffer, static_cast<size_t>(size), "%s/out-%d.pdf", host->folder.c_str(), host->counter++);
    return 0;
}

namespace {

std::string localName(pugi::xml_node n) {
    std::string name = n.name();
    return name.substr(name.find(':') + 1);
}

// Pages a FileSpec's run list uses: its NPage and one more than the highest page of its Pages,
// both inherited from enclosing run lists.
int pagesUsed(pugi::xml_node fileSpec) {
    int pages = 1;
    bool ranged = false;
    for (pugi::xml_node n = fileSpec.parent(); n; n = n.parent()) {
        if (localName(n) != "RunList") continue;
        pages = std::max(pages, n.attribute("NPage").as_int());
        if (ranged || !n.attribute("Pages")) continue;
        ranged = true;
        std::string range = n.attribute("Pages").value();
        std::replace(range.begin(), range.end(), '~', ' ');
        std::istringstream values(range);
        for (int page; values >> page;) pages = std::max(pages, page + 1);
    }
    return pages;
}

// The file name a URL ends in, "%20" read as a blank.
std::string fileNameOf(std::string url) {
    url = url.substr(url.find_last_of("/\\") + 1);
    for (size_t at; (at = url.find("%20")) != std::string::npos;) url.replace(at, 3, " ");
    return url;
}

}  // namespace

std::string ticketXml(const TicketSpec& shape) {
    const int surfacesPerSheet = shape.twoSided ? 2 : 1;
    const int objects = shape.sheets * surfacesPerSheet * shape.objectsPerSurface;
    const int files = static_cast<int>(shape.pdfs.size());
    std::ostringstream x;
    x << "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
      << "<JDF xmlns=\"http://www.CIP4.org/JDFSchema_1_1\" ID=\"n1\" JobPartID=\"n1\" Type=\"Imposition\""
         " Status=\"Waiting\" Version=\"1.3\">\n  <ResourcePool>\n";
    // The content objects take the pages of the PDFs in turn, in blocks, so that content object
    // k shows logical page (ordinal) k.
    x << "    <RunList ID=\"rDoc\" Class=\"Parameter\" Status=\"Available\" PartIDKeys=\"Run\">\n";
    if (files == 1) {
        x << runPartitions(shape.pdfs[0], objects, shape.pagePartitions);
    } else {
        for (int f = 0; f < files; ++f) {
            int pages = objects / files + (f < objects % files ? 1 : 0);
            x << "      <RunList Run=\"" << f << "\" Pages=\"" << (pages > 1 ? "0 ~ " + std::to_string(pages - 1) : "0")
              << "\"><LayoutElement><FileSpec URL=\"" << shape.pdfs[static_cast<size_t>(f)]
              << "\" MimeType=\"application/pdf\"/></LayoutElement></RunList>\n";
        }
    }
    x << "    </RunList>\n";
    if (shape.marks)
        x << "    <RunList ID=\"rMarks\" Class=\"Parameter\" Status=\"Available\" PartIDKeys=\"Run\">\n"
          << runPartitions("marks.pdf", 1, false) << "    </RunList>\n";
    x << "    <Layout ID=\"rLayout\" Class=\"Parameter\" Status=\"Available\">\n"
      << "      <Signature Name=\"Sig1\">\n";
    int object = 0;
    for (int s = 0; s < shape.sheets; ++s) {
        x << "        <Sheet Name=\"Sheet" << s + 1 << "\">\n";
        if (shape.sheetMedia) x << "          <Media Dimension=\"600 800\" MediaType=\"Paper\"/>\n";
        for (int side = 0; side < surfacesPerSheet; ++side) {
            x << "          <Surface Side=\"" << (side ? "Back" : "Front") << "\""
              << (shape.surfaceBoxes ? " SurfaceContentsBox=\"0 0 600 800\"" : "") << ">\n";
            for (int o = 0; o < shape.objectsPerSurface; ++o) {
                if (shape.marks && o == 1) x << "            <MarkObject CTM=\"1 0 0 1 0 0\" Ord=\"0\"/>\n";
                x << "            <ContentObject CTM=\"1 0 0 1 " << 10 * o << " 0\" Ord=\"" << object
                  << "\" ClipBox=\"0 0 300 400\" TrimSize=\"300 400\"/>\n";
                ++object;
            }
            if (shape.marks && shape.objectsPerSurface < 2) x << "            <MarkObject CTM=\"1 0 0 1 0 0\" Ord=\"0\"/>\n";
            if (shape.extraOrd >= 0 && s == 0 && side == 0)
                x << "            <ContentObject CTM=\"1 0 0 1 0 0\" Ord=\"" << shape.extraOrd << "\"/>\n";
            x << "          </Surface>\n";
        }
        x << "        </Sheet>\n";
    }
    x << "      </Signature>\n    </Layout>\n  </ResourcePool>\n  <ResourceLinkPool>\n"
      << "    <RunListLink rRef=\"rDoc\" Usage=\"Input\" ProcessUsage=\"Document\"/>\n";
    if (shape.marks) x << "    <RunListLink rRef=\"rMarks\" Usage=\"Input\" ProcessUsage=\"Marks\"/>\n";
    x << "    <LayoutLink rRef=\"rLayout\" Usage=\"Input\"/>\n  </ResourceLinkPool>\n</JDF>\n";
    return x.str();
}

std::string descriptionXml(const std::vector<LayerSpec>& layers, const std::vector<VersionSpec>& versions,
                           const DieSpec* die, bool exportVersions, bool layerMode) {
    std::ostringstream x;
    x << "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<OptionalContentGroupData DefaultLayerMode=\""
      << (layerMode ? "true" : "false") << "\"" << (exportVersions ? " export=\"true\"" : "") << ">\n";
    for (const LayerSpec& l : layers)
        x << "  <OptionalLayer pdfIndex=\"" << l.pdfIndex << "\" OCGName=\"" << l.name << "\" displayName=\"" << l.name
          << "\" isSep=\"" << (l.isSep ? "true" : "false") << "\" isNested=\"false\" default=\""
          << (l.on ? "true" : "false") << "\"/>\n";
    if (!versions.empty()) {
        x << "  <Versions>\n";
        for (const VersionSpec& v : versions) {
            x << "    <Version name=\"" << v.name << "\" enable=\"" << (v.enabled ? "true" : "false") << "\" copies=\""
              << v.copies << "\">\n";
            for (const SurfaceSwitch& s : v.surfaces) {
                x << "      <Surface index=\"" << s.index << "\">";
                for (const ContentSwitch& c : s.objects)
                    x << "<ContentObject index=\"" << c.index << "\" LayerNameOn=\"" << c.layerOn << "\" LayerNameOff=\""
                      << c.layerOff << "\" SepNameOn=\"" << c.sepOn << "\" SepNameOff=\"" << c.sepOff << "\"/>";
                x << "</Surface>\n";
            }
            x << "    </Version>\n";
        }
        x << "  </Versions>\n";
    }
    if (die) {
        x << "  <DieCut name=\"Die\" enable=\"" << (die->enable ? "true" : "false") << "\">\n";
        for (int i = 0; i < die->count; ++i)
            x << "    <Surface index=\"0\" dieLayerInternalNames=\"" << die->layers << "\" dieSepInternalNames=\""
              << die->seps << "\"/>\n";
        x << "  </DieCut>\n";
    }
    x << "</OptionalContentGroupData>\n";
    return x.str();
}

Job ticketJobAt(const fs::path& root) {
    return {root, root / "job1.0001", root / "job1D0001", root / "job1.impinfo", root / "out.jdf"};
}

Job writeTicketJob(const fs::path& root, const TicketSpec& shape, const std::string& description) {
    Job job = ticketJobAt(root);
    vorlan::test::writeFile(job.dataFile, "data file of job 1\n");
    vorlan::test::writeFile(job.dataFolder / "ticket.jdf", ticketXml(shape));
    for (const std::string& pdf : shape.pdfs) vorlan::test::writeFile(job.dataFolder / pdf, vorlan::test::minimalPdf());
    if (shape.marks) vorlan::test::writeFile(job.dataFolder / "marks.pdf", vorlan::test::minimalPdf());
    if (!description.empty()) vorlan::test::writeFile(job.description, description);
    return job;
}

Job writeJobForTicket(const fs::path& root, const fs::path& ticket) {
    Job job = ticketJobAt(root);
    vorlan::test::writeFile(job.dataFile, "data file of job 1\n");
    fs::create_directories(job.dataFolder);
    fs::copy_file(ticket, job.dataFolder / "ticket.jdf");
    pugi::xml_document doc;
    doc.load_file(ticket.c_str());
    std::map<std::string, int> pdfs;
    for (pugi::xpath_node fileSpec : doc.select_nodes("//*[local-name()='FileSpec'][@URL]")) {
        int& pages = pdfs[fileNameOf(fileSpec.node().attribute("URL").value())];
        pages = std::max(pages, pagesUsed(fileSpec.node()));
    }
    for (const auto& [name, pages] : pdfs)
        if (!name.empty()) vorlan::test::writeFile(job.dataFolder / name, vorlan::test::minimalPdf("0 0 m 10 10 l S", pages));
    return job;
}

Job writeBarePdfJob(const fs::path& root, const std::string& description) {
    Job job{root, root / "job1.pdf", root, root / "job1.impinfo", root / "out.jdf"};
    vorlan::test::writeFile(job.dataFile, vorlan::test::minimalPdf());
    if (!description.empty()) vorlan::test::writeFile(job.description, description);
    return job;
}

int consume(const Job& job, const char* pageRange, bool alwaysNameDescription) {
    std::string output = job.output.string();
    std::string description = job.description.string();
    HostFolder host{job.root / "out"};
    fs::create_directories(host.folder);
    const bool named = alwaysNameDescription || fs::exists(job.description);
    return vorlan_consume_job(job.dataFile.c_str(), named ? description.c_str() : nullptr,
                              output.data(), job.root.c_str(), pageRange, nullptr, newPdfPath, &host);
}

void setJobAttribute(const char* name, const char* value) {
    LD_JDF worker;
    worker.jobNumber = 1;
    worker.setJobAttribute(name, value);
}

std::string schemaErrors(const std::vector<fs::path>& tickets) {
    std::string report;
    return vorlan::test::filesFailingJdfSchema(tickets, &report).empty() ? std::string() : report;
}

}  // namespace layermode_test
