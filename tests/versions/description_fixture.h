// A worker ready to read version descriptions, with helpers to inspect what was recorded.
#pragma once

#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "vorlan/LD_JDF.h"

namespace vorlan::test {

// The names of a list, for comparisons.
inline std::vector<std::wstring> names(const std::vector<wchar_t*>& list) {
    std::vector<std::wstring> out;
    for (const wchar_t* name : list) out.emplace_back(name ? name : L"<null>");
    return out;
}
using Names = std::vector<std::wstring>;

class DescriptionTest : public ::testing::Test {
protected:
    // Gives the worker a ticket with `content` content runs (each its own PDF) and `marks` mark runs.
    void giveTicket(int content, int marks) {
        hasTicket = true;
        for (int i = 0; i < content; ++i) addRun(worker.contentRuns, worker.contentPDFs);
        for (int i = 0; i < marks; ++i) addRun(worker.markRuns, worker.markPDFs);
    }

    LDError read(const std::string& description) {
        return worker.parseXMLBuffer(description.data(), static_cast<long>(description.size()), hasTicket, nullptr);
    }

    // The layer record of a PDF; throws (failing the test) when there is none.
    XMLLayerData& layers(LD_PDF* pdf) { return *worker.layerDataMap.at(pdf); }

    LD_JDF worker;
    bool hasTicket = false;

private:
    static void addRun(std::vector<LD_Run*>& runs, std::vector<LD_PDF*>& pdfs) {
        auto* pdf = new LD_PDF;
        pdfs.push_back(pdf);
        auto* run = new LD_Run;
        run->pdf = pdf;
        runs.push_back(run);
    }
};

}  // namespace vorlan::test
