#pragma once

#include <map>
#include <string>
#include <string_view>
#include <vector>

namespace Author {

/// A template as its author means it: forms stand in one another like parentheses. The engine knows
/// no such structure; where its expansion differs from this one, the author is in for a surprise.
struct TemplateNode {
    enum class Kind { Text, Value, If, List, MultiList };
    Kind kind = Kind::Text;
    std::string text;  ///< as it stands in the template
    std::string name;
    std::string argument;  ///< the separator of a list, the prefix of a repeated one
    bool quote = false;
    std::vector<TemplateNode> body;  ///< of a condition

    [[nodiscard]] bool IsList() const { return kind == Kind::List || kind == Kind::MultiList; }
};

struct Template {
    std::vector<TemplateNode> nodes;
    /// What looks like a form and is none, and what to write instead.
    std::vector<std::string> faults;
};

Template ReadTemplate(std::string_view text);

/// Values of the parameters that are given; a flag has one, which is empty.
using Given = std::map<std::string, std::vector<std::string>>;

/// The text that the author expects. Forms of missing parameters stay as they are, and their names
/// are added to `left`.
std::string Expand(const std::vector<TemplateNode>& nodes, const Given& given, bool isStdin,
                   std::vector<std::string>& left);

/// Calls `visit` for each form, from left to right, with the conditions around it, the outermost
/// first.
template <class Visit>
void ForEachForm(const std::vector<TemplateNode>& nodes, Visit visit,
                 const std::vector<const TemplateNode*>& around = {}) {
    for (const TemplateNode& node : nodes) {
        if (node.kind == TemplateNode::Kind::Text) {
            continue;
        }
        visit(node, around);
        auto inside = around;
        inside.push_back(&node);
        ForEachForm(node.body, visit, inside);
    }
}

}  // namespace Author
