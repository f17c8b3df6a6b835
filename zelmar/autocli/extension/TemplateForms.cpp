#include <zelmar/autocli/extension/TemplateForms.h>

#include <algorithm>
#include <optional>
#include <utility>

namespace AutoCli {

namespace {

constexpr size_t npos = std::string_view::npos;

// A form found in a text.
struct Form {
    size_t begin;
    size_t end;
    std::string_view argument;
    bool quote = false;
};

// The opening of a form: all of it up to its arguments.
std::string HeadOf(std::string_view word, std::string_view name, std::string_view tail) {
    return std::string(word).append(name).append(tail);
}

// The quote word and what closes a list form, at the front of a text.
struct ListEnd {
    std::string_view text;
    bool quote;
};

constexpr ListEnd listEnds[] = {{",true}", true}, {",false}", false}};

const ListEnd* ListEndAt(std::string_view text, size_t place) {
    const auto* end = std::ranges::find_if(listEnds, [rest = text.substr(place)](const ListEnd& e) {
        return rest.starts_with(e.text);
    });
    return end == std::end(listEnds) ? nullptr : end;
}

std::optional<Form> FindValue(std::string_view text, std::string_view head, size_t from) {
    const size_t begin = text.find(head, from);
    if (begin == npos) {
        return std::nullopt;
    }
    return Form{begin, begin + head.size(), {}};
}

std::optional<Form> FindCondition(std::string_view text, std::string_view head, size_t from) {
    const size_t begin = text.find(head, from);
    if (begin == npos) {
        return std::nullopt;
    }
    const size_t body = begin + head.size();
    const size_t close = text.find('}', body + 1);
    if (close == npos) {
        return std::nullopt;  // nor does a later one close
    }
    return Form{begin, close + 1, text.substr(body, close - body)};
}

// A joined list whose head ends where the separator, of one character or none, should stand.
std::optional<Form> ReadJoinedList(std::string_view text, size_t begin, size_t separator) {
    for (const size_t length : {1u, 0u}) {
        const size_t quote = separator + length;
        if (quote < text.size() && text[quote] == '\'') {
            if (const ListEnd* end = ListEndAt(text, quote + 1)) {
                return Form{begin, quote + 1 + end->text.size(), text.substr(separator, length),
                            end->quote};
            }
        }
    }
    return std::nullopt;
}

std::optional<Form> FindJoinedList(std::string_view text, std::string_view head, size_t from) {
    for (size_t begin = text.find(head, from); begin != npos; begin = text.find(head, begin + 1)) {
        if (const auto form = ReadJoinedList(text, begin, begin + head.size())) {
            return form;
        }
    }
    return std::nullopt;
}

std::optional<Form> ReadRepeatedList(std::string_view text, size_t begin, size_t prefix) {
    for (size_t comma = text.find(',', prefix + 1); comma != npos;
         comma = text.find(',', comma + 1)) {
        if (const ListEnd* end = ListEndAt(text, comma)) {
            return Form{begin, comma + end->text.size(), text.substr(prefix, comma - prefix),
                        end->quote};
        }
    }
    return std::nullopt;
}

std::optional<Form> FindRepeatedList(std::string_view text, std::string_view head, size_t from) {
    const size_t begin = text.find(head, from);
    return begin == npos ? std::nullopt : ReadRepeatedList(text, begin, begin + head.size());
}

// The last joined list. Forms of this kind never stand inside one another.
std::optional<Form> FindLastJoinedList(std::string_view text, std::string_view head) {
    for (size_t begin = text.rfind(head); begin != npos;
         begin = begin == 0 ? npos : text.rfind(head, begin - 1)) {
        if (const auto form = ReadJoinedList(text, begin, begin + head.size())) {
            return form;
        }
    }
    return std::nullopt;
}

// The last opening that an end follows, with at least one character between them.
std::optional<Form> FindLastRepeatedList(std::string_view text, std::string_view head) {
    size_t lastEnd = 0;
    for (const ListEnd& end : listEnds) {
        const size_t place = text.rfind(end.text);
        lastEnd = std::max(lastEnd, place == npos ? 0 : place);
    }
    if (lastEnd <= head.size()) {
        return std::nullopt;
    }
    return FindRepeatedList(text, head, text.rfind(head, lastEnd - 1 - head.size()));
}

// Replaces what `find` finds by what `replacement` makes of it.
template <class Find, class Replacement>
void ReplaceForms(std::string& text, Find find, const std::string& head, Replacement replacement) {
    std::string replaced;
    size_t done = 0;
    for (auto form = find(text, head, 0); form; form = find(text, head, done)) {
        replaced.append(text, done, form->begin - done).append(replacement(*form));
        done = form->end;
    }
    if (done > 0) {
        text = std::move(replaced.append(text, done));
    }
}

template <class Find, class FindLast>
void ReplaceLists(std::string& text, Find find, FindLast findLast, const std::string& head,
                  const ListMaker& list) {
    if (const auto last = findLast(text, head)) {
        const std::string replacement = list(last->argument, last->quote);
        ReplaceForms(
            text, find, head, [&](const Form&) -> auto& { return replacement; });
    }
}

}  // namespace

void ReplaceValues(std::string& text, std::string_view name, const ValueMaker& value) {
    const std::string form = HeadOf("$val{", name, "}");
    const size_t last = text.rfind(form);
    if (last == npos) {
        return;
    }
    const std::string_view whole = text;
    const std::string replacement = value(whole.substr(0, last).ends_with('\'') &&
                                          whole.substr(last + form.size()).starts_with('\''));
    ReplaceForms(
        text, FindValue, form, [&](const Form&) -> auto& { return replacement; });
}

void ReplaceConditions(std::string& text, std::string_view name) {
    ReplaceForms(text, FindCondition, HeadOf("$if{", name, ","),
                 [](const Form& form) { return form.argument; });
}

void ReplaceJoinedLists(std::string& text, std::string_view name, const ListMaker& list) {
    ReplaceLists(text, FindJoinedList, FindLastJoinedList, HeadOf("$list{", name, ",'"), list);
}

void ReplaceRepeatedLists(std::string& text, std::string_view name, const ListMaker& list) {
    ReplaceLists(text, FindRepeatedList, FindLastRepeatedList, HeadOf("$multilist{", name, ","),
                 list);
}

}  // namespace AutoCli
