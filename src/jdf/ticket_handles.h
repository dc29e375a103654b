// The parsed ticket's handles that the worker keeps between the reader and the writer.
#pragma once

#include <memory>

#include "platform/jdf/jdf.h"

struct LD_JDFHandles {
    std::unique_ptr<JDF::JDFParser> parser;  // owned by the reader while it reads
    JDF::JDFNode rootNode;
    JDF::JDFNode processNode;
    JDF::KElement layoutElement;
    JDF::KElement interpretingParamsElement;
    JDF::KElement renderingParamsElement;
    JDF::KElement digitalPrintingParamsElement;
    JDF::KElement runListElement;

    LD_JDFHandles() = default;
    // Copies share the document; the parser stays with the original.
    LD_JDFHandles(const LD_JDFHandles& other)
        : rootNode(other.rootNode), processNode(other.processNode), layoutElement(other.layoutElement),
          interpretingParamsElement(other.interpretingParamsElement),
          renderingParamsElement(other.renderingParamsElement),
          digitalPrintingParamsElement(other.digitalPrintingParamsElement),
          runListElement(other.runListElement) {}
};
