#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/extension/XmlReader.h>
#include <zelmar/internal/platform/FileDescriptor.h>

#include <fcntl.h>
#include <libxml/SAX2.h>
#include <libxml/parser.h>
#include <sys/stat.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <deque>
#include <exception>
#include <memory>
#include <vector>

using Zelmar::ZelmarException;

namespace AutoCli {

namespace {

std::string_view View(const xmlChar* text) {
    return text ? reinterpret_cast<const char*>(text) : std::string_view();
}

std::optional<std::string_view> Content(const xmlChar* text) {
    return text ? std::optional(View(text)) : std::nullopt;
}

// Between libxml2's callbacks and the events: joins texts, resolves attributes, and keeps
// exceptions away from C.
class Reader {
public:
    explicit Reader(XmlEvents& events);

    [[nodiscard]] xmlParserCtxt* GetParser() const { return _parser.get(); }
    // Takes what the parser made of its input, which is null for one that is not well-formed.
    bool Finish(xmlDoc* document);

    void ReadNode(const xmlNode* node);

private:
    struct ParserDeleter {
        void operator()(xmlParserCtxt* parser) const { xmlFreeParserCtxt(parser); }
    };
    struct NodeListDeleter {
        void operator()(xmlNode* list) const { xmlFreeNodeList(list); }
    };

    void Start(const xmlChar* name, const xmlChar* prefix, const xmlChar* uri, int namespaceCount,
               const xmlChar** namespaces, int attributeCount, int defaultedCount,
               const xmlChar** attributes);
    void End(const xmlChar* name, const xmlChar* prefix, const xmlChar* uri);
    void Text(const xmlChar* text, int size) { Append("text", text, size); }
    void CData(const xmlChar* text, int size) { Append({}, text, size); }
    void Comment(const xmlChar* text) { Leaf({.name = "comment", .content = Content(text)}); }
    void Instruction(const xmlChar* target, const xmlChar* data) {
        Leaf({.name = View(target), .content = Content(data)});
    }
    void Reference(const xmlChar* name);

    void Append(std::string_view name, const xmlChar* text, int size);
    void FlushText();
    void Leaf(const XmlNode& node);
    void Open(const xmlDoc* document, std::string_view name);

    std::string_view Keep(std::string text) { return _kept.emplace_back(std::move(text)); }
    std::string_view Qualified(const xmlChar* name, const xmlChar* prefix, const xmlChar* uri);
    std::string_view Value(const xmlChar* value, const xmlChar* end);
    std::string_view Expanded(const xmlNode* nodes);
    void AppendExpanded(const xmlNode* nodes, std::string& text);
    void AddDefaults(const xmlDoc* document, std::string_view name);
    void CountDeclared(const xmlChar* text);
    void CountReferences(const xmlNode* nodes);

    // One for all callbacks. libxml2 reads the content of an entity with a parser of its own and
    // tells the same callbacks; that becomes a tree below the entity's declaration, as ever.
    template <auto own, auto standard, class... Arguments>
    static void Handle(void* context, Arguments... arguments) {
        Reader& reader = *static_cast<Reader*>(static_cast<xmlParserCtxt*>(context)->_private);
        if (context != reader._parser.get()) {
            standard(context, arguments...);
        } else if (!reader._failure) {
            try {
                (reader.*own)(arguments...);
            } catch (...) {
                reader._failure = std::current_exception();
            }
        }
    }

    XmlEvents& _events;
    const std::unique_ptr<xmlParserCtxt, ParserDeleter> _parser;
    std::exception_ptr _failure;
    size_t _depth = 0;
    size_t _declaredBytes = 0;
    // The text that is being gathered, under the name of its node.
    std::optional<std::string_view> _textName;
    std::string _text;
    // The attributes of one element, and those of its texts that stand nowhere else.
    std::vector<XmlNode::Attribute> _attributes;
    std::deque<std::string> _kept;
};

Reader::Reader(XmlEvents& events) : _events(events), _parser(xmlNewParserCtxt()) {
    if (!_parser) {
        throw std::bad_alloc();
    }
    _parser->_private = this;
    xmlSAXHandler& handler = *_parser->sax;
    handler.startElementNs = Handle<&Reader::Start, xmlSAX2StartElementNs>;
    handler.endElementNs = Handle<&Reader::End, xmlSAX2EndElementNs>;
    handler.characters = Handle<&Reader::Text, xmlSAX2Characters>;
    handler.ignorableWhitespace = handler.characters;
    handler.cdataBlock = Handle<&Reader::CData, xmlSAX2CDataBlock>;
    handler.comment = Handle<&Reader::Comment, xmlSAX2Comment>;
    handler.processingInstruction = Handle<&Reader::Instruction, xmlSAX2ProcessingInstruction>;
    handler.reference = Handle<&Reader::Reference, xmlSAX2Reference>;
    xmlResetLastError();
}

// Where memory or the input fails, libxml2 may stop and take what it has for a document.
void RequireWholeDocument() {
    const xmlError* error = xmlGetLastError();
    if (error && error->code == XML_ERR_NO_MEMORY) {
        throw ZelmarException("There was not enough memory for the whole document");
    }
    if (error && error->domain == XML_FROM_IO && error->level >= XML_ERR_ERROR) {
        throw ZelmarException("The document could not be read to its end");
    }
}

bool Reader::Finish(xmlDoc* document) {
    xmlFreeDoc(document);
    RequireWholeDocument();
    if (document && _failure) {
        std::rethrow_exception(_failure);
    }
    return document != nullptr;
}

void Reader::Start(const xmlChar* name, const xmlChar* prefix, const xmlChar* uri,
                   int /*namespaceCount*/, const xmlChar** /*namespaces*/, int attributeCount,
                   int defaultedCount, const xmlChar** attributes) {
    FlushText();
    // Those that the parser takes from declarations come last, and from these they are added.
    constexpr int width = 5;  // name, prefix, URI, value, its end
    for (int i = 0; i < attributeCount - defaultedCount; ++i) {
        const xmlChar** attribute = attributes + width * i;
        const auto value = Value(attribute[3], attribute[4]);
        _attributes.push_back({Qualified(attribute[0], attribute[1], attribute[2]), value});
    }
    ++_depth;
    Open(_parser->myDoc, Qualified(name, prefix, uri));
}

void Reader::Open(const xmlDoc* document, std::string_view name) {
    AddDefaults(document, name);
    _events.Open({.name = name, .attributes = _attributes});
    _attributes.clear();
    _kept.clear();
}

void Reader::End(const xmlChar* /*name*/, const xmlChar* /*prefix*/, const xmlChar* /*uri*/) {
    FlushText();
    --_depth;
    _events.Close();
}

void Reader::Reference(const xmlChar* name) {
    const xmlEntity* entity = xmlGetDocEntity(_parser->myDoc, name);
    CountDeclared(entity ? entity->content : nullptr);
    CountReferences(entity ? entity->children : nullptr);
    Leaf({.name = View(name), .content = Content(entity ? entity->content : nullptr)});
}

// The parser gives a text in pieces.
void Reader::Append(std::string_view name, const xmlChar* text, int size) {
    if (_textName != name) {
        FlushText();
        _textName = name;
    }
    _text.append(reinterpret_cast<const char*>(text), static_cast<size_t>(size));
}

void Reader::FlushText() {
    if (_textName) {
        _events.Leaf({.name = *_textName, .content = _text});
        _textName.reset();
        _text.clear();
    }
}

void Reader::Leaf(const XmlNode& node) {
    FlushText();
    // What stands around the root element, and in the declarations before it, is no part of it.
    if (_depth > 0) {
        _events.Leaf(node);
    }
}

// A prefix that nobody declared is a part of the name; any other is not.
std::string_view Reader::Qualified(const xmlChar* name, const xmlChar* prefix, const xmlChar* uri) {
    if (!prefix || uri) {
        return View(name);
    }
    return Keep(std::string(View(prefix)) + ":" + std::string(View(name)));
}

// Behind the value of an attribute stands a quote. Where none does, the parser made a copy, in
// which references are still references.
std::string_view Reader::Value(const xmlChar* value, const xmlChar* end) {
    if (*end) {
        return {reinterpret_cast<const char*>(value), static_cast<size_t>(end - value)};
    }
    const std::unique_ptr<xmlNode, NodeListDeleter> nodes(
        xmlStringLenGetNodeList(_parser->myDoc, value, static_cast<int>(end - value)));
    CountReferences(nodes.get());
    return Expanded(nodes.get());
}

std::string_view Reader::Expanded(const xmlNode* nodes) {
    std::string text;
    AppendExpanded(nodes, text);
    return Keep(std::move(text));
}

// As `xmlNodeListGetString` does, in linear time.
void Reader::AppendExpanded(const xmlNode* nodes, std::string& text) {
    for (const xmlNode* node = nodes; node; node = node->next) {
        if (node->type == XML_ENTITY_REF_NODE) {
            const xmlEntity* entity = xmlGetDocEntity(node->doc, node->name);
            AppendExpanded(entity ? entity->children : nullptr, text);
        } else {
            text += View(node->content);
        }
    }
}

void Reader::AddDefaults(const xmlDoc* document, std::string_view name) {
    if (!document || !document->intSubset) {
        return;
    }
    const xmlElement* element = xmlGetDtdElementDesc(
        document->intSubset, reinterpret_cast<const xmlChar*>(std::string(name).c_str()));
    for (const xmlAttribute* declared = element ? element->attributes : nullptr; declared;
         declared = declared->nexth) {
        CountDeclared(declared->defaultValue);
        const bool isGiven = std::ranges::find(_attributes, View(declared->name),
                                               &XmlNode::Attribute::name) != _attributes.end();
        if (declared->defaultValue && !declared->prefix && !isGiven) {
            _attributes.push_back({View(declared->name), View(declared->defaultValue)});
        }
    }
}

// Each place counts, so that the sum bounds the time it takes as well. The parser does not count
// this, since it leaves references as they are.
void Reader::CountDeclared(const xmlChar* text) {
    constexpr size_t limit = 10'000'000;
    _declaredBytes += 1 + View(text).size();
    if (_declaredBytes > limit) {
        throw ZelmarException("The declarations of the document stand for more than " +
                              std::to_string(limit) + " bytes");
    }
}

// An entity may hold references in turn.
void Reader::CountReferences(const xmlNode* nodes) {
    for (const xmlNode* node = nodes; node; node = node->next) {
        if (node->type == XML_ENTITY_REF_NODE) {
            CountDeclared(node->content);
            const xmlEntity* entity = xmlGetDocEntity(node->doc, node->name);
            CountReferences(entity ? entity->children : nullptr);
        }
    }
}

void Reader::ReadNode(const xmlNode* node) {
    if (node->type != XML_ELEMENT_NODE) {
        _events.Leaf({.name = View(node->name), .content = Content(node->content)});
        return;
    }
    for (const xmlAttr* attribute = node->properties; attribute; attribute = attribute->next) {
        CountReferences(attribute->children);
        _attributes.push_back({View(attribute->name), Expanded(attribute->children)});
    }
    Open(node->doc, View(node->name));
    for (const xmlNode* child = node->children; child; child = child->next) {
        ReadNode(child);
    }
    _events.Close();
}

int TakeText(void* rest, char* buffer, int size) {
    auto& text = *static_cast<std::string_view*>(rest);
    const size_t count = text.copy(buffer, static_cast<size_t>(size));
    text.remove_prefix(count);
    return static_cast<int>(count);
}

// In the words, and on the stream, that libxml2 has for a file that it cannot open. The reason is
// told of a file that is there, and twice, since libxml2 tries such a file twice.
void TellUnopened(const std::string& path, int error) {
    struct stat status = {};
    for (int attempt = 0; attempt < 2 && stat(path.c_str(), &status) == 0; ++attempt) {
        xmlGenericError(xmlGenericErrorContext, "I/O error : %s\n", std::strerror(error));
    }
    xmlGenericError(xmlGenericErrorContext, "I/O warning : failed to load external entity \"%s\"\n",
                    path.c_str());
}

}  // namespace

// In pieces, for the parser copies a text that it is given whole.
bool XmlUtil_ReadText(std::string_view text, const char* name, XmlEvents& events) {
    if (text.empty()) {
        return false;  // of which libxml2 says nothing
    }
    Reader reader(events);
    return reader.Finish(
        xmlCtxtReadIO(reader.GetParser(), TakeText, nullptr, &text, name, nullptr, 0));
}

bool XmlUtil_ReadFile(const std::string& path, XmlEvents& events) {
    LIBXML_TEST_VERSION
    const FileDescriptor file(open(path.c_str(), O_RDONLY | O_CLOEXEC));
    if (file.Get() < 0) {
        TellUnopened(path, errno);
        return false;
    }
    Reader reader(events);
    return reader.Finish(xmlCtxtReadFd(reader.GetParser(), file.Get(), path.c_str(), nullptr, 0));
}

void XmlUtil_ReadNode(const _xmlNode* node, XmlEvents& events) {
    Reader(events).ReadNode(node);
}

}  // namespace AutoCli
