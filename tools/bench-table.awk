# Makes the table of tools/bench out of what the benchmarks print: comma-separated results of
# Google Benchmark, of which the least of the repetitions counts, and lines of bench_server,
#   server,NAME,BEST,MEDIAN
# Times of the former are kept in nanoseconds, of the latter in seconds.
BEGIN { FS = "," }

function cell(text) { gsub(/"/, "", text); return text }
function least(table, name, value) {
    if (!(name in table) || value + 0 < table[name]) table[name] = value + 0
}

$1 == "server" && NF == 4 {
    best[$2] = $3 + 0
    median[$2] = $4 + 0
    next
}
cell($1) == "name" {
    delete column
    for (i = 1; i <= NF; i++) column[cell($i)] = i
    next
}
NF > 4 && cell($1) !~ /_(mean|median|stddev|cv)$/ {
    if (cell($column["error_occurred"]) == "true") { print "failed: " $0; failed = 1; exit 1 }
    name = cell($1)
    unit = cell($column["time_unit"])
    scale = unit == "ms" ? 1e6 : unit == "us" ? 1e3 : 1
    least(time, name, $column["cpu_time"] * scale)
    if ("peak" in column) least(peak, name, $column["peak"])
    if ("allocations" in column) least(allocations, name, $column["allocations"])
}

function row(what, figure, goal, met) {
    printf "%-50s  %-30s  %-30s  %s\n", what, figure, goal, met
}
function told(is) { return is ? "met" : "NOT MET" }
function heading(what, figure) {
    if (headings++) print ""
    row(what, figure, "goal", "")
}

# --- The provider, in process ----------------------------------------------------------------

function perAccount(name, accounts) { return sprintf("%.2f us", time[name] / accounts / 1000) }
function line(name, what, most) {
    if (!(name in time)) return
    row(what, sprintf("%.1f ns", time[name]), most ? "under " most " ns" : "",
        most ? told(time[name] < most) : "")
}
function ratio(name, base, what, accounts, of, most,    times) {
    if (!(name in time) || !(base in time)) return
    times = time[name] / time[base]
    row(what, sprintf("%s = %.2f x", perAccount(name, accounts), times),
        sprintf("at most %s x %s", most, of), told(times <= most))
}
# All accounts have to be read before the first is named.
function namesRatio(which, label, n,    base) {
    if (!(("readStore/" which) in time) || !(("namesFloor/" n) in time)) return
    base = time["readStore/" which] + time["namesFloor/" n]
    row("EnumInstanceNames, " label ", " n " accounts",
        sprintf("%s = %.2f x", perAccount("names/" which, n), time["names/" which] / base),
        "(of reading + floor)", "")
}
function growth(name, what, scaled, most,    grown) {
    if (!((name "/60000") in time) || !((name "/1000") in time)) return
    grown = time[name "/60000"] / scaled / time[name "/1000"]
    row("growth from 1000 to 60000 accounts, " what, sprintf("%.2f x", grown),
        most ? "at most " most " x" : "", most ? told(grown <= most) : "")
}
function memory(name) {
    if (name in peak)
        row("  allocations, peak memory",
            sprintf("%.0f, %.1f KiB", allocations[name], peak[name] / 1024),
            "at most 12 KiB", told(peak[name] <= 12 * 1024))
}
function floorOf(name, what, n) {
    if ((name "/" n) in time) row(what ", " n " accounts", perAccount(name "/" n, n), "", "")
}
function providerTable(    i, f, n, label) {
    heading("provider", "figure (per account)")
    line("lineNotAdmitted/threads:1", "a line that nobody admits, one sink", 0)
    line("tracePointNotAdmitted", "a trace point that nobody admits", 60)
    line("tracePointOfAVariableNotAdmitted", "the same with a value", 60)
    for (i = 1; i in sizes; i++) {
        n = sizes[i]
        floorOf("floor", "floor", n)
        for (f = 1; f in forms; f++) {
            ratio("enumerate/" forms[f] "/" n, "floor/" n,
                "EnumInstances, " labels[f] ", " n " accounts", n, "floor", 3)
            memory("enumerate/" forms[f] "/" n)
        }
        floorOf("namesFloor", "floor of names", n)
        for (f = 1; f in forms; f++)
            namesRatio(forms[f] "/" n, labels[f], n)
    }
    for (f = 1; f in forms; f++) {
        growth("enumerate/" forms[f], labels[f], 60, 1.15)
        growth("names/" forms[f], "names, " labels[f], 60, 0)
        ratio("getOne/" forms[f] "/60000", "readStore/" forms[f] "/60000",
            "GetInstance among 60000, " labels[f], 60000, "reading", 1.2)
    }
    ratio("enumerateTraced/1000", "enumerate/node_file/1000",
        "EnumInstances, all traced to a file", 1000, "untraced", 8)
    if ("enumerateTracedAtOnce/1000" in time)
        row("  each line written at once",
            sprintf("%s = %.2f x", perAccount("enumerateTracedAtOnce/1000", 1000),
                time["enumerateTracedAtOnce/1000"] / time["enumerate/node_file/1000"]),
            "", "")
}
function methodTable(    i, f, n, name) {
    if (!("methodFloor/1" in time)) return
    heading("InvokeMethod, refused by the store", "figure (per call)")
    row("floor: refused at once", sprintf("%.2f us", time["methodFloor/1"] / 1000), "", "")
    for (i = 1; i in sizes; i++)
        for (f = 1; f in forms; f++) {
            name = "method/" forms[f] "/" sizes[i]
            if (name in time)
                row(labels[f] ", " sizes[i] " accounts",
                    sprintf("%.2f us = %.2f x", time[name] / 1000,
                        time[name] / time["methodFloor/1"]), "", "")
        }
    for (f = 1; f in forms; f++) growth("method/" forms[f], labels[f], 1, 0)
}

# --- The server ------------------------------------------------------------------------------

function both(name, format, scale) {
    return sprintf(format " (" format ")", best[name] * scale, median[name] * scale)
}
function figure(name, what, format, scale) {
    if (name in best) row(what, both(name, format, scale), "", "")
}
function atLeast(name, what, format, goal) {
    if (name in best) row(what, both(name, format, 1), "at least " goal, told(best[name] >= goal))
}
function under(name, what, format, scale, most, unit) {
    if (name in best)
        row(what, both(name, format, scale), "under " most " " unit,
            told(best[name] * scale < most))
}
# Independent of the number of instances: at most so much more than for 1000.
function independent(of, count, quantity, what, format, scale, most, unit,    name, more) {
    name = of count "/" quantity
    if (!(name in best)) return
    more = (best[name] - best[of "1000/" quantity]) * scale
    row(what, both(name, format, scale), "1000's and " most " " unit, told(more <= most))
}
function ratesOf(kind, what,    i, c) {
    figure("inprocess/" kind "/cpu", what ", in process, of CPU", "%.0f", 1)
    figure("inprocess/" kind "/wall", "  of wall time", "%.0f", 1)
    for (i = 1; i in connections; i++) {
        c = connections[i]
        figure("connections/" c "/" kind "/cpu", what ", " c " connections, of CPU", "%.0f", 1)
        figure("connections/" c "/" kind "/wall", "  of wall time", "%.0f", 1)
    }
}
function coreTable() {
    heading("server on one core, 60000 instances", "a second: best (median)")
    atLeast("core/ready/cpu", "one instance returned again, of CPU", "%.0f", 150000)
    figure("core/ready/wall", "  of wall time", "%.0f", 1)
    figure("core/ready/client", "  cost of the client, us an instance", "%.2f", 1e6)
    figure("core/fresh/cpu", "each made anew, of CPU", "%.0f", 1)
    figure("core/fresh/wall", "  of wall time", "%.0f", 1)
}
function lengthsOf(of, what,    i, n) {
    for (i = 1; i in lengths; i++) {
        n = lengths[i]
        independent(of, n, "peak", n " instances, " what ", peak, MiB", "%.1f", 1 / 1048576, 1, "MiB")
        independent(of, n, "first", "  first instance, ms", "%.2f", 1e3, 0.5, "ms")
    }
}
function lengthTable() {
    heading("length of an answer", "best (median)")
    lengthsOf("length/", "one returned again")
    lengthsOf("length/fresh/", "made anew")
}
function accountsTable(    each) {
    if (!("accounts/peak" in best)) return
    heading("server, 60000 accounts", "best (median)")
    each = best["accounts/peak"] / 60000 / 1024
    row("peak memory, MiB", both("accounts/peak", "%.0f", 1 / 1048576) \
        sprintf(" = %.1f KiB each", each), "at most 12 KiB", told(each <= 12))
    figure("accounts/first", "first instance, ms", "%.0f", 1e3)
    figure("accounts/inprocess/first", "  in process", "%.0f", 1e3)
    figure("accounts/whole", "all of them, ms", "%.0f", 1e3)
    figure("accounts/inprocess/whole", "  in process", "%.0f", 1e3)
}
function serverTable() {
    heading("server, 1000 instances an answer", "a second: best (median)")
    ratesOf("ready", "instances")
    heading("server, GetInstance", "a second: best (median)")
    ratesOf("get", "requests")
    coreTable()
    heading("GetInstance over one connection", "best (median) of runs")
    under("get/trivial/median", "trivial provider, median, ms", "%.3f", 1e3, 0.3, "ms")
    under("get/trivial/p99", "  99th percentile, ms", "%.3f", 1e3, 0.3, "ms")
    under("get/accounts/median", "one of 10 accounts, median, ms", "%.3f", 1e3, 0.3, "ms")
    under("get/accounts/p99", "  99th percentile, ms", "%.3f", 1e3, 0.3, "ms")
    lengthTable()
    accountsTable()
}

END {
    if (failed) exit 1
    split("100 1000 10000 60000", sizes, " ")
    split("node_file account_files", forms, " ")
    split("node file,account files", labels, ",")
    split("1 4 16", connections, " ")
    split("1000 10000 60000 500000", lengths, " ")
    providerTable()
    methodTable()
    if ("core/ready/cpu" in best) serverTable()
}
