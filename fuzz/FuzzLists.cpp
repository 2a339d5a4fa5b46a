// Escaped lists and node paths: what is joined splits into the same pieces, what is escaped unescapes, and a relative
// path leads from its base to its target.

#include <string>
#include <vector>

#include "FuzzInput.h"
#include "qn/dsc/StringBase.h"
#include "restree/NodePath.h"
#include "restree/TextList.h"

namespace {

using qn::dsc::String;
using zkhw::EscapeText;
using zkhw::SplitList;
using zkhw::UnescapeText;

std::vector<String> Split(const String& text, const String& separator, bool trim) {
    std::vector<String> pieces;
    SplitList(text, separator, pieces, trim);
    return pieces;
}

bool SameUnits(const std::vector<String>& a, const std::vector<String>& b) {
    if (a.size() != b.size()) {
        return false;
    }
    for (size_t i = 0; i < a.size(); ++i) {
        if (a[i].View() != b[i].View()) {
            return false;
        }
    }
    return true;
}

void CheckLists(const std::vector<String>& pieces, const String& separator) {
    const String joined = zkhw::JoinAll(pieces, separator, true);
    // An empty text is a list of nothing, so one empty piece does not come back.
    if (!joined.IsEmpty()) {
        fuzz::Require(SameUnits(Split(joined, separator, false), pieces), "joined pieces split into themselves");
    }
    for (const String& piece : pieces) {
        const String escaped = EscapeText(piece, separator);
        fuzz::Require(UnescapeText(escaped, separator).View() == piece.View(), "an escaped text unescapes");
        fuzz::Require(piece.IsEmpty() || Split(escaped, separator, false).size() == 1, "an escaped text is one piece");
    }
}

void CheckAnyText(const String& text, const String& separator) {
    const std::vector<String> pieces = Split(text, separator, false);
    fuzz::Require(pieces.empty() == text.IsEmpty(), "only an empty text has no pieces");
    const std::vector<String> trimmed = Split(text, separator, true);
    fuzz::Require(trimmed.size() == pieces.size(), "trimming loses no piece");
    // Of two units, a separator may also arise where a piece meets it.
    if (separator.Length() == 1) {
        const String again = zkhw::JoinAll(pieces, separator, true);
        fuzz::Require(again.IsEmpty() || SameUnits(Split(again, separator, false), pieces),
                      "pieces of any text come back");
    }
    zkhw::RebaseListPaths(text, String(u"/a/b"));
    zkhw::ParseBool(text);
    const String bare = zkhw::TrimWhitespace(text);
    fuzz::Require(zkhw::TrimWhitespace(bare).View() == bare.View(), "trimming twice is trimming once");
    fuzz::Require(zkhw::EndsWith(text, text.CStr()) || text.Find(u'\0', 0) != String::npos, "a text ends with itself");
}

// The names are those that a path may hold unescaped, so that a path can be followed by hand.
String PathOf(const std::vector<String>& pieces, size_t from, size_t to) {
    String path(from == to ? u"/" : u"");
    for (size_t i = from; i < to; ++i) {
        path.Append(u"/");
        for (const char16_t unit : pieces[i].View()) {
            path.Append(1, unit == u'/' || unit == u'\\' || unit == 0 ? u'x' : unit);
        }
        path.Append(u"n");
    }
    return path;
}

void CheckRelative(const std::vector<String>& pieces, size_t common, size_t middle) {
    common = common < pieces.size() ? common : pieces.size();
    middle = middle < common ? common : middle > pieces.size() ? pieces.size() : middle;
    const String shared = common == 0 ? String() : PathOf(pieces, 0, common);
    const String base = common == middle ? shared : shared + PathOf(pieces, common, middle).CStr();
    const String target = middle == pieces.size() ? shared : shared + PathOf(pieces, middle, pieces.size()).CStr();
    const String relative = zkhw::MakeRelativeNodePath(target, base);
    std::vector<String> place = Split(base, String(u"/"), false);
    for (const String& step : Split(relative, String(u"/"), false)) {
        if (step == u"..") {
            fuzz::Require(!place.empty(), "a relative path does not climb above the root");
            place.pop_back();
        } else {
            place.push_back(step);
        }
    }
    const std::vector<String> goal = Split(target, String(u"/"), false);
    bool same = place.size() == goal.size();
    for (size_t i = 0; same && i < goal.size(); ++i) {
        same = place[i] == goal[i];
    }
    fuzz::Require(same, "a relative path leads from its base to its target");
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    fuzz::Input input(data, size);
    const uint8_t choice = input.TakeByte();
    const String separator(choice % 3 == 0 ? u"," : choice % 3 == 1 ? u"/" : u"::");
    const size_t common = input.TakeByte() % 8;
    const size_t middle = input.TakeByte() % 8;
    std::vector<String> pieces;
    while (!input.IsEmpty()) {
        pieces.emplace_back(input.TakeText());
    }
    for (const String& piece : pieces) {
        CheckAnyText(piece, separator);
    }
    if (choice % 3 != 2) {
        CheckLists(pieces, separator);
    }
    CheckRelative(pieces, common, middle);
    return 0;
}
