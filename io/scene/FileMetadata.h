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
inline constexpr const char* kFileName = "FileName";

// Of a clip.
inline constexpr const char* kFileFormat = "FileFormat";                        // string: "C3D", "BVH", "TRC"
inline constexpr const char* kFileUnit = "FileUnit";                            // string: the file's own word
inline constexpr const char* kFileUnitInMillimetres = "FileUnitInMillimetres";  // float
// Records: seconds, label, context, subject, description.
inline constexpr const char* kEvents = "Events";
// Records: channel in the scene, name in the file, unit, description, scale, offset.
inline constexpr const char* kAnalogChannels = "AnalogChannels";
// Records: channel in the scene, name in the file, unit, kind.
inline constexpr const char* kOutputs = "OutputChannels";

// Of a marker: string.
inline constexpr const char* kDescription = "Description";
// Of a bone: the file's channel names in their order, separated by blanks, a string.
inline constexpr const char* kFileChannels = "FileChannels";

// Takes these names for attributes, so that no channel of a file gets one of them.
void reserveNames(PropertyTable& table);

using Record = std::vector<std::string>;

// These set the custom attribute, which is added when the module has none.
void setText(Module&, const char* name, const std::string& text);
void setNumber(Module&, const char* name, double number);
void setRecords(Module&, const char* name, const std::vector<Record>&);

// Empty, or `byDefault`, when there is no such attribute.
std::string text(const Module&, const char* name);
double number(const Module&, const char* name, double byDefault);
// Each record is filled up with empty fields to `fields`.
std::vector<Record> records(const Module&, const char* name, size_t fields);

// The shortest text that reads back the same, and back; 0 for other texts.
std::string numberText(double);
double textNumber(std::string_view);

}  // namespace talix::fileMetadata
