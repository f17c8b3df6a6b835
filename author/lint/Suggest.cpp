#include <author/lint/Suggest.h>

#include <algorithm>
#include <numeric>

namespace Author {

namespace {

constexpr size_t longestWord = 64;

// Case does not count: it is the commonest slip.
char Fold(char c) {
    return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
}

size_t Distance(std::string_view one, std::string_view other) {
    std::vector<size_t> row(other.size() + 1);
    std::iota(row.begin(), row.end(), size_t{0});
    for (const char c : one) {
        size_t diagonal = row[0]++;
        for (size_t j = 0; j < other.size(); ++j) {
            const size_t replaced = diagonal + (Fold(c) == Fold(other[j]) ? 0 : 1);
            diagonal = row[j + 1];
            row[j + 1] = std::min({replaced, row[j] + 1, row[j + 1] + 1});
        }
    }
    return row.back();
}

}  // namespace

std::string Nearest(std::string_view word, const std::vector<std::string>& names) {
    const auto longer = std::ranges::find_if(names, [word](const std::string& name) {
        return word.size() > 2 && name.size() > word.size() && name.starts_with(word);
    });
    if (longer != names.end()) {
        return *longer;
    }
    std::string nearest;
    size_t limit = std::min(word.size() / 3 + 1, size_t{3}) + 1;
    for (const std::string& name : names) {
        if (word.size() > longestWord || name.size() > longestWord) {
            continue;
        }
        const size_t distance = Distance(word, name);
        if (distance < limit && distance < name.size()) {
            limit = distance;
            nearest = name;
        }
    }
    return nearest;
}

std::string Suggestion(std::string_view word, const std::vector<std::string>& names) {
    const std::string nearest = Nearest(word, names);
    return nearest.empty() ? "" : "; did you mean '" + nearest + "'?";
}

std::string JoinedByOr(const std::vector<std::string>& words, std::string_view last) {
    std::string joined;
    for (size_t i = 0; i < words.size(); ++i) {
        joined += i == 0 ? "" : i + 1 == words.size() ? std::string(last) : ", ";
        joined += words[i];
    }
    return joined;
}

}  // namespace Author
