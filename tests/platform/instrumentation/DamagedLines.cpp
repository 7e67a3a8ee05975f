#include "DamagedLines.h"

namespace qelo::nodes::tests {

namespace {

constexpr std::size_t megabyte = 1024UL * 1024;

const std::vector<std::string>& badNumbers() {
    static const std::vector<std::string> numbers = {"",
                                                     "abc",
                                                     "x",
                                                     "1.5",
                                                     "1,5",
                                                     "1;2",
                                                     "0x10",
                                                     "0b1",
                                                     "1e3",
                                                     "12a",
                                                     "a12",
                                                     "--1",
                                                     "+-1",
                                                     "-",
                                                     "+",
                                                     "1 2",
                                                     "1_000",
                                                     "NaN",
                                                     "inf",
                                                     "*",
                                                     "!",
                                                     "?",
                                                     "\"1\"",
                                                     "'1'",
                                                     "(1)",
                                                     "1-",
                                                     "1+",
                                                     "$1",
                                                     "#1",
                                                     "\xC2\xB2",
                                                     "\xEF\xBC\x91",
                                                     "\xFF",
                                                     "\x01",
                                                     "1\x7F",
                                                     "0o7",
                                                     "99999999999999999999",
                                                     "18446744073709551616",
                                                     "4294967296",
                                                     "9223372036854775808",
                                                     "100000000000000000000000000000000000000000",
                                                     "%d",
                                                     "%n%n",
                                                     "1'000",
                                                     "/",
                                                     "\\1"};
    return numbers;
}

std::string withNul(const std::string& before, const std::string& after) {
    return before + '\0' + after;
}

void addAll(std::vector<DamagedLine>& lines, const std::vector<std::string>& texts, bool served) {
    for (const std::string& text : texts) {
        lines.push_back({text, served});
    }
}

} // namespace

std::vector<DamagedLine> damagedAccountLines() {
    std::vector<DamagedLine> lines;
    for (const std::string& number : badNumbers()) {
        lines.push_back({"bad:x:" + number + ":100:gecos:/home/bad:/bin/sh", false});
        lines.push_back({"bad:x:100:" + number + ":gecos:/home/bad:/bin/sh", false});
    }
    addAll(lines,
           {"bad",
            "bad:",
            "bad:x",
            "bad:x:",
            "bad:x:1",
            "bad:x:1:",
            ":",
            "::",
            ":::::::",
            ":x:1:1:::",
            ":x:0:0:root:/root:/bin/sh",
            "bad x 1 1 gecos / /bin/sh",
            "bad;x;1;1;;;",
            "bad,x,1,1,,,",
            "bad\tx\t1\t1",
            "+",
            "-",
            "+::::::",
            "-::::::",
            "+bad",
            "-bad",
            "+@netgroup::::::",
            "-@netgroup::::::",
            "+bad:x:1:1:::",
            "-bad:x:1:1:::",
            "bad:x:4294967295:1:::",
            "bad:x:1:4294967295:::",
            "bad:x:4294967295:4294967295:::",
            "<?xml version=\"1.0\"?>",
            "{\"bad\": 1}",
            "\x01\x02\x03",
            "\xFF\xFE\xFD",
            std::string(70000, 'b'),
            std::string(megabyte, 'b'),
            std::string(megabyte, '\xFF'),
            "bad:x:" + std::string(megabyte, '9') + ":1:::",
            withNul("bad:x:", "1:1:::"),
            withNul("bad", ":x:1:1:::"),
            withNul("", "bad:x:1:1:::"),
            std::string(100, '\0'),
            withNul("bad:x:1", ":1:::"),
            withNul("bad:x:abc:1:::", ""),
            "=======",
            "<<<<<<< HEAD",
            ">>>>>>> other"},
           false);
    addAll(lines,
           {"bad:x:1:1", "bad:x:1:1:", "bad:x:1:1::", "bad:x:1:1:gecos:/",
            "bad:x:1:1:::/bin/sh:", "bad:x:1:1:::/bin/sh:extra:fields:here",
            "bad:x:1:1::" + std::string(20, ':'), "bad:x:1:1:\xFF:/:/bin/sh",
            "bad:x:1:1::/\xC3:/bin/sh", "bad:x:1:1::/:/bin/\xF0\x9F", withNul("bad:x:1:1:::", "x"),
            withNul("bad:x:1:1::/:/bin/sh", ""), withNul("bad:x:1:1", "\xFF::/:")},
           true);
    return lines;
}

std::vector<DamagedLine> damagedShadowLines() {
    std::vector<DamagedLine> lines;
    const std::vector<std::pair<std::string, std::string>> fields = {
        {"bad:h:", ":0:99999:7:::"},      {"bad:h:19000:", ":99999:7:::"},
        {"bad:h:19000:0:", ":7:::"},      {"bad:h:19000:0:99999:", ":::"},
        {"bad:h:19000:0:99999:7:", "::"}, {"bad:h:19000:0:99999:7:14:", ":"}};
    for (const auto& [before, after] : fields) {
        for (const std::string& number : badNumbers()) {
            if (!number.empty()) {
                lines.push_back({before + number + after, false});
            }
        }
    }
    addAll(lines,
           {"bad",
            "bad:",
            "bad:h",
            "bad:h:",
            "bad:h:1",
            "bad:h:1:",
            "bad:h:1:2:3",
            "bad:h:1:2:3:4",
            ":h:1:2:3:4:::",
            "+",
            "-",
            "+::::::::",
            "-bad:h:1:2:3:4:::",
            "+bad",
            "bad:h:1:2:3:4:5:6:7:8",
            "bad:h:1:2:3:4:5:6:7:8:9",
            "bad:h:1:2:3:4:5:6:x",
            "bad;h;1;2;3",
            "\xFF",
            std::string(megabyte, 'b'),
            "bad:" + std::string(megabyte, 'h') + ":1",
            withNul("bad:h:1:2", ":3:4:::"),
            withNul("", "bad:h:1:2:3:4:::")},
           false);
    addAll(lines, {"bad:h:1:2:3:4:5:6", withNul("bad:h:1:2:3:4:5:6:", "junk")}, true);
    return lines;
}

std::vector<DamagedLine> damagedGroupLines() {
    std::vector<DamagedLine> lines;
    for (const std::string& number : badNumbers()) {
        lines.push_back({"bad:x:" + number + ":alice,bob", false});
    }
    addAll(lines,
           {"bad",
            "bad:",
            "bad:x",
            "bad:x:",
            ":",
            ":::",
            ":x:1:alice",
            ":x:0:",
            "+",
            "-",
            "+:::",
            "-:::",
            "+bad:::",
            "-bad:x:1:alice",
            "+@netgroup:::",
            "bad x 1 alice",
            "bad;x;1;alice",
            "bad:x:4294967295:alice",
            "\xFF",
            std::string(megabyte, 'b'),
            "bad:x:" + std::string(megabyte, '1') + ":",
            withNul("bad:x", ":1:alice"),
            withNul("", "bad:x:1:")},
           false);
    addAll(lines,
           {"bad:x:1", "bad:x:1:alice:bob", "bad:x:1:\xFF,alice",
            "bad:x:1:alice::::", withNul("bad:x:1:alice", ",bob")},
           true);
    return lines;
}

} // namespace qelo::nodes::tests
