// A tree of 100,000 values in 1,000 members, as XML and as bytes.
//
// The peers hold the same values in maps of variants, sorted by name as ours, with texts in the form that they handle
// best: UTF-8 for pugixml, 16 bits for the others. Their trees are filled from the file, too: a file whose values
// nobody has read is not loaded. Dropping a tree isn't part of the time.

#include "benchmarks/inputs/inputs.h"
#include "foundation/text/string.h"
#include "storage/archive/fbinarchive.h"
#include "storage/archive/fxmlarchive.h"
#include "storage/stream/fmemorystream.h"

#include <benchmark/benchmark.h>

#include <QtCore/QDataStream>
#include <QtCore/QIODevice>
#include <QtCore/QVariantMap>
#include <cereal/archives/binary.hpp>
#include <cereal/types/map.hpp>
#include <cereal/types/string.hpp>
#include <cereal/types/variant.hpp>
#include <cstdio>
#include <map>
#include <memory>
#include <pugixml.hpp>
#include <sstream>
#include <variant>

namespace
{
constexpr char kRootTag[] = "Settings";

// Ours

IPtr<FAttributes> makeTree()
{
    auto tree = adopt(new FAttributes);
    for (const Inputs::Member& member : Inputs::tree())
    {
        auto inner = adopt(new FAttributes);
        for (const Inputs::Value& value : member.values)
            if (value.kind == 0)
                inner->set(value.name.c_str(), value.integer);
            else if (value.kind == 1)
                inner->set(value.name.c_str(), value.number);
            else
                inner->set(value.name.c_str(), value.text.c_str());
        tree->setAttributes(member.name.c_str(), inner);
    }
    return tree;
}

bool saveXml(FStream* stream, const FAttributes& tree)
{
    return FXmlArchive(stream, true).saveAttributes(kRootTag, tree);
}
bool loadXml(FStream* stream, FAttributes& tree)
{
    return FXmlArchive(stream, false).loadAttributes(kRootTag, tree);
}
bool saveBinary(FStream* stream, const FAttributes& tree)
{
    return FBinArchive(stream, true).saveAttributes(tree);
}
bool loadBinary(FStream* stream, FAttributes& tree)
{
    return FBinArchive(stream, false).loadAttributes(tree);
}

template <bool (*store)(FStream*, const FAttributes&)>
void saveOurs(benchmark::State& state)
{
    const auto tree = makeTree();
    const auto stream = adopt(new FMemoryStream);
    for (auto _ : state)
    {
        stream->reset();
        if (!store(stream, *tree))
            state.SkipWithError("not saved");
    }
}

template <bool (*store)(FStream*, const FAttributes&), bool (*load)(FStream*, FAttributes&)>
void loadOurs(benchmark::State& state)
{
    const auto stored = makeTree();
    const auto stream = adopt(new FMemoryStream);
    store(stream, *stored);
    for (auto _ : state)
    {
        stream->rewind();
        auto tree = adopt(new FAttributes);
        if (!load(stream, *tree) || tree->total() != stored->total())
            state.SkipWithError("not loaded");
        state.PauseTiming();
        tree = nullptr;
        state.ResumeTiming();
    }
}

void sizeOurs(benchmark::State& state)
{
    const auto stream = adopt(new FMemoryStream);
    saveBinary(stream, *makeTree());
    for (auto _ : state)
        benchmark::DoNotOptimize(stream.get());
    state.counters["memory"] = static_cast<double>(stream->getSize()) / 1e6;
}

// The peers' tree

template <class Text>
using Values = std::map<std::string, std::variant<int64, double, Text>>;
template <class Text>
using Tree = std::map<std::string, Values<Text>>;

void setText(std::variant<int64, double, std::u16string>& target, const std::u16string& text)
{
    target = text;
}
void setText(std::variant<int64, double, std::string>& target, const std::u16string& text)
{
    target = QString::fromStdU16String(text).toStdString();
}

template <class Text>
Tree<Text> makePeerTree()
{
    Tree<Text> tree;
    for (const Inputs::Member& member : Inputs::tree())
        for (const Inputs::Value& value : member.values)
        {
            auto& target = tree[member.name][value.name];
            if (value.kind == 0)
                target = value.integer;
            else if (value.kind == 1)
                target = value.number;
            else
                setText(target, value.text);
        }
    return tree;
}

// pugixml: the same elements and attributes

using PugiTree = Tree<std::string>;

void buildByPugixml(pugi::xml_node root, const PugiTree& tree)
{
    for (const auto& [memberName, values] : tree)
    {
        pugi::xml_node member = root.append_child("member");
        member.append_attribute("name") = memberName.c_str();
        for (const auto& [name, value] : values)
        {
            const char* tags[] = {"int", "float", "string"};
            pugi::xml_node node = member.append_child(tags[value.index()]);
            node.append_attribute("name") = name.c_str();
            if (const auto* integer = std::get_if<int64>(&value))
                node.append_attribute("value") = static_cast<long long>(*integer);
            else if (const auto* text = std::get_if<std::string>(&value))
                node.append_attribute("value") = text->c_str();
            else
            {
                char digits[512];
                snprintf(digits, sizeof(digits), "%.50g", std::get<double>(value));
                node.append_attribute("value") = digits;
            }
            if (value.index() == 2)
                node.append_attribute("wide") = "true";
        }
    }
}

struct Collector : pugi::xml_writer
{
    void write(const void* data, size_t size) override { text.append(static_cast<const char*>(data), size); }
    std::string text;
};

void saveByPugixml(benchmark::State& state)
{
    const PugiTree tree = makePeerTree<std::string>();
    Collector target;
    for (auto _ : state)
    {
        target.text.clear();
        pugi::xml_document document;
        buildByPugixml(document.append_child(kRootTag), tree);
        document.save(target, "   ", pugi::format_indent, pugi::encoding_utf8);
    }
}

PugiTree readByPugixml(pugi::xml_node root)
{
    PugiTree tree;
    for (const pugi::xml_node member : root.children())
    {
        auto& values =
            tree.emplace_hint(tree.end(), member.attribute("name").value(), PugiTree::mapped_type())->second;
        for (const pugi::xml_node node : member.children())
        {
            auto& value = values.try_emplace(values.end(), node.attribute("name").value())->second;
            const pugi::xml_attribute stored = node.attribute("value");
            if (strcmp(node.name(), "int") == 0)
                value = static_cast<int64>(stored.as_llong());
            else if (strcmp(node.name(), "float") == 0)
                value = stored.as_double();
            else
                value = std::string(stored.value());
        }
    }
    return tree;
}

void loadByPugixml(benchmark::State& state)
{
    const auto stream = adopt(new FMemoryStream);
    saveXml(stream, *makeTree());
    for (auto _ : state)
    {
        auto document = std::make_unique<pugi::xml_document>();
        document->load_buffer(stream->getData(), static_cast<size_t>(stream->getSize()));
        auto tree = std::make_unique<PugiTree>(readByPugixml(document->child(kRootTag)));
        if (tree->size() != Inputs::tree().size())
            state.SkipWithError("not loaded");
        state.PauseTiming();
        tree.reset();
        document.reset();
        state.ResumeTiming();
    }
}

/// The text turned into nodes alone, with no value read.
void parseByPugixml(benchmark::State& state)
{
    const auto stream = adopt(new FMemoryStream);
    saveXml(stream, *makeTree());
    for (auto _ : state)
    {
        auto document = std::make_unique<pugi::xml_document>();
        document->load_buffer(stream->getData(), static_cast<size_t>(stream->getSize()));
        state.PauseTiming();
        document.reset();
        state.ResumeTiming();
    }
}

// QDataStream

QVariantMap makeQtTree()
{
    QVariantMap tree;
    for (const Inputs::Member& member : Inputs::tree())
    {
        QVariantMap inner;
        for (const Inputs::Value& value : member.values)
        {
            QVariant& target = inner[QString::fromStdString(value.name)];
            if (value.kind == 0)
                target = static_cast<qlonglong>(value.integer);
            else if (value.kind == 1)
                target = value.number;
            else
                target = QString::fromStdU16String(value.text);
        }
        tree[QString::fromStdString(member.name)] = inner;
    }
    return tree;
}

QByteArray storeByQt(const QVariantMap& tree)
{
    QByteArray bytes;
    QDataStream stream(&bytes, QIODevice::WriteOnly);
    stream << tree;
    return bytes;
}

void saveByQt(benchmark::State& state)
{
    const QVariantMap tree = makeQtTree();
    for (auto _ : state)
        benchmark::DoNotOptimize(storeByQt(tree));
}

void loadByQt(benchmark::State& state)
{
    const QByteArray bytes = storeByQt(makeQtTree());
    for (auto _ : state)
    {
        auto tree = std::make_unique<QVariantMap>();
        QDataStream stream(bytes);
        stream >> *tree;
        state.PauseTiming();
        tree.reset();
        state.ResumeTiming();
    }
}

// cereal

using CerealTree = Tree<std::u16string>;

std::string storeByCereal(const CerealTree& tree)
{
    std::ostringstream stream;
    cereal::BinaryOutputArchive archive(stream);
    archive(tree);
    return std::move(stream).str();
}

void saveByCereal(benchmark::State& state)
{
    const CerealTree tree = makePeerTree<std::u16string>();
    for (auto _ : state)
        benchmark::DoNotOptimize(storeByCereal(tree));
}

void loadByCereal(benchmark::State& state)
{
    std::istringstream stream(storeByCereal(makePeerTree<std::u16string>()));
    for (auto _ : state)
    {
        stream.clear();
        stream.seekg(0);
        auto tree = std::make_unique<CerealTree>();
        cereal::BinaryInputArchive archive(stream);
        archive(*tree);
        state.PauseTiming();
        tree.reset();
        state.ResumeTiming();
    }
}

void sizeByCereal(benchmark::State& state)
{
    const std::string bytes = storeByCereal(makePeerTree<std::u16string>());
    for (auto _ : state)
        benchmark::DoNotOptimize(bytes.data());
    state.counters["memory"] = static_cast<double>(bytes.size()) / 1e6;
}
} // namespace

#define CASE(function, name) BENCHMARK(function)->Name(name)->Unit(benchmark::kMillisecond)

CASE(saveOurs<saveXml>, "XML archive save/ours");
CASE(saveByPugixml, "XML archive save/pugixml");
CASE((loadOurs<saveXml, loadXml>), "XML archive load/ours");
CASE(loadByPugixml, "XML archive load/pugixml");
CASE((loadOurs<saveXml, loadXml>), "XML archive load, nodes alone/ours");
CASE(parseByPugixml, "XML archive load, nodes alone/pugixml");
CASE(saveOurs<saveBinary>, "binary archive save/ours");
CASE(saveByQt, "binary archive save/QDataStream");
CASE(saveByCereal, "binary archive save/cereal");
CASE((loadOurs<saveBinary, loadBinary>), "binary archive load/ours");
CASE(loadByQt, "binary archive load/QDataStream");
CASE(loadByCereal, "binary archive load/cereal");
CASE(sizeOurs, "binary archive size/ours")->Iterations(1);
CASE(sizeByCereal, "binary archive size/cereal")->Iterations(1);
