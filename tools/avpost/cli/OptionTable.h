#ifndef AVPOST_TOOLS_AVPOST_CLI_OPTIONTABLE_H
#define AVPOST_TOOLS_AVPOST_CLI_OPTIONTABLE_H

#include <string>
#include <vector>

#include "tools/avpost/cli/Settings.h"

namespace avpost::tool {

// Every option of every command, declared once: the command line parses and checks values by
// it, takes the defaults from it, and the help is written from it, so the three cannot drift.

// Which commands take an option (bits).
constexpr unsigned kForDemo = 1;
constexpr unsigned kForVideo = 2;
constexpr unsigned kForAudio = 4;
constexpr unsigned kForConvert = 8;
constexpr unsigned kForGallery = 16;

enum class ValueKind {
    Switch,      // no value
    Whole,       // a whole number in [low, high]
    Choice,      // one name of choices
    ChoiceList,  // names of choices separated by commas; their values are or-ed
    Text,        // a form of its own, parsed by the option's apply
    // Timed forms: items separated by commas, each a value (a whole number in [low, high], or
    // a name of choices) that may be limited to a stretch of time as VALUE@FROM-UNTIL.
    TimedWhole,
    TimedChoiceList,
};

struct Choice {
    const char* name;
    int value;
};

// A value as the table's kinds deliver it: the number of a Whole, Choice or ChoiceList (of
// a timed kind: the value outside every stretch), the stretches of a timed kind, and always
// the text as given.
struct OptionValue {
    int number = 0;
    std::vector<TimedValue> stretches;
    std::string text;

    Timed timed() const { return {number, stretches}; }
};

struct OptionEntry {
    const char* name;         // "--size"
    const char* alias;        // "-q", or nullptr
    const char* placeholder;  // "WxH" in the help; nullptr for a switch
    unsigned commands;
    ValueKind kind;
    int low;  // range of a Whole
    int high;
    std::vector<Choice> choices;
    // Applied before the command line, like a given value; nullptr when there is none.
    const char* defaultValue;
    // What happens without the option, for the help, when there is no default value.
    const char* defaultMeaning;
    // True when giving the option asks the video stage for an output request.
    bool shapesRequest;
    const char* group;  // heading in the help
    const char* help;
    void (*apply)(Invocation& call, const OptionValue& value);
};

const std::vector<OptionEntry>& OptionTable();

// The names --watermark-pos takes for the nine places, with their alignment codes.
const std::vector<Choice>& WatermarkPlaces();

// The entry of a name or alias; nullptr when there is none.
const OptionEntry* FindOption(const std::string& name);

// "a, b or c": the names of choices as the help and the error messages list them.
std::string ChoiceNames(const std::vector<Choice>& choices);

// The bit of kForDemo ... kForGallery for a command; 0 for the others.
unsigned CommandBit(Command command);

}  // namespace avpost::tool

#endif
