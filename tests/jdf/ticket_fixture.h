// Writes a ticket to a temporary folder and reads it with a fresh worker.
#pragma once

#include <memory>
#include <string>

#include "jdf/ticket_handles.h"
#include "test_support.h"
#include "vorlan/LD_JDF.h"

namespace vorlan::test {

// A JDF root with the given attributes around a resource pool and a link pool.
inline std::string jdfTicket(const std::string& resources, const std::string& links = "",
                             const std::string& rootAttributes = R"(Type="Imposition")") {
    return R"(<?xml version="1.0" encoding="UTF-8"?>
<JDF xmlns="http://www.CIP4.org/JDFSchema_1_1" ID="n1" JobPartID="p1" Status="Waiting" Version="1.3" )" +
           rootAttributes + ">\n<ResourcePool>\n" + resources + "\n</ResourcePool>\n<ResourceLinkPool>\n" + links +
           "\n</ResourceLinkPool>\n</JDF>\n";
}

// A RunList partitioned by Run with one partition per file (NPage pages each).
inline std::string runListByRun(const std::string& id, const std::string& partitions) {
    return R"(<RunList ID=")" + id + R"(" Class="Parameter" Status="Available" PartIDKeys="Run">)" + partitions +
           "</RunList>";
}

inline std::string runPartition(int run, const std::string& url, const std::string& pageAttributes,
                                const std::string& extra = "") {
    return R"(<RunList Run=")" + std::to_string(run) + "\" " + pageAttributes + " " + extra +
           R"(><LayoutElement><FileSpec URL=")" + url + R"(" MimeType="Application/PDF"/></LayoutElement></RunList>)";
}

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
