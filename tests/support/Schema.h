#pragma once

#include <gtest/gtest.h>
#include <libxml/xmlschemas.h>

#include <memory>
#include <string>

/// A schema of author/schema/, to hold documents against.
class Schema {
public:
    explicit Schema(const char* name) {
        const std::string path = SCHEMA_DIR + std::string(name);
        const std::unique_ptr<xmlSchemaParserCtxt, void (*)(xmlSchemaParserCtxt*)> context(
            xmlSchemaNewParserCtxt(path.c_str()), xmlSchemaFreeParserCtxt);
        _schema.reset(xmlSchemaParse(context.get()));
        EXPECT_TRUE(_schema) << path;
    }

    [[nodiscard]] bool IsValid(const std::string& text) const {
        const std::unique_ptr<xmlDoc, void (*)(xmlDoc*)> document(
            xmlReadMemory(text.data(), static_cast<int>(text.size()), nullptr, nullptr, 0),
            xmlFreeDoc);
        const std::unique_ptr<xmlSchemaValidCtxt, void (*)(xmlSchemaValidCtxt*)> context(
            xmlSchemaNewValidCtxt(_schema.get()), xmlSchemaFreeValidCtxt);
        return document && xmlSchemaValidateDoc(context.get(), document.get()) == 0;
    }

private:
    std::unique_ptr<xmlSchema, void (*)(xmlSchema*)> _schema{nullptr, xmlSchemaFree};
};
