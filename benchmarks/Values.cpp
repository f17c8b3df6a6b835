// Building a list of structs: what one struct of six fields costs, in time and in bytes.

#include <malloc.h>

#include <iostream>

#include "Paired.h"
#include "Rows.h"

namespace {

using List = std::shared_ptr<MetaObj::MetaList>;

std::vector<Rows::Texts> MakeTexts(long count) {
    std::vector<Rows::Texts> texts;
    for (long row = 0; row < count; ++row) {
        texts.emplace_back(row);
    }
    return texts;
}

List Build(const std::vector<Rows::Texts>& texts) {
    auto list = MetaObj::MetaList::New(MetaObj::MetaType::Struct, Rows::Definition());
    for (size_t row = 0; row < texts.size(); ++row) {
        Rows::Add(*list, static_cast<long>(row), texts[row]);
    }
    return list;
}

// The same values in plain variables.
struct Plain {
    std::string device;
    std::string path;
    bool readonly;
    std::string type;
    long size;
    long used;
};

void BuildPlain(const std::vector<Rows::Texts>& texts) {
    std::vector<Plain> rows;
    for (const auto& [device, path, type] : texts) {
        const auto row = static_cast<long>(rows.size());
        rows.push_back({device, path, row % 2 == 0, type, 4096 * row, 1000 + row});
    }
    Paired::Keep(rows);
}

size_t UsedBytes() {
    const auto heap = mallinfo2();
    return heap.uordblks + heap.hblkhd;
}

// What the list of all structs takes to go, beside what it took to build.
void PrintLettingGo(const char* title, const std::vector<Rows::Texts>& texts) {
    List list;
    std::vector<double> ratios;
    for (int round = 0; round < 15; ++round) {
        const double building = Paired::Seconds([&] { list = Build(texts); });
        ratios.push_back(Paired::Seconds([&] { list.reset(); }) / building);
    }
    std::printf("%-50s %.2f of building it\n", title, Paired::Median(ratios));
}

}  // namespace

int main() {
    const auto texts = MakeTexts(100'000);
    const size_t before = UsedBytes();
    const List list = Build(texts);
    std::cout << "values: " << (UsedBytes() - before) / texts.size()
              << " bytes for a struct of six fields, its values included\n"
              << std::endl;
    List built;
    const auto drop = [&] { built.reset(); };
    Paired::Compare("values: building one struct, of 100,000", 20,
                    {{"MetaStruct of six fields", [&] { built = Build(texts); }, "", 1e5, drop},
                     {"plain struct", [&] { BuildPlain(texts); }, "", 1e5}});

    std::vector<Paired::Contender> sizes;
    for (const int count : {1'000, 10'000, 100'000, 1'000'000}) {
        sizes.push_back({"of " + std::to_string(count),
                         [&, texts = MakeTexts(count)] { built = Build(texts); }, "about 1",
                         1.0 * count, drop});
    }
    Paired::Compare("values: building one struct", 9, sizes);

    PrintLettingGo("values: letting 100,000 structs go", texts);
    mallopt(M_MXFAST, 0);
    PrintLettingGo("  without fast bins, as kelvash: at most 1", texts);
}
