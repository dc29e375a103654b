// The job pipeline: from the data file and the version description to the new ticket.
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <memory>
#include <string>

#include "jdf/ticket_handles.h"
#include "jobpaths/layout_injection.h"
#include "jobpaths/pdf_only.h"
#include "jobpaths/spot_mode.h"
#include "pdf/zipped_jdf_file_system.h"
#include "platform/os/file_system.h"
#include "platform/os/text.h"
#include "vorlan/LD_JDF.h"

namespace {

PageRangeMode pageRangeModeOf(const char* pageRange) {
    if (!pageRange) return PAGE_RANGE_LIST;
    if (std::strcmp(pageRange, "All") == 0) return PAGE_RANGE_ALL;
    if (std::strcmp(pageRange, "Odd") == 0) return PAGE_RANGE_ODD;
    if (std::strcmp(pageRange, "Even") == 0) return PAGE_RANGE_EVEN;
    return PAGE_RANGE_LIST;
}

}  // namespace

LDError LD_JDF::JDF_InitializeAndCreateNewJDF(char* outputPath, char* xmlBuffer, long xmlLength,
                                               const char* dataFile, const char* folder, const char* range,
                                               int number) {
    // 1. The per-job file context.
    if (!dataFile) return exitWith(LD_FAILED);
    destroyZippedJDFFileSystem(zipFileSystem);
    zipFileSystem = createZippedJDFFileSystem(dataFile);
    if (!zipFileSystem) return exitWith(LD_FAILED);

    // 2. Pipeline state.
    jobFolder = const_cast<char*>(folder);
    outputJdfPath = outputPath;
    dieCutDefined = false;
    pageRange = const_cast<char*>(range);
    pageRangeMode = pageRangeModeOf(range);
    jobNumber = number;
    printDieLine = false;
    autoDieControl = false;

    // 3. Job attributes that steer the die handling; only the exact value "True" counts.
    char* value = nullptr;
    if (getJobAttribute("KVPrintDieLine", &value) && std::strcmp(value, "True") == 0) printDieLine = true;
    if (getJobAttribute("KVAutoDieControl", &value) && std::strcmp(value, "True") == 0) autoDieControl = true;

    // 4. Classify the data file.
    auto* path = static_cast<wchar_t*>(std::calloc(std::strlen(dataFile) + 1, sizeof(wchar_t)));
    if (!path) return exitWith(LD_FAILED);
    inputType = analizeDataFile(dataFile, path);
    std::free(dataPath);
    dataPath = path;

    // 5. Find the ticket.
    jobHasTicket = false;
    switch (inputType) {
        case INPUT_FOLDER: {
            std::free(jdfPath);
            jdfPath = findFileByExtentionInDir(dataPath, const_cast<wchar_t*>(L"jdf"));
            jobHasTicket = jdfPath != nullptr;
            break;
        }
        case INPUT_COMPRESSED:
            break;
        case INPUT_PDF:
            delete inputPDF;
            inputPDF = new LD_PDF;
            LD_SetText(inputPDF->nativePath, dataPath);
            LD_SetText(inputPDF->mimeType, L"application/pdf");
            inputPDF->status = LD_RESOURCE_AVAILABLE;
            break;
        default:
            return exitWith(LD_INVALID_INPUT);
    }

    // 6. No die is defined until this run defines one.
    setJobAttribute("KVDieDefined", "False");

    // 7. Read the ticket, or start the JDF library for a job without one.
    if (jobHasTicket) {
        ticketDataPath = dataPath;
        LDError read = JDF_InitializeAndParseJDF(jdfPath);
        if (read == LD_JDF_UNUSABLE || read == LD_FAILED) return exitWith(read);
        // A ticket that yields neither a content run nor a placed object has nothing to print.
        if (contentRuns.empty() && contentObjects.empty() && markObjects.empty())
            return exitWith(LD_JDF_RESOURCE_MISSING);
        // A ticket that came without a Layout gets a ticket of its own, whatever the reader
        // injected to answer queries.
        if (!ticket->ticketHasLayout) {
            LayoutInjectionProcessingJdf injection(jdfPath, dataPath, outputJdfPath, this);
            return exitWith(injection.run());
        }
        AddDieInfoFile("OrigPageCount", numberOfSurfaces);
    } else {
        try {
            JDF::PlatformUtils::Initialize();
        } catch (...) {
            return exitWith(LD_FAILED);
        }
    }

    // 8. The version description: the host's, or one generated from the PDFs' inks.
    LDError parsed = LD_OK;
    bool described = false;
    if (xmlBuffer) {
        described = true;
        parsed = parseXMLBuffer(xmlBuffer, xmlLength, jobHasTicket, jobFolder);
    } else {
        bool generate = autoDieControl && populateKAVDieLibInks();
        if (!generate) {
            eskoInksFound = false;
            populateEskoTechInks();
            generate = eskoInksFound;
        }
        if (generate) {
            // The host may keep its own description in the job folder under the job's name, so
            // the generated one goes to a file of its own, removed on every way out.
            vorlan::os::TemporaryFile file(jobFolder ? jobFolder : ".", ".job" + std::to_string(jobNumber) + ".impinfo.");
            generateImpInfoFile(file.path().c_str());
            char* generated = nullptr;
            long generatedLength = 0;
            parseImpInfoFile(file.path().c_str(), &generated, &generatedLength);
            file.remove();
            std::unique_ptr<char, decltype(&std::free)> owned(generated, &std::free);
            if (generated) {
                described = true;
                parsed = parseXMLBuffer(generated, generatedLength, jobHasTicket, jobFolder);
            }
        }
    }
    if (parsed != LD_OK) return exitWith(parsed);
    if (described) {
        LDError pruned = applyClientModeChangesToXMLBufferData();
        if (pruned != LD_OK) return exitWith(pruned);
    }

    // 9. Locate every PDF in the data folder.
    if (inputType == INPUT_FOLDER) {
        if (jobHasTicket) {
            for (auto* list : {&contentPDFs, &markPDFs}) {
                for (LD_PDF* pdf : *list) {
                    wchar_t* found = findTicketFileInDir(dataPath, pdf->url);
                    if (!found) return exitWith(LD_FILE_NOT_FOUND);
                    LD_SetText(pdf->nativePath, found);
                    std::free(found);
                }
            }
        } else {
            wchar_t* found = findFileByExtentionInDir(dataPath, const_cast<wchar_t*>(L"pdf"));
            if (!found) return exitWith(LD_FILE_NOT_FOUND);
            delete inputPDF;
            inputPDF = new LD_PDF;
            LD_SetText(inputPDF->nativePath, found);
            LD_SetText(inputPDF->mimeType, L"application/pdf");
            inputPDF->status = LD_RESOURCE_AVAILABLE;
            std::free(found);
            // The description was read before the PDF was found: its layers, kept under no PDF,
            // are this PDF's.
            auto unbound = layerDataMap.find(nullptr);
            if (unbound != layerDataMap.end()) {
                XMLLayerData* layers = unbound->second;
                layerDataMap.erase(unbound);
                layerDataMap[inputPDF] = layers;
            }
        }
    }

    // 10. Separation mode leaves for its own path.
    if (!defaultLayerMode) {
        if (!jobHasTicket) {
            PdfOnlyProcessingJdf pdfOnly(outputJdfPath, this);
            return exitWith(pdfOnly.run());
        }
        if (!surfaceVersions.empty() || !versions.empty() || !m_XMLDieCuts.empty()) {
            SpotModeProcessingJdf spotMode(outputJdfPath, this);
            return exitWith(spotMode.run());
        }
    }

    // 11. Page ranges.
    if (jobHasTicket)
        applyPageRangeForLayout();
    else if (!versions.empty())
        applyPageRangeForPDF();
    else
        applyPageRangeForPDFWithoutVersions();

    // 12.-13. Convert the PDFs, then spell out every version.
    if (LDError converted = convertAllPDFs(); converted != LD_OK) return exitWith(converted);
    if (LDError expanded = createRunListAndInterpretingParamPairs(jobHasTicket); expanded != LD_OK)
        return exitWith(expanded);

    // 14.-15. Die cuts.
    if (m_XMLDieCuts.size() == 1) {
        AddDieInfoFile("KVDieDefined", 1);
        setJobAttribute("KVDieDefined", "True");
    }
    if (LDError died = addDieCut(jobHasTicket); died != LD_OK) return exitWith(died);

    // 16. The new ticket, built from the model alone: the parsed input ticket goes first, so
    // the two documents are never held at once.
    if (ticket) ticket->dropTree();
    if (LDError written = writeJDF(outputJdfPath); written != LD_OK) return exitWith(written);

    // 17. Release the model.
    releaseJobRecords();
    if (ticketDataPath != dataPath) std::free(ticketDataPath);
    ticketDataPath = nullptr;
    std::free(jdfPath);
    jdfPath = nullptr;
    std::free(dataPath);
    dataPath = nullptr;
    destroyZippedJDFFileSystem(zipFileSystem);
    zipFileSystem = nullptr;
    JDF::PlatformUtils::Terminate();
    return exitWith(LD_OK);
}
