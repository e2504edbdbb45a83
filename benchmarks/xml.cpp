// The XML parsers, the document and its memory, on a settings file and on the description of screens.
//
// Sizes are the file's bytes in MB: 20 is the settings file, 2 the screens. The rates count bytes of the file.

#include "benchmarks/inputs/inputs.h"
#include "storage/stream/fmemorystream.h"
#include "storage/xml/fxmlparser.h"
#include "storage/xml/fxmlparser2.h"
#include "storage/xml/xmldocument.h"
#include "storage/xml/xmlelement.h"
#include "storage/xml/xmlhandler.h"

#include <benchmark/benchmark.h>

#include <algorithm>
#include <cstring>
#include <expat.h>
#include <libxml/parser.h>
#include <malloc.h>
#include <memory>
#include <pugixml.hpp>
#include <sys/wait.h>
#include <unistd.h>

namespace
{
constexpr int64_t kSettings = 20;
constexpr int kBlockSize = 32768;

const std::string& inputOf(const benchmark::State& state)
{
    return state.range(0) == kSettings ? Inputs::settingsFile() : Inputs::skinFile();
}

void setRate(benchmark::State& state)
{
    state.SetBytesProcessed(state.iterations() * static_cast<int64_t>(inputOf(state).size()));
}

FMemoryStream* openInput(const std::string& text)
{
    return new FMemoryStream(const_cast<char*>(text.data()), static_cast<int64>(text.size()));
}

// Expat with handlers that do nothing, in blocks of 32 KiB

void XMLCALL ignoreStart(void*, const char*, const char**) {}
void XMLCALL ignoreEnd(void*, const char*) {}
void XMLCALL ignoreText(void*, const char*, int) {}
void XMLCALL ignoreComment(void*, const char*) {}

bool parseByExpat(const std::string& text)
{
    XML_Parser parser = XML_ParserCreate(nullptr);
    XML_SetElementHandler(parser, ignoreStart, ignoreEnd);
    XML_SetCharacterDataHandler(parser, ignoreText);
    XML_SetCommentHandler(parser, ignoreComment);
    bool done = true;
    for (size_t place = 0; done && place < text.size(); place += kBlockSize)
    {
        const size_t count = std::min<size_t>(kBlockSize, text.size() - place);
        memcpy(XML_GetBuffer(parser, kBlockSize), text.data() + place, count);
        done =
            XML_ParseBuffer(parser, static_cast<int>(count), place + count == text.size()) == XML_STATUS_OK;
    }
    XML_ParserFree(parser);
    return done;
}

void rawExpat(benchmark::State& state)
{
    for (auto _ : state)
        if (!parseByExpat(inputOf(state)))
            state.SkipWithError("not parsed");
    setRate(state);
}

void newerParser(benchmark::State& state)
{
    for (auto _ : state)
    {
        const auto handler = adopt(new XmlHandler);
        const auto parser = adopt(new FXmlParser2(handler));
        if (!parser->process(adopt(openInput(inputOf(state)))))
            state.SkipWithError("not parsed");
    }
    setRate(state);
}

void olderParser(benchmark::State& state)
{
    for (auto _ : state)
    {
        FXmlParser parser(adopt(openInput(inputOf(state))), true);
        if (!parser.process(nullptr))
            state.SkipWithError("not parsed");
    }
    setRate(state);
}

void parseByPugixml(benchmark::State& state)
{
    const std::string& text = inputOf(state);
    for (auto _ : state)
    {
        pugi::xml_document document;
        if (!document.load_buffer(text.data(), text.size()))
            state.SkipWithError("not parsed");
    }
    setRate(state);
}

// The document. Dropping the tree isn't part of the time; it is a case of its own. What was dropped goes back to the
// system, so that no round begins with the sorting of a hundred thousand free blocks; what came from the pool of small
// blocks stays with it, so only the first round touches all pages anew.

/// Asks for all names and values, which are made only then.
void askForAll(const Xml::Element* element)
{
    for (; element; element = element->nextElement())
    {
        benchmark::DoNotOptimize(element->getName().length());
        for (int i = 0; i < element->countAttributes(); i++)
            benchmark::DoNotOptimize(element->attributeAt(i)->getValue().length());
        askForAll(element->firstElement());
    }
}

template <bool askToo>
void loadDocument(benchmark::State& state)
{
    for (auto _ : state)
    {
        auto document = std::make_unique<Xml::Document>();
        if (!document->load(adopt(openInput(inputOf(state)))))
            state.SkipWithError("not loaded");
        if (askToo)
            askForAll(document->getRootElement());
        state.PauseTiming();
        document.reset();
        malloc_trim(0);
        state.ResumeTiming();
    }
    setRate(state);
}

void loadAndDropDocument(benchmark::State& state)
{
    for (auto _ : state)
    {
        Xml::Document document;
        if (!document.load(adopt(openInput(inputOf(state)))))
            state.SkipWithError("not loaded");
    }
    setRate(state);
}

void loadAndDropByLibxml2(benchmark::State& state)
{
    const std::string& text = inputOf(state);
    for (auto _ : state)
    {
        xmlDocPtr document =
            xmlReadMemory(text.data(), static_cast<int>(text.size()), nullptr, nullptr, XML_PARSE_HUGE);
        if (!document)
            state.SkipWithError("not loaded");
        xmlFreeDoc(document);
    }
    setRate(state);
}

// What a tree takes is measured in a process of its own, where nothing was freed before that it could take again.

using LoadFunction = void (*)(const std::string& text);

template <bool askToo>
void keepDocument(const std::string& text)
{
    auto* document = new Xml::Document;
    document->load(adopt(openInput(text)));
    if (askToo)
        askForAll(document->getRootElement());
}

void keepDocumentOfLibxml2(const std::string& text)
{
    benchmark::DoNotOptimize(
        xmlReadMemory(text.data(), static_cast<int>(text.size()), nullptr, nullptr, XML_PARSE_HUGE));
}

double bytesInUse()
{
    const struct mallinfo2 info = mallinfo2();
    return static_cast<double>(info.uordblks + info.hblkhd);
}

double measureInChild(LoadFunction load, const std::string& text)
{
    int ends[2];
    double used = 0;
    if (pipe(ends) != 0)
        return 0;
    if (fork() == 0)
    {
        const double before = bytesInUse();
        load(text);
        used = bytesInUse() - before;
        _exit(write(ends[1], &used, sizeof(used)) == sizeof(used) ? 0 : 1);
    }
    if (read(ends[0], &used, sizeof(used)) != sizeof(used))
        used = 0;
    close(ends[0]);
    close(ends[1]);
    wait(nullptr);
    return used;
}

struct Memory
{
    double settings = 0;
    double skin = 0;
};
Memory ours;
Memory oursAsked;
Memory libxml2;

Memory measureTrees(LoadFunction load)
{
    return {measureInChild(load, Inputs::settingsFile()), measureInChild(load, Inputs::skinFile())};
}

template <Memory* memory>
void showMemory(benchmark::State& state)
{
    const double used = state.range(0) == kSettings ? memory->settings : memory->skin;
    for (auto _ : state)
        benchmark::DoNotOptimize(used);
    state.counters["memory"] = used / 1e6;
}

void saveDocument(benchmark::State& state)
{
    Xml::Document document;
    document.load(adopt(openInput(inputOf(state))));
    const auto target = adopt(new FMemoryStream);
    int64_t written = 0;
    for (auto _ : state)
    {
        target->reset();
        if (!document.save(target, false))
            state.SkipWithError("not saved");
        written += target->getSize();
    }
    state.SetBytesProcessed(written);
}

/// Collects what pugixml writes in a block that is kept, as the memory stream does.
struct Collector : pugi::xml_writer
{
    void write(const void* data, size_t size) override { text.append(static_cast<const char*>(data), size); }
    std::string text;
};

void saveByPugixml(benchmark::State& state)
{
    const std::string& text = inputOf(state);
    pugi::xml_document document;
    document.load_buffer(text.data(), text.size(),
                         pugi::parse_default | pugi::parse_ws_pcdata | pugi::parse_comments);
    Collector target;
    int64_t written = 0;
    for (auto _ : state)
    {
        target.text.clear();
        document.save(target, "", pugi::format_raw | pugi::format_write_bom, pugi::encoding_utf8);
        written += static_cast<int64_t>(target.text.size());
    }
    state.SetBytesProcessed(written);
}
} // namespace

#define BOTH_FILES(function, name)                                                                           \
    BENCHMARK(function)->Name(name)->Arg(20)->Arg(2)->Unit(benchmark::kMillisecond)

BOTH_FILES(newerParser, "newer parser/ours");
BOTH_FILES(rawExpat, "newer parser/expat");
BOTH_FILES(olderParser, "older parser/ours");
BOTH_FILES(parseByPugixml, "older parser/pugixml");
BOTH_FILES(loadDocument<false>, "document load/ours");
BOTH_FILES(rawExpat, "document load/expat");
BOTH_FILES(loadDocument<true>, "document load, all asked for/ours");
BOTH_FILES(rawExpat, "document load, all asked for/expat");
BOTH_FILES(loadAndDropDocument, "document load and drop/ours");
BOTH_FILES(loadAndDropByLibxml2, "document load and drop/libxml2");
BOTH_FILES(showMemory<&ours>, "document memory/ours")->Iterations(1);
BOTH_FILES(showMemory<&libxml2>, "document memory/libxml2")->Iterations(1);
BOTH_FILES(showMemory<&oursAsked>, "document memory, all asked for/ours")->Iterations(1);
BOTH_FILES(showMemory<&libxml2>, "document memory, all asked for/libxml2")->Iterations(1);
BOTH_FILES(saveDocument, "document save/ours");
BOTH_FILES(saveByPugixml, "document save/pugixml");

int main(int argc, char** argv)
{
    // The processes that measure memory begin as this one is now.
    ours = measureTrees(keepDocument<false>);
    oursAsked = measureTrees(keepDocument<true>);
    libxml2 = measureTrees(keepDocumentOfLibxml2);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
}
