#pragma once

#include "dcm/library/dcm.h"

#include <nlohmann/json.hpp>

#include <span>
#include <string>
#include <string_view>
#include <vector>

/// @file
/// Parameters as JSON and back, bit by bit. docs/json.md tells of the form.

namespace dcm::tools {

using Json = nlohmann::ordered_json;

/// A text: a string, or an object with the numbers of its characters where it is not Unicode.
Json JsonOf(const CString& text);
/// A number or text; null for nothing.
Json JsonOf(const VARIANT& value);
Json JsonOf(const Parameter& parameter);

/// The text of a JSON value on one line. All texts in it are Unicode.
std::string JsonText(const Json& json);

/// A whole document: the comment and one parameter a line.
std::string JsonText(const CString& comment, std::span<const Parameter> parameters);

/// What a document in JSON holds.
struct JsonDocument
{
    CString comment;
    std::vector<Parameter> parameters;
};

/// Reads what `JsonText` writes; members other than "kind" and "name" may be missing. Throws
/// `Trouble`, with `label` and with line and column or the place in the document, for any other
/// text.
JsonDocument ReadJson(std::string_view text, const std::string& label);

} // namespace dcm::tools
