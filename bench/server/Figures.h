// What was measured, each figure from several runs: the best, for other programs can only
// make it worse, and the median.
#pragma once

#include <map>
#include <string>
#include <vector>

namespace qelo::bench {

enum class Better { Higher, Lower };

class Figures {
public:
    void add(const std::string& name, double value, Better better);

    // One line for each in the order of their names: server,NAME,BEST,MEDIAN.
    void print() const;

private:
    struct Figure {
        Better better;
        std::vector<double> values;
    };
    std::map<std::string, Figure> figures_;
};

// Of a list that is not empty: the value below which `share` of all lie.
double quantile(std::vector<double> values, double share);

} // namespace qelo::bench
