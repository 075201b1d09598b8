/* The report page's script: sorting, filters and paging over the table of
   partitions. The page reads fully without it.

   With script on, the browser keeps the table inside <noscript> as plain
   text instead of laying out tens of thousands of rows. The script reads
   that text with an HTML parser into an inert document, keeps its rows as
   an array, sorts and filters the array, and moves a page of the matching
   rows at a time into a table of its own. Columns are found by the
   data-column attribute of their headers, so the order of the columns is
   the page's alone.

   Parsing 50,000 rows takes about a second, so the parser is given the
   text a slice at a time (document.write on the inert document): the first
   page shows at once and the rest is read between the browser's other
   work. Whatever needs every row reads the rest first (allRows). */
(function () {
    "use strict";

    var ROWS_PER_PAGE = 200;
    var SEARCH_DELAY_MILLISECONDS = 120;
    // About 500 rows, a few tens of milliseconds of parsing.
    var SLICE_CHARACTERS = 131072;

    var rowSource = document.getElementById("partition-rows");
    var liveRows = document.getElementById("live-rows");
    var filterForm = document.getElementById("filters");
    var textFilter = document.getElementById("text-filter");
    var machineChoice = document.getElementById("machine-choice");
    var rowCount = document.getElementById("row-count");
    var showMore = document.getElementById("show-more");

    var rowText = rowSource.textContent;
    var parsed = document.implementation.createHTMLDocument("");
    var readTo = 0;
    var isRead = false;
    var rows = [];

    var sortKeysByColumn = {};
    var searchTexts = null;
    // Indexes into rows in the order the table lists them; null while the
    // table is in the page's order.
    var rowOrder = null;
    // How many of the matching rows the table lists at most.
    var rowLimit = ROWS_PER_PAGE;

    // Moves the rows the parser has finished out of its table into rows;
    // the last node may still grow until the text ends.
    function takeFinishedRows() {
        var body = parsed.querySelector("tbody");
        while (body && body.firstChild && (isRead || body.firstChild !== body.lastChild)) {
            var node = body.removeChild(body.firstChild);
            if (node.nodeType === Node.ELEMENT_NODE) {
                rows.push(node);
            }
        }
    }

    function readSlice() {
        var end = readTo + SLICE_CHARACTERS;
        var lastCode = rowText.charCodeAt(end - 1);
        // Both halves of a surrogate pair in the same slice.
        if (lastCode >= 0xD800 && lastCode <= 0xDBFF) {
            end += 1;
        }
        parsed.write(rowText.slice(readTo, end));
        readTo = end;
        if (readTo >= rowText.length) {
            parsed.close();
            isRead = true;
        }
        takeFinishedRows();
    }

    function allRows() {
        while (!isRead) {
            readSlice();
        }
        return rows;
    }

    function readInBackground() {
        if (isRead) {
            return;
        }
        readSlice();
        if (isRead) {
            render();
        } else {
            setTimeout(readInBackground, 0);
        }
    }

    // The live table: the parsed one's columns and headers, and a body of
    // its own, as the parser still adds rows to the parsed one.
    function liveTable() {
        var parsedTable = parsed.querySelector("table");
        var live = document.importNode(parsedTable, false);
        Array.prototype.forEach.call(parsedTable.children, function (part) {
            if (part.tagName !== "TBODY") {
                live.appendChild(document.importNode(part, true));
            }
        });
        live.appendChild(document.createElement("tbody"));
        live.id = "parts";
        return live;
    }

    parsed.open();
    do {
        readSlice();
    } while (!isRead && (parsed.querySelector("tbody") === null || rows.length < ROWS_PER_PAGE));
    rowSource.parentNode.removeChild(rowSource);
    var table = liveRows.appendChild(liveTable());
    var tableBody = table.tBodies[0];
    var headers = Array.prototype.slice.call(table.tHead.rows[0].cells);

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
        return allRows().map(function (row) { return cellText(row.cells[cellIndex]).trim(); });
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
        allRows();
        rowLimit = ROWS_PER_PAGE;
        render();
    }

    function sortBy(header) {
        var isAscending = header.getAttribute("aria-sort") !== "ascending";
        var keys = sortKeysOf(header.getAttribute("data-column"), header.getAttribute("data-type"));
        var direction = isAscending ? 1 : -1;
        rowOrder = allRows().map(function (row, index) { return index; });
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

    // Every outcome's page class with whether its box is ticked.
    function chosenOutcomeClasses() {
        var chosen = {};
        outcomeBoxes().forEach(function (box) { chosen[box.value] = box.checked; });
        return chosen;
    }

    function rowSearchTexts() {
        if (!searchTexts) {
            searchTexts = allRows().map(function (row) {
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
        var order = rowOrder || rows.map(function (row, index) { return index; });
        order.forEach(function (rowIndex) {
            if (!isWanted(rowIndex)) { return; }
            if (matched < rowLimit) { page.appendChild(rows[rowIndex]); }
            matched += 1;
        });
        tableBody.textContent = "";
        tableBody.appendChild(page);
        var listed = Math.min(matched, rowLimit);
        if (isRead) {
            rowCount.textContent = (listed < matched ? "showing " + listed + " of " : "") +
                matched + " of " + rows.length + " partitions";
        } else {
            rowCount.textContent = "reading the partitions\u2026";
        }
        showMore.hidden = listed >= matched;
        fitWholeColumns();
    }

    // A table wider than its box would show the column at the box's right
    // edge cut through its heading ("Docum"): the box ends after the last
    // column that fits whole, and the rest is scrolled to. Rows, an opened
    // reason and the window's width change where the columns end.
    var scrollBox = liveRows.parentNode;
    function fitWholeColumns() {
        scrollBox.style.width = "";
        var room = scrollBox.clientWidth;
        if (table.offsetWidth <= room) {
            return;
        }
        var fits = 0;
        var box = scrollBox.getBoundingClientRect();
        var left = box.left + scrollBox.clientLeft - scrollBox.scrollLeft;
        headers.forEach(function (header) {
            var end = header.getBoundingClientRect().right - left;
            if (end <= room) {
                fits = Math.max(fits, end);
            }
        });
        if (fits > 0) {
            scrollBox.style.width = (fits + scrollBox.offsetWidth - scrollBox.clientWidth) + "px";
        }
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
        allRows();
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
    window.addEventListener("resize", fitWholeColumns);
    table.addEventListener("toggle", fitWholeColumns, true);
    filterForm.hidden = false;
    render();
    setTimeout(readInBackground, 0);
}());
