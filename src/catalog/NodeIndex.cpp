#include "catalog/NodeIndex.h"

#include <algorithm>

namespace Brindle::Data::XmlAccess {

void NodeIndex::Add(const char* value, pugi::xml_node node) {
    auto [it, inserted] = m_entries.try_emplace(value);
    if (inserted)
        it->second.node = node;
    else
        it->second.others.push_back(node);
}

void NodeIndex::Remove(const char* value, pugi::xml_node node) {
    const auto it = m_entries.find(value);
    if (it == m_entries.end())
        return;
    Entry& entry = it->second;
    if (entry.node == node) {
        if (entry.others.empty()) {
            m_entries.erase(it);
            return;
        }
        entry.node = entry.others.back();
        entry.others.pop_back();
        return;
    }
    const auto other = std::find(entry.others.begin(), entry.others.end(), node);
    if (other != entry.others.end())
        entry.others.erase(other);
}

pugi::xml_node NodeIndex::First(const std::string& value) const {
    const auto it = m_entries.find(value);
    if (it == m_entries.end())
        return {};
    pugi::xml_node first = it->second.node;
    for (const pugi::xml_node& other : it->second.others) {
        if (Precedes(other, first))
            first = other;
    }
    return first;
}

bool NodeIndex::Precedes(pugi::xml_node a, pugi::xml_node b) {
    if (a == b)
        return false;
    std::vector<pugi::xml_node> pathA;
    std::vector<pugi::xml_node> pathB;
    for (pugi::xml_node n = a; n; n = n.parent())
        pathA.push_back(n);
    for (pugi::xml_node n = b; n; n = n.parent())
        pathB.push_back(n);
    auto ia = pathA.rbegin();
    auto ib = pathB.rbegin();
    while (ia != pathA.rend() && ib != pathB.rend() && *ia == *ib) {
        ++ia;
        ++ib;
    }
    if (ia == pathA.rend())
        return true; // a is an ancestor of b
    if (ib == pathB.rend())
        return false;
    // Two siblings: walk forward from both at once, so the cost is their distance.
    const pugi::xml_node siblingA = *ia;
    const pugi::xml_node siblingB = *ib;
    pugi::xml_node fromA = siblingA;
    pugi::xml_node fromB = siblingB;
    for (;;) {
        fromA = fromA.next_sibling();
        if (fromA == siblingB)
            return true;
        if (!fromA)
            return false;
        fromB = fromB.next_sibling();
        if (fromB == siblingA)
            return false;
        if (!fromB)
            return true;
    }
}

} // namespace Brindle::Data::XmlAccess
