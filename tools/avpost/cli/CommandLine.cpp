#include "tools/avpost/cli/CommandLine.h"

#include "tools/avpost/cli/OptionTable.h"
#include "tools/avpost/cli/Values.h"
#include "tools/avpost/common/ToolError.h"

namespace avpost::tool {
namespace {

int ChoiceValue(const std::vector<Choice>& choices, const std::string& text, const std::string& what)
{
    for (const Choice& choice : choices)
        if (text == choice.name)
            return choice.value;
    throw Expected{what};
}

std::string RangeText(const OptionEntry& entry)
{
    return "a whole number from " + std::to_string(entry.low) + " to " + std::to_string(entry.high);
}

// Items of a timed kind: plain ones make the value outside every stretch (numbers: the last
// one; choices: all of them), VALUE@FROM-UNTIL ones a stretch each.
void ReadTimedItems(const OptionEntry& entry, const std::string& text, OptionValue& value)
{
    const bool whole = entry.kind == ValueKind::TimedWhole;
    const std::string what = (whole ? RangeText(entry) : "a comma-separated list of " + ChoiceNames(entry.choices)) +
                             ", each may be limited to a time as VALUE@FROM-UNTIL";
    for (const std::string& item : Split(text, ',')) {
        const size_t at = item.find('@');
        const std::string name = item.substr(0, at);
        const int number =
            whole ? WholeNumber(name, entry.low, entry.high, what) : ChoiceValue(entry.choices, name, what);
        if (at != std::string::npos)
            value.stretches.push_back({number, ParseTimeRange(item.substr(at + 1))});
        else
            value.number = whole ? number : value.number | number;
    }
}

OptionValue ValueOf(const OptionEntry& entry, const std::string& text)
{
    OptionValue value;
    value.text = text;
    switch (entry.kind) {
    case ValueKind::Whole:
        value.number = WholeNumber(text, entry.low, entry.high, RangeText(entry));
        break;
    case ValueKind::Choice:
        value.number = ChoiceValue(entry.choices, text, ChoiceNames(entry.choices));
        break;
    case ValueKind::ChoiceList:
        for (const std::string& name : Split(text, ','))
            value.number |= ChoiceValue(entry.choices, name, "a comma-separated list of " + ChoiceNames(entry.choices));
        break;
    case ValueKind::TimedWhole:
    case ValueKind::TimedChoiceList:
        ReadTimedItems(entry, text, value);
        break;
    case ValueKind::Switch:
    case ValueKind::Text:
        break;
    }
    return value;
}

void Apply(const OptionEntry& entry, Invocation& call, const std::string& text)
{
    try {
        entry.apply(call, ValueOf(entry, text));
    } catch (const Expected& expected) {
        Fail(entry.name, "expected " + expected.what + ", got '" + text + "'");
    }
}

void ApplyDefaults(Invocation& call)
{
    const unsigned bit = CommandBit(call.command);
    for (const OptionEntry& entry : OptionTable())
        if ((entry.commands & bit) != 0 && entry.defaultValue != nullptr)
            Apply(entry, call, entry.defaultValue);
}

const char* CommandName(unsigned bit)
{
    switch (bit) {
    case kForDemo:
        return "demo";
    case kForVideo:
        return "video";
    case kForAudio:
        return "audio";
    case kForGallery:
        return "gallery";
    default:
        return "convert";
    }
}

std::string CommandsOf(const OptionEntry& entry)
{
    std::vector<std::string> names;
    for (unsigned bit : {kForDemo, kForVideo, kForAudio, kForConvert, kForGallery})
        if ((entry.commands & bit) != 0)
            names.push_back("'avpost " + std::string(CommandName(bit)) + "'");
    std::string text;
    for (size_t i = 0; i < names.size(); ++i)
        text += (i == 0 ? "" : i + 1 == names.size() ? " and " : ", ") + names[i];
    return text;
}

bool IsOption(const std::string& argument) { return argument.size() > 1 && argument[0] == '-'; }

Command CommandNamed(const std::string& word)
{
    if (word == "demo")
        return Command::Demo;
    if (word == "video")
        return Command::Video;
    if (word == "audio")
        return Command::Audio;
    if (word == "convert")
        return Command::Convert;
    if (word == "gallery")
        return Command::Gallery;
    if (word == "help" || word == "--help" || word == "-h")
        return Command::Help;
    if (word == "--version")
        return Command::Version;
    Fail(word, "unknown command (use convert, video, audio, demo or gallery; see avpost --help)");
}

// Applies the option at args[at]; returns how many arguments it used.
size_t ApplyOption(Invocation& call, const std::vector<std::string>& args, size_t at)
{
    std::string name = args[at];
    std::string value;
    const size_t equals = name.find('=');
    const bool inlineValue = equals != std::string::npos;
    if (inlineValue) {
        value = name.substr(equals + 1);
        name = name.substr(0, equals);
    }
    const OptionEntry* entry = FindOption(name);
    if (entry == nullptr)
        Fail(name, "unknown option (see avpost --help)");
    if ((entry->commands & CommandBit(call.command)) == 0)
        Fail(name, "is an option of " + CommandsOf(*entry));
    const bool takesValue = entry->kind != ValueKind::Switch;
    size_t used = 1;
    if (takesValue && !inlineValue) {
        if (at + 1 >= args.size())
            Fail(name, "needs a value");
        value = args[at + 1];
        used = 2;
    } else if (!takesValue && inlineValue) {
        Fail(name, "takes no value");
    }
    Apply(*entry, call, value);
    if (entry->shapesRequest)
        call.video.hasRequest = true;
    return used;
}

// --help anywhere before "--" wins over everything else on the line, mistakes included.
bool AsksForHelp(const std::vector<std::string>& args)
{
    for (const std::string& arg : args) {
        if (arg == "--")
            return false;
        if (arg == "--help" || arg == "-h")
            return true;
    }
    return false;
}

void Place(Invocation& call, std::vector<std::string>& positional)
{
    const size_t wanted = call.command == Command::Demo || call.command == Command::Gallery ? 1 : 2;
    if (positional.size() > wanted)
        Fail(positional[wanted], "unexpected argument");
    if (call.command == Command::Demo) {
        call.output = positional.empty() ? "avpost-demo" : positional[0];
        return;
    }
    if (call.command == Command::Gallery) {
        if (positional.empty())
            Fail("avpost gallery", "needs the FOLDER to write into");
        call.output = positional[0];
        return;
    }
    if (positional.size() < wanted)
        Fail(std::string("avpost ") + CommandName(CommandBit(call.command)),
             positional.empty() ? "needs an INPUT and an OUTPUT" : "needs an OUTPUT after the INPUT");
    call.input = positional[0];
    call.output = positional[1];
}

}  // namespace

Invocation ParseCommandLine(const std::vector<std::string>& args)
{
    Invocation call;
    if (args.empty())
        return call;
    call.command = CommandNamed(args[0]);
    if (call.command == Command::Help) {
        call.helpTopic = args.size() > 1 ? args[1] : "";
        return call;
    }
    if (call.command == Command::Version)
        return call;
    if (AsksForHelp(args)) {
        call.command = Command::Help;
        call.helpTopic = args[0];
        return call;
    }

    ApplyDefaults(call);
    std::vector<std::string> positional;
    bool optionsEnded = false;
    for (size_t at = 1; at < args.size();) {
        const std::string& arg = args[at];
        if (optionsEnded || !IsOption(arg)) {
            positional.push_back(arg);
            ++at;
        } else if (arg == "--") {
            optionsEnded = true;
            ++at;
        } else {
            at += ApplyOption(call, args, at);
        }
    }
    Place(call, positional);
    return call;
}

}  // namespace avpost::tool
