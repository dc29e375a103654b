// Writes a ticket to a temporary folder and reads it with a fresh worker.
#pragma once

#include <memory>
#include <string>

#include "jdf/ticket_handles.h"
#include "test_support.h"
#include "vorlan/LD_JDF.h"

namespace vorlan::test {

struct ReadTicket {
    TempDir dir;
    std::string path;
    std::unique_ptr<LD_JDF> worker = std::make_unique<LD_JDF>();
    LDError result = LD_OK;

    explicit ReadTicket(const std::string& xml, bool jobHasTicket = false, const char* outputJdf = nullptr) {
        path = (dir / "ticket.jdf").string();
        writeFile(path, xml);
        worker->jobHasTicket = jobHasTicket;
        worker->outputJdfPath = const_cast<char*>(outputJdf);
        ::testing::internal::CaptureStdout();
        result = worker->JDF_InitializeAndParseJDF(path.c_str());
        ::testing::internal::GetCapturedStdout();  // the reader's timing line
    }
    LD_JDF& operator*() { return *worker; }
    LD_JDF* operator->() { return worker.get(); }
};

}  // namespace vorlan::test
