// `vexel info`: header, tags, labels, characters and streams of a movie.
#include "tools/vexel/arguments.h"
#include "tools/vexel/commands.h"
#include "tools/vexel/json_writer.h"
#include "tools/vexel/message.h"
#include "tools/vexel/movie_file.h"
#include "tools/vexel/movie_info.h"
#include "tools/vexel/text_form.h"

#include <cstdio>

namespace {

S32 Pixels(S32 low, S32 high)
{
    return static_cast<S32>((static_cast<S64>(high) - low) / 20);
}

void PrintSound(U8 format, U32 samples)
{
    std::printf("  %s, %d Hz, %d bits, %s, %u samples", CompressionName(format), SoundRate(format),
                SoundBits(format), SoundChannels(format) == 2 ? "stereo" : "mono", samples);
}

void PrintStream(const InfoStream& stream)
{
    std::printf(stream.sprite < 0 ? "   main" : "  %5d", stream.sprite);
    PrintSound(stream.format, stream.samplesPerFrame);
    std::printf(" a frame, %d blocks\n", stream.blocks);
}

void PrintCharacter(const InfoCharacter& c)
{
    std::printf("  %5d  %-6s  %s", c.id, c.type, TagTitle(c.tagCode).c_str());
    if (c.hasBounds)
        std::printf("  %s twips", RectText(c.bounds).c_str());
    if (c.hasSize)
        std::printf("  %dx%d pixels", c.width, c.height);
    if (c.frames != 0)
        std::printf("  %d frames", c.frames);
    if (c.hasSound) {
        PrintSound(c.format, c.samples);
        std::printf(", %.3f seconds", SoundSeconds(c.format, c.samples));
    }
    std::printf("\n");
}

void PrintText(const MovieFile& file, const MovieInfo& info)
{
    const ScriptPlayer& movie = file.movie;
    std::printf("file      %s\n", Quote(file.input.Name()).c_str());
    std::printf("version   %u\n", movie.version);
    std::printf("length    %d bytes", movie.scriptLen);
    if (file.Truncated())
        std::printf(", truncated: %d are there", movie.len);
    std::printf("\nsize      %dx%d pixels (%s twips)\n", Pixels(movie.frame.xmin, movie.frame.xmax),
                Pixels(movie.frame.ymin, movie.frame.ymax), RectText(movie.frame).c_str());
    std::printf("rate      %.11g frames a second\n", movie.frameRate / 65536.0);
    std::printf("frames    %d", movie.numFrames);
    if (info.frames != movie.numFrames)
        std::printf(" declared, %d found", info.frames);
    std::printf("\ntags\n");
    for (const auto& [code, count] : info.tags)
        std::printf("  %5u  %s\n", count, TagTitle(code).c_str());
    std::printf("labels\n");
    for (const InfoLabel& label : info.labels)
        std::printf("  %5d  %s\n", label.frame, Quote(label.name).c_str());
    std::printf("characters\n");
    for (const InfoCharacter& character : info.characters)
        PrintCharacter(character);
    std::printf("streams\n");
    for (const InfoStream& stream : info.streams)
        PrintStream(stream);
}

void AddRect(JsonWriter* json, const SRECT& r)
{
    json->BeginArray().Int(r.xmin).Int(r.xmax).Int(r.ymin).Int(r.ymax).EndArray();
}

void AddHeader(JsonWriter* json, const MovieFile& file, const MovieInfo& info)
{
    const ScriptPlayer& movie = file.movie;
    json->Key("schema").Int(1).Key("file").String(file.input.Name());
    json->Key("version").Int(movie.version).Key("length").Int(movie.scriptLen);
    json->Key("bytes").Int(movie.len).Key("truncated").Bool(file.Truncated());
    json->Key("size").BeginArray().Int(Pixels(movie.frame.xmin, movie.frame.xmax));
    json->Int(Pixels(movie.frame.ymin, movie.frame.ymax)).EndArray();
    json->Key("frame");
    AddRect(json, movie.frame);
    json->Key("rate").Number(movie.frameRate / 65536.0);
    json->Key("frames").Int(movie.numFrames).Key("framesFound").Int(info.frames);
}

void AddSound(JsonWriter* json, U8 format)
{
    json->Key("compression").String(CompressionName(format)).Key("rate").Int(SoundRate(format));
    json->Key("bits").Int(SoundBits(format)).Key("channels").Int(SoundChannels(format));
}

void AddStream(JsonWriter* json, const InfoStream& stream)
{
    json->BeginObject();
    if (stream.sprite >= 0)
        json->Key("sprite").Int(stream.sprite);
    AddSound(json, stream.format);
    json->Key("samplesPerFrame").Int(stream.samplesPerFrame);
    json->Key("blocks").Int(stream.blocks).EndObject();
}

void AddCharacter(JsonWriter* json, const InfoCharacter& c)
{
    json->BeginObject().Key("id").Int(c.id).Key("type").String(c.type);
    json->Key("tag").String(TagTitle(c.tagCode)).Key("code").Int(c.tagCode);
    if (c.hasBounds) {
        json->Key("bounds");
        AddRect(json, c.bounds);
    }
    if (c.hasSize)
        json->Key("size").BeginArray().Int(c.width).Int(c.height).EndArray();
    if (c.frames != 0)
        json->Key("frames").Int(c.frames);
    if (c.hasSound) {
        AddSound(json, c.format);
        json->Key("samples").Int(c.samples);
        json->Key("seconds").Number(SoundSeconds(c.format, c.samples));
    }
    json->EndObject();
}

void PrintJson(const MovieFile& file, const MovieInfo& info)
{
    JsonWriter json;
    json.BeginObject();
    AddHeader(&json, file, info);
    json.Key("tags").BeginObject();
    for (const auto& [code, count] : info.tags)
        json.Key(TagTitle(code)).Int(count);
    json.EndObject().Key("labels").BeginArray();
    for (const InfoLabel& label : info.labels)
        json.BeginObject().Key("frame").Int(label.frame).Key("name").String(label.name).EndObject();
    json.EndArray().Key("characters").BeginArray();
    for (const InfoCharacter& character : info.characters)
        AddCharacter(&json, character);
    json.EndArray().Key("streams").BeginArray();
    for (const InfoStream& stream : info.streams)
        AddStream(&json, stream);
    json.EndArray().EndObject();
    std::puts(json.Text().c_str());
}

} // namespace

int InfoCommand(std::span<char* const> words)
{
    constexpr OptionForm kOptions[] = {{"--json", false}};
    Arguments args;
    if (!args.Parse(words, kOptions))
        return ComplainUsage(args.error);
    if (args.Rest().size() != 1)
        return ComplainUsage("info takes one movie");
    MovieFile file;
    const int code = file.Load(args.Rest()[0]);
    if (code != kExitDone)
        return code;
    MovieInfo info;
    info.Collect(TagReader(file.movie.script, file.movie.startPos, file.movie.len), 0);
    if (args.Has("--json"))
        PrintJson(file, info);
    else
        PrintText(file, info);
    return kExitDone;
}
