#include "Figures.h"

#include <algorithm>
#include <cmath>
#include <cstdio>

namespace qelo::bench {

void Figures::add(const std::string& name, double value, Better better) {
    Figure& figure = figures_[name];
    figure.better = better;
    figure.values.push_back(value);
}

void Figures::print() const {
    for (const auto& [name, figure] : figures_) {
        const auto [least, most] = std::minmax_element(figure.values.begin(), figure.values.end());
        std::printf("server,%s,%.9g,%.9g\n", name.c_str(),
                    figure.better == Better::Higher ? *most : *least, quantile(figure.values, 0.5));
    }
}

double quantile(std::vector<double> values, double share) {
    const auto last = static_cast<double>(values.size() - 1);
    const auto place = static_cast<std::ptrdiff_t>(std::lround(last * share));
    std::nth_element(values.begin(), values.begin() + place, values.end());
    return values[static_cast<std::size_t>(place)];
}

} // namespace qelo::bench
