#include <author/try/Judge.h>
#include <author/try/ShapeJudge.h>

#include <libxml/SAX2.h>
#include <libxml/parser.h>

#include <algorithm>
#include <exception>
#include <memory>

namespace Author {

namespace {

std::string_view View(const xmlChar* text) {
    return text ? reinterpret_cast<const char*>(text) : std::string_view();
}

void Ignore(void* /*context*/, xmlErrorPtr /*error*/) {}

// Between libxml2's callbacks and the judge; keeps exceptions away from C.
class Reading {
public:
    Reading(const MetaObj::MetaObject* declared, Faults& faults)
        : _faults(faults), _judge(declared, faults), _parser(xmlNewParserCtxt()) {
        if (!_parser) {
            throw std::bad_alloc();
        }
        _parser->_private = this;
        xmlSAXHandler& handler = *_parser->sax;
        handler.startElementNs = Handle<&Reading::Start, xmlSAX2StartElementNs>;
        handler.endElementNs = Handle<&Reading::End, xmlSAX2EndElementNs>;
        handler.characters = Handle<&Reading::Text, xmlSAX2Characters>;
        handler.ignorableWhitespace = handler.characters;
        handler.cdataBlock = Handle<&Reading::CData, xmlSAX2CDataBlock>;
        handler.comment = Handle<&Reading::Comment, xmlSAX2Comment>;
        handler.processingInstruction = Handle<&Reading::Instruction, xmlSAX2ProcessingInstruction>;
        handler.reference = Handle<&Reading::Reference, xmlSAX2Reference>;
        xmlSetStructuredErrorFunc(this, [](void* reading, xmlErrorPtr error) {
            static_cast<Reading*>(reading)->Note(*error);
        });
    }
    Reading(const Reading&) = delete;
    Reading& operator=(const Reading&) = delete;
    ~Reading() { xmlSetStructuredErrorFunc(nullptr, Ignore); }

    void Run(std::string_view document) {
        xmlFreeDoc(xmlCtxtReadMemory(_parser.get(), document.data(),
                                     static_cast<int>(document.size()), nullptr, nullptr,
                                     XML_PARSE_NONET | XML_PARSE_RECOVER));
        if (_failure) {
            std::rethrow_exception(_failure);
        }
        _faults.isWellFormed = _parser->wellFormed != 0;
    }

private:
    struct ParserDeleter {
        void operator()(xmlParserCtxt* parser) const { xmlFreeParserCtxt(parser); }
    };

    // libxml2 reads the content of an entity with a parser of its own; that is not looked at.
    template <auto own, auto standard, class... Arguments>
    static void Handle(void* context, Arguments... arguments) {
        Reading& reading = *static_cast<Reading*>(static_cast<xmlParserCtxt*>(context)->_private);
        if (context != reading._parser.get()) {
            standard(context, arguments...);
        } else if (!reading._failure) {
            try {
                (reading.*own)(arguments...);
            } catch (...) {
                reading._failure = std::current_exception();
            }
        }
    }

    [[nodiscard]] long Line() const { return _parser->input ? _parser->input->line : 0; }

    void Start(const xmlChar* name, const xmlChar* /*prefix*/, const xmlChar* /*uri*/,
               int /*namespaceCount*/, const xmlChar** /*namespaces*/, int attributeCount,
               int /*defaultedCount*/, const xmlChar** attributes) {
        constexpr int width = 5;  // name, prefix, URI, value, its end
        ShapeJudge::Attributes found;
        for (int i = 0; i < attributeCount; ++i) {
            const xmlChar** attribute = attributes + width * i;
            if (!attribute[1]) {  // xml:space and its like are not meant for the reader
                found.push_back({View(attribute[0]),
                                 {reinterpret_cast<const char*>(attribute[3]),
                                  static_cast<size_t>(attribute[4] - attribute[3])}});
            }
        }
        _judge.Open(Line(), View(name), found);
    }
    void End(const xmlChar* /*name*/, const xmlChar* /*prefix*/, const xmlChar* /*uri*/) {
        _judge.Close();
    }
    void Text(const xmlChar* text, int size) {
        _judge.Text(Line(), {reinterpret_cast<const char*>(text), static_cast<size_t>(size)});
    }
    void CData(const xmlChar* text, int size) {
        _judge.Piece(Line(), {reinterpret_cast<const char*>(text), static_cast<size_t>(size)},
                     true);
    }
    void Comment(const xmlChar* text) { _judge.Piece(Line(), View(text), false); }
    void Instruction(const xmlChar* /*target*/, const xmlChar* data) {
        _judge.Piece(Line(), View(data), false);
    }
    void Reference(const xmlChar* name) {
        _judge.Piece(Line(), "&" + std::string(View(name)) + ";", true);
    }

    void Note(const xmlError& error) {
        // Of names with prefixes that nobody declared the engine makes plain names.
        if (error.level < XML_ERR_ERROR || error.domain == XML_FROM_NAMESPACE || _failure) {
            return;
        }
        try {
            if (error.code == XML_ERR_TAG_NOT_FINISHED || error.code == XML_ERR_DOCUMENT_END) {
                _faults.Add(error.line, "the document ends inside of <" +
                                            std::string(_judge.Innermost()) +
                                            ">: what prints it died, or stopped half way");
            } else {
                std::string text = error.message ? error.message : "unknown error";
                text.erase(text.find_last_not_of(" \n") + 1);
                _faults.Add(error.line, "not well-formed, and refused as a whole: " + text);
            }
        } catch (...) {
            _failure = std::current_exception();
        }
    }

    Faults& _faults;
    ShapeJudge _judge;
    std::exception_ptr _failure;
    const std::unique_ptr<xmlParserCtxt, ParserDeleter> _parser;
};

}  // namespace

void Faults::Add(long line, std::string text) {
    constexpr size_t most = 1000;
    if (++count <= most) {
        kept.push_back({line, std::move(text)});
    }
}

Faults JudgePrinted(std::string_view printed, const MetaObj::MetaObject* declared) {
    constexpr std::string_view mark = "ERROR:";
    const bool hasFailed = printed.starts_with(mark);
    Faults faults = hasFailed ? Faults() : JudgeDocument(printed, declared);
    bool atHead = true;
    long number = 0;
    for (std::string_view rest = printed; !rest.empty();) {
        const std::string_view line = rest.substr(0, rest.find('\n'));
        rest.remove_prefix(std::min(line.size() + 1, rest.size()));
        ++number;
        if (line.starts_with(mark) && (!hasFailed || !atHead)) {
            faults.Add(number, Quoted(line) +
                                   " is not read as an error: such lines stand ahead of all else");
        } else if (hasFailed && atHead && !line.starts_with(mark)) {
            faults.Add(number, "what stands behind the ERROR: lines is dropped");
        }
        atHead = atHead && line.starts_with(mark);
    }
    std::ranges::stable_sort(faults.kept, {}, &Faults::Fault::line);
    return faults;
}

QuietXml::QuietXml() {
    xmlSetStructuredErrorFunc(nullptr, Ignore);
}

QuietXml::~QuietXml() {
    xmlSetStructuredErrorFunc(nullptr, nullptr);
}

Faults JudgeDocument(std::string_view document, const MetaObj::MetaObject* declared) {
    const QuietXml quiet;
    Faults faults;
    Reading(declared, faults).Run(document);
    std::ranges::stable_sort(faults.kept, {}, &Faults::Fault::line);
    return faults;
}

}  // namespace Author
