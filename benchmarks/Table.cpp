// A table of 100,000 rows into a file, from values that stand ready.

#include <zelmar/zelmar.h>

#include <libsmartcols.h>

#include <charconv>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <span>
#include <sstream>

#include "Paired.h"
#include "Rows.h"

using MetaObj::MetaCast;
using MetaObj::MetaInt;
using MetaObj::MetaObject;
using MetaObj::MetaString;
using MetaObj::MetaStruct;
using MetaObj::MetaType;

namespace {

using List = std::shared_ptr<MetaObj::MetaList>;

void PrintOurs(const List& list, const std::string& file) {
    static AutoCli::Dispatcher dispatcher;
    const auto output = AutoCli::CommandOutput::New();
    output->SetRootObject(list);
    AutoCli::FormatParameters parameters;
    parameters.SetFormatter("table");
    AutoCli::DisplayContext context;
    std::ofstream stream(file);
    dispatcher.FormatOutput(output, parameters, context, stream);
}

// The text of a cell, in `digits` if need be.
std::string_view CellText(const MetaObject& value, std::span<char> digits) {
    switch (value.GetType()) {
        case MetaType::String:
            return MetaCast<MetaString>(&value)->GetValue();
        case MetaType::Int: {
            const long number = MetaCast<MetaInt>(&value)->GetValue();
            const auto end = std::to_chars(&digits.front(), &digits.back(), number).ptr;
            return {&digits.front(), end};
        }
        default:
            return MetaCast<MetaObj::MetaBool>(&value)->GetValue() ? "true" : "false";
    }
}

// Calls `work` with the index of the column, the value and its text, for each cell in order.
template <class Work>
void ForEachCell(const MetaObject& row, Work work) {
    char digits[24];
    size_t index = 0;
    for (const auto& [name, field] : MetaCast<MetaStruct>(&row)->GetFields()) {
        work(index++, *field.value, CellText(*field.value, digits));
    }
}

// The same table by hand: one pass that measures and one that writes into one buffer, and nothing
// that this table does not need.
void PrintByHand(const List& list, const std::string& file) {
    const auto names = list->GetListStructure()->GetFieldNames();
    std::vector<size_t> widths(names.size());
    std::ranges::transform(names, widths.begin(), [](const auto& name) { return name.size(); });
    for (const auto& row : list->GetObjects()) {
        ForEachCell(*row, [&](size_t i, const MetaObject&, std::string_view text) {
            widths[i] = std::max(widths[i], text.size());
        });
    }
    std::string text;
    std::string line;
    for (size_t i = 0; i < names.size(); ++i) {
        const bool last = i + 1 == names.size();
        text.append(names[i]).append(last ? 0 : widths[i] + 2 - names[i].size(), ' ');
        line.append(last ? names[i].size() : widths[i], '-').append(last ? 0 : 2, ' ');
    }
    text.append("\n").append(line).append("\n");
    for (const auto& row : list->GetObjects()) {
        ForEachCell(*row, [&](size_t i, const MetaObject& value, std::string_view cell) {
            const size_t padding = widths[i] - cell.size();
            if (value.GetType() == MetaType::Int) {
                text.append(padding, ' ').append(cell).append(2, ' ');
            } else {
                text.append(cell).append(padding + 2, ' ');
            }
        });
        text.push_back('\n');
    }
    std::ofstream(file) << text;
}

void PrintWithSmartcols(const List& list, const std::string& file) {
    const std::unique_ptr<FILE, int (*)(FILE*)> stream(std::fopen(file.c_str(), "w"), &std::fclose);
    libscols_table* table = scols_new_table();
    scols_table_set_stream(table, stream.get());
    for (const auto& [name, field] : list->GetListStructure()->GetFields()) {
        const bool isInt = field.value->GetType() == MetaType::Int;
        scols_table_new_column(table, name.c_str(), 0, isInt ? SCOLS_FL_RIGHT : 0);
    }
    for (const auto& row : list->GetObjects()) {
        libscols_line* line = scols_table_new_line(table, nullptr);
        ForEachCell(*row, [&](size_t i, const MetaObject&, std::string_view text) {
            scols_line_set_data(line, i, std::string(text).c_str());
        });
    }
    scols_print_table(table);
    scols_unref_table(table);
}

void WriteCells(const List& list, const std::string& file) {
    std::ofstream stream(file);
    for (const std::string& name : list->GetListStructure()->GetFieldNames()) {
        stream << name << '\t';
    }
    for (const auto& row : list->GetObjects()) {
        stream << '\n';
        ForEachCell(*row, [&](size_t, const MetaObject&, std::string_view text) {
            stream << text << '\t';
        });
    }
    stream << '\n';
}

std::string Content(const std::string& file) {
    return (std::stringstream() << std::ifstream(file).rdbuf()).str();
}

// The most memory that the process has held so far; writing 5 below starts that record anew.
long PeakKilobytes() {
    std::ifstream status("/proc/self/status");
    std::string word;
    while (status >> word && word != "VmHWM:") {
    }
    long kilobytes = 0;
    status >> kilobytes;
    return kilobytes;
}

void MeasureMemory(const List& list, const std::string& file) {
    std::ofstream("/proc/self/clear_refs") << 5;
    const long before = PeakKilobytes();
    PrintOurs(list, file);
    std::cout << "memory for a table of " << list->GetCount()
              << " rows: " << PeakKilobytes() - before << " KiB more than the values, for "
              << std::filesystem::file_size(file) / 1024 << " KiB of text\n"
              << std::endl;
}

}  // namespace

int main() {
    const std::string folder = std::filesystem::temp_directory_path() / "zelmar-table-benchmark-";
    const std::string ours = folder + "ours", floor = folder + "floor", peer = folder + "peer",
                      cells = folder + "cells";
    PrintOurs(Rows::Make(1), ours);  // what is loaded and kept at the first call is no growth
    MeasureMemory(Rows::Make(1'000), ours);
    MeasureMemory(Rows::Make(10'000), ours);
    const List list = Rows::Make(100'000);
    MeasureMemory(list, ours);
    PrintByHand(list, floor);
    if (Content(ours) != Content(floor)) {
        throw std::runtime_error("The tables differ");
    }
    WriteCells(list, cells);
    const auto column = [&] {
        Paired::RunProgram({{"column", "-t", "-s", "\t", "-R", "4,6"}, cells, peer});
    };
    const auto formatter = [&] { PrintOurs(list, ours); };
    Paired::Compare("table: 100,000 rows of six fields, to a file", 60,
                    {{"table formatter", formatter},
                     {"two passes by hand", [&] { PrintByHand(list, floor); }, "at most 2"}});
    Paired::Compare("table: the same, beside its peers", 10,
                    {{"table formatter", formatter},
                     {"libsmartcols", [&] { PrintWithSmartcols(list, peer); }, "at most 0.33"},
                     {"column -t", column, "at most 0.33"}});
    for (const std::string& file : {ours, floor, peer, cells}) {
        std::filesystem::remove(file);
    }
}
