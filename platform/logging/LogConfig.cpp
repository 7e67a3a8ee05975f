#include "logging/LogConfig.h"

#include <algorithm>
#include <charconv>
#include <optional>

namespace qelo::logging {
namespace {

constexpr std::size_t kLongestLine = 1024;
constexpr std::size_t kMostProblems = 20;

// How much of an offending setting a problem repeats.
constexpr std::size_t kLongestQuote = 64;

constexpr std::string_view kBlanks = " \t\r";
constexpr std::string_view kFilePrefix = "file:";

bool startsWith(std::string_view text, std::string_view prefix) {
    return text.substr(0, prefix.size()) == prefix;
}

std::string_view trimmed(std::string_view text) {
    const std::size_t first = text.find_first_not_of(kBlanks);
    if (first == std::string_view::npos) {
        return {};
    }
    return text.substr(first, text.find_last_not_of(kBlanks) - first + 1);
}

std::string quoted(std::string_view text) {
    std::string quote = "\"";
    quote += text.substr(0, kLongestQuote);
    quote += text.size() > kLongestQuote ? "...\"" : "\"";
    return quote;
}

std::optional<Threshold> thresholdFrom(std::string_view value) {
    if (value == "off") {
        return kAdmitsNothing;
    }
    int level = 0;
    const auto [end, error] = std::from_chars(value.data(), value.data() + value.size(), level);
    if (error != std::errc() || end != value.data() + value.size() || level < 0) {
        return std::nullopt;
    }
    return level;
}

bool isPath(std::string_view text) {
    const bool printable = std::all_of(text.begin(), text.end(), [](char character) {
        const auto byte = static_cast<unsigned char>(character);
        return byte >= 0x20 && byte != 0x7F;
    });
    return printable && text.size() > 1 && text.front() == '/' && text.back() != '/';
}

std::optional<SinkTarget> targetFrom(std::string_view value) {
    if (value == "none") {
        return SinkTarget{SinkKind::None, {}};
    }
    if (value == "syslog") {
        return SinkTarget{SinkKind::Syslog, {}};
    }
    if (value == "stderr") {
        return SinkTarget{SinkKind::Stderr, {}};
    }
    const bool isFile = startsWith(value, kFilePrefix);
    const std::string_view path = isFile ? value.substr(kFilePrefix.size()) : std::string_view();
    if (!isFile || !isPath(path)) {
        return std::nullopt;
    }
    return SinkTarget{SinkKind::File, std::string(path)};
}

// The channel whose name `key` begins with, and the rest of the key.
struct ChannelKey {
    Channel channel;
    std::string_view rest;
};

std::optional<ChannelKey> channelKeyFrom(std::string_view key) {
    if (startsWith(key, "log")) {
        return ChannelKey{Channel::Log, key.substr(3)};
    }
    if (startsWith(key, "trace")) {
        return ChannelKey{Channel::Trace, key.substr(5)};
    }
    return std::nullopt;
}

// The component that ".level" or ".level.<component>" names.
std::optional<std::string_view> componentFrom(std::string_view rest) {
    constexpr std::string_view level = ".level";
    if (rest == level) {
        return std::string_view();
    }
    const std::string_view component =
        startsWith(rest, level) ? rest.substr(level.size()) : std::string_view();
    if (component.size() < 2 || component.front() != '.') {
        return std::nullopt;
    }
    return component.substr(1);
}

class Parser {
public:
    LogConfig parse(std::string_view text) {
        while (!text.empty()) {
            ++line_;
            const std::size_t end = std::min(text.find('\n'), text.size());
            readLine(text.substr(0, end));
            text.remove_prefix(std::min(end + 1, text.size()));
        }
        joinFiles();
        if (unreported_ > 0) {
            config_.problems.push_back({0, std::to_string(unreported_) + " more problems"});
        }
        return std::move(config_);
    }

private:
    void readLine(std::string_view text) {
        if (text.size() > kLongestLine) {
            report("line is too long");
            return;
        }
        const std::string_view setting = trimmed(text);
        if (setting.empty() || setting.front() == '#') {
            return;
        }
        const std::size_t equals = setting.find('=');
        if (equals == std::string_view::npos) {
            report("no \"=\" in " + quoted(setting));
            return;
        }
        set(trimmed(setting.substr(0, equals)), trimmed(setting.substr(equals + 1)));
    }

    void set(std::string_view key, std::string_view value) {
        const auto channelKey = channelKeyFrom(key);
        if (channelKey && channelKey->rest.empty()) {
            setTarget(channelKey->channel, value);
            return;
        }
        if (channelKey && channelKey->rest == ".buffer") {
            setBuffered(channelKey->channel, value);
            return;
        }
        const auto component = channelKey ? componentFrom(channelKey->rest) : std::nullopt;
        if (!component) {
            report("unknown setting " + quoted(key));
            return;
        }
        setThreshold(channelKey->channel, *component, value);
    }

    void setTarget(Channel channel, std::string_view value) {
        auto target = targetFrom(value);
        if (!target) {
            report("not a place to write to: " + quoted(value));
            return;
        }
        target->buffered = config_.of(channel).target.buffered;
        config_.of(channel).target = std::move(*target);
    }

    void setBuffered(Channel channel, std::string_view value) {
        if (value != "on" && value != "off") {
            report("neither on nor off: " + quoted(value));
            return;
        }
        config_.of(channel).target.buffered = value == "on";
    }

    void setThreshold(Channel channel, std::string_view component, std::string_view value) {
        const auto threshold = thresholdFrom(value);
        if (!threshold) {
            report("not a level: " + quoted(value));
        } else if (!config_.of(channel).thresholds.set(component, *threshold)) {
            report("too many components");
        }
    }

    // Both channels into one file: one buffer, so that their lines keep their order.
    void joinFiles() {
        SinkTarget& log = config_.of(Channel::Log).target;
        SinkTarget& trace = config_.of(Channel::Trace).target;
        if (log.kind == SinkKind::File && trace.kind == SinkKind::File && log.path == trace.path) {
            log.buffered = trace.buffered = log.buffered && trace.buffered;
        }
    }

    void report(std::string text) {
        if (config_.problems.size() < kMostProblems) {
            config_.problems.push_back({line_, std::move(text)});
        } else {
            ++unreported_;
        }
    }

    LogConfig config_;
    std::size_t line_ = 0;
    std::size_t unreported_ = 0;
};

} // namespace

LogConfig parseConfig(std::string_view text) { return Parser().parse(text); }

} // namespace qelo::logging
