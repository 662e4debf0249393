#include "references/GraphForms.hpp"

#include <set>
#include <string_view>

#include "fl/i18n/Utf8.hpp"
#include "output/JsonRows.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"

namespace projectctl {

namespace {

using Node = ReferenceGraph::Node;
using Reference = ReferenceGraph::Reference;
using State = ReferenceGraph::State;

std::u16string_view wordFor(State state) {
    switch (state) {
    case State::Project:
        return u"project";
    case State::NoFolder:
        return u"missing";
    case State::NoProject:
        return u"no project";
    case State::Unreadable:
        return u"unreadable";
    }
    return {};
}

void writeNode(Node const& node) {
    auto& out = output();
    if (node.state == State::Project) {
        out.name(node.name);
        out.text() += " (";
        out.name(node.folder.native());
        out.text() += ')';
        return;
    }
    out.text() += fl::i18n::toUtf8(wordFor(node.state)) + " (";
    out.name(node.folder.native());
    out.text() += ')';
    if (!node.problem.empty()) {
        out.text() += ": " + withoutControls(node.problem, false);
    }
}

/// The text as a quoted string of Graphviz. The only escapes there are those of the quotation mark and the
/// backslash.
std::string dotString(std::u16string_view text) {
    std::string result = "\"";
    for (auto const byte : withoutControls(fl::i18n::toUtf8(text), false)) {
        result += byte == '"' || byte == '\\' ? "\\" : "";
        result += byte;
    }
    return result + '"';
}

std::u16string labelOf(Node const& node) {
    return node.state == State::Project && !node.name.empty() ? node.name : node.folder.native();
}

void writeJsonNodes(std::vector<Node> const& nodes) {
    JsonRows rows;
    for (auto const& node : nodes) {
        rows.begin();
        rows.addText("folder", node.folder.native());
        rows.addText("state", wordFor(node.state));
        rows.addText("name", node.name);
        if (!node.problem.empty()) {
            rows.addText("problem", textOf(node.problem));
        }
    }
    rows.finish();
}

void writeJsonReferences(std::vector<Node> const& nodes) {
    JsonRows rows;
    for (auto const& node : nodes) {
        for (auto const& reference : node.references) {
            rows.begin();
            rows.addText("from", node.folder.native());
            rows.addText("to", nodes[reference.to].folder.native());
            rows.addText("path", reference.text);
            rows.addText("type", reference.type);
            rows.addFlag("closesCycle", reference.closesCycle);
        }
    }
    rows.finish();
}

} // namespace

void writeTree(ReferenceGraph const& graph) {
    struct Line {
        Reference const* reference;
        std::size_t depth;
    };

    auto const& nodes = graph.nodes();
    std::set<std::size_t> shown{0};
    std::vector<Line> waiting;
    auto const await = [&waiting](Node const& node, std::size_t depth) {
        for (auto at = node.references.rbegin(); at != node.references.rend(); ++at) {
            waiting.push_back({&*at, depth});
        }
    };
    writeNode(nodes[0]);
    output().text() += '\n';
    await(nodes[0], 1);
    while (!waiting.empty()) {
        auto const [reference, depth] = waiting.back();
        waiting.pop_back();
        auto const& node = nodes[reference->to];
        output().text().append(2 * depth, ' ');
        output().name(reference->text.empty() ? u"." : reference->text);
        output().text() += ": ";
        writeNode(node);
        if (shown.insert(reference->to).second) {
            await(node, depth + 1);
        } else if (reference->closesCycle) {
            output().text() += ", a cycle";
        } else if (!node.references.empty()) {
            output().text() += ", see above";
        }
        output().text() += '\n';
    }
}

void writeJson(ReferenceGraph const& graph) {
    auto& out = output().text();
    JsonDocument document(json::referenceGraph);
    document.addKey("projects");
    writeJsonNodes(graph.nodes());
    document.addKey("references");
    writeJsonReferences(graph.nodes());
    document.addKey("cycles");
    out += '[';
    for (std::size_t index = 0; index < graph.cycles().size(); ++index) {
        out += index == 0 ? "\n[" : ",\n[";
        for (std::size_t const node : graph.cycles()[index]) {
            out += out.back() == '[' ? "" : ", ";
            appendJsonString(out, graph.nodes()[node].folder.native());
        }
        out += ']';
    }
    out += graph.cycles().empty() ? "]" : "\n]";
    document.finish();
}

void writeDot(ReferenceGraph const& graph) {
    auto& out = output().text();
    out += "digraph references {\n";
    for (auto const& node : graph.nodes()) {
        out += "  " + dotString(node.folder.native()) + " [label=" + dotString(labelOf(node));
        out += node.state == State::Project ? "];\n" : ", style=dashed, color=red];\n";
    }
    for (auto const& node : graph.nodes()) {
        for (auto const& reference : node.references) {
            out += "  " + dotString(node.folder.native()) + " -> " +
                   dotString(graph.nodes()[reference.to].folder.native());
            out += reference.closesCycle ? " [color=red];\n" : ";\n";
        }
    }
    out += "}\n";
}

} // namespace projectctl
