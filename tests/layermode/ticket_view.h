// Reading a written ticket back for assertions (XPath over the output).
#pragma once

#include <filesystem>
#include <string>
#include <vector>

#include <gtest/gtest.h>
#include <pugixml.hpp>

#include "job_builder.h"
#include "test_support.h"

namespace layermode_test {

class TicketView {
public:
    explicit TicketView(const std::filesystem::path& file) { loaded_ = doc_.load_file(file.c_str()); }
    bool loaded() const { return static_cast<bool>(loaded_); }
    pugi::xpath_node_set all(const std::string& xpath) const { return doc_.select_nodes(xpath.c_str()); }
    pugi::xml_node one(const std::string& xpath) const { return doc_.select_node(xpath.c_str()).node(); }
    size_t count(const std::string& xpath) const { return all(xpath).size(); }
    std::string attr(const std::string& xpath, const char* name) const { return one(xpath).attribute(name).value(); }
    // The OCGControl switches of the interpreting parameters of one ordinal, as "+A -B" text.
    std::string switches(int ordinal) const {
        std::string text;
        for (auto c : all("/JDF/ResourcePool/InterpretingParams/InterpretingParams[@Run='" + std::to_string(ordinal) +
                          "']/PDFInterpretingParams/OCGControl")) {
            if (!text.empty()) text += ' ';
            text += std::string(c.node().attribute("IncludeOCG").value()) == "true" ? "+" : "-";
            text += c.node().attribute("OCGName").value();
        }
        return text;
    }

private:
    pugi::xml_document doc_;
    pugi::xml_parse_result loaded_;
};

// Runs the job and expects the result; on success the ticket is there and, where the corpus is,
// valid against the JDF 1.8 schema; on failure no ticket is left. Returns the ticket to read back.
inline TicketView consumeAndRead(const Job& job, const char* pageRange = "All", int expected = 0) {
    EXPECT_EQ(consume(job, pageRange), expected);
    EXPECT_EQ(std::filesystem::exists(job.output), expected == 0);
    if (expected == 0 && !vorlan::test::corpusDir().empty()) {
        EXPECT_EQ(schemaErrors({job.output}), "");
    }
    return TicketView(job.output);
}

}  // namespace layermode_test
