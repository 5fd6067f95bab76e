#pragma once

#include <pugixml.hpp>

#include <string>
#include <unordered_map>
#include <vector>

namespace Brindle::Data::XmlAccess {

// The nodes of a document that carry a given attribute value. Answers what an XPath
// "//name[@attribute=$value]" answers: the first match in document order, by exact comparison,
// also when several nodes share a value (a hand-edited file) and after they moved.
class NodeIndex {
public:
    void Clear() { m_entries.clear(); }
    void Reserve(std::size_t count) { m_entries.reserve(count); }
    void Add(const char* value, pugi::xml_node node);
    void Remove(const char* value, pugi::xml_node node);
    pugi::xml_node First(const std::string& value) const;

    // True when a comes before b in document order.
    static bool Precedes(pugi::xml_node a, pugi::xml_node b);

private:
    struct Entry {
        pugi::xml_node node;
        std::vector<pugi::xml_node> others; // empty unless the value is shared
    };
    std::unordered_map<std::string, Entry> m_entries;
};

} // namespace Brindle::Data::XmlAccess
