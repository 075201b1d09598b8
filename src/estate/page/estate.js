/* The estate page's partitions: rows kept as columns of data and made into
   table rows only as far as they are in view, so that 200,000 partitions
   open, sort and filter quickly. Times of the last open, sort and filter
   are kept in window.estateTimings (milliseconds) for the benchmark. */
(function () {
    "use strict";

    const data = JSON.parse(document.getElementById("estate-data").textContent);
    const total = data.host.length;
    const viewport = document.getElementById("row-viewport");
    const body = document.getElementById("row-body");
    const rowCount = document.getElementById("row-count");
    const textFilter = document.getElementById("text-filter");
    const outcomeChoice = document.getElementById("outcome-choice");
    const consoleChoice = document.getElementById("console-choice");
    const overscan = 20;
    const timings = { open: 0, sort: 0, filter: 0 };
    window.estateTimings = timings;

    let rowHeight = 29;
    let sorted = identityOrder();
    let shown = sorted;
    let haystacks = null;
    let drawPending = false;

    function identityOrder() {
        const order = new Int32Array(total);
        for (let i = 0; i < total; i += 1) {
            order[i] = i;
        }
        return order;
    }

    function escapeText(text) {
        return String(text).replace(/[&<>"]/g, function (character) {
            return { "&": "&amp;", "<": "&lt;", ">": "&gt;", "\"": "&quot;" }[character];
        });
    }

    function consoleOf(row) {
        return data.machines[data.machine[row]][0];
    }

    function cell(text, className) {
        const title = text === "" ? "" : " title=\"" + escapeText(text) + "\"";
        return "<td class=\"" + className + "\"" + title + ">" + escapeText(text) + "</td>";
    }

    function consoleCell(row) {
        const console = data.consoles[consoleOf(row)];
        if (!console.report) {
            return cell(console.name, "console");
        }
        return "<td class=\"console\"><a href=\"" + escapeText(console.report) + "\">" +
            escapeText(console.name) + "</a></td>";
    }

    function rowMarkup(row) {
        const outcome = data.outcomes[data.outcome[row]];
        const seconds = data.seconds[row] === null ? "" : data.seconds[row].toFixed(1);
        const reason = data.reason[row] < 0 ? "" : data.texts[data.reason[row]];
        return "<tr class=\"" + outcome[2] + "\">" + consoleCell(row) +
            cell(data.machines[data.machine[row]][1], "machine") + cell(data.id[row], "number") +
            cell(data.host[row], "host") + cell(data.ip[row], "ip") +
            cell(outcome[1], "outcome") + cell(data.texts[data.status[row]], "status") +
            cell(seconds, "number") + cell(reason, "reason") + "</tr>";
    }

    function spacer(height) {
        return "<tr class=\"spacer\"><td colspan=\"9\" style=\"height:" + height +
            "px\"></td></tr>";
    }

    function draw() {
        drawPending = false;
        const first = Math.max(0, Math.floor(viewport.scrollTop / rowHeight) - overscan);
        const visible = Math.ceil(viewport.clientHeight / rowHeight) + 2 * overscan;
        const last = Math.min(shown.length, first + visible);
        const parts = [spacer(first * rowHeight)];
        for (let i = first; i < last; i += 1) {
            parts.push(rowMarkup(shown[i]));
        }
        parts.push(spacer((shown.length - last) * rowHeight));
        body.innerHTML = parts.join("");
        rowCount.textContent = shown.length.toLocaleString("en") + " of " +
            total.toLocaleString("en") + " partitions";
    }

    function drawSoon() {
        if (!drawPending) {
            drawPending = true;
            window.requestAnimationFrame(draw);
        }
    }

    function measureRowHeight() {
        const row = body.querySelector("tr:not(.spacer)");
        if (row && row.getBoundingClientRect().height > 0) {
            rowHeight = row.getBoundingClientRect().height;
        }
    }

    // Ranks of a table of texts in sorted order, so that rows sort by number.
    function ranksOf(texts) {
        const order = texts.map(function (text, index) { return index; });
        order.sort(function (left, right) {
            return texts[left] < texts[right] ? -1 : texts[left] > texts[right] ? 1 : 0;
        });
        const ranks = new Int32Array(texts.length);
        order.forEach(function (index, rank) { ranks[index] = rank; });
        return ranks;
    }

    function ipKey(text) {
        const parts = text.split(".");
        if (parts.length !== 4 || parts.some(function (part) { return !/^\d{1,3}$/.test(part); })) {
            return Number.MAX_SAFE_INTEGER;
        }
        return parts.reduce(function (sum, part) { return sum * 256 + Number(part); }, 0);
    }

    function numberOrLast(text) {
        const value = text === null || text === "" ? NaN : Number(text);
        return Number.isNaN(value) ? Number.MAX_VALUE : value;
    }

    function keysFor(column) {
        const keys = new Float64Array(total);
        const texts = column === "status" || column === "reason" ? ranksOf(data.texts) : null;
        const machines = column === "machine" ?
            ranksOf(data.machines.map(function (machine) { return machine[1]; })) : null;
        for (let row = 0; row < total; row += 1) {
            keys[row] = keyOf(column, row, texts, machines);
        }
        return keys;
    }

    function keyOf(column, row, texts, machines) {
        switch (column) {
        case "console": return consoleOf(row);
        case "machine": return machines[data.machine[row]];
        case "id": return numberOrLast(data.id[row]);
        case "ip": return ipKey(data.ip[row]);
        case "outcome": return data.outcome[row];
        case "status": return texts[data.status[row]];
        case "reason": return data.reason[row] < 0 ? -1 : texts[data.reason[row]];
        case "seconds": return data.seconds[row] === null ? Number.MAX_VALUE : data.seconds[row];
        default: return 0;
        }
    }

    function sortBy(column, descending) {
        const order = identityOrder();
        const direction = descending ? -1 : 1;
        if (column === "host") {
            order.sort(function (left, right) {
                const leftHost = data.host[left];
                const rightHost = data.host[right];
                return direction * (leftHost < rightHost ? -1 : leftHost > rightHost ? 1 :
                    left - right);
            });
        } else {
            const keys = keysFor(column);
            order.sort(function (left, right) {
                return direction * (keys[left] - keys[right] || left - right);
            });
        }
        return order;
    }

    function rowText(row) {
        const reason = data.reason[row] < 0 ? "" : data.texts[data.reason[row]];
        return [data.consoles[consoleOf(row)].name, data.machines[data.machine[row]][1],
            data.id[row], data.host[row], data.ip[row], data.texts[data.status[row]],
            reason].join("\n").toLowerCase();
    }

    function matchesOutcome(row, choice) {
        if (choice === "") {
            return true;
        }
        const outcome = data.outcomes[data.outcome[row]];
        return choice === "failed" ? outcome[3] === 1 : outcome[0] === choice;
    }

    function applyFilters() {
        const started = performance.now();
        const text = textFilter.value.trim().toLowerCase();
        const outcome = outcomeChoice.value;
        const console = consoleChoice.value === "" ? -1 : Number(consoleChoice.value);
        if (text !== "" && haystacks === null) {
            haystacks = new Array(total);
            for (let row = 0; row < total; row += 1) {
                haystacks[row] = rowText(row);
            }
        }
        shown = sorted.filter(function (row) {
            return (console < 0 || consoleOf(row) === console) && matchesOutcome(row, outcome) &&
                (text === "" || haystacks[row].indexOf(text) >= 0);
        });
        viewport.scrollTop = 0;
        draw();
        timings.filter = performance.now() - started;
    }

    function onSort(event) {
        const heading = event.target.closest("th");
        if (!heading) {
            return;
        }
        const started = performance.now();
        const descending = heading.getAttribute("aria-sort") === "ascending";
        document.querySelectorAll(".estate-rows th").forEach(function (other) {
            other.removeAttribute("aria-sort");
        });
        heading.setAttribute("aria-sort", descending ? "descending" : "ascending");
        sorted = sortBy(heading.dataset.column, descending);
        applyFilters();
        timings.sort = performance.now() - started;
    }

    function start() {
        document.getElementById("filters").hidden = false;
        viewport.hidden = false;
        draw();
        measureRowHeight();
        draw();
        viewport.addEventListener("scroll", drawSoon, { passive: true });
        document.querySelector(".estate-rows thead").addEventListener("click", onSort);
        textFilter.addEventListener("input", applyFilters);
        outcomeChoice.addEventListener("change", applyFilters);
        consoleChoice.addEventListener("change", applyFilters);
        timings.open = performance.now();
        document.body.dataset.ready = "true";
    }

    start();
}());
