/* The report page's script: sorting, filters and paging over the table of
   partitions. The page reads fully without it.

   With script on, the browser keeps the table inside <noscript> as plain
   text instead of laying out tens of thousands of rows. The script parses
   that text once into an inert template, keeps its rows as an array, sorts
   and filters the array, and moves a page of the matching rows at a time
   into a table of its own. Columns are found by the data-column attribute
   of their headers, so the order of the columns is the page's alone. */
(function () {
    "use strict";

    var ROWS_PER_PAGE = 200;
    var SEARCH_DELAY_MILLISECONDS = 120;

    var rowSource = document.getElementById("partition-rows");
    var liveRows = document.getElementById("live-rows");
    var filterForm = document.getElementById("filters");
    var textFilter = document.getElementById("text-filter");
    var machineChoice = document.getElementById("machine-choice");
    var rowCount = document.getElementById("row-count");
    var showMore = document.getElementById("show-more");

    var template = document.createElement("template");
    template.innerHTML = rowSource.textContent;
    var table = template.content.querySelector("table");
    var tableBody = table.tBodies[0];
    var headers = Array.prototype.slice.call(table.tHead.rows[0].cells);
    var rows = Array.prototype.slice.call(tableBody.rows);

    var sortKeysByColumn = {};
    var searchTexts = null;
    var rowOrder = rows.map(function (row, index) { return index; });
    // How many of the matching rows the table lists at most.
    var rowLimit = ROWS_PER_PAGE;

    tableBody.textContent = "";
    table.id = "parts";
    liveRows.appendChild(table);
    rowSource.parentNode.removeChild(rowSource);

    function headerOf(column) {
        return headers.filter(function (header) {
            return header.getAttribute("data-column") === column;
        })[0];
    }

    // A reason's text without the "reason" of its <summary>.
    function cellText(cell) {
        var reason = cell.querySelector("pre");
        return (reason || cell).textContent;
    }

    function columnTexts(column) {
        var cellIndex = headerOf(column).cellIndex;
        return rows.map(function (row) { return cellText(row.cells[cellIndex]).trim(); });
    }

    function numberOrNull(text) {
        return text !== "" && isFinite(text) ? Number(text) : null;
    }

    // Each part of an IPv4 address to three digits, so that they sort as texts.
    function ipKey(text) {
        var parts = text.split(".");
        var isAddress = parts.length === 4 && parts.every(function (part) {
            return /^\d{1,3}$/.test(part);
        });
        if (!isAddress) {
            return text;
        }
        return parts.map(function (part) { return ("00" + part).slice(-3); }).join(".");
    }

    function sortKeysOf(column, type) {
        if (!sortKeysByColumn[column]) {
            sortKeysByColumn[column] = columnTexts(column).map(function (text) {
                if (type === "number") { return numberOrNull(text); }
                if (type === "ip") { return ipKey(text); }
                return text.toLowerCase();
            });
        }
        return sortKeysByColumn[column];
    }

    function isEmpty(key) {
        return key === null || key === "";
    }

    // Numbers before texts.
    function compareKeys(left, right) {
        if (left === right) { return 0; }
        if (typeof left !== typeof right) { return typeof left === "number" ? -1 : 1; }
        return left < right ? -1 : 1;
    }

    function firstPage() {
        rowLimit = ROWS_PER_PAGE;
        render();
    }

    function sortBy(header) {
        var isAscending = header.getAttribute("aria-sort") !== "ascending";
        var keys = sortKeysOf(header.getAttribute("data-column"), header.getAttribute("data-type"));
        var direction = isAscending ? 1 : -1;
        rowOrder = rows.map(function (row, index) { return index; });
        rowOrder.sort(function (left, right) {
            // Empty cells last, whichever way the column runs.
            var emptiness = isEmpty(keys[left]) - isEmpty(keys[right]);
            if (emptiness !== 0) { return emptiness; }
            return direction * compareKeys(keys[left], keys[right]) || left - right;
        });
        headers.forEach(function (each) { each.removeAttribute("aria-sort"); });
        header.setAttribute("aria-sort", isAscending ? "ascending" : "descending");
        firstPage();
    }

    function outcomeBoxes() {
        return Array.prototype.slice.call(filterForm.querySelectorAll("input[data-outcome]"));
    }

    // The page classes of the outcomes whose boxes are ticked.
    function chosenOutcomeClasses() {
        var chosen = {};
        outcomeBoxes().forEach(function (box) { chosen[box.value] = box.checked; });
        return chosen;
    }

    function rowSearchTexts() {
        if (!searchTexts) {
            searchTexts = rows.map(function (row) {
                return Array.prototype.map.call(row.cells, cellText).join("\n").toLowerCase();
            });
        }
        return searchTexts;
    }

    function rowFilter() {
        var chosen = chosenOutcomeClasses();
        var query = textFilter.value.trim().toLowerCase();
        var machine = machineChoice.value.toLowerCase();
        var machines = machine === "" ? null : sortKeysOf("machine", "text");
        var texts = query === "" ? null : rowSearchTexts();
        return function (rowIndex) {
            return chosen[rows[rowIndex].className] === true &&
                (machines === null || machines[rowIndex] === machine) &&
                (texts === null || texts[rowIndex].indexOf(query) !== -1);
        };
    }

    function render() {
        var isWanted = rowFilter();
        var page = document.createDocumentFragment();
        var matched = 0;
        rowOrder.forEach(function (rowIndex) {
            if (!isWanted(rowIndex)) { return; }
            if (matched < rowLimit) { page.appendChild(rows[rowIndex]); }
            matched += 1;
        });
        tableBody.textContent = "";
        tableBody.appendChild(page);
        var listed = Math.min(matched, rowLimit);
        rowCount.textContent = (listed < matched ? "showing " + listed + " of " : "") +
            matched + " of " + rows.length + " partitions";
        showMore.hidden = listed >= matched;
    }

    var pendingSearch = null;
    function renderSoon() {
        clearTimeout(pendingSearch);
        pendingSearch = setTimeout(firstPage, SEARCH_DELAY_MILLISECONDS);
    }

    function showOnly(update) {
        update();
        firstPage();
        table.scrollIntoView();
    }

    headers.forEach(function (header) {
        var button = document.createElement("button");
        button.type = "button";
        button.textContent = header.textContent;
        button.title = "Sort by " + header.textContent;
        header.textContent = "";
        header.appendChild(button);
        button.addEventListener("click", function () { sortBy(header); });
    });
    filterForm.addEventListener("change", firstPage);
    filterForm.addEventListener("submit", function (event) { event.preventDefault(); });
    textFilter.addEventListener("input", renderSoon);
    showMore.querySelector("button").addEventListener("click", function () {
        rowLimit += ROWS_PER_PAGE * 5;
        render();
    });
    Array.prototype.forEach.call(document.querySelectorAll("a[data-machine]"), function (link) {
        link.addEventListener("click", function (event) {
            event.preventDefault();
            showOnly(function () { machineChoice.value = link.getAttribute("data-machine"); });
        });
    });
    var totals = document.querySelectorAll(".totals li[data-outcome]");
    Array.prototype.forEach.call(totals, function (total) {
        var outcome = total.getAttribute("data-outcome");
        total.title = "Show only these partitions";
        total.addEventListener("click", function () {
            showOnly(function () {
                outcomeBoxes().forEach(function (box) {
                    box.checked = box.getAttribute("data-outcome") === outcome;
                });
            });
        });
    });
    filterForm.hidden = false;
    render();
}());
