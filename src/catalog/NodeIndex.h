#pragma once

#include <pugixml.hpp>

#include <string_view>
#include <unordered_map>
#include <vector>

namespace Brindle::Data::XmlAccess {

// The nodes of a document that carry a given attribute value. Answers what an XPath
// "//name[@attribute=$value]" answers: the first match in document order, by exact comparison,
// also when several nodes share a value (a hand-edited file) and after they moved.
// Keys are views of the attribute values inside the document, so loading copies no strings;
// a node must be removed from the index before it leaves the document, and the attribute's
// value must not change while indexed.
class NodeIndex {
public:
    void Clear() { m_entries.clear(); }
    void Add(pugi::xml_node node, pugi::xml_attribute attribute);
    void Remove(pugi::xml_node node, pugi::xml_attribute attribute);
    pugi::xml_node First(std::string_view value) const;

    // True when a comes before b in document order.
    static bool Precedes(pugi::xml_node a, pugi::xml_node b);

private:
    struct Holder {
        pugi::xml_node node;
        pugi::xml_attribute attribute; // its value is the entry's key
        bool operator==(const Holder&) const = default;
    };
    struct Entry {
        Holder holder;
        std::vector<Holder> others; // empty unless the value is shared
    };
    std::unordered_map<std::string_view, Entry> m_entries;
};

} // namespace Brindle::Data::XmlAccess
