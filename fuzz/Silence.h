#pragma once

#include <libxml/xmlerror.h>

inline void Ignore(void* /*context*/, const char* /*format*/, ...) {}

/// To be called by targets that read XML: libxml2 tells the details of every faulty input, which
/// takes far longer than to read it.
inline void SilenceXml() {
    xmlSetGenericErrorFunc(nullptr, Ignore);
}
