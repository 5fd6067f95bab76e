#pragma once

namespace DataExchange {
class IProperties;
}

// Visitor over the property sets of catalog items; true stops the walk at that item.
class IDataIteration {
public:
    virtual ~IDataIteration() = default;
    virtual bool Visit(DataExchange::IProperties* properties) = 0;
};
