// vorlan inspect: what the query interface sees of a ticket.
#include <cstdio>
#include <string>
#include <unistd.h>

#include "commands.h"
#include "host_api.h"
#include "vorlan/JDFinterface.h"

namespace vorlan::cli {
namespace {

void reportPdfs(Report& r, const std::string& key, const std::vector<LD_PDF*>& pdfs) {
    r.beginArray(key);
    for (const LD_PDF* pdf : pdfs) {
        r.beginObject("pdf");
        r.field("index", static_cast<long long>(pdf->index));
        r.field("url", pdf->url);
        r.field("mimeType", pdf->mimeType);
        r.field("status", static_cast<long long>(pdf->status));
        r.end();
    }
    r.end();
}

std::string pageList(const std::vector<int32_t>& pages) {
    std::string text;
    for (size_t i = 0; i < pages.size(); ++i) text += (i ? " " : "") + std::to_string(pages[i]);
    return text;
}

void reportRuns(Report& r, const std::string& key, const std::vector<LD_Run*>& runs) {
    r.beginArray(key);
    for (const LD_Run* run : runs) {
        r.beginObject("run");
        r.field("runName", run->runName);
        r.field("runNumber", static_cast<long long>(run->runNumber));
        r.field("pages", pageList(run->pages));
        r.field("NPage", static_cast<long long>(run->NPage));
        r.field("FirstPage", static_cast<long long>(run->FirstPage));
        r.field("SkipPage", static_cast<long long>(run->SkipPage));
        r.flag("EndOfDocument", run->EndOfDocument);
        r.flag("IsBlank", run->IsBlank);
        r.field("pdf", run->pdf ? run->pdf->url : L"");
        r.end();
    }
    r.end();
}

std::string ctmText(const LD_CTM* m) {
    char text[160];
    std::snprintf(text, sizeof text, "%g %g %g %g %g %g", m->a, m->b, m->c, m->d, m->e, m->f);
    return text;
}

std::string boxText(const LD_Box* b) {
    char text[160];
    std::snprintf(text, sizeof text, "%g %g %g %g", b->lowerLeft.x, b->lowerLeft.y, b->upperRight.x, b->upperRight.y);
    return text;
}

void reportSurface(Report& r, const std::string& side, const LD_Surface* s) {
    r.beginObject(side);
    r.field("index", static_cast<long long>(s->index));
    r.field("SurfaceContentsBox", boxText(s->SurfaceContentsBox));
    r.beginArray("contentObjects");
    for (const LD_ContentObject* o : s->contentObjects) {
        r.beginObject("contentObject");
        r.field("contentObjectIndex", static_cast<long long>(o->contentObjectIndex));
        r.field("objectIndex", static_cast<long long>(o->objectIndex));
        r.field("Ord", static_cast<long long>(o->Ord));
        r.flag("ordRepeated", o->ordRepeated);
        r.field("CTM", ctmText(o->CTM));
        if (o->ClipBox) r.field("ClipBox", boxText(o->ClipBox));
        if (o->ClipPath) r.field("clipPathOperations", static_cast<long long>(o->ClipPath->size()));
        r.end();
    }
    r.end();
    r.beginArray("markObjects");
    for (const LD_MarkObject* o : s->markObjects) {
        r.beginObject("markObject");
        r.field("markObjectIndex", static_cast<long long>(o->markObjectIndex));
        r.field("objectIndex", static_cast<long long>(o->objectIndex));
        r.field("Ord", static_cast<long long>(o->Ord));
        r.field("CTM", ctmText(o->CTM));
        r.end();
    }
    r.end();
    r.end();
}

void reportLayout(Report& r, JDFinterface& ticket) {
    r.beginArray("signatures");
    for (long i = 0; i < ticket.JDF_GetNumberOfSignatures(); ++i) {
        const LD_Signature* signature = ticket.JDF_GetSignaturesInLayoutByIndex(i);
        const LD_Range* range = ticket.JDF_GetRangeOfSheetsPerSignature(i);
        r.beginObject("signature");
        r.field("index", static_cast<long long>(signature->index));
        r.field("name", signature->name);
        r.field("firstSheet", static_cast<long long>(range->first));
        r.field("lastSheet", static_cast<long long>(range->last));
        r.beginArray("sheets");
        for (const LD_Sheet* sheet : signature->sheetList) {
            r.beginObject("sheet");
            r.field("index", static_cast<long long>(sheet->index));
            r.field("name", sheet->name);
            r.field("numberInSignature", static_cast<long long>(sheet->numberInSignature));
            if (sheet->front) reportSurface(r, "front", sheet->front);
            if (sheet->back) reportSurface(r, "back", sheet->back);
            r.end();
        }
        r.end();
        r.end();
    }
    r.end();
}

void reportOrdinals(Report& r, JDFinterface& ticket) {
    r.beginArray("ordinals");
    for (long ordinal = 0; ordinal <= ticket.JDF_GetMaxOrdinalNumber(); ++ordinal) {
        const LD_ContentTableElement* content = ticket.JDF_GetLogicalContentPageByOrdinalNumber(ordinal);
        const LD_MarkTableElement* mark = ticket.JDF_GetLogicalMarkPageByOrdinalNumber(ordinal);
        r.beginObject("ordinal");
        r.field("ordinal", static_cast<long long>(ordinal));
        if (content) {
            r.field("contentPdf", content->pdf ? content->pdf->url : L"");
            r.field("contentPage", static_cast<long long>(content->page));
        }
        if (mark) {
            r.field("markPdf", mark->pdf ? mark->pdf->url : L"");
            r.field("markPage", static_cast<long long>(mark->page));
        }
        r.end();
    }
    r.end();
}

// Reads the ticket; with JSON output the reader's timing line goes to standard error.
LDError readTicket(JDFinterface& ticket, const std::string& path, bool quiet) {
    StdoutToStderr toStderr(quiet);
    return ticket.JDF_InitializeAndParseJDF(path.c_str());
}

}  // namespace

int runInspect(Args args) {
    bool json = takeFlag(args, "--json");
    if (wantsHelp(args) || args.size() != 1) {
        std::fputs("usage: vorlan inspect [--json] TICKET_JDF\n\n"
                   "Reads the ticket and prints what the query interface sees: content and mark PDFs, runs,\n"
                   "signatures with their sheets, surfaces, content and mark objects, and the ordinal rows.\n"
                   "The exit status is the reader's result code.\n",
                   wantsHelp(args) ? stdout : stderr);
        return wantsHelp(args) ? 0 : 2;
    }
    JDFinterface ticket(nullptr, nullptr, nullptr);
    LDError result = readTicket(ticket, args[0], json);

    Report r(json);
    r.beginObject();
    r.field("ticket", args[0]);
    r.field("result", static_cast<long long>(result));
    r.field("resultName", resultName(result));
    r.field("signatureCount", static_cast<long long>(ticket.JDF_GetNumberOfSignatures()));
    r.field("sheetCount", static_cast<long long>(ticket.JDF_GetNumberOfSheets()));
    r.field("surfaceCount", static_cast<long long>(ticket.JDF_GetNumberOfSurfaces()));
    r.field("contentObjectCount", static_cast<long long>(ticket.worker()->contentObjects.size()));
    r.field("markObjectCount", static_cast<long long>(ticket.worker()->markObjects.size()));
    r.field("logicalPages", static_cast<long long>(ticket.JDF_GetNumberOfLogicalPages()));
    r.field("logicalDocuments", static_cast<long long>(ticket.JDF_GetNumberOfLogicalDocs()));
    reportPdfs(r, "contentPDFs", *ticket.JDF_GetAllContentPDFs());
    reportPdfs(r, "markPDFs", *ticket.JDF_GetAllMarkPDFs());
    reportRuns(r, "contentRuns", *ticket.JDF_GetAllContentRuns());
    reportRuns(r, "markRuns", *ticket.JDF_GetAllMarkRuns());
    reportLayout(r, ticket);
    reportOrdinals(r, ticket);
    r.end();
    return result;
}

}  // namespace vorlan::cli
