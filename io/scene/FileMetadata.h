// What the scene remembers of the file that a take came from, so that it can be written again: custom
// attributes.
//
// Some hold records: one a line, its fields separated by tabs. In a field a backslash stands for itself
// doubled, a tab is "\t", a line break "\n".
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "host/scene/Module.h"
#include "host/scene/PropertyTable.h"

namespace talix::fileMetadata {

// Of a clip: the file's name without folder and suffix, a string. Of a character that stands for a file's
// points without a subject: the name that it got from it; its markers' labels carry no subject as long as it
// has that name.
inline constexpr char const* kFileName = "FileName";

// Of a clip.
inline constexpr char const* kFileFormat = "FileFormat";                        // string: "C3D", "BVH", "TRC"
inline constexpr char const* kFileUnit = "FileUnit";                            // string: the file's own word
inline constexpr char const* kFileUnitInMillimetres = "FileUnitInMillimetres";  // float
// Records: seconds, label, context, subject, description.
inline constexpr char const* kEvents = "Events";
// Records: channel in the scene, name in the file, unit, description, scale, offset.
inline constexpr char const* kAnalogChannels = "AnalogChannels";
// Records: channel in the scene, name in the file, unit, kind.
inline constexpr char const* kOutputs = "OutputChannels";

// Of a marker: string.
inline constexpr char const* kDescription = "Description";
// Of a bone: the file's channel names in their order, separated by blanks, a string.
inline constexpr char const* kFileChannels = "FileChannels";

// Takes these names for attributes, so that no channel of a file gets one of them.
void reserveNames(PropertyTable& table);

using Record = std::vector<std::string>;

// These set the custom attribute, which is added when the module has none.
void setText(Module&, char const* name, std::string const& text);
void setNumber(Module&, char const* name, double number);
void setRecords(Module&, char const* name, std::vector<Record> const&);

// Empty, or `byDefault`, when there is no such attribute.
std::string text(Module const&, char const* name);
double number(Module const&, char const* name, double byDefault);
// Each record is filled up with empty fields to `fields`.
std::vector<Record> records(Module const&, char const* name, size_t fields);

// The shortest text that reads back the same, and back; 0 for other texts.
std::string numberText(double);
double textNumber(std::string_view);

}  // namespace talix::fileMetadata
